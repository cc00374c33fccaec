#include "app/session/HostSession.h"

#include "TestCompany.h"
#include "app/session/CardMembers.h"
#include "app/session/StateJson.h"
#include "platform/Encoding.h"
#include "platform/Error.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <sstream>

namespace dovrel {
namespace {

using nlohmann::json;
using test::TestCompany;

const char* const kCompany = R"({
  "company": {"title": "דמו מחשבים", "currencies": ["יורו"]},
  "accounts": [{"key": "1001", "phone": "03-1234567", "district": "מרכז", "details": "לקוח קבוע"}],
  "items": [{"key": "A100", "category": "07", "foreignName": "Screen"}],
  "documents": [{"type": 20, "customer": "משה כהן", "vatPercent": 17, "lines": [
       {"key": "A100", "description": "מסך", "details": "שחור", "price": 100, "quantity": 2},
       {"key": "B200", "description": "מקלדת", "currency": 10, "price": 10.5,
        "quantity": 1.5, "discount": 12.5}]}]})";

class HostSessionTest : public ::testing::Test {
protected:
    json ask(const json& request) { return json::parse(session.handle(request.dump())); }
    // The request fails with an error that holds these words.
    void fails(const json& request, const std::string& words) {
        json reply = ask(request);
        EXPECT_EQ(reply["ok"], false) << request;
        EXPECT_NE(reply.value("error", "").find(words), std::string::npos) << reply;
    }

    ModuleState shared;
    HostSession session{shared};
};

TEST_F(HostSessionTest, BadRequestsFailAndTheSessionGoesOn) {
    const std::pair<std::string, const char*> bad[] = {
        {"not json", "Bad JSON"},
        {" \r", "Bad JSON"},
        {"", "Bad JSON"},
        {std::string("[\"state\"]\0[\"click\", \"NextButt\"]", 31), "NUL"},
        {"[\"state\"] [\"state\"]", "Bad JSON"},
        {R"({"command": "state"})", "JSON array"},
        {R"(["Explode"])", "Unknown command: Explode"},
        {R"(["state", 1])", "takes 0 arguments, got 1"},
        {R"(["FindAccount"])", "takes 1 argument, got 0"},
        {R"(["ReadStock", "/tmp", "13", "", "", "Next", ""])", "argument 2"},
        {R"(["ReadStock", "/tmp", 13, "", [1], "Next", ""])", "argument 4"},
        {R"(["ReadStock", 5, 13, "", "", "Next", ""])", "must be a string"},
        {R"(["set", "NoSuchBox", 1])", "Unknown member or control: NoSuchBox"},
        {R"(["set", "DocLines", 1])", "cannot be set"},
        {R"(["set", "PubACTLocation", 1.5])", "whole number"},
        {R"(["set", "PubACTLocation", 3000000000])", "whole number"}};
    // Every line gets one line, blank or not.
    std::string input;
    for (const auto& [line, words] : bad)
        input += line + "\n";
    std::istringstream in(input + "[\"state\"]\n");
    std::ostringstream out;
    EXPECT_EQ(session.serve(in, out), 0);
    std::istringstream answers(out.str());
    std::string answer;
    for (const auto& [line, words] : bad) {
        ASSERT_TRUE(std::getline(answers, answer)) << line;
        json reply = json::parse(answer);
        EXPECT_EQ(reply["ok"], false) << line;
        EXPECT_NE(reply.value("error", "").find(words), std::string::npos) << line << reply;
        EXPECT_FALSE(reply.contains("state")) << line;
    }
    ASSERT_TRUE(std::getline(answers, answer));
    json reply = json::parse(answer);
    EXPECT_EQ(json({reply["ok"], reply["messages"], reply["state"]["PubACTLocation"],
                    reply.contains("result")}),
              json({true, json::array(), 2, false}));
    EXPECT_FALSE(std::getline(answers, answer));
}

TEST_F(HostSessionTest, SetAndGetRoundTripEachKind) {
    ask({"set", "PubPrevLocation", -3});
    EXPECT_EQ(ask({"get", "PubPrevLocation"})["value"], -3);
    for (json value : {json(nullptr), json(3.5), json("כהן"), json(true)}) {
        EXPECT_EQ(ask({"set", "PubSearchValue", value})["state"]["PubSearchValue"], value);
        EXPECT_EQ(ask({"get", "PubSearchValue"})["value"], value);
    }
    EXPECT_EQ(session.card().PubSearchValue, Variant(true));
    // Texts come in as UTF-8 and are held in code page 1255.
    EXPECT_EQ(ask({"set", "txtItemKey", "מק\"ט 7"})["state"]["controls"]["txtItemKey"], "מק\"ט 7");
    EXPECT_EQ(session.card().txtItemKey.Text(), test::W("מק\"ט 7"));
}

