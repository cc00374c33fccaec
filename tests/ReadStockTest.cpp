// The document reader over companies written by the sample-company writer.

#include "fixfiles/ReadStock.h"
#include "TestCompany.h"
#include "control/Card.h"
#include "fixfiles/DocTypes.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <array>
#include <chrono>
#include <filesystem>
#include <fstream>
#include <optional>
#include <tuple>

namespace dovrel {
namespace {

using nlohmann::json;
using test::Doc;
using test::Filler;
using test::Line;
using test::U;
using test::W;
using Texts = std::vector<std::string>;

constexpr int16_t kInvoiceRow = 0; // type 1, IMV.FIX

class ReadStockTest : public test::CardFixture {
protected:
    void search(const std::string& by, const std::string& value) {
        card->PubSearchBy = by;
        card->PubSearchValue = Variant(W(value));
    }
    // Reads and checks what it returns, the reference it shows and, unless -1, the record it
    // stands on.
    void expectRead(const std::string& direction, int32_t result, const std::string& reference,
                    int32_t at = -1) {
        EXPECT_EQ(read(direction), result) << direction;
        EXPECT_EQ(box(card->txtReference1), reference) << direction;
        EXPECT_TRUE(at == -1 || card->PubACTLocation == at)
            << direction << " at " << card->PubACTLocation;
    }
    // Searches the lines by item key or details, in the account given or in all.
    int32_t readLines(const std::string& by, const std::string& text, const std::string& account,
                      const std::string& direction = "First") {
        card->PubSearchBy = by;
        (by == "Details" ? card->txtDetails : card->txtItemKey).setText(text);
        card->txtAccountKey.setText(account);
        return read(direction);
    }
};

TEST_F(ReadStockTest, LoadsTheDocumentIntoBoxesGridAndCurrentDocument) {
    write(json::parse(R"({"documents": [{"file": "ISHP.FIX", "filler": 8},
        {"type": 20, "reference": "4711", "customer": "משה כהן", "account": "1001",
         "address1": "הרצל 5", "address2": "תל אביב", "remarks": ["הערה ראשונה", "", "שלישית"],
         "discountPercent": 10, "totalBeforeDiscount": 1000, "totalWithVat": 1053,
         "warehouse": 3, "date": "2024-02-09",
         "lines": [{"key": "A100", "description": "מברג חשמלי", "details": "X1", "price": 1234.5,
                    "quantity": 2, "discount": 12.5, "currency": 21},
                   {"key": "*", "description": "הערה לשורה"},
                   {"key": "B200", "description": "Drill bits", "price": 10, "quantity": 1.5,
                    "currency": 1, "lineNumber": 7}]}]})"));

    card->PubACTLocation = 9;
    EXPECT_EQ(read("Next"), 14);
    EXPECT_EQ(lastMessage(), "");
    EXPECT_EQ(std::tuple(card->PubACTLocation, card->PubPrevLocation), std::tuple(10, 10));

    Texts boxes;
    for (const TextBox* b : {&card->txtAccountKey, &card->txtReference1, &card->txtCustomerName,
                             &card->txtDate, &card->txtAddress1, &card->txtAddress2,
                             &card->txtTotalVat, &card->txtVatValue, &card->txtTotal1})
        boxes.push_back(box(*b));
    // In the first address the digits move to the front.
    EXPECT_EQ(boxes, (Texts{"1001", "4711", "משה כהן", "09/02/2024", "5 הרצל", "תל אביב", "900.00",
                            "153.00", "1,053.00"}));

    ASSERT_EQ(card->DocLines.Rows(), 5); // heading, three lines, the empty row
    // 1234.5 * 2 * 0.875, the half rounded up.
    EXPECT_EQ(gridRow(1),
              (Texts{"1", "A100", "מברג חשמלי", "X1", "2", "1,234.50", "ש", "2,160.38"}));
    EXPECT_EQ(gridRow(2), (Texts{"2", "", "הערה לשורה", "", "", "", "", ""}));
    EXPECT_EQ(gridRow(3), (Texts{"7", "B200", "Drill bits", "", "1.5", "10.00", "$", "15.00"}));
    EXPECT_EQ(gridRow(4), Texts(8, ""));

