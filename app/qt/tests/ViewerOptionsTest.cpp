#include "app/qt/ViewerOptions.h"

#include "platform/Error.h"

#include <gtest/gtest.h>

namespace dovrel {
namespace {

ViewerOptions Parse(QStringList arguments) {
    arguments.prepend("dovrel-viewer");
    return ViewerOptions::Parse(arguments);
}

TEST(ViewerOptionsTest, ReadsTheCompanyTheTypeAndTheStart) {
    ViewerOptions none = Parse({});
    EXPECT_TRUE(none.compDir.isEmpty());
    EXPECT_EQ(none.type, 20);
    EXPECT_EQ(none.start, 2);
    EXPECT_FALSE(none.help);

    ViewerOptions all = Parse({"/data/comp02", "--type", "30", "--start=7"});
    EXPECT_EQ(all.compDir, "/data/comp02");
    EXPECT_EQ(all.type, 30);
    EXPECT_EQ(all.start, 7);
    EXPECT_TRUE(Parse({"--help"}).help);
    EXPECT_EQ(Parse({"--type", "-32768"}).type, -32768);
    EXPECT_NE(ViewerOptions::HelpText().indexOf("--start <N>"), -1);
}

TEST(ViewerOptionsTest, RefusesWhatItCannotUse) {
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
