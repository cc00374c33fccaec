// The document reader over companies written by the sample-company writer.

#include "control/Card.h"
#include "fixfiles/DocTypes.h"
#include "TestCompany.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <filesystem>
#include <fstream>

namespace dovrel {
namespace {

using nlohmann::json;
using test::U;
using test::W;

constexpr int16_t kDeliveryRow = 13;  // type 20, ISHP.FIX
constexpr int16_t kInvoiceRow = 0;    // type 1, IMV.FIX

json Line(const std::string& key, const std::string& description, double price = 10,
          double quantity = 1) {
    return {{"key", key}, {"description", description}, {"price", price},
            {"quantity", quantity}};
}

json Doc(int type, const std::string& reference, const std::string& customer,
         std::vector<json> lines = {}) {
    return {{"type", type}, {"reference", reference}, {"customer", customer},
            {"account", "1001"}, {"date", "2024-03-15"}, {"lines", lines}};
}

json Filler(const std::string& file, int count) {
    return {{"file", file}, {"filler", count}};
}

// A Card on a private module state, with a message box that records.
class ReadStockTest : public ::testing::Test {
protected:
    void SetUp() override { card = std::make_unique<Card>(messages, state); }

    void write(const json& description) { company = std::make_unique<test::TestCompany>(description.dump()); }

    int32_t read(const std::string& direction, int16_t row = kDeliveryRow,
                 std::string fromDate = "01/01/1980") {
        int16_t wizFile = row;
        std::string dir = direction;
        return card->ReadStock(company->compPath(), wizFile, card->PubSearchBy,
                               card->PubSearchValue, dir, fromDate);
    }
    void search(const std::string& by, const std::string& value) {
        card->PubSearchBy = by;
        card->PubSearchValue = Variant(W(value));
    }
    std::string cell(int row, int col) { return U(card->DocLines.TextMatrix(row, col)); }
    std::string box(const TextBox& b) { return U(b.Text()); }
    std::string lastMessage() {
        return messages.shown().empty() ? std::string() : U(messages.shown().back().text);
    }

