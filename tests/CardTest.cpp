// The viewer control as a host and a user drive it: start-up, members,
// navigation, searches, resets, settings and two controls on one thread or on two.

#include "control/Card.h"
#include "TestCompany.h"
#include "control/CardInterface.h"
#include "platform/Error.h"
#include "platform/SettingsStore.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <filesystem>
#include <map>
#include <sstream>
#include <thread>
#include <tuple>
#include <utility>

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

// The saved settings as the control shows them, in the order they are stored.
std::vector<std::string> Params(const Card& card) {
    auto n = [](int value) { return std::to_string(value); };
    return {U(card.txtCompPath.Text()),     n(card.cmbDocType.ListIndex()),
            U(card.txtTitle.Text()),        n(card.ChkWithDrawing.Value()),
            n(card.CmbDocLang.ListIndex()), n(card.ChkUseFName.Value()),
            n(card.chkLineDisc.Value()),    n(card.ChkShowDetails.Value()),
            n(card.ChkShowTotalFC.Value()), n(card.cmbRules.ListIndex()),
            U(card.txtFromDate.Text())};
}

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
    // Runs "Control=reference ..." steps: a click (a double click for "2Control"),
    // then the reference that must be on display.
    void walk(Card& card, const std::string& steps) {
        std::istringstream words(steps);
        for (std::string step; words >> step;) {
            SCOPED_TRACE(step);
            std::string control = step.substr(0, step.find('='));
            if (control[0] == '2')
                card.DblClick(control.substr(1));
            else
                card.Click(control);
            EXPECT_EQ(shown(card), step.substr(step.find('=') + 1));
        }
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

TEST_F(CardTest, StartUpShowsTheDefaultsOrWhatThePageNames) {
    auto card = make(state);
    EXPECT_EQ(state.AppName, "Dovrel");
    EXPECT_EQ(state.CompDir, "c:\\comp02");
    EXPECT_EQ(Params(*card), (std::vector<std::string>{"c:\\comp02", "1", "", "0", "1", "0", "0",
                                                       "1", "0", "0", "01/01/1980"}));
    EXPECT_EQ(card->PubACTLocation, 2);
    EXPECT_EQ(std::make_pair(card->DocLines.Rows(), card->DocLines.Cols()), std::make_pair(2, 8));
    EXPECT_EQ(shown(*card), "");
    // The picture settings form is loaded, hidden; the other forms are not made yet.
    ASSERT_EQ(state.Forms.size(), 1u);
    EXPECT_FALSE(state.Forms.at("frmItemPics")->Visible());
    EXPECT_TRUE(forms.shown.empty());
    EXPECT_TRUE(messages.shown().empty());

    // Elements of the page the control sits on name its settings and its account.
    ElementsContainer page({{"SettingID", " 12 "}, {"AccountKey", "  1001 "}});
    EXPECT_EQ(make(state, &page)->txtAccountKey.Text(), "1001");
    EXPECT_EQ(state.AppName, "Dovrel12");
    ElementsContainer letters({{"SettingID", "a1"}, {"AccountKey", "   "}});
    EXPECT_EQ(make(state, &letters)->txtAccountKey.Text(), "");
    EXPECT_EQ(state.AppName, "Dovrel");
    // A page that cannot be reached skips those two steps and nothing else.
    struct Broken : Container {
        std::optional<std::string> ElementValue(const std::string&) override {
            throw Error("no document");
        }
    } broken;
    settings.SaveSetting("Dovrel", "Params", "FromDate", "02/02/2020");
    EXPECT_EQ(make(state, &broken)->txtFromDate.Text(), "02/02/2020");
    EXPECT_EQ(state.AppName, "Dovrel");
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
    EXPECT_EQ(Params(*make(fresh)), Params(*card));
    EXPECT_EQ(fresh.CompDir, company.compPath());
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
    EXPECT_EQ(state.CompDir, "d:\\other");
    // Rows after "DocType" keep what the start-up gave them before the load.
    EXPECT_EQ(Params(*card), (std::vector<std::string>{"d:\\other", "0", "חשבונית מס", "0", "0",
                                                       "0", "0", "0", "0", "-1", "01/01/1980"}));

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
    EXPECT_EQ(card->cmbDocType.ListIndex(), 13);
    EXPECT_EQ(card->PubPrevLocation, 2);
    const std::tuple<int16_t, int32_t, std::string> cases[] = {
        {20, 1, "100"}, {20, 3, "300"}, {21, 2, "200"}};
    for (const auto& [type, start, reference] : cases) {
        showDoc(*card, type, start);
        EXPECT_EQ(shown(*card), reference) << type << " from " << start;
    }
    EXPECT_EQ(state.CompDir, company.compPath());
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
    EXPECT_EQ(std::make_pair(state.DBPath, state.PicPath), std::make_pair(db, pics));
    EXPECT_EQ(std::make_pair(type, start), std::make_pair(int16_t{20}, 9));
}

TEST_F(CardTest, ButtonsWalkTheTypeAndLabelsSearchTheirBoxes) {
    auto card = make(state);
    showDoc(*card, 20, 2);
    // The agent's note at record 5 is another type. Double-clicking the name
    // searches for the name on display until First ends the search.
    walk(*card, "NextButt=300 NextButt=400 PrevButt=300 LastButt=500 FirstButt=100 "
                "2Label2=100 NextButt=400 LastButt=400 PrevButt=100 FirstButt=100 NextButt=300");
    EXPECT_EQ(card->PubSearchBy, "");

    // Each label searches its box on its own event: a single click on the
    // four double-click labels does nothing.
    for (const char* label : {"Label1", "Label2", "LblReference1", "lblItemKey"}) {
        card->Click(label);
        EXPECT_EQ(card->PubSearchBy, "") << label;
    }
    card->txtReference1.setText("  300 ");
    walk(*card, "2LblReference1=300");
    EXPECT_EQ(card->PubSearchValue, Variant("300"));
    card->txtDetails.setText(W("כחול"));
    card->DblClick("lblDetails"); // only its single click searches
    EXPECT_EQ(card->PubSearchBy, "Reference1");
    walk(*card, "lblDetails=300");
    EXPECT_EQ(card->PubSearchBy, "Details");
    // An item-key search keeps to the account in its box, when there is one.
    card->txtItemKey.setText("C300");
    walk(*card, "2lblItemKey=");
    card->txtAccountKey.setText("");
    walk(*card, "2lblItemKey=500");
    card->txtAccountKey.setText("1002");
    walk(*card, "2Label1=300");
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
    EXPECT_EQ(std::make_pair(card->PubACTLocation, card->PubPrevLocation), std::make_pair(2, 0));
    EXPECT_EQ(card->txtTitle.Text(), "Delivery Note"); // language "אנגלית" from the settings
    EXPECT_EQ(shown(*card), "100");                    // nothing read
    walk(*card, "NextButt=300");                       // starts at record 3

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
}

TEST_F(CardTest, MembersConvertTheirValuesOrFailLeavingTheirState) {
    auto card = make(state);
    card->ACTLocation(Variant(10.5));
    EXPECT_EQ(card->ACTLocation(), Variant(10.0));
    card->ACTLocation(Variant("11.5"));
    EXPECT_THROW(card->ACTLocation(Variant("abc")), Error);
    EXPECT_THROW(card->ACTLocation(Variant(3e9)), Error);
    EXPECT_EQ(card->PubACTLocation, 12);
    card->SetAccountKey(Variant(1001));
    EXPECT_THROW(card->SetAccountKey(Variant::Null()), Error);
    EXPECT_EQ(card->SetAccountKey(), Variant("1001"));

    EXPECT_EQ(card->CompanyTitle(), Variant(std::string(60, '\0')));
    card->CompanyTitle(Variant("abc"));
    EXPECT_EQ(card->CompanyTitle(), Variant("abc" + std::string(57, ' ')));
    card->CompanyTitle(Variant(std::string(70, 'x')));
    EXPECT_EQ(card->CompanyTitle(), Variant(std::string(60, 'x')));
    card->PicPath(Variant(5));
    EXPECT_EQ(card->PicPath(), Variant("5"));

    // The interface calls the members by name, converting to their kinds.
    EXPECT_EQ(CardInterface::Invoke(*card, "showdoc",
                                    {Variant(company.compPath()), Variant("20"), Variant(2.0)}),
              Variant(0.0));
    EXPECT_EQ(shown(*card), "100");
    CardInterface::Invoke(*card, "ACTLocation", {Variant(4.5)});
    EXPECT_EQ(CardInterface::Invoke(*card, "PubACTLocation", {}), Variant(4.0));
    for (const std::vector<Variant>& args :
         {std::vector<Variant>{Variant("x")}, {Variant(""), Variant(70000), Variant(2)}})
        EXPECT_THROW(CardInterface::Invoke(*card, "ShowDoc", args), Error);
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
    second->cmbDocType.setListIndex(13);
    walk(*second, "LastButt=500"); // reads the company the first one chose
    EXPECT_EQ(first->PubACTLocation, 8);
    // A company path set in one is read by the other, whose position stays.
    test::TestCompany other(
        json{{"documents", {Doc(20, "2001", "אחר", "900", "2024-01-01", "Z1")}}}.dump());
    second->SetCompDir(Variant(other.compPath()));
    EXPECT_EQ(first->PubACTLocation, 8);
    walk(*first, "FirstButt=900");
}

// Each thread makes its own module state: controls showing documents on two
// threads at once see what each sees alone.
TEST_F(CardTest, TwoControlsOnTwoThreadsKeepTheirOwnState) {
    auto work = [this](int16_t type, std::string& reference) {
        RecordedMessages own;
        ModuleState state;
        Card card(own, state);
        card.UserControl_InitProperties(nullptr);
        for (int round = 0; round < 50; ++round) {
            int32_t start = 2;
            EXPECT_EQ(card.ShowDoc(company.compPath(), type, start), 0);
        }
        reference = shown(card);
        EXPECT_TRUE(own.shown().empty());
    };
    std::string alone20, alone21, delivery, agent;
    work(20, alone20);
    work(21, alone21);
    ASSERT_NE(alone20, alone21);
    std::thread first(work, 20, std::ref(delivery)), second(work, 21, std::ref(agent));
    first.join();
    second.join();
    EXPECT_EQ(delivery, alone20);
    EXPECT_EQ(agent, alone21);
}

} // namespace
} // namespace dovrel