// Every byte of the code page is its own character in the JSON, control
// characters included, and comes back as the same byte.
TEST_F(HostSessionTest, TextCrossesTheJsonWithoutLoss) {
    EXPECT_EQ(ask({"call", "CompanyTitle"})["result"], std::string(60, '\0'));
    std::string bytes;
    for (int b = 1; b < 256; ++b)
        bytes.push_back(static_cast<char>(b));
    std::string text = ToUtf8(bytes).str();
    ask({"set", "PubSearchValue", text});
    json back = ask({"get", "PubSearchValue"})["value"];
    EXPECT_EQ(back, text);
    EXPECT_EQ(FromUtf8(Utf8(back.get<std::string>())), bytes);
    EXPECT_EQ(back.get<std::string>().find("\xEF\xBF\xBD"), std::string::npos) << "no U+FFFD";

    // A company folder whose name the code page cannot hold opens as it is named.
    test::TestCompany company(kCompany);
    test::TempDir temp;
    std::filesystem::path folder = temp.path() / "Документы";
    std::filesystem::copy(company.path(), folder);
    EXPECT_EQ(ask({"call", "ShowDoc", folder.string(), 20, 2})["result"], 0);
    EXPECT_EQ(ask({"get", "txtCustomerName"})["value"], "משה כהן");
    EXPECT_EQ(ask({"get", "txtCompPath"})["value"], ToUtf8(FromUtf8(Utf8(folder.string()))).str());
}

TEST(CardMembersTest, ListsAndCheckBoxesTakeWholeNumbersInTheirRange) {
    ComboBox list("cmbTest");
    list.AddItem("a");
    list.AddItem("b");
    CardMembers::SetControl(list, -1);
    EXPECT_THROW(CardMembers::SetControl(list, 2), Error);
    EXPECT_THROW(CardMembers::SetControl(list, "1"), Error);
    EXPECT_EQ(StateJson::ControlValue(list), -1);
    CheckBox check("chkTest");
    CardMembers::SetControl(check, 2);
    EXPECT_THROW(CardMembers::SetControl(check, 3), Error);
    EXPECT_THROW(CardMembers::SetControl(check, true), Error);
    EXPECT_EQ(StateJson::ControlValue(check), 2);
}

TEST_F(HostSessionTest, ReadsAnswerResultControlsGridDocumentAndAccounts) {
    TestCompany company(kCompany);
    std::string path = company.path().string();
    EXPECT_EQ(ask({"ReadAdf", path})["result"], true);
    json reply = ask({"ReadStock", path, 13, "", "", "First", ""});
    ASSERT_EQ(reply["ok"], true) << reply;
    // Filler record 1, header 2, continuation 3, lines 4 and 5.
    EXPECT_EQ(reply["result"], 5);
    EXPECT_EQ(reply["messages"], json::array());
    // The state's every field is compared byte for byte by ShowGoldenTest.
    EXPECT_EQ(reply["state"]["grid"][2][6], "יורו"); // the company file read first

    json items = ask({"ReadITM", path});
    EXPECT_EQ(items["result"], true);
    EXPECT_EQ(items["state"]["doc"]["lines"][0]["foreignName"], "Screen");

    json accounts = ask({"ReadACT", path})["state"]["accounts"];
    EXPECT_EQ(json({accounts["count"], accounts["loaded"]}), json({1, true}));
    EXPECT_EQ(ask({"FindAccount", "1001"})["result"], json::parse(R"({"Key": "1001",
        "Phone": "03-1234567", "Details": "לקוח קבוע", "District": "מרכז"})"));
    EXPECT_EQ(ask({"FindAccount", "9999"})["result"],
              json({{"Key", ""}, {"Phone", "ריק"}, {"Details", "ריק"}, {"District", "ריק"}}));
    EXPECT_EQ(ask({"CurrencyNames", 10})["result"], json({"יורו", "יורו"}));
    EXPECT_EQ(ask({"ReadAdf", path + "/nothing-here"})["result"], false);
    fails({"ReadACT", path + "/nothing-here"}, "ACT.fix");
}

TEST_F(HostSessionTest, MissingDocumentFileAnswersTheMessageBoxOnce) {
    TestCompany company(R"({"company": {"title": "x"}})");
    ask({"set", "txtCustomerName", "קודם"});
    json reply = ask({"ReadStock", company.path().string(), 13, "", "", "First", ""});
    ASSERT_EQ(reply["ok"], true) << reply;
    EXPECT_EQ(reply["result"], 0);
    EXPECT_EQ(reply["messages"], json::parse(R"([{"icon": "critical", "title": "שגיאה",
        "text": "קבצי מסמכים לא נמצאו", "buttons": "ok"}])"));
    EXPECT_EQ(reply["state"]["controls"]["txtCustomerName"], "קודם");
    EXPECT_EQ(ask({"state"})["messages"], json::array());
}