    const CurrentDocument& d = state.Doc;
    EXPECT_EQ(std::tuple(d.lineCount, d.header.warehouse, d.header.totalBeforeDiscount,
                         d.header.discountPercent),
              std::tuple(3, 3, 1000.0, 10.0));
    EXPECT_DOUBLE_EQ(d.header.foreignTotal, (1234.5 * 2 * 0.875 + 15) * 0.9);
    const auto& remarks = d.header.remarksLogical;
    EXPECT_EQ(U(remarks[0] + "|" + remarks[1] + "|" + remarks[2]), "הערה ראשונה||שלישית");
    // Visual texts keep the stored (reversed) order; a text-only line keeps no key.
    EXPECT_EQ(U(d.header.customerVisual + "|" + d.header.remarksVisual[2]), "ןהכ השמ|תישילש");
    EXPECT_EQ(U(d.lines[1].descriptionVisual + "|" + d.lines[2].descriptionVisual),
              "ילמשח גרבמ|הרושל הרעה");
    EXPECT_EQ(d.lines[1].itemKey + "|" + d.lines[2].itemKey + "|" + d.lines[3].itemKey,
              "A100        |            |B200        ");
    // Amounts are filed under the line's own number.
    EXPECT_EQ(std::tuple(d.amounts[1].price, d.amounts[1].discount, d.amounts[1].currency,
                         d.amounts[7].quantity),
              std::tuple(1234.5, 12.5, 21, 1.5));
    EXPECT_TRUE(d.amounts[2].isZero() && d.amounts[3].isZero());