    ModuleState state;
    RecordedMessages messages;
    std::unique_ptr<Card> card;
    std::unique_ptr<test::TestCompany> company;
};

TEST_F(ReadStockTest, LoadsTheDocumentIntoBoxesGridAndCurrentDocument) {
    json doc = Doc(20, "4711", "משה כהן",
                   {{{"key", "A100"}, {"description", "מברג חשמלי"}, {"details", "X1"},
                     {"price", 1234.5}, {"quantity", 2}, {"discount", 12.5}, {"currency", 21}},
                    {{"key", "*"}, {"description", "הערה לשורה"}},
                    {{"key", "B200"}, {"description", "Drill bits"}, {"price", 10},
                     {"quantity", 1.5}, {"currency", 1}, {"lineNumber", 7}}});
    doc["address1"] = "הרצל 5";
    doc["address2"] = "תל אביב";
    doc["remarks"] = json::array({"הערה ראשונה", "", "שלישית"});
    doc["discountPercent"] = 10;
    doc["vatPercent"] = 17;
    doc["totalBeforeDiscount"] = 1000;
    doc["totalWithVat"] = 1053;
    doc["warehouse"] = 3;
    doc["date"] = "2024-02-09";
    write({{"documents", {Filler("ISHP.FIX", 8), doc}}});

    card->PubACTLocation = 9;
    EXPECT_EQ(read("Next"), 14);
    EXPECT_TRUE(messages.shown().empty()) << lastMessage();
    EXPECT_EQ(card->PubACTLocation, 10);
    EXPECT_EQ(card->PubPrevLocation, 10);

    EXPECT_EQ(box(card->txtAccountKey), "1001");
    EXPECT_EQ(box(card->txtReference1), "4711");
    EXPECT_EQ(box(card->txtCustomerName), "משה כהן");
    EXPECT_EQ(box(card->txtDate), "09/02/2024");
    EXPECT_EQ(box(card->txtAddress1), "5 הרצל");  // digits move to the front
    EXPECT_EQ(box(card->txtAddress2), "תל אביב");
    EXPECT_EQ(box(card->txtTotalVat), "900.00");
    EXPECT_EQ(box(card->txtVatValue), "153.00");
    EXPECT_EQ(box(card->txtTotal1), "1,053.00");

    ASSERT_EQ(card->DocLines.Rows(), 5);  // heading, three lines, the empty row
    EXPECT_EQ(cell(1, 0), "1");
    EXPECT_EQ(cell(1, 1), "A100");
    EXPECT_EQ(cell(1, 2), "מברג חשמלי");
    EXPECT_EQ(cell(1, 3), "X1");
    EXPECT_EQ(cell(1, 4), "2");
    EXPECT_EQ(cell(1, 5), "1,234.50");
    EXPECT_EQ(cell(1, 6), "ש");
    EXPECT_EQ(cell(1, 7), "2,160.38");  // 1234.5 * 2 * 0.875, the half rounded up
    for (int col : {1, 3, 4, 5, 6, 7})
        EXPECT_EQ(cell(2, col), "") << col;
    EXPECT_EQ(cell(2, 0), "2");
    EXPECT_EQ(cell(2, 2), "הערה לשורה");
    EXPECT_EQ(cell(3, 0), "7");
    EXPECT_EQ(cell(3, 4), "1.5");
    EXPECT_EQ(cell(3, 6), "$");
    for (int col = 0; col < 8; ++col)
        EXPECT_EQ(cell(4, col), "");

    const CurrentDocument& d = state.Doc;
    EXPECT_EQ(d.lineCount, 3);
    EXPECT_EQ(d.header.type, 20);
    EXPECT_EQ(d.header.warehouse, 3);
    EXPECT_DOUBLE_EQ(d.header.totalBeforeDiscount, 1000);
    EXPECT_DOUBLE_EQ(d.header.discountPercent, 10);
    EXPECT_DOUBLE_EQ(d.header.foreignTotal, (1234.5 * 2 * 0.875 + 15) * 0.9);
    EXPECT_EQ(U(d.header.remarksLogical[0]), "הערה ראשונה");
    EXPECT_EQ(d.header.remarksLogical[1], "");
    EXPECT_EQ(U(d.header.remarksLogical[2]), "שלישית");
    // Visual texts keep the stored (reversed) order.
    EXPECT_EQ(U(d.header.customerVisual), "ןהכ השמ");
    EXPECT_EQ(U(d.header.remarksVisual[2]), "תישילש");
    EXPECT_EQ(d.lines[1].itemKey, "A100        ");
    EXPECT_EQ(U(d.lines[1].descriptionVisual), "ילמשח גרבמ");
    EXPECT_EQ(d.lines[2].itemKey, std::string(12, ' '));  // a text-only line keeps no key
    EXPECT_EQ(U(d.lines[2].descriptionVisual), "הרושל הרעה");
    EXPECT_EQ(d.lines[3].itemKey, "B200        ");
    // Amounts are filed under the line's own number.
    EXPECT_DOUBLE_EQ(d.amounts[1].price, 1234.5);
    EXPECT_DOUBLE_EQ(d.amounts[1].discount, 12.5);
    EXPECT_EQ(d.amounts[1].currency, 21);
    EXPECT_TRUE(d.amounts[2].isZero());
    EXPECT_TRUE(d.amounts[3].isZero());
    EXPECT_DOUBLE_EQ(d.amounts[7].quantity, 1.5);
    EXPECT_EQ(card->ProgressFill.Width(), 0);
}

TEST_F(ReadStockTest, WalksForwardAndBackwardThroughTheDocumentsOfTheType) {
    write({{"documents",
            {Doc(20, "1", "א", {Line("A", "a")}), Doc(21, "2", "ב", {Line("A", "a")}),
             Doc(20, "3", "ג", {Line("A", "a"), Line("B", "b")}), Filler("ISHP.FIX", 2),
             Doc(20, "4", "ד")}}});
    // Records: 1 filler, 2-4 doc 1, 5-7 doc 2 (type 21), 8-11 doc 3, 12-13 filler, 14-15 doc 4.
    EXPECT_EQ(read("First"), 4);
    EXPECT_EQ(box(card->txtReference1), "1");
    EXPECT_EQ(read("Next"), 11);
    EXPECT_EQ(box(card->txtReference1), "3");
    EXPECT_EQ(card->PubACTLocation, 8);
    EXPECT_EQ(read("Next"), 15);
    EXPECT_EQ(box(card->txtReference1), "4");
    EXPECT_EQ(state.Doc.lineCount, 0);

    // Past the last document: everything is emptied, the header stays.
    EXPECT_EQ(read("Next"), 16);
    EXPECT_EQ(box(card->txtReference1), "");
    EXPECT_EQ(box(card->txtCustomerName), "");
    EXPECT_EQ(card->DocLines.Rows(), 2);
    EXPECT_EQ(card->PubACTLocation, 15);
    EXPECT_EQ(card->PubPrevLocation, 14);
    EXPECT_EQ(state.Doc.header.type, 20);

    EXPECT_EQ(read("Last"), 15);
    EXPECT_EQ(card->PubACTLocation, 14);
    EXPECT_EQ(read("Previous"), 11);
    EXPECT_EQ(box(card->txtReference1), "3");
    EXPECT_EQ(read("Previous"), 4);
    EXPECT_EQ(box(card->txtReference1), "1");
    EXPECT_EQ(read("Previous"), 1);
    EXPECT_EQ(box(card->txtReference1), "");

    // The other type in the same file, and direction words in any case.
    card->PubACTLocation = 2;
    EXPECT_EQ(read("fIRST", 14), 7);
    EXPECT_EQ(box(card->txtReference1), "2");
    EXPECT_EQ(card->ProgressFill.Width(), 0);
}

TEST_F(ReadStockTest, NextFromTheLastRecordReadsOnlyThatRecord) {
    write({{"documents", {Doc(20, "1", "א"), Doc(20, "2", "ב")}}});
    // Records: 1 filler, 2-3 doc 1, 4-5 doc 2.
    card->PubACTLocation = 5;
    EXPECT_EQ(read("Next"), 6);
    EXPECT_EQ(card->PubACTLocation, 5);
    card->PubACTLocation = 500;  // far past the end: starts at the last record
    EXPECT_EQ(read("Next"), 6);
    card->PubACTLocation = 500;
    EXPECT_EQ(read("Previous"), 5);
    EXPECT_EQ(box(card->txtReference1), "2");
    EXPECT_TRUE(messages.shown().empty()) << lastMessage();
}

TEST_F(ReadStockTest, SearchesByHeaderFields) {
    json a = Doc(20, "100", "משה כהן");
    json b = Doc(20, "200", "Dana Levi");
    b["account"] = "ab12";
    json c = Doc(20, "300", "כהן ובניו");
    write({{"documents", {a, b, c}}});

    search("AccountKey", "AB12");
    EXPECT_GT(read("First"), 0);
    EXPECT_EQ(box(card->txtReference1), "200");
    search("AccountKey", "ab12 ");  // whole-text comparison: the space counts
    read("First");
    EXPECT_EQ(box(card->txtReference1), "");

    search("Reference1", "300");
    read("First");
    EXPECT_EQ(box(card->txtReference1), "300");

    search("CustomerName", "כהן");
    read("First");
    EXPECT_EQ(box(card->txtReference1), "100");
    read("Next");
    EXPECT_EQ(box(card->txtReference1), "300");
    read("Previous");
    EXPECT_EQ(box(card->txtReference1), "100");
    search("CustomerName", "levi");
    read("Last");
    EXPECT_EQ(box(card->txtReference1), "200");
    search("customername", "");  // an empty text is in every name
    read("Last");
    EXPECT_EQ(box(card->txtReference1), "300");

    search("NoSuchField", "zzz");  // an unknown field is no search
    read("First");
    EXPECT_EQ(box(card->txtReference1), "100");
    EXPECT_TRUE(messages.shown().empty()) << lastMessage();
}

TEST_F(ReadStockTest, ItemKeyAndDetailsSearchesStartTheGridAtTheFirstMatch) {
    json a = Doc(20, "1", "א", {Line("K1", "one"), Line("K2", "two")});
    json b = Doc(20, "2", "ב",
                 {Line("K1", "one"), {{"key", "K3"}, {"details", "RED"}, {"price", 5}},
                  Line("K4", "four")});
    b["account"] = "2002";
    write({{"documents", {a, b}}});

    card->PubSearchBy = "ItemKey";
    card->txtItemKey.setText("k2");
    EXPECT_GT(read("First"), 0);
    EXPECT_EQ(box(card->txtReference1), "1");
    ASSERT_EQ(card->DocLines.Rows(), 3);
    EXPECT_EQ(cell(1, 1), "K2");
    EXPECT_EQ(cell(1, 0), "2");
    EXPECT_EQ(state.Doc.lineCount, 1);
    EXPECT_EQ(state.Doc.lines[1].itemKey, "K2          ");
    EXPECT_TRUE(state.Doc.amounts[1].isZero());  // line 1 came before the match
    EXPECT_FALSE(state.Doc.amounts[2].isZero());

    // The account box narrows an item search to that account.
    card->txtItemKey.setText("K1");
    card->txtAccountKey.setText("2002");
    read("First");
    EXPECT_EQ(box(card->txtReference1), "2");
    EXPECT_EQ(card->DocLines.Rows(), 5);

    card->PubSearchBy = "Details";
    card->txtDetails.setText("re");
    card->txtAccountKey.setText("");
    read("First");
    EXPECT_EQ(box(card->txtReference1), "2");
    EXPECT_EQ(cell(1, 1), "K3");
    EXPECT_EQ(cell(2, 1), "K4");

    // Backward, a document without a match is passed over once, not forever.
    card->txtAccountKey.setText("");  // the document shown filled it in
    card->PubSearchBy = "ItemKey";
    card->txtItemKey.setText("K2");
    EXPECT_GT(read("Last"), 0);
    EXPECT_EQ(box(card->txtReference1), "1");
    card->txtItemKey.setText("none");
    EXPECT_EQ(read("Last"), 1);
    EXPECT_EQ(box(card->txtReference1), "");
}

TEST_F(ReadStockTest, FromDatePassesOverEarlierDocumentsInBothDirections) {
    json a = Doc(20, "1", "א", {Line("A", "a")});
    a["date"] = "2023-12-31";
    json b = Doc(20, "2", "ב", {Line("A", "a")});
    b["date"] = "2024-01-01";
    json c = Doc(20, "3", "ג", {Line("A", "a")});
    c["date"] = "2020-05-05";
    write({{"documents", {a, b, c}}});

    read("First", kDeliveryRow, "01/01/2024");
    EXPECT_EQ(box(card->txtReference1), "2");
    read("Last", kDeliveryRow, "1/1/24");
    EXPECT_EQ(box(card->txtReference1), "2");
    read("Previous", kDeliveryRow, "01/01/2024");
    EXPECT_EQ(box(card->txtReference1), "");
    read("Last", kDeliveryRow, "1/1/4");  // shorter than six characters: no filter
    EXPECT_EQ(box(card->txtReference1), "3");
    EXPECT_TRUE(messages.shown().empty()) << lastMessage();

    EXPECT_EQ(read("First", kDeliveryRow, "31-12-2023"), 0);
    EXPECT_EQ(messages.shown().size(), 1u);
    EXPECT_EQ(U(messages.shown().back().title), "שגיאה");
}

TEST_F(ReadStockTest, HiddenForeignAndKeylessLines) {
    write({{"documents",
            {Doc(20, "1", "א",
                 {Line("A", "shown"), Line("#", "hidden"),
                  {{"key", "F"}, {"docType", 21}, {"price", 9}, {"quantity", 9}, {"lineNumber", 3}},
                  {{"key", ""}, {"description", "no key"}, {"price", 7}, {"quantity", 2},
                   {"lineNumber", 4}}})}}});
    read("First");
    ASSERT_EQ(card->DocLines.Rows(), 4);
    EXPECT_EQ(cell(1, 2), "shown");
    EXPECT_EQ(cell(2, 2), "no key");
    EXPECT_EQ(cell(2, 4), "2");
    EXPECT_EQ(cell(2, 5), "7.00");
    EXPECT_EQ(state.Doc.lineCount, 2);
    EXPECT_EQ(U(state.Doc.lines[2].descriptionVisual), "no key");  // Latin text is stored as it reads
    EXPECT_EQ(state.Doc.lines[2].itemKey, std::string(12, ' '));
    EXPECT_TRUE(state.Doc.amounts[3].isZero());
    EXPECT_TRUE(state.Doc.amounts[4].isZero());
    EXPECT_DOUBLE_EQ(state.Doc.header.foreignTotal, 10);
}

TEST_F(ReadStockTest, MissingFilesAreReportedAndChangeNothing) {
    write({{"documents", {Doc(20, "1", "א", {Line("A", "a")})}}});
    read("First");
    ASSERT_EQ(box(card->txtReference1), "1");

    std::filesystem::remove(company->file("IBD.FIX"));
    int16_t quotations = 24;
    EXPECT_EQ(read("First", quotations), 0);
    EXPECT_EQ(read("First", 30), 0);  // a row without a file
    ASSERT_EQ(messages.shown().size(), 2u);
    for (const auto& shown : messages.shown()) {
        EXPECT_EQ(shown.icon, MsgIcon::Critical);
        EXPECT_EQ(shown.buttons, MsgButtons::Ok);
        EXPECT_EQ(U(shown.title), "שגיאה");
        EXPECT_EQ(U(shown.text), "קבצי מסמכים לא נמצאו");
    }
    EXPECT_EQ(box(card->txtReference1), "1");
    EXPECT_EQ(card->DocLines.Rows(), 3);
    EXPECT_EQ(state.Doc.lineCount, 1);
    EXPECT_EQ(card->PubACTLocation, 2);

    // Names are matched without regard to case, and "/" works like "\".
    std::filesystem::rename(company->file("ISHP.FIX"), company->file("ishp.fix"));
    int16_t row = kDeliveryRow;
    std::string first = "First", from;
    EXPECT_GT(card->ReadStock(company->compPath() + "/", row, card->PubSearchBy,
                              card->PubSearchValue, first, from),
              0);
    EXPECT_EQ(messages.shown().size(), 2u);
}

TEST_F(ReadStockTest, RunTimeErrorsAreReportedWithResultZero) {
    std::vector<json> many;
    for (int i = 0; i < 41; ++i)
        many.push_back(Line("K" + std::to_string(i), "x"));
    json nan = Doc(20, "3", "ג", {{{"key", "N"}, {"price", {{"hex", "000000000000F87F"}}}}});
    json badNumber = Doc(20, "4", "ד", {{{"key", "Z"}, {"lineNumber", 41}}});
    json zeroNumber = Doc(20, "5", "ה", {{{"key", "Z"}, {"lineNumber", 0}}});
    json huge = Doc(20, "6", "ו", {{{"key", "H"}, {"price", 1e300}, {"quantity", 1e300}}});
    write({{"documents", {Doc(20, "1", "א", many), nan, badNumber, zeroNumber, huge}}});

    struct Case {
        std::string name;
        std::function<int32_t()> run;
    } cases[] = {
        {"41 lines", [&] { return read("First"); }},
        {"NaN price", [&] { search("Reference1", "3"); return read("First"); }},
        {"line 41", [&] { search("Reference1", "4"); return read("First"); }},
        {"line 0", [&] { search("Reference1", "5"); return read("First"); }},
        {"overflow", [&] { search("Reference1", "6"); return read("First"); }},
        {"row -1", [&] { return read("First", -1); }},
        {"row 42", [&] { return read("First", 42); }},
        {"record 0", [&] { card->PubACTLocation = -1; return read("Next"); }},
        {"direction", [&] { return read("Sideways"); }},
        {"null search", [&] { card->PubSearchBy = "AccountKey"; card->PubSearchValue = Variant::Null(); return read("First"); }},
    };
    for (auto& c : cases) {
        size_t before = messages.shown().size();
        EXPECT_EQ(c.run(), 0) << c.name;
        ASSERT_EQ(messages.shown().size(), before + 1) << c.name;
        EXPECT_EQ(U(messages.shown().back().title), "שגיאה") << c.name;
        EXPECT_FALSE(messages.shown().back().text.empty()) << c.name;
        EXPECT_EQ(card->ProgressFill.Width(), 0) << c.name;
    }
    EXPECT_NE(lastMessage().find("Null"), std::string::npos);
}

TEST_F(ReadStockTest, DamagedFilesNeverCrashTheReader) {
    json runsPast = Doc(20, "1", "א", {Line("A", "a"), Line("B", "b")});
    runsPast["lineCount"] = 200;
    write({{"documents", {runsPast}}, {"damage", {{{"file", "ISHP.FIX"}, {"truncate", 100}}}}});
    // Records: 1 filler, 2 header, 3 continuation, 4 line A, 5 line B cut short.
    EXPECT_EQ(read("First"), 203);
    EXPECT_EQ(box(card->txtReference1), "1");
    EXPECT_EQ(card->DocLines.Rows(), 3);  // only the whole line record
    EXPECT_EQ(read("Last"), 203);
    EXPECT_EQ(card->PubACTLocation, 2);

    // A header as the very last record: its continuation is not there yet.
    write({{"documents", {Doc(20, "1", "א")}},
           {"damage", {{{"file", "ISHP.FIX"}, {"length", 2 * 170}}}}});
    EXPECT_EQ(read("First"), 4);
    EXPECT_EQ(box(card->txtReference1), "");

    // An empty file holds no document.
    write({{"documents", json::array()}, {"damage", {{{"file", "ISHP.FIX"}, {"length", 0}}}}});
    EXPECT_EQ(read("First"), 2);
    EXPECT_EQ(read("Last"), 0);
    EXPECT_EQ(box(card->txtReference1), "");
    card->PubACTLocation = 7;
    EXPECT_EQ(read("Next"), 1);
    EXPECT_EQ(read("Previous"), 0);
    EXPECT_TRUE(messages.shown().empty());
}

TEST_F(ReadStockTest, ProgressMovesDuringALongScanAndEndsEmpty) {
    std::vector<json> docs{Filler("IMV.FIX", 3000), Doc(1, "9", "א")};
    write({{"documents", docs}});
    int32_t widest = 0;
    int changes = 0;
    card->ProgressFill.changed.connect([&] {
        widest = std::max(widest, card->ProgressFill.Width());
        ++changes;
    });
    EXPECT_EQ(read("Last", kInvoiceRow), 3003);
    EXPECT_EQ(read("First", kInvoiceRow), 3003);
    EXPECT_EQ(box(card->txtReference1), "9");
    EXPECT_GT(widest, card->ProgressFrame.Width() / 2);
    EXPECT_LE(widest, card->ProgressFrame.Width());
    EXPECT_LE(changes, 2 * (card->ProgressFrame.Width() + 2));
    EXPECT_EQ(card->ProgressFill.Width(), 0);
}

} // namespace
} // namespace dovrel
