// The control's ReadingOrder option: what the boxes and the grid show, what
// the searches compare, what the pages and the accounts lookup still take,
// and the print button with nothing shown.

#include "TestCompany.h"
#include "control/Card.h"
#include "control/CardInterface.h"
#include "platform/Error.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <cstdlib>

namespace dovrel {
namespace {

using nlohmann::json;
using test::U;
using test::W;

class ReadingOrderCardTest : public ::testing::Test, protected test::CardDesk<> {
protected:
    void SetUp() override {
        setenv("TMPDIR", temp.str().c_str(), 1);
        json line = test::Line("מק-12a", "דיבלים 8 מ\"מ", 12.9, 10);
        line["details"] = "שחור 2";
        json doc = test::Doc(20, "4105", "כהן (ירושלים) 45", {line});
        doc["address1"] = "רח' הרצל 45";
        json other = test::Doc(20, "4106", "לוי", {test::Line("A1", "x")});
        company = std::make_unique<test::TestCompany>(json{{"documents", {doc, other}}}.dump());
        card = std::make_unique<Card>(services, state);
        card->UserControl_InitProperties(nullptr);
        int16_t type = 20;
        int32_t start = 2;
        ASSERT_EQ(card->ShowDoc(company->compPath(), type, start), 0);
    }
    void TearDown() override { unsetenv("TMPDIR"); }

    // The reference of the document a search finds, "" for none.
    std::string search(const char* label, TextBox& box, const std::string& text) {
        card->txtAccountKey.setText("");
        box.setText(W(text));
        card->Click(label);
        card->DblClick(label);
        return U(card->txtReference1.Text());
    }
    std::string page() {
        std::string path = temp.str() + "/page.htm";
        int16_t mode = 0;
        card->CreateHTML(path, mode);
        return test::ReadAll(path);
    }

    test::TempDir temp;
    std::unique_ptr<test::TestCompany> company;
    std::unique_ptr<Card> card;
};

TEST_F(ReadingOrderCardTest, ShowsAndSearchesTheTextsAsTypedWhileThePagesKeepTheirs) {
    EXPECT_EQ(card->ReadingOrder(), 0);
    std::string logicalPage = page();
    std::string logicalAddress = U(card->txtAddress1.Text());
    EXPECT_NE(logicalAddress, "רח' הרצל 45");

    CardInterface::Invoke(*card, "ReadingOrder", {Variant(1)});
    EXPECT_EQ(CardInterface::Invoke(*card, "ReadingOrder", {}).toInt32(), 1);
    EXPECT_EQ(U(card->txtAddress1.Text()), "רח' הרצל 45");
    EXPECT_EQ(U(card->txtCustomerName.Text()), "כהן (ירושלים) 45");
    EXPECT_EQ(U(card->DocLines.TextMatrix(1, 1)), "מק-12a");
    EXPECT_EQ(U(card->DocLines.TextMatrix(1, 2)), "דיבלים 8 מ\"מ");
    EXPECT_EQ(U(card->DocLines.TextMatrix(1, 3)), "שחור 2");
    EXPECT_EQ(page(), logicalPage);

    // What is shown is what is found; the converted forms no longer are.
    EXPECT_EQ(search("Label2", card->txtCustomerName, "(ירושלים) 45"), "4105");
    EXPECT_EQ(search("lblDetails", card->txtDetails, "שחור 2"), "4105");
    EXPECT_EQ(search("lblItemKey", card->txtItemKey, "מק-12A"), "4105");
    EXPECT_EQ(search("lblDetails", card->txtDetails, "2 שחור"), "");

    card->setReadingOrder(0);
    EXPECT_EQ(search("lblDetails", card->txtDetails, "2 שחור"), "4105");
    EXPECT_EQ(U(card->txtAddress1.Text()), logicalAddress);
    EXPECT_EQ(search("lblDetails", card->txtDetails, "שחור 2"), "");
    EXPECT_THROW(card->setReadingOrder(2), Error);
    EXPECT_TRUE(messages.shown().empty());
}

TEST_F(ReadingOrderCardTest, IsSavedWithTheSettingsAndAHostMayChooseTheDefault) {
    uint8_t save = 1, load = 2;
    EXPECT_EQ(settings.GetSetting("Dovrel", "Params", "ReadingOrder", "absent"), "absent");
    card->setReadingOrder(1);
    card->SetGetRegParams(load); // nothing stored: the host's choice stays
    EXPECT_EQ(card->ReadingOrder(), 1);
    card->setReadingOrder(0);
    card->SetGetRegParams(load);
    EXPECT_EQ(card->ReadingOrder(), 0);

    card->setReadingOrder(1);
    card->SetGetRegParams(save);
    Card second(services, state);
    second.UserControl_InitProperties(nullptr);
    EXPECT_EQ(second.ReadingOrder(), 1);
}

TEST_F(ReadingOrderCardTest, PrintWithNothingShownSaysSoAndWritesNothing) {
    card->CmbDocLang.setListIndex(0);
    card->Click("PrintButt");
    ASSERT_EQ(browser.opened.size(), 1u);
    EXPECT_TRUE(messages.shown().empty());

    EXPECT_EQ(search("Label2", card->txtCustomerName, "אין כזה"), "");
    EXPECT_FALSE(card->document());
    card->Click("PrintButt");
    EXPECT_EQ(browser.opened.size(), 1u);
    ASSERT_EQ(messages.shown().size(), 1u);
    EXPECT_EQ(U(messages.shown()[0].text), "אין מסמך להדפסה");
    EXPECT_EQ(messages.shown()[0].icon, MsgIcon::Information);
}

} // namespace
} // namespace dovrel
