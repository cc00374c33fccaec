#include "app/qt/ViewerOptions.h"

#include "platform/Error.h"

#include <gtest/gtest.h>

#include <tuple>
#include <utility>

namespace dovrel {
namespace {

ViewerOptions Parse(QStringList arguments) {
    arguments.prepend("dovrel-viewer");
    return ViewerOptions::Parse(arguments);
}

// The values the viewer is started with, held to the ranges of the control's arguments.
TEST(ViewerOptionsTest, ReadsTheCompanyTheTypeAndTheStartOrRefusesThem) {
    ViewerOptions all = Parse({"/data/comp02", "--type", "-32768", "--start=7"});
    EXPECT_EQ(std::tuple(all.compDir.toStdString(), all.type, all.start),
              std::tuple("/data/comp02", -32768, 7));
    EXPECT_EQ(std::pair(Parse({}).type, Parse({}).start), std::pair(20, 2));
    for (QStringList wrong : {QStringList{"a", "b"},
                              {"--start", "0"},
                              {"--start", "x"},
                              {"--type", "40000"},
                              {"--type", "2.5"},
                              {"--colour"}}) {
        EXPECT_THROW(Parse(wrong), Error) << wrong.join(' ').toStdString();
    }
}

} // namespace
} // namespace dovrel