    // The control keeps the document it shows, each text as stored and as shown.
    ASSERT_TRUE(card->document());
    const Document& doc = *card->document();
    EXPECT_EQ(
        std::tuple(doc.type, doc.record, doc.file, doc.lines.size(), doc.lines[1].textOnly,
                   doc.lines[2].lineNumber, doc.totals.beforeVat, doc.totals.withVat),
        std::tuple(20, 10, Path(company->file("ISHP.FIX").string()), 3u, true, 7, 900.0, 1053.0));
    EXPECT_EQ(U(doc.customer.stored + "|" + doc.customer.logical + "|" + doc.address1.logical),
              "ןהכ השמ|משה כהן|5 הרצל");
    EXPECT_EQ(U(doc.lines[0].description.logical + "|" + doc.lines[0].currencyName),
              "מברג חשמלי|ש");
    EXPECT_EQ(doc.totals.foreign, d.header.foreignTotal);
}

// The walk alone changes neither the boxes nor the grid and reports nothing;
// it says what it found, or why there is nothing.
TEST_F(ReadStockTest, TheWalkYieldsTheDocumentOrWhyThereIsNone) {
    write({{"documents", {Doc(20, "1", "א", {Line("A", "a")})}}});
    auto walk = [&](const std::string& direction, int16_t row = kDeliveryRow) {
        StockContext context{state.DocTypes, state.DocFiles, state.Company, state.Doc, messages};
        return WalkStock(*card, context, Path(company->path().string()), row, "",
                         Variant(std::string()), direction, "");
    };
    card->txtReference1.setText("before");
    StockRead found = walk("First");
    ASSERT_EQ(found.outcome, StockRead::Outcome::Found);
    EXPECT_EQ(std::tuple(found.stoppedAt, U(found.document->reference.logical),
                         box(card->txtReference1), card->DocLines.Rows(), card->document()),
              std::tuple(4, "1", "before", 2, std::nullopt));

    StockRead none = walk("Next");
    EXPECT_EQ(std::tuple(none.outcome, none.stoppedAt, none.document.has_value()),
              std::tuple(StockRead::Outcome::NotFound, 5, false));
    EXPECT_EQ(walk("First", 30).outcome, StockRead::Outcome::FileMissing); // a row without a file
    StockRead failed = walk("Sideways");
    EXPECT_EQ(std::tuple(failed.outcome, failed.error.str()),
              std::tuple(StockRead::Outcome::Failed, "Unknown direction \"Sideways\""));
    EXPECT_EQ(messages.shown().size(), 0u);

    // Through the control: a read that finds nothing leaves it no document.
    read("First");
    ASSERT_TRUE(card->document());
    read("Next");
    EXPECT_FALSE(card->document());
}

// The company's own currency names show from the first document on. Its
// adf.fix is read once, and again when the file changes; when it is missing
// or short the document still shows, with the names it had.
TEST_F(ReadStockTest, TheCompanyRecordIsReadWhenShownAndAgainWhenItChanges) {
    json currencyLine = {{"key", "A"}, {"price", 1}, {"quantity", 1}, {"currency", 10}};
    auto described = [&](const std::string& currency) {
        return json{{"company", {{"currencies", {currency}}}},
                    {"documents", {Doc(20, "1", "א", {currencyLine})}}};
    };
    write(described("יורו"));
    auto currency = [&] {
        read("First");
        return cell(1, 6) + lastMessage();
    };
    EXPECT_EQ(currency(), "יורו");

    // Another adf.fix written over the first in place.
    test::TempDir other;
    sample::WriteCompany(described("דולר"), other.path());
    std::filesystem::path adf = company->file("adf.fix");
    auto stamp = std::filesystem::last_write_time(adf);
    std::ofstream(adf, std::ios::binary | std::ios::in) << test::ReadAll(other.path() / "adf.fix");
    // Unchanged as far as the file system tells, it is not read again...
    std::filesystem::last_write_time(adf, stamp);
    EXPECT_EQ(currency(), "יורו");
    // ...and once its time moves it is.
    std::filesystem::last_write_time(adf, stamp + std::chrono::seconds(2));
    EXPECT_EQ(currency(), "דולר");

    std::filesystem::resize_file(adf, 100);
    EXPECT_EQ(currency(), "דולר");
    std::filesystem::remove(adf);
    EXPECT_EQ(currency(), "דולר");
    EXPECT_EQ(box(card->txtReference1), "1");
}

TEST_F(ReadStockTest, WalksForwardAndBackwardThroughTheDocumentsOfTheType) {
    write({{"documents",
            {Doc(20, "1", "א", {Line("A", "a")}), Doc(21, "2", "ב", {Line("A", "a")}),
             Doc(20, "3", "ג", {Line("A", "a"), Line("B", "b")}), Filler("ISHP.FIX", 2),
             Doc(20, "4", "ד")}}});
    // Records: 1 filler, 2-4 doc 1, 5-7 doc 2 (type 21), 8-11 doc 3, 12-13 filler, 14-15 doc 4.
    expectRead("First", 4, "1");
    expectRead("Next", 11, "3", 8);
    expectRead("Next", 15, "4");
    EXPECT_EQ(state.Doc.lineCount, 0);

    // Past the last document: everything is emptied, the header stays.
    expectRead("Next", 16, "", 15);
    EXPECT_EQ(std::tuple(box(card->txtCustomerName), card->DocLines.Rows(), card->PubPrevLocation,
                         state.Doc.header.type),
              std::tuple("", 2, 14, 20));
    // Next from the last record reads only that record; far past the end starts there.
    expectRead("Next", 16, "", 15);
    card->PubACTLocation = 500;
    expectRead("Next", 16, "");
    card->PubACTLocation = 500;
    expectRead("Previous", 15, "4");

    expectRead("Last", 15, "4", 14);
    expectRead("Previous", 11, "3");
    expectRead("Previous", 4, "1");
    expectRead("Previous", 1, "");

    // The other type in the same file, and direction words in any case.
    card->PubACTLocation = 2;
    EXPECT_EQ(read("fIRST", 14), 7);
    EXPECT_EQ(box(card->txtReference1) + lastMessage(), "2");
}

TEST_F(ReadStockTest, SearchesByHeaderFieldsAndFromDate) {
    json docs = {Doc(20, "100", "משה כהן"), Doc(20, "200", "Dana Levi"),
                 Doc(20, "300", "כהן ובניו")};
    docs[1]["account"] = "ab12";
    for (int i = 0; i < 3; ++i)
        docs[i]["date"] = std::array{"2023-12-31", "2024-01-01", "2020-05-05"}[i];
    write({{"documents", docs}});

    const std::tuple<const char*, const char*, const char*, const char*, const char*> cases[] = {
        {"AccountKey", "AB12", "First", "", "200"},
        {"AccountKey", "ab12 ", "First", "", ""}, // whole-text comparison: the space counts
        {"Reference1", "300", "First", "", "300"},
        {"CustomerName", "כהן", "First", "", "100"},
        {"CustomerName", "כהן", "Next", "", "300"},
        {"CustomerName", "כהן", "Previous", "", "100"},
        {"CustomerName", "levi", "Last", "", "200"},
        {"customername", "", "Last", "", "300"},    // an empty text is in every name
        {"NoSuchField", "zzz", "First", "", "100"}, // an unknown field is no search
        // From a date, both ways; shorter than six characters is no filter.
        {"", "", "First", "01/01/2024", "200"},
        {"", "", "Last", "1/1/24", "200"},
        {"", "", "Previous", "01/01/2024", ""},
        {"", "", "Last", "1/1/4", "300"}};
    for (const auto& [by, value, direction, from, reference] : cases) {
        search(by, value);
        read(direction, kDeliveryRow, *from ? from : "01/01/1980");
        EXPECT_EQ(box(card->txtReference1), reference) << by << " " << value << " " << direction;
    }
    EXPECT_EQ(lastMessage(), "");

    EXPECT_EQ(read("First", kDeliveryRow, "31-12-2023"), 0);
    EXPECT_EQ(messages.shown().size(), 1u);
    EXPECT_EQ(U(messages.shown().back().title), "שגיאה");
}

// A document found by one of its lines is shown whole: a grid that started at
// the matching line hid the lines before it and printed them nowhere.
TEST_F(ReadStockTest, ItemKeyAndDetailsSearchesShowTheWholeDocumentFound) {
    json b = Doc(
        20, "2", "ב",
        {Line("K1", "one"), {{"key", "K3"}, {"details", "RED"}, {"price", 5}}, Line("K4", "four")});
    b["account"] = "2002";
    write({{"documents", {Doc(20, "1", "א", {Line("K1", "one"), Line("K2", "two")}), b}}});

    EXPECT_GT(readLines("ItemKey", "k2", ""), 0);
    EXPECT_EQ(box(card->txtReference1), "1");
    ASSERT_EQ(card->DocLines.Rows(), 4);
    EXPECT_EQ(gridRow(1)[0] + gridRow(1)[1] + gridRow(2)[0] + gridRow(2)[1], "1K12K2");
    EXPECT_EQ(state.Doc.lineCount, 2);
    EXPECT_EQ(state.Doc.lines[1].itemKey, "K1          ");
    EXPECT_FALSE(state.Doc.amounts[1].isZero());
    EXPECT_FALSE(state.Doc.amounts[2].isZero());

    // The account box narrows an item search to that account.
    readLines("ItemKey", "K1", "2002");
    EXPECT_EQ(box(card->txtReference1), "2");
    EXPECT_EQ(card->DocLines.Rows(), 5);

    readLines("Details", "re", "");
    EXPECT_EQ(box(card->txtReference1) + cell(1, 1) + cell(2, 1), "2K1K3");

    // Backward, a document without a match is passed over once, not forever (the account box
    // is emptied: the document shown filled it in).
    EXPECT_GT(readLines("ItemKey", "K2", "", "Last"), 0);
    EXPECT_EQ(box(card->txtReference1), "1");
    EXPECT_EQ(readLines("ItemKey", "none", "", "Last"), 1);
    EXPECT_EQ(box(card->txtReference1), "");
}

TEST_F(ReadStockTest, HiddenForeignAndKeylessLines) {
    write(json::parse(R"({"documents": [{"type": 20, "lines": [
        {"key": "A", "description": "shown", "price": 10, "quantity": 1},
        {"key": "#", "description": "hidden", "price": 10, "quantity": 1},
        {"key": "F", "docType": 21, "price": 9, "quantity": 9, "lineNumber": 3},
        {"key": "", "description": "no key", "price": 7, "quantity": 2, "lineNumber": 4}]}]})"));
    read("First");
    ASSERT_EQ(card->DocLines.Rows(), 4);
    EXPECT_EQ(cell(1, 2), "shown");
    EXPECT_EQ(gridRow(2), (Texts{"4", "", "no key", "", "2", "7.00", "ש", "14.00"}));
    EXPECT_EQ(state.Doc.lineCount, 2);
    // Latin text is stored as it reads.
    EXPECT_EQ(U(state.Doc.lines[2].descriptionVisual), "no key");
    EXPECT_EQ(state.Doc.lines[2].itemKey, std::string(12, ' '));
    EXPECT_TRUE(state.Doc.amounts[3].isZero() && state.Doc.amounts[4].isZero());
    EXPECT_DOUBLE_EQ(state.Doc.header.foreignTotal, 10);
}

