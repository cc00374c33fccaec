// The viewer control as a host and a user drive it: start-up, members,
// navigation, searches, resets, settings and two controls on one thread.

#include "control/Card.h"
#include "TestCompany.h"
#include "control/CardInterface.h"
#include "control/Surface.h"
#include "platform/Error.h"
#include "platform/SettingsStore.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <filesystem>
#include <map>
#include <set>

namespace dovrel {
namespace {

using nlohmann::json;
using test::U;
using test::W;

json Doc(int type, const std::string& account, const std::string& customer,
         const std::string& reference, const std::string& date, const std::string& key,
         const std::string& details = "") {
    json line = {{"key", key}, {"details", details}, {"price", 10}, {"quantity", 1}};
    return {{"type", type},           {"account", account}, {"customer", customer},
            {"reference", reference}, {"date", date},       {"lines", {line}}};
}

// Delivery notes (type 20) at records 2, 8, 11 and 14 of ISHP.FIX, an agent's
// delivery note (type 21) at record 5; each document is three records.
const json kCompany = {
    {"accounts", {{{"key", "1001"}, {"phone", "03-5555555"}, {"district", "מרכז"}}}},
    {"documents",
     {Doc(20, "1001", "משה כהן", "100", "2024-01-10", "A100", "אדום"),
      Doc(21, "1002", "דנה לוי", "200", "2024-01-11", "B200"),
      Doc(20, "1002", "דנה לוי", "300", "2023-05-01", "B200", "כחול"),
      Doc(20, "1001", "משה כהן", "400", "2024-02-01", "A100"),
      Doc(20, "1003", "יוסי", "500", "2024-03-01", "C300")}}};

// Records which forms were shown.
class RecordingForms : public ClosingFormPresenter {
public:
    void ShowModal(Form& form) override {
        shown.push_back(form.name());
        ClosingFormPresenter::ShowModal(form);
    }
    std::vector<std::string> shown;
};

class CardTest : public ::testing::Test {
protected:
    CardTest() : company(kCompany.dump()) {}

    std::unique_ptr<Card> make(ModuleState& state, Container* container = nullptr) {
        auto card = std::make_unique<Card>(services, state);
        card->UserControl_InitProperties(container);
        return card;
    }
    // The reference of the document on display, "" when none.
    std::string shown(const Card& card) { return U(card.txtReference1.Text()); }
    void showDoc(Card& card, int16_t type, int32_t start) {
        EXPECT_EQ(card.ShowDoc(company.compPath(), type, start), 0);
    }