TEST_F(HostSessionTest, NumbersThatAreNotFiniteAreWrittenAsNull) {
    shared.Doc.header.foreignTotal = std::numeric_limits<double>::quiet_NaN();
    shared.Doc.header.totalBeforeDiscount = std::numeric_limits<double>::infinity();
    shared.Doc.amounts[7].price = -std::numeric_limits<double>::infinity();
    shared.Doc.amounts[7].quantity = 2;
    session.card().PubSearchValue = Variant(std::nan(""));
    json state = ask({"state"})["state"];
    const json& doc = state["doc"];
    EXPECT_EQ(json({doc["header"]["foreignTotal"], doc["header"]["totalBeforeDiscount"],
                    doc["amounts"]["7"]["price"], doc["amounts"]["7"]["quantity"],
                    state["PubSearchValue"]}),
              json({nullptr, nullptr, nullptr, 2, nullptr}));
}

TEST_F(HostSessionTest, TwoControlsOnOneThreadShareTheCompanyNotThePosition) {
    TestCompany company(kCompany);
    std::string path = company.path().string();
    json made = ask({"new", {{"SettingID", " 5 "}, {"AccountKey", "1001"}}})["state"];
    EXPECT_EQ(json({made["AppName"], made["controls"]["txtAccountKey"]}),
              json({"Dovrel5", "1001"}));
    EXPECT_EQ(ask({"call", "ShowDoc", path, 20, 2})["result"], 0);
    EXPECT_EQ(ask({"use", 2})["error"], "There is no control 2; make it with new2");
    // The second control's start-up loads the settings; the requests go to it until "use".
    EXPECT_EQ(ask({"new2"})["state"]["CompDir"], "c:\\comp02");
    ask({"call", "SetCompDir", path});
    EXPECT_EQ(ask({"call", "ACTLocation", 9})["state"]["PubACTLocation"], 9);
    EXPECT_EQ(ask({"use", 1})["state"]["PubACTLocation"], 2);
    fails({"use", 3}, "from 1 to 2");
}

TEST_F(HostSessionTest, CallsEventsAndTypedTextReachTheControl) {
    TestCompany company(kCompany);
    std::string path = company.path().string();
    ask({"call", "ShowDoc", path, 20, 1});
    fails({"call", "ACTLocation", "abc"}, "Type mismatch");
    EXPECT_EQ(ask({"call", "ACTLocation", 7.5})["state"]["PubACTLocation"], 8);
    // Typing a company path resets the position; typing the same one does not.
    ask({"set", "txtCompPath", path});
    EXPECT_EQ(ask({"state"})["state"]["PubACTLocation"], 8);
    EXPECT_EQ(ask({"set", "txtCompPath", path + "/"})["state"]["PubACTLocation"], 2);
    ask({"set", "CmbDocLang", 1});
    EXPECT_EQ(ask({"lostfocus", "cmbDocType"})["state"]["controls"]["txtTitle"], "Delivery Note");
    EXPECT_EQ(ask({"dblclick", "Nothing"})["error"], "Unknown control: Nothing");
    EXPECT_EQ(ask({"click", "FirstButt"})["state"]["grid"].size(), 4u);
}

TEST_F(HostSessionTest, QueuedUserActionsRunWhileTheFormIsShown) {
    ask({"modal", "frmOpenDir", {{"set", "txtTitle", "בחירה"}, {"state"}}});
    json reply = ask({"click", "CmdDir"});
    ASSERT_EQ(reply["ok"], true) << reply;
    EXPECT_EQ(reply["state"]["controls"]["txtTitle"], "בחירה");
    EXPECT_EQ(reply["state"]["forms"]["frmOpenDir"]["visible"], false);
    // The queue is used once; a failing action fails the click, form closed.
    ASSERT_EQ(ask({"modal", "frmOpenDir",
                   json::array({json::array({"click", "frmOpenDir.Nothing"})})})["ok"],
              true);
    fails({"click", "CmdDir"}, "Unknown control: frmOpenDir.Nothing");
    EXPECT_EQ(ask({"state"})["state"]["forms"]["frmOpenDir"]["visible"], false);
    EXPECT_EQ(ask({"set", "frmAccDetails.x", 1})["error"], "Form frmAccDetails is not loaded");
    // The control that shows the form cannot be replaced under it.
    ask({"modal", "frmOpenDir", json::array({json::array({"new"})})});
    EXPECT_EQ(ask({"click", "CmdDir"})["error"],
              "A control cannot be made while one of its forms is shown");
    fails({"modal", "frmOpenDir", "click"}, "");
}