TEST_F(ReadStockTest, MissingFilesAreReportedAndChangeNothing) {
    write({{"documents", {Doc(20, "1", "א", {Line("A", "a")})}}});
    read("First");
    ASSERT_EQ(box(card->txtReference1), "1");

    std::filesystem::remove(company->file("IBD.FIX"));
    EXPECT_EQ(read("First", 24), 0); // quotations
    EXPECT_EQ(read("First", 30), 0); // a row without a file
    ASSERT_EQ(messages.shown().size(), 2u);
    for (const auto& shown : messages.shown())
        EXPECT_EQ(std::tuple(shown.icon, shown.buttons, U(shown.title), U(shown.text)),
                  std::tuple(MsgIcon::Critical, MsgButtons::Ok, "שגיאה", "קבצי מסמכים לא נמצאו"));
    EXPECT_EQ(std::tuple(box(card->txtReference1), card->DocLines.Rows(), state.Doc.lineCount,
                         card->PubACTLocation),
              std::tuple("1", 3, 1, 2));

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

    size_t reported = 0;
    auto expectReported = [&](int32_t result, const std::string& what) {
        EXPECT_EQ(result, 0) << what;
        ASSERT_EQ(messages.shown().size(), ++reported) << what;
        EXPECT_EQ(U(messages.shown().back().title), "שגיאה") << what;
        EXPECT_FALSE(messages.shown().back().text.empty()) << what;
        EXPECT_EQ(card->ProgressFill.Width(), 0) << what;
    };
    expectReported(read("First"), "41 lines");
    EXPECT_NE(lastMessage().find("more than 40 lines"), std::string::npos);
    // A NaN price, line numbers 41 and 0, an amount too large.
    for (const char* reference : {"3", "4", "5", "6"}) {
        search("Reference1", reference);
        expectReported(read("First"), reference);
    }
    expectReported(read("First", -1), "row -1");
    expectReported(read("First", 42), "row 42");
    card->PubACTLocation = -1;
    expectReported(read("Next"), "record 0");
    expectReported(read("Sideways"), "direction");
    card->PubSearchBy = "AccountKey";
    card->PubSearchValue = Variant::Null();
    expectReported(read("First"), "null search");
    EXPECT_NE(lastMessage().find("Null"), std::string::npos);
}