    test::TestCompany company;
    RecordedMessages messages;
    MemorySettingsStore settings;
    RecordingForms forms;
    MemoryClipboard clipboard;
    RecordingBrowser browser;
    FixedClock clock{{2026, 12, 6}};
    CardServices services{messages, settings, forms, clipboard, browser, clock};
    ModuleState state;
};

TEST_F(CardTest, FirstRunShowsTheDefaultsAndReadsNoDocument) {
    auto card = make(state);
    EXPECT_EQ(state.AppName, "Dovrel");
    EXPECT_EQ(card->txtCompPath.Text(), "c:\\comp02");
    EXPECT_EQ(state.CompDir, "c:\\comp02");
    ASSERT_EQ(card->cmbDocType.ListCount(), 26);
    EXPECT_EQ(card->cmbDocType.ListIndex(), 1);
    EXPECT_EQ(U(card->cmbDocType.List(13)), "תעודת משלוח");
    EXPECT_EQ(card->txtTitle.Text(), "");
    EXPECT_EQ(U(card->CmbDocLang.Text()), "אנגלית");
    EXPECT_EQ(U(card->cmbRules.Text()), "רשת מלאה");
    EXPECT_EQ(card->ChkShowDetails.Value(), 1);
    for (const CheckBox* box :
         {&card->ChkWithDrawing, &card->ChkUseFName, &card->chkLineDisc, &card->ChkShowTotalFC})
        EXPECT_EQ(box->Value(), 0) << box->name();
    EXPECT_EQ(card->txtFromDate.Text(), "01/01/1980");
    EXPECT_EQ(card->PubACTLocation, 2);
    EXPECT_EQ(card->DocLines.Rows(), 2);
    EXPECT_EQ(card->DocLines.Cols(), 8);
    EXPECT_EQ(card->txtReference1.Text(), "");
    // The picture settings form is loaded, hidden; the other forms are not made yet.
    ASSERT_EQ(state.Forms.size(), 1u);
    EXPECT_FALSE(state.Forms.at("frmItemPics")->Visible());
    EXPECT_TRUE(forms.shown.empty());
    EXPECT_TRUE(messages.shown().empty());
}

TEST_F(CardTest, SurfaceNamesEveryControlOnceWithItsCaption) {
    auto card = make(state);
    std::set<std::string> names;
    for (const ControlDesign& design : CardSurface()) {
        EXPECT_TRUE(names.insert(design.name).second) << design.name;
        Control* control = card->findControl(design.name);
        ASSERT_NE(control, nullptr) << design.name;
        EXPECT_EQ(control->kind(), design.kind) << design.name;
        EXPECT_LE(design.left + design.width, kCardDesignWidth) << design.name;
        EXPECT_LE(design.top + design.height, kCardDesignHeight) << design.name;
        if (!design.labelFor.empty()) {
            EXPECT_NE(FindDesign(design.labelFor), nullptr) << design.name;
        }
    }
    EXPECT_EQ(card->controls().size(), CardSurface().size());
    // The abbreviation sign is an ordinary quotation mark inside the caption.
    EXPECT_EQ(U(card->findControl("lblItemKey")->Caption()), ":חיפוש מק\"ט");
    EXPECT_EQ(card->findControl("NoSuchControl"), nullptr);
}

TEST_F(CardTest, ContainerElementsNameTheSettingsAndTheAccount) {
    ElementsContainer page({{"SettingID", " 12 "}, {"AccountKey", "  1001 "}});
    auto card = make(state, &page);
    EXPECT_EQ(state.AppName, "Dovrel12");
    EXPECT_EQ(card->txtAccountKey.Text(), "1001");

    ElementsContainer letters({{"SettingID", "a1"}, {"AccountKey", "   "}});
    auto other = make(state, &letters);
    EXPECT_EQ(state.AppName, "Dovrel");
    EXPECT_EQ(other->txtAccountKey.Text(), "");

    // A page that cannot be reached skips those two steps and nothing else.
    struct Broken : Container {
        std::optional<std::string> ElementValue(const std::string&) override {
            throw Error("no document");
        }
    } broken;
    settings.SaveSetting("Dovrel", "Params", "FromDate", "02/02/2020");
    auto third = make(state, &broken);
    EXPECT_EQ(state.AppName, "Dovrel");
    EXPECT_EQ(third->txtFromDate.Text(), "02/02/2020");
}

TEST_F(CardTest, SavedSettingsComeBackInTheNextControl) {
    auto card = make(state);
    card->txtCompPath.setText(company.compPath());
    card->cmbDocType.setListIndex(13);
    card->txtTitle.setText(W("כותרת שלי"));
    card->ChkWithDrawing.setValue(1);
    card->CmbDocLang.setListIndex(2);
    card->ChkUseFName.setValue(1);
    card->chkLineDisc.setValue(2);
    card->ChkShowDetails.setValue(0);
    card->ChkShowTotalFC.setValue(1);
    card->cmbRules.setListIndex(3);
    card->txtFromDate.setText("01/06/2023");
    card->Click("cmdSaveDef");
    EXPECT_EQ(settings.GetSetting("dovrel", "PARAMS", "doctype", ""), "13");

    ModuleState fresh;
    auto next = make(fresh);
    EXPECT_EQ(fresh.CompDir, company.compPath());
    EXPECT_EQ(next->cmbDocType.ListIndex(), 13);
    EXPECT_EQ(U(next->txtTitle.Text()), "כותרת שלי");
    EXPECT_EQ(next->ChkWithDrawing.Value(), 1);
    EXPECT_EQ(next->CmbDocLang.ListIndex(), 2);
    EXPECT_EQ(next->ChkUseFName.Value(), 1);
    EXPECT_EQ(next->chkLineDisc.Value(), 2);
    EXPECT_EQ(next->ChkShowDetails.Value(), 0);
    EXPECT_EQ(next->ChkShowTotalFC.Value(), 1);
    EXPECT_EQ(next->cmbRules.ListIndex(), 3);
    EXPECT_EQ(next->txtFromDate.Text(), "01/06/2023");

    // Another setting number keeps its own settings.
    ElementsContainer page(std::map<std::string, std::string>{{"SettingID", "7"}});
    ModuleState seventh;
    auto other = make(seventh, &page);
    EXPECT_EQ(other->txtCompPath.Text(), "c:\\comp02");
    EXPECT_EQ(other->cmbDocType.ListIndex(), 1);
}

TEST_F(CardTest, ARefusedStoredValueStopsTheLoadAtItsRow) {
    settings.SaveSetting("Dovrel", "Params", "CompPath", "d:\\other");
    settings.SaveSetting("Dovrel", "Params", "DocType", "30");
    settings.SaveSetting("Dovrel", "Params", "Title", "never loaded");
    auto card = make(state);
    EXPECT_EQ(card->txtCompPath.Text(), "d:\\other");
    EXPECT_EQ(state.CompDir, "d:\\other");
    // Rows after "DocType" keep what the start-up gave them before the load.
    EXPECT_EQ(card->cmbDocType.ListIndex(), 0);
    EXPECT_EQ(U(card->txtTitle.Text()), "חשבונית מס");
    EXPECT_EQ(card->CmbDocLang.ListIndex(), 0);
    EXPECT_EQ(card->ChkShowDetails.Value(), 0);
    EXPECT_EQ(card->cmbRules.ListIndex(), -1);

    // Saved with no selection, "-1" loads back as no selection.
    card->cmbDocType.setListIndex(-1);
    uint8_t save = 1, load = 2, other = 3;
    card->SetGetRegParams(save);
    EXPECT_EQ(settings.GetSetting("Dovrel", "Params", "DocType", ""), "-1");
    card->cmbDocType.setListIndex(4);
    card->SetGetRegParams(load);
    EXPECT_EQ(card->cmbDocType.ListIndex(), -1);
    card->SetGetRegParams(other); // neither saves nor loads
    for (const char* refused : {"3", "x", "", "1e10"}) {
        settings.SaveSetting("Dovrel", "Params", "WithDrawing", refused);
        EXPECT_THROW(card->SetGetRegParams(load), Error) << refused;
    }
    // A property the control does not have is an error; an unknown kind does nothing.
    EXPECT_THROW(card->SetGetRegParam(2, "Dovrel", "Params", "X", card->cmbRules, 1, Variant("")),
                 Error);
    card->SetGetRegParam(1, "Dovrel", "Params", "X", card->cmbRules, 9, Variant(""));
    EXPECT_FALSE(settings.FindSetting("Dovrel", "Params", "X"));
}

TEST_F(CardTest, ShowDocShowsTheFirstDocumentAtOrAfterThePosition) {
    auto card = make(state);
    showDoc(*card, 20, 2);
    EXPECT_EQ(shown(*card), "100");
    EXPECT_EQ(card->cmbDocType.ListIndex(), 13);
    EXPECT_EQ(state.CompDir, company.compPath());
    EXPECT_EQ(card->PubPrevLocation, 2);
    showDoc(*card, 20, 1); // record 1 holds no document
    EXPECT_EQ(shown(*card), "100");
    showDoc(*card, 20, 3);
    EXPECT_EQ(shown(*card), "300");
    showDoc(*card, 21, 2);
    EXPECT_EQ(shown(*card), "200");
    // A code that is not a document type selects the first type (invoices in
    // IMV.FIX, where this company has none): nothing is shown, nothing reported.
    showDoc(*card, 99, 2);
    EXPECT_EQ(card->cmbDocType.ListIndex(), 0);
    EXPECT_EQ(shown(*card), "");
    EXPECT_TRUE(messages.shown().empty());

    std::string db = "/data/", pics = "/pics/";
    int16_t type = 20;
    int32_t start = 9;
    EXPECT_EQ(card->SetParams(company.compPath(), type, start, db, pics), 0);
    EXPECT_EQ(shown(*card), "400");
    EXPECT_EQ(state.DBPath, "/data/");
    EXPECT_EQ(state.PicPath, "/pics/");
    EXPECT_EQ(type, 20);
    EXPECT_EQ(start, 9);
}

TEST_F(CardTest, ButtonsWalkTheTypeAndSearchesStayInForce) {
    auto card = make(state);
    showDoc(*card, 20, 2);
    card->Click("NextButt");
    EXPECT_EQ(shown(*card), "300"); // the agent's note at record 5 is another type
    card->Click("NextButt");
    EXPECT_EQ(shown(*card), "400");
    card->Click("PrevButt");
    EXPECT_EQ(shown(*card), "300");
    card->Click("LastButt");
    EXPECT_EQ(shown(*card), "500");
    card->Click("FirstButt");
    EXPECT_EQ(shown(*card), "100");

    // Double-clicking the name searches for the name on display.
    card->DblClick("Label2");
    EXPECT_EQ(card->PubSearchBy, "CustomerName");
    EXPECT_EQ(shown(*card), "100");
    card->Click("NextButt");
    EXPECT_EQ(shown(*card), "400");
    card->Click("LastButt");
    EXPECT_EQ(shown(*card), "400");
    card->Click("PrevButt");
    EXPECT_EQ(shown(*card), "100");
    card->Click("FirstButt");
    EXPECT_EQ(card->PubSearchBy, "");
    card->Click("NextButt");
    EXPECT_EQ(shown(*card), "300");
}

TEST_F(CardTest, EachLabelSearchesItsBoxOnItsOwnEvent) {
    auto card = make(state);
    showDoc(*card, 20, 2);
    // A single click on the four double-click labels does nothing.
    for (const char* label : {"Label1", "Label2", "LblReference1", "lblItemKey"}) {
        card->Click(label);
        EXPECT_EQ(card->PubSearchBy, "") << label;
    }
    card->txtReference1.setText("  300 ");
    card->DblClick("LblReference1");
    EXPECT_EQ(card->PubSearchValue, Variant("300"));
    EXPECT_EQ(shown(*card), "300");

    card->txtDetails.setText(W("כחול"));
    card->DblClick("lblDetails"); // only its single click searches
    EXPECT_EQ(card->PubSearchBy, "Reference1");
    card->Click("lblDetails");
    EXPECT_EQ(card->PubSearchBy, "Details");
    EXPECT_EQ(shown(*card), "300");

    // An item-key search keeps to the account in its box, when there is one.
    card->txtItemKey.setText("C300");
    card->DblClick("lblItemKey");
    EXPECT_EQ(shown(*card), "");
    card->txtAccountKey.setText("");
    card->DblClick("lblItemKey");
    EXPECT_EQ(shown(*card), "500");
    card->txtAccountKey.setText("1002");
    card->DblClick("Label1");
    EXPECT_EQ(shown(*card), "300");
    // The name is searched as it stands in the box, leading space and all.
    card->txtCustomerName.setText(W(" משה"));
    card->DblClick("Label2");
    EXPECT_EQ(card->PubSearchValue, Variant(W(" משה")));
    EXPECT_THROW(card->Click("NoSuchLabel"), Error);
}

TEST_F(CardTest, ResetsEndTheSearchAndRestartTheWalk) {
    auto card = make(state);
    showDoc(*card, 20, 2);
    card->txtTitle.setText("typed");
    card->DblClick("Label2");
    card->LostFocus("cmbDocType");
    EXPECT_EQ(card->PubSearchBy, "");
    EXPECT_EQ(card->PubACTLocation, 2);
    EXPECT_EQ(card->PubPrevLocation, 0);
    EXPECT_EQ(card->txtTitle.Text(), "Delivery Note"); // language "אנגלית" from the settings
    EXPECT_EQ(shown(*card), "100");                    // nothing read
    card->Click("NextButt");                           // starts at record 3
    EXPECT_EQ(shown(*card), "300");

    card->CmbDocLang.setListIndex(0);
    card->LostFocus("CmbDocLang");
    EXPECT_EQ(U(card->txtTitle.Text()), "תעודת משלוח");
    card->CmbDocLang.setListIndex(-1);
    card->txtTitle.setText("kept");
    card->LostFocus("CmbDocLang");
    EXPECT_EQ(card->txtTitle.Text(), "kept");

    // The same path changes nothing; another path resets; null empties it.
    card->DblClick("Label2");
    card->SetCompDir(Variant(company.compPath()));
    EXPECT_EQ(card->PubSearchBy, "CustomerName");
    EXPECT_EQ(card->PubACTLocation, 8);
    card->SetCompDir(Variant(company.compPath() + "/"));
    EXPECT_EQ(card->PubSearchBy, "");
    EXPECT_EQ(card->PubACTLocation, 2);
    card->SetCompDir(Variant::Null());
    EXPECT_EQ(card->SetCompDir(), Variant(""));
    EXPECT_EQ(card->txtCompPath.Text(), "");

    // The company chooser, even cancelled, resets position and search.
    card->SetCompDir(Variant(company.compPath()));
    card->DblClick("Label2");
    card->Click("CmdDir");
    EXPECT_EQ(forms.shown, std::vector<std::string>{"frmOpenDir"});
    EXPECT_EQ(card->PubSearchBy, "");
    EXPECT_EQ(card->PubACTLocation, 2);
    card->Click("CmdParams");
    EXPECT_EQ(forms.shown.back(), "frmItemPics");
}

TEST_F(CardTest, PropertiesConvertTheirValuesOrFailLeavingTheirState) {
    auto card = make(state);
    card->ACTLocation(Variant(10.5));
    EXPECT_EQ(card->ACTLocation(), Variant(10.0));
    card->ACTLocation(Variant("11.5"));
    EXPECT_EQ(card->PubACTLocation, 12);
    EXPECT_THROW(card->ACTLocation(Variant("abc")), Error);
    EXPECT_THROW(card->ACTLocation(Variant(3e9)), Error);
    EXPECT_EQ(card->PubACTLocation, 12);
    card->SetAccountKey(Variant(1001));
    EXPECT_EQ(card->SetAccountKey(), Variant("1001"));
    EXPECT_THROW(card->SetAccountKey(Variant::Null()), Error);
    EXPECT_EQ(card->txtAccountKey.Text(), "1001");

    EXPECT_EQ(card->CompanyTitle(), Variant(std::string(60, '\0')));
    card->CompanyTitle(Variant("abc"));
    EXPECT_EQ(card->CompanyTitle(), Variant("abc" + std::string(57, ' ')));
    card->CompanyTitle(Variant(std::string(70, 'x')));
    EXPECT_EQ(card->CompanyTitle(), Variant(std::string(60, 'x')));
    card->DBPath(Variant("/db/"));
    card->PicPath(Variant(5));
    EXPECT_EQ(card->DBPath(), Variant("/db/"));
    EXPECT_EQ(card->PicPath(), Variant("5"));
}

TEST_F(CardTest, TheInterfaceCallsMembersByNameWithTheirKinds) {
    auto card = make(state);
    ASSERT_EQ(CardInterface::Members().size(), 24u);
    EXPECT_STREQ(CardInterface::Members()[12].name, "ShowDoc");
    EXPECT_EQ(CardInterface::Invoke(*card, "showdoc",
                                    {Variant(company.compPath()), Variant("20"), Variant(2.0)}),
              Variant(0.0));
    EXPECT_EQ(shown(*card), "100");
    CardInterface::Invoke(*card, "ACTLocation", {Variant(4.5)});
    EXPECT_EQ(CardInterface::Invoke(*card, "PubACTLocation", {}), Variant(4.0));
    EXPECT_THROW(CardInterface::Invoke(*card, "ShowDoc", {Variant("x")}), Error);
    EXPECT_THROW(CardInterface::Invoke(*card, "ShowDoc", {Variant(""), Variant(70000), Variant(2)}),
                 Error);
    EXPECT_THROW(CardInterface::Invoke(*card, "Explode", {}), Error);
    card->cmbRules.setListIndex(3);
    EXPECT_EQ(CardInterface::Invoke(*card, "rulesvalue", {}), Variant("cols"));
    EXPECT_EQ(CardInterface::Invoke(*card, "CreateAsIs", {Variant(12)}),
              Variant("<table cellspacing='0' cellpadding='0' border='0' align='right' "
                      "dir='rtl'><tr><td>2</td><td>1</td></tr></table>"));
}

TEST_F(CardTest, AccountButtonLoadsTheAccountsAndShowsWhatItFinds) {
    auto card = make(state);
    card->SetCompDir(Variant(company.compPath()));
    card->txtAccountKey.setText("   ");
    card->Click("cmdAccount");
    EXPECT_TRUE(forms.shown.empty());
    EXPECT_FALSE(state.Accounts.AccountsLoaded);

    card->txtAccountKey.setText(" 1001 ");
    card->Click("cmdAccount");
    EXPECT_EQ(forms.shown, std::vector<std::string>{"frmAccDetails"});
    EXPECT_EQ(state.Accounts.CurrentAccount.Key, "1001");
    EXPECT_EQ(U(state.Accounts.CurrentAccount.District), "מרכז");

    // A key that is not there reloads the file, and an unreadable file is skipped.
    card->txtAccountKey.setText("9999");
    card->SetCompDir(Variant(company.compPath() + "/missing"));
    card->Click("cmdAccount");
    EXPECT_EQ(forms.shown.size(), 2u);
    EXPECT_EQ(state.Accounts.CurrentAccount.Key, "");
    EXPECT_EQ(U(state.Accounts.CurrentAccount.Phone), "ריק");
    EXPECT_EQ(state.Accounts.AccountCount, 1);
}

TEST_F(CardTest, TwoControlsShareTheCompanyButNotTheirPositions) {
    auto first = make(state);
    auto second = make(state);
    showDoc(*first, 20, 2);
    first->Click("NextButt");
    EXPECT_EQ(first->PubACTLocation, 8);
    second->cmbDocType.setListIndex(13);
    second->Click("LastButt"); // reads the company the first one chose
    EXPECT_EQ(shown(*second), "500");
    EXPECT_EQ(state.Doc.header.type, 20);
    EXPECT_EQ(first->PubACTLocation, 8);

    // A company path set in one is read by the other, whose position stays.
    test::TestCompany other(
        json{{"documents", {Doc(20, "2001", "אחר", "900", "2024-01-01", "Z1")}}}.dump());
    second->SetCompDir(Variant(other.compPath()));
    EXPECT_EQ(first->PubACTLocation, 8);
    first->Click("FirstButt");
    EXPECT_EQ(shown(*first), "900");
}

} // namespace
} // namespace dovrel
