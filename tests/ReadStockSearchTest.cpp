// Searches that the document reader answers mostly without decoding: Hebrew
// and mixed fields in visual order, case, hidden-line keys, and the grid of a
// document found after many rejected ones.

#include "TestCompany.h"
#include "control/Card.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

namespace dovrel {
namespace {

using nlohmann::json;
using test::U;
using test::W;

constexpr int16_t kDeliveryRow = 13; // type 20, ISHP.FIX

json Doc(const std::string& reference, const std::string& customer, json lines) {
    return {{"type", 20}, {"reference", reference}, {"customer", customer}, {"lines", lines}};
}

class ReadStockSearchTest : public ::testing::Test {
protected:
    void SetUp() override { card = std::make_unique<Card>(messages, state); }

    // The reference of the document found, or "" when none was.
    std::string find(const std::string& by, const std::string& value,
                     const std::string& direction = "First") {
        card->PubSearchBy = by;
        card->PubSearchValue = Variant(W(value));
        card->txtItemKey.setText(W(value));
        card->txtDetails.setText(W(value));
        card->txtAccountKey.setText("");
        int16_t row = kDeliveryRow;
        std::string start = direction, from;
        card->ReadStock(company->compPath(), row, card->PubSearchBy, card->PubSearchValue, start,
                        from);
        EXPECT_TRUE(messages.shown().empty());
        return U(card->txtReference1.Text());
    }

    ModuleState state;
    RecordedMessages messages;
    std::unique_ptr<Card> card;
    std::unique_ptr<test::TestCompany> company;
};

TEST_F(ReadStockSearchTest, FindsHebrewAndMixedTextsWhateverTheirStoredOrderAndCase) {
    json lines = {{{"key", "מק-12a"}, {"details", "כחול 2"}, {"description", "x"}}};
    json hidden = {{{"key", {{"hex", "20 20 23"}}}, {"details", "ZZ"}},
                   {{"key", "##"}, {"details", "Q1"}},
                   {{"key", "#a"}, {"details", "Q2"}}};
    company = std::make_unique<test::TestCompany>(json{
        {"documents", {Doc("1", "משה כהן (ירושלים) Ltd", lines), Doc("2", "Levi & Sons", hidden)}}}
                                                      .dump());

    // Decoded, the mixed name reads "Ltd משה כהן )ירושלים(".
    EXPECT_EQ(find("CustomerName", "כהן )ירושלים("), "1");
    EXPECT_EQ(find("CustomerName", "ltd"), "1");
    EXPECT_EQ(find("CustomerName", "LEVI &"), "2");
    EXPECT_EQ(find("CustomerName", "כהן לוי"), "");
    EXPECT_EQ(find("CustomerName", "כהן", "Last"), "1");

    // And the key "12a מק-", the details "2 כחול".
    EXPECT_EQ(find("ItemKey", "12A מק-"), "1");
    EXPECT_EQ(find("ItemKey", "12 מק-"), "");
    EXPECT_EQ(find("ItemKey", "12A מק-", "Last"), "1");
    EXPECT_EQ(find("Details", "2 כח"), "1");
    EXPECT_EQ(find("Details", "3 כח"), "");

    // A key of only "#" between spaces hides its line; "##" and "#a" do not.
    EXPECT_EQ(find("Details", "ZZ"), "");
    EXPECT_EQ(find("ItemKey", "##"), "2");
    EXPECT_EQ(find("ItemKey", "#A"), "2");
    EXPECT_EQ(U(card->DocLines.TextMatrix(1, 1)), "#a");
}

TEST_F(ReadStockSearchTest, TheGridShowsOnlyTheDocumentFoundAfterRejectedOnes) {
    json many = json::array();
    for (int i = 0; i < 30; ++i)
        many.push_back(Doc(std::to_string(i), "אבי",
                           {{{"key", "A" + std::to_string(i)}, {"description", "d"}},
                            {{"key", "B"}, {"description", "e"}}}));
    company = std::make_unique<test::TestCompany>(json{{"documents", many}}.dump());

    EXPECT_EQ(find("ItemKey", "A17"), "17");
    ASSERT_EQ(card->DocLines.Rows(), 4); // heading, A17, B, the empty row
    EXPECT_EQ(U(card->DocLines.TextMatrix(1, 1)), "A17");
    EXPECT_EQ(U(card->DocLines.TextMatrix(2, 1)), "B");
    EXPECT_EQ(state.Doc.lineCount, 2);

    EXPECT_EQ(find("ItemKey", "A99"), "");
    EXPECT_EQ(card->DocLines.Rows(), 2); // heading and the empty row
    EXPECT_EQ(state.Doc.lineCount, 0);
}

} // namespace
} // namespace dovrel