TEST_F(HostSessionTest, AnswersAndClipboard) {
    fails({"answers", {"yes", "maybe"}}, "");
    ask({"answers", {"yes", "no"}});
    RecordedMessages& box = session.messages();
    for (MsgAnswer answer : {MsgAnswer::Yes, MsgAnswer::No, MsgAnswer::No}) // "no" once used up
        EXPECT_EQ(box.show(MsgIcon::Question, MsgButtons::YesNo, Utf8("t"), Utf8("q")), answer);
    session.clipboard().SetText(test::W("טלפון 03"));
    EXPECT_EQ(ask({"clipboard"})["result"], "טלפון 03");
}

TEST_F(HostSessionTest, TheChooserAndTheAccountWindowAreScripted) {
    test::TempDir main;
    json named = json::parse(kCompany);
    named["company"]["name"] = "דמו";
    sample::WriteCompany(named, main.path() / "comp01");
    sample::WriteCompany(R"({"company": {"name": "אחרת"}})", main.path() / "comp02");
    std::string dir = main.str();
    ask({"modal",
         "frmOpenDir",
         {{"set", "frmOpenDir.MainDir", dir},
          {"click", "frmOpenDir.cmdFindWizComp"},
          {"select", "frmOpenDir.cmbCompany", 1},
          {"click", "frmOpenDir.OKButton"}}});
    json chosen = ask({"click", "CmdDir"});
    ASSERT_EQ(chosen["ok"], true) << chosen;
    EXPECT_EQ(chosen["state"]["CompDir"], dir + "/comp01");
    json list = chosen["state"]["forms"]["frmOpenDir"]["controls"]["cmbCompany"];
    EXPECT_EQ(list["entries"], json::parse(R"(["אחרת", "דמו"])"));
    EXPECT_EQ(list["index"], 1);
    EXPECT_EQ(ask({"get", "frmOpenDir.MainDir"})["value"], dir);

    ask({"set", "txtAccountKey", "1001"});
    ask({"modal",
         "frmAccDetails",
         {{"select", "frmAccDetails.txtPhone", 3, 100},
          {"click", "frmAccDetails.cmdCopyText", 0}}});
    json copied = ask({"click", "cmdAccount"});
    ASSERT_EQ(copied["ok"], true) << copied;
    EXPECT_EQ(copied["state"]["forms"]["frmAccDetails"]["controls"]["txtDistrict"], "מרכז");
    EXPECT_EQ(copied["state"]["forms"]["frmAccDetails"]["selections"]["txtPhone"],
              json::parse(R"({"start": 3, "length": 7})"));
    EXPECT_EQ(ask({"clipboard"})["result"], "1234567");

    const std::pair<json, const char*> bad[] = {
        {{"select", "frmOpenDir.Msg1", 1}, "cannot be selected"},
        {{"select", "frmAccDetails.txtPhone", 1}, "takes 3 arguments"},
        {{"select", "frmAccDetails.txtPhone", -1, 2}, "selection start"},
        {{"click", "CmdDir", 1}, "not a control array"},
        {{"click", "frmAccDetails.cmdCopyText", 5},
         "Unknown control: frmAccDetails.cmdCopyText(5)"},
        {{"click", "frmAccDetails.cmdCopyText", 0}, "not shown"}};
    for (const auto& [request, words] : bad)
        fails(request, words);
}

TEST_F(HostSessionTest, PrintingOpensThePageAndFormGridsTakeTyping) {
    test::TempDir temp;
    test::ScopedEnv tmp("TMPDIR", temp.str());
    TestCompany company(kCompany);
    session.setToday({2026, 3, 4});
    ask({"call", "ShowDoc", company.path().string(), 20, 2});
    ask({"set", "CmbDocLang", 1});
    json printed = ask({"click", "PrintButt"});
    ASSERT_EQ(printed["opened"].size(), 1u) << printed;
    std::string page = test::ReadAll(printed["opened"][0].get<std::string>());
    EXPECT_NE(page.find("<Font class=TD1>03-04-2026</Font>"), std::string::npos);
    EXPECT_FALSE(ask({"state"}).contains("opened")) << "each opening is told once";

    // The picture settings form is loaded, hidden, at start-up.
    ask({"set", "frmItemPics.ItemPicLines", 0, 1, "key"});
    EXPECT_EQ(ask({"get", "frmItemPics.ItemPicLines"})["value"][0][1], "key");
    EXPECT_EQ(ask({"state"})["state"]["forms"]["frmItemPics"]["controls"]["ItemPicLines"][0][1],
              "key");
    EXPECT_TRUE(ask({"select", "frmItemPics.ItemPicLines", 0})["ok"]);
    EXPECT_FALSE(ask({"select", "frmItemPics.ItemPicLines", 5})["ok"]);
    EXPECT_FALSE(ask({"set", "frmItemPics.ItemPicLines", 0, 9, "x"})["ok"]);
    EXPECT_EQ(ask({"set", "txtTitle", 0, 0, "x"})["error"], "txtTitle has no cells");
}

} // namespace
} // namespace dovrel
