#include "fixfiles/ItemsFile.h"

#include "TestCompany.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Error.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <limits>

namespace dovrel {
namespace {

using nlohmann::json;
using test::TestCompany;
using test::W;

// A document line's item key as the document reader leaves it: 12 characters.
std::string LineKey(std::string key) {
    key.resize(12, ' ');
    return key;
}

struct Progress {
    Shape frame{"ProgressFrame", 0, 0, 3015, 495};
    Shape fill{"ProgressFill", 0, 0, 0, 495};
    std::vector<int32_t> widths;

    Progress() {
        fill.changed.connect([this] { widths.push_back(fill.Width()); });
    }
    ProgressBar bar() { return ProgressBar{frame, fill}; }
};

CurrentDocument DocumentWithKeys(const std::vector<std::string>& keys) {
    CurrentDocument doc;
    for (const std::string& key : keys)
        doc.lines[++doc.lineCount].itemKey = LineKey(key);
    return doc;
}

json Item(const std::string& key, const std::string& category, const std::string& foreign) {
    return {{"key", key}, {"name", "x"}, {"category", category}, {"foreignName", foreign}};
}

TEST(ItemsFileTest, ScanRangeRoundsHalvesToEven) {
    EXPECT_EQ(LastScanRecord(0, 500), -1);
    EXPECT_EQ(LastScanRecord(250, 500), 0);
    EXPECT_EQ(LastScanRecord(1000, 500), 1);
    EXPECT_EQ(LastScanRecord(1250, 500), 2);
    EXPECT_EQ(LastScanRecord(1251, 500), 2);
    EXPECT_EQ(LastScanRecord(1750, 500), 2);
    EXPECT_EQ(LastScanRecord(1751, 500), 3);
    EXPECT_EQ(LastScanRecord(2750, 500), 4);
    EXPECT_EQ(LastScanRecord(650 * 7 + 325, 650), 6);
    EXPECT_EQ(LastScanRecord(std::numeric_limits<int64_t>::max(), 500),
              std::numeric_limits<int64_t>::max() / 500);
}

TEST(ItemsFileTest, OnlyRecordsBetweenTheFirstAndTheLastAreRead) {
    TestCompany three(json{
        {"items",
         {{"trailer", false}, {"list", {Item("A1", "01", "First"), Item("A2", "02", "Second")}}}}}
                          .dump());
    ASSERT_EQ(std::filesystem::file_size(three.file("ITM.fix")), 1500u);
    CurrentDocument doc = DocumentWithKeys({"A1", "A2"});
    Progress progress;
    EXPECT_TRUE(ReadITM(three.compPath(), doc, progress.bar()));
    EXPECT_EQ(doc.lines[1].catCode, "01 ");
    EXPECT_EQ(doc.lines[1].foreignName, "First");
    EXPECT_EQ(doc.lines[2].catCode, "   ");
    EXPECT_EQ(doc.lines[2].foreignName, "");

    TestCompany two(
        json{{"items", {{"trailer", false}, {"list", {Item("A1", "01", "First")}}}}}.dump());
    ASSERT_EQ(std::filesystem::file_size(two.file("ITM.fix")), 1000u);
    CurrentDocument untouched = DocumentWithKeys({"A1"});
    EXPECT_TRUE(ReadITM(two.compPath(), untouched, progress.bar()));
    EXPECT_EQ(untouched.lines[1].catCode, "   ");
    EXPECT_EQ(progress.fill.Width(), 0);
}

TEST(ItemsFileTest, FillsTheFirstLineOfAnItemWithFieldsAsStored) {
    TestCompany company(json{{"items",
                              {Item("B7", "9", "  Spare part  "),
                               {{"key", "C3"},
                                {"category", json{{"hex", "80 41 20"}}},
                                {"foreignName", json{{"hex", "20 80 81 20"}}}},
                               Item("ZZ", "77", "Not in the document")}}}
                            .dump());
    CurrentDocument doc = DocumentWithKeys({"X", "B7", "C3", "Y", "B7"});
    doc.lines[4].catCode = "old";
    doc.lines[4].foreignName = "kept";
    Progress progress;
    EXPECT_TRUE(ReadITM(company.compPath(), doc, progress.bar()));

    EXPECT_EQ(doc.lines[2].catCode, "9  ");
    EXPECT_EQ(doc.lines[2].foreignName, "Spare part");
    EXPECT_EQ(doc.lines[5].catCode, "   ");
    EXPECT_EQ(doc.lines[5].foreignName, "");
    EXPECT_EQ(doc.lines[3].catCode, "\x80"
                                    "A ");
    EXPECT_EQ(doc.lines[3].foreignName, "\x80\x81");
    EXPECT_EQ(doc.lines[4].catCode, "old");
    EXPECT_EQ(doc.lines[4].foreignName, "kept");
    EXPECT_EQ(doc.lines[1].catCode, "   ");
}

TEST(ItemsFileTest, KeysMatchAfterDecodingWithoutRegardToLatinCase) {
    TestCompany company(json{
        {"items",
         {Item("שלום", "01", "Peace"), Item("Ab12", "02", "Mixed"), Item("Q9", "03", "Spaced")}}}
                            .dump());
    // Keys as the document reader decodes them from the same stored bytes.
    std::string hebrew = W("שלום");
    CurrentDocument doc = DocumentWithKeys({"aB12", hebrew, "  q9", "ab13"});
    Progress progress;
    ASSERT_TRUE(ReadITM(company.compPath(), doc, progress.bar()));
    EXPECT_EQ(doc.lines[1].foreignName, "Mixed");
    EXPECT_EQ(doc.lines[2].foreignName, "Peace");
    EXPECT_EQ(doc.lines[3].foreignName, "Spaced");
    EXPECT_EQ(doc.lines[4].foreignName, "");
}

TEST(ItemsFileTest, TheLastRecordOfAKeyInTheFileWins) {
    TestCompany company(
        json{{"items",
              {Item("K1", "01", "Older"), Item("k1", "02", "Newer"), Item("K2", "03", "Other")}}}
            .dump());
    CurrentDocument doc = DocumentWithKeys({"K1", "K1", "K2"});
    Progress progress;
    ASSERT_TRUE(ReadITM(company.compPath(), doc, progress.bar()));
    EXPECT_EQ(doc.lines[1].catCode, "02 ");
    EXPECT_EQ(doc.lines[1].foreignName, "Newer");
    EXPECT_EQ(doc.lines[2].foreignName, "");
    EXPECT_EQ(doc.lines[3].foreignName, "Other");

    // A line count beyond the forty entries is held to them.
    doc.lineCount = 1000;
    EXPECT_TRUE(ReadITM(company.compPath(), doc, progress.bar()));
}

TEST(ItemsFileTest, ProgressMovesDuringALongScanAndEndsEmpty) {
    json items = json::array();
    for (int i = 0; i < 200; ++i)
        items.push_back(Item("I" + std::to_string(i), "01", "Item " + std::to_string(i)));
    TestCompany company(json{{"items", items}}.dump());
    CurrentDocument doc = DocumentWithKeys({"I199"});
    Progress progress;
    progress.fill.setWidth(700);
    progress.widths.clear();
    ASSERT_TRUE(ReadITM(company.compPath(), doc, progress.bar()));
    EXPECT_EQ(doc.lines[1].foreignName, "Item 199");

    // 202 records: the scan reads 2 to 201 and moves the bar at 5, 10, ... 200.
    ASSERT_GE(progress.widths.size(), 4u);
    EXPECT_EQ(progress.widths.front(), 0);
    EXPECT_EQ(progress.widths[1], 75);                            // 3015 * 5 / 201 = 75.0
    EXPECT_EQ(progress.widths[progress.widths.size() - 2], 3000); // 3015 * 200 / 201 = 3000.0
    EXPECT_TRUE(std::is_sorted(progress.widths.begin() + 1, progress.widths.end() - 1));
    EXPECT_EQ(progress.widths.back(), 0);
    EXPECT_EQ(progress.fill.Width(), 0);
}

TEST(ItemsFileTest, AMissingFileIsAnErrorThatTouchesNothing) {
    TestCompany company(json{{"accounts", json::array()}}.dump());
    CurrentDocument doc = DocumentWithKeys({"A1"});
    doc.lines[1].catCode = "abc";
    Progress progress;
    progress.fill.setWidth(500);
    EXPECT_THAT([&] { ReadITM(company.compPath(), doc, progress.bar()); },
                testing::ThrowsMessage<Error>(testing::HasSubstr("ITM.fix")));
    EXPECT_EQ(doc.lines[1].catCode, "abc");
    EXPECT_EQ(progress.fill.Width(), 500);

    std::filesystem::create_directory(company.file("ITM.fix"));
    EXPECT_THROW(ReadITM(company.compPath(), doc, progress.bar()), Error);
    EXPECT_EQ(doc.lines[1].catCode, "abc");
    EXPECT_THROW(ReadITM(company.compPath() + "\\nowhere", doc, progress.bar()), Error);
}

TEST(ItemsFileTest, TheFileNameIsMatchedWithoutRegardToCase) {
    TestCompany company(json{{"items", {Item("A1", "01", "Found")}}}.dump());
    std::filesystem::rename(company.file("ITM.fix"), company.file("itm.FIX"));
    CurrentDocument doc = DocumentWithKeys({"A1"});
    Progress progress;
    ASSERT_TRUE(ReadITM(company.compPath(), doc, progress.bar()));
    EXPECT_EQ(doc.lines[1].foreignName, "Found");
}

TEST(ItemsFileTest, AFileThatShrinksDuringTheScanEndsItWithWhatWasRead) {
    json items = json::array();
    for (int i = 0; i < 1000; ++i)
        items.push_back(Item("I" + std::to_string(i), "01", "Item " + std::to_string(i)));
    TestCompany company(json{{"items", items}}.dump());
    CurrentDocument doc = DocumentWithKeys({"I3", "I900"});
    Progress progress;
    bool cut = false;
    progress.fill.changed.connect([&] {
        if (!cut && progress.fill.Width() > 0) {
            std::filesystem::resize_file(company.file("ITM.fix"), 300 * 500);
            cut = true;
        }
    });
    EXPECT_TRUE(ReadITM(company.compPath(), doc, progress.bar()));
    EXPECT_TRUE(cut);
    EXPECT_EQ(doc.lines[1].foreignName, "Item 3");
    EXPECT_EQ(doc.lines[2].foreignName, "");
    EXPECT_EQ(progress.fill.Width(), 0);
}

} // namespace
} // namespace dovrel
