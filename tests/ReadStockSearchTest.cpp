// Searches that the document reader answers mostly without decoding: Hebrew
// and mixed fields in visual order, case, hidden-line keys, and the grid of a
// document found after many rejected ones.

#include "TestCompany.h"
#include "control/Card.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <tuple>

namespace dovrel {
namespace {

using nlohmann::json;
using test::Doc;
using test::W;

class ReadStockSearchTest : public test::CardFixture {
protected:
    // The reference of the document found, or "" when none was.
    std::string find(const std::string& by, const std::string& value,
                     const std::string& direction = "First") {
        card->PubSearchBy = by;
        card->PubSearchValue = Variant(W(value));
        card->txtItemKey.setText(W(value));
        card->txtDetails.setText(W(value));
        card->txtAccountKey.setText("");
        read(direction, kDeliveryRow, "");
        EXPECT_TRUE(messages.shown().empty());
        return box(card->txtReference1);
    }
};

TEST_F(ReadStockSearchTest, FindsHebrewAndMixedTextsWhateverTheirStoredOrderAndCase) {
    json lines = {{{"key", "מק-12a"}, {"details", "כחול 2"}, {"description", "x"}}};
    json hidden = {{{"key", {{"hex", "20 20 23"}}}, {"details", "ZZ"}},
                   {{"key", "##"}, {"details", "Q1"}},
                   {{"key", "#a"}, {"details", "Q2"}}};
    write({{"documents",
            {Doc(20, "1", "משה כהן (ירושלים) Ltd", lines), Doc(20, "2", "Levi & Sons", hidden)}}});

    // Decoded, the mixed name reads "Ltd משה כהן )ירושלים(", the key "12a מק-",
    // the details "2 כחול". A key of only "#" between spaces hides its line;
    // "##" and "#a" do not.
    const std::tuple<const char*, const char*, const char*, const char*> cases[] = {
        {"CustomerName", "כהן )ירושלים(", "First", "1"},
        {"CustomerName", "ltd", "First", "1"},
        {"CustomerName", "LEVI &", "First", "2"},
        {"CustomerName", "כהן לוי", "First", ""},
        {"CustomerName", "כהן", "Last", "1"},
        {"ItemKey", "12A מק-", "First", "1"},
        {"ItemKey", "12 מק-", "First", ""},
        {"ItemKey", "12A מק-", "Last", "1"},
        {"Details", "2 כח", "First", "1"},
        {"Details", "3 כח", "First", ""},
        {"Details", "ZZ", "First", ""},
        {"ItemKey", "##", "First", "2"},
        {"ItemKey", "#A", "First", "2"}};
    for (const auto& [by, value, direction, reference] : cases)
        EXPECT_EQ(find(by, value, direction), reference) << by << " " << value << " " << direction;
    EXPECT_EQ(cell(1, 1) + "|" + cell(2, 1), "##|#a"); // the whole document, hidden line aside
}

TEST_F(ReadStockSearchTest, TheGridShowsOnlyTheDocumentFoundAfterRejectedOnes) {
    json many = json::array();
    for (int i = 0; i < 30; ++i)
        many.push_back(Doc(20, std::to_string(i), "אבי",
                           {{{"key", "A" + std::to_string(i)}, {"description", "d"}},
                            {{"key", "B"}, {"description", "e"}}}));
    write({{"documents", many}});

    EXPECT_EQ(find("ItemKey", "A17"), "17");
    ASSERT_EQ(card->DocLines.Rows(), 4); // heading, A17, B, the empty row
    EXPECT_EQ(cell(1, 1) + "|" + cell(2, 1), "A17|B");
    EXPECT_EQ(state.Doc.lineCount, 2);

    EXPECT_EQ(find("ItemKey", "A99"), "");
    // Only the heading and the empty row.
    EXPECT_EQ(std::tuple(card->DocLines.Rows(), state.Doc.lineCount), std::tuple(2, 0));
}

} // namespace
} // namespace dovrel
