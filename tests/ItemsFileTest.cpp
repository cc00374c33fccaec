#include "fixfiles/ItemsFile.h"

#include "TestCompany.h"
#include "platform/Error.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdint>
#include <filesystem>
#include <utility>

namespace dovrel {
namespace {

using nlohmann::json;
using test::TestCompany;
using Texts = std::vector<std::string>;

class ItemsFileTest : public testing::Test {
protected:
    Shape frame{"ProgressFrame", 0, 0, 3015, 495};
    Shape fill{"ProgressFill", 0, 0, 0, 495};
    ProgressBar progress{frame, fill};
};

// Item keys as the document reader leaves them: 12 characters.
CurrentDocument DocumentWithKeys(const Texts& keys) {
    CurrentDocument doc;
    for (const std::string& key : keys)
        doc.lines[++doc.lineCount].itemKey = (key + std::string(12, ' ')).substr(0, 12);
    return doc;
}

// Each line's category code and foreign name, joined with "|".
Texts LineFields(const CurrentDocument& doc) {
    Texts fields;
    for (int entry = 1; entry <= doc.lineCount; ++entry)
        fields.push_back(doc.lines[entry].catCode + "|" + doc.lines[entry].foreignName);
    return fields;
}

json Item(const std::string& key, const json& category, const json& foreign) {
    return {{"key", key}, {"category", category}, {"foreignName", foreign}};
}

std::string Items(const std::vector<json>& list, bool trailer = true) {
    return json{{"items", {{"trailer", trailer}, {"list", list}}}}.dump();
}

std::vector<json> ManyItems(int count) {
    std::vector<json> items;
    for (int i = 0; i < count; ++i)
        items.push_back(Item("I" + std::to_string(i), "01", "Item " + std::to_string(i)));
    return items;
}

TEST(ItemsFileScanTest, LastScanRecordRoundsHalvesToEven) {
    const std::pair<int64_t, int64_t> cases[] = {{0, -1},   {250, 0},  {1000, 1}, {1250, 2},
                                                 {1251, 2}, {1750, 2}, {1751, 3}, {2750, 4}};
    for (auto [length, last] : cases)
        EXPECT_EQ(LastScanRecord(length, 500), last) << length;
    EXPECT_EQ(LastScanRecord(INT64_MAX, 500), INT64_MAX / 500);
}

TEST_F(ItemsFileTest, OnlyRecordsBetweenTheFirstAndTheLastAreRead) {
    // Three records hold only the first item; two hold none.
    TestCompany three(Items({Item("A1", "01", "First"), Item("A2", "02", "Second")}, false));
    TestCompany two(Items({Item("A1", "09", "Other")}, false));
    CurrentDocument doc = DocumentWithKeys({"A1", "A2"});
    for (const TestCompany* company : {&three, &two}) {
        EXPECT_TRUE(ReadITM(PathFromCp1255(company->compPath()), doc, progress));
        EXPECT_EQ(LineFields(doc), (Texts{"01 |First", "   |"}));
    }
    EXPECT_EQ(std::filesystem::file_size(two.file("ITM.fix")), 1000u);
}

TEST_F(ItemsFileTest, FillsTheFirstLineOfAKeyFromItsLastRecordAsStored) {
    TestCompany company(Items(
        {Item("B7", "9", "  Spare part  "),
         Item("C3", {{"hex", "80 41 20"}}, {{"hex", "20 80 81 20"}}), Item("שלום", "01", "Peace"),
         Item("Ab12", "02", "Mixed"), Item("Q9", "03", "Spaced"), Item("K1", "04", "Older"),
         Item("k1", "05", "Newer"), Item("ZZ", "77", "Not in the document")}));
    std::filesystem::rename(company.file("ITM.fix"), company.file("itm.FIX"));
    // Keys as the document reader decodes them, in any Latin case; a blank one meets no filler.
    CurrentDocument doc = DocumentWithKeys(
        {"X", "B7", "C3", "", "B7", "aB12", test::W("שלום"), "  q9", "ab13", "K1", "K1"});
    doc.lines[4].foreignName = "kept";
    ASSERT_TRUE(ReadITM(PathFromCp1255(company.compPath()), doc, progress));
    EXPECT_EQ(LineFields(doc),
              (Texts{"   |", "9  |Spare part", "\x80\x41 |\x80\x81", "   |kept", "   |",
                     "02 |Mixed", "01 |Peace", "03 |Spaced", "   |", "05 |Newer", "   |"}));
    doc.lineCount = 1000; // held to the forty entries
    EXPECT_TRUE(ReadITM(PathFromCp1255(company.compPath()), doc, progress));
}

TEST_F(ItemsFileTest, ProgressMovesDuringALongScanAndEndsEmpty) {
    TestCompany company(Items(ManyItems(200)));
    CurrentDocument doc = DocumentWithKeys({"I199"});
    fill.setWidth(700);
    std::vector<int32_t> widths;
    Connection watching = fill.changed.connect([&] { widths.push_back(fill.Width()); });
    ASSERT_TRUE(ReadITM(PathFromCp1255(company.compPath()), doc, progress));
    EXPECT_EQ(doc.lines[1].foreignName, "Item 199");
    // 202 records: the bar is emptied, moves at records 5, 10, ... 200 of the 201 read,
    // to 3015 * n / 201 = 15 * n twips, and is emptied at the end.
    std::vector<int32_t> expected(42, 0);
    for (size_t n = 1; n <= 40; ++n)
        expected[n] = 75 * static_cast<int32_t>(n);
    EXPECT_EQ(widths, expected);
}

TEST_F(ItemsFileTest, AMissingFileIsAnErrorThatTouchesNothing) {
    TestCompany company(json{{"accounts", json::array()}}.dump());
    CurrentDocument doc = DocumentWithKeys({"A1"});
    doc.lines[1].catCode = "abc";
    fill.setWidth(500);
    EXPECT_THAT([&] { ReadITM(PathFromCp1255(company.compPath()), doc, progress); },
                testing::ThrowsMessage<Error>(testing::HasSubstr("ITM.fix")));
    std::filesystem::create_directory(company.file("ITM.fix"));
    EXPECT_THROW(ReadITM(PathFromCp1255(company.compPath()), doc, progress), Error);
    EXPECT_EQ(std::pair(doc.lines[1].catCode, fill.Width()), std::pair(std::string("abc"), 500));
}

TEST_F(ItemsFileTest, AFileThatShrinksDuringTheScanEndsItWithWhatWasRead) {
    TestCompany company(Items(ManyItems(1000)));
    CurrentDocument doc = DocumentWithKeys({"I3", "I900"});
    bool cut = false;
    Connection watching = fill.changed.connect([&] {
        if (fill.Width() > 0 && !std::exchange(cut, true))
            std::filesystem::resize_file(company.file("ITM.fix"), 300 * 500);
    });
    EXPECT_TRUE(ReadITM(PathFromCp1255(company.compPath()), doc, progress));
    EXPECT_EQ(LineFields(doc), (Texts{"01 |Item 3", "   |"}));
}

} // namespace
} // namespace dovrel