TEST_F(ReadStockTest, DamagedFilesNeverCrashTheReader) {
    json runsPast = Doc(20, "1", "א", {Line("A", "a"), Line("B", "b")});
    runsPast["lineCount"] = 200;
    write({{"documents", {runsPast}}, {"damage", {{{"file", "ISHP.FIX"}, {"truncate", 100}}}}});
    // Records: 1 filler, 2 header, 3 continuation, 4 line A, 5 line B cut short.
    expectRead("First", 203, "1");
    EXPECT_EQ(card->DocLines.Rows(), 3); // only the whole line record
    expectRead("Last", 203, "1", 2);

    // A header as the very last record: its continuation is not there yet.
    write({{"documents", {Doc(20, "1", "א")}},
           {"damage", {{{"file", "ISHP.FIX"}, {"length", 2 * 170}}}}});
    expectRead("First", 4, "");

    // An empty file holds no document.
    write({{"documents", json::array()}, {"damage", {{{"file", "ISHP.FIX"}, {"length", 0}}}}});
    expectRead("First", 2, "");
    expectRead("Last", 0, "");
    card->PubACTLocation = 7;
    expectRead("Next", 1, "");
    expectRead("Previous", 0, "");
    EXPECT_EQ(lastMessage(), "");
}

TEST_F(ReadStockTest, ProgressMovesDuringALongScanAndEndsEmpty) {
    write({{"documents", {Filler("IMV.FIX", 3000), Doc(1, "9", "א")}}});
    int32_t widest = 0;
    int changes = 0;
    Connection watching = card->ProgressFill.changed.connect([&] {
        widest = std::max(widest, card->ProgressFill.Width());
        ++changes;
    });
    EXPECT_EQ(read("Last", kInvoiceRow), 3003);
    EXPECT_EQ(read("First", kInvoiceRow), 3003);
    EXPECT_EQ(box(card->txtReference1), "9");
    EXPECT_TRUE(widest > card->ProgressFrame.Width() / 2 && widest <= card->ProgressFrame.Width())
        << widest;
    EXPECT_LE(changes, 2 * (card->ProgressFrame.Width() + 2));
    EXPECT_EQ(card->ProgressFill.Width(), 0);
}

} // namespace
} // namespace dovrel
