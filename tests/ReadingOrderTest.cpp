#include "fixfiles/ReadingOrder.h"

#include "platform/Encoding.h"
#include "tools/SampleWriter.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <fstream>
#include <set>

namespace dovrel {
namespace {

// Every text of the demo company's description, in reading order: the
// company, the accounts, the items and every field of every document.
std::set<std::string> DemoTexts() {
    std::ifstream in(DOVREL_SOURCE_DIR "/samples/demo.json");
    nlohmann::json demo = nlohmann::json::parse(in);
    std::set<std::string> texts;
    auto collect = [&texts](const nlohmann::json& value, auto& self) -> void {
        if (value.is_string())
            texts.insert(value.get<std::string>());
        else if (value.is_structured())
            for (const auto& child : value)
                self(child, self);
    };
    collect(demo, collect);
    return texts;
}

TEST(ReadingOrderTest, GivesBackEveryDemoTextAsTyped) {
    std::set<std::string> texts = DemoTexts();
    ASSERT_GT(texts.size(), 100u);
    for (const std::string& text : texts) {
        std::string stored = "  " + sample::DosVisual(text) + "   "; // padded as in a field
        EXPECT_EQ(ToUtf8(ReadingOrderText(stored)).str(), text)
            << "stored as " << sample::DosVisual(text);
    }
}

TEST(ReadingOrderTest, KeepsTextWithoutHebrewAsStoredAndBlankAsEmpty) {
    EXPECT_EQ(ReadingOrderText("  12 Baker St. (rear)  "), "12 Baker St. (rear)");
    EXPECT_EQ(ReadingOrderText("A-100."), "A-100.");
    EXPECT_EQ(ReadingOrderText("      "), "");
    EXPECT_EQ(ReadingOrderText(""), "");
}

} // namespace
} // namespace dovrel
