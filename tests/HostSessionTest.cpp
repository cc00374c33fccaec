#include "app/cli/HostSession.h"

#include "TestCompany.h"
#include "app/cli/CardMembers.h"
#include "app/cli/StateJson.h"
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
  "accounts": [
    {"key": "1001", "phone": "03-1234567", "district": "מרכז", "details": "לקוח קבוע"},
    {"key": "2002", "phone": "04-7654321"}
  ],
  "items": [{"key": "A100", "category": "07", "foreignName": "Screen"}],
  "documents": [
    {"type": 20, "account": "1001", "customer": "משה כהן", "address1": "רחוב הרצל",
     "address2": "חיפה", "reference": "1234", "remarks": ["הערה אחת", "", ""],
     "date": "2024-03-15", "vatPercent": 17, "warehouse": 3,
     "lines": [
       {"key": "A100", "description": "מסך", "details": "שחור", "currency": 21,
        "price": 100, "quantity": 2},
       {"key": "B200", "description": "מקלדת", "currency": 10, "price": 10.5,
        "quantity": 1.5, "discount": 12.5}
     ]}
  ]
})";

class HostSessionTest : public ::testing::Test {
protected:
    json ask(const json& request) { return askLine(request.dump()); }
    json askLine(const std::string& line) {
        std::optional<std::string> reply = session.handle(line);
        EXPECT_TRUE(reply.has_value()) << line;
        EXPECT_EQ(reply->find('\n'), std::string::npos);
        return json::parse(reply.value_or("null"));
    }
    // Asks and expects a failure whose description mentions the given words.
    void expectFailure(const std::string& line, const std::string& words) {
        json reply = askLine(line);
        EXPECT_EQ(reply["ok"], false) << line;
        ASSERT_TRUE(reply.contains("error")) << line;
        EXPECT_NE(reply["error"].get<std::string>().find(words), std::string::npos)
            << line << " -> " << reply["error"];
        EXPECT_FALSE(reply.contains("state"));
    }

    ModuleState shared;
    HostSession session{shared};
};

TEST_F(HostSessionTest, BadRequestsFailAndTheSessionGoesOn) {
    expectFailure("not json", "Bad JSON");
    expectFailure("{\"command\": \"state\"}", "JSON array");
    expectFailure("[]", "JSON array");
    expectFailure("[5, 1]", "JSON array");
    expectFailure("[\"Explode\"]", "Unknown command: Explode");
    expectFailure("[\"state\", 1]", "takes 0 arguments, got 1");
    expectFailure("[\"FindAccount\"]", "takes 1 argument, got 0");
    expectFailure("[\"ReadStock\", \"/tmp\", \"13\", \"\", \"\", \"Next\", \"\"]", "argument 2");
    expectFailure("[\"ReadStock\", \"/tmp\", 13.5, \"\", \"\", \"Next\", \"\"]", "whole number");
    expectFailure("[\"ReadStock\", \"/tmp\", 13, \"\", [1], \"Next\", \"\"]", "argument 4");
    expectFailure("[\"ReadStock\", 5, 13, \"\", \"\", \"Next\", \"\"]", "must be a string");
    expectFailure("[\"set\", \"NoSuchBox\", 1]", "Unknown member or control: NoSuchBox");
    expectFailure("[\"set\", \"DocLines\", 1]", "cannot be set");
    expectFailure("[\"get\", 5]", "must be a string");

    EXPECT_FALSE(session.handle("").has_value());
    EXPECT_FALSE(session.handle("   \r").has_value());

    json reply = ask({"state"});
    EXPECT_EQ(reply["ok"], true);
    EXPECT_EQ(reply["messages"], json::array());
    EXPECT_EQ(reply["state"]["PubACTLocation"], 2);
    EXPECT_FALSE(reply.contains("result"));
}

TEST_F(HostSessionTest, SetAndGetRoundTripEachKind) {
    ask({"set", "PubACTLocation", 10});
    EXPECT_EQ(ask({"get", "PubACTLocation"})["value"], 10);
    ask({"set", "PubPrevLocation", -3});
    EXPECT_EQ(ask({"get", "PubPrevLocation"})["value"], -3);
    expectFailure(R"(["set", "PubACTLocation", 1.5])", "whole number");
    expectFailure(R"(["set", "PubACTLocation", 3000000000])", "whole number");
    EXPECT_EQ(session.card().PubACTLocation, 10);

    ask({"set", "PubSearchBy", "CustomerName"});
    EXPECT_EQ(ask({"get", "PubSearchBy"})["value"], "CustomerName");
    for (json value : {json(nullptr), json(3.5), json("כהן"), json(true)}) {
        json reply = ask({"set", "PubSearchValue", value});
        EXPECT_EQ(reply["state"]["PubSearchValue"], value);
        EXPECT_EQ(ask({"get", "PubSearchValue"})["value"], value);
    }
    EXPECT_EQ(session.card().PubSearchValue, Variant(true));
    ask({"set", "PubSearchValue", nullptr});
    EXPECT_TRUE(session.card().PubSearchValue.isNull());

    // Text boxes take UTF-8 and hold code page 1255.
    json reply = ask({"set", "txtItemKey", "מק\"ט 7"});
    EXPECT_EQ(reply["state"]["controls"]["txtItemKey"], "מק\"ט 7");
    EXPECT_EQ(session.card().txtItemKey.Text(), test::W("מק\"ט 7"));
    EXPECT_EQ(ask({"get", "txtItemKey"})["value"], "מק\"ט 7");
    EXPECT_EQ(ask({"get", "ProgressFrame"})["value"], 3015);
    expectFailure(R"(["set", "txtItemKey", 5])", "must be a string");
}

TEST(CardMembersTest, ListsAndCheckBoxesTakeWholeNumbers) {
    ComboBox list("cmbTest");
    list.AddItem("a");
    list.AddItem("b");
    CardMembers::SetControl(list, 1);
    EXPECT_EQ(StateJson::ControlValue(list), 1);
    CardMembers::SetControl(list, -1);
    EXPECT_EQ(StateJson::ControlValue(list), -1);
    EXPECT_THROW(CardMembers::SetControl(list, 2), Error);
    EXPECT_THROW(CardMembers::SetControl(list, "1"), Error);

    CheckBox check("chkTest");
    CardMembers::SetControl(check, 2);
    EXPECT_EQ(StateJson::ControlValue(check), 2);
    EXPECT_THROW(CardMembers::SetControl(check, 3), Error);
    EXPECT_THROW(CardMembers::SetControl(check, true), Error);
    EXPECT_EQ(StateJson::ControlValue(check), 2);
}

TEST_F(HostSessionTest, ReadStockAnswersResultControlsGridAndDocument) {
    TestCompany company(kCompany);
    std::string path = company.path().string();
    EXPECT_EQ(ask({"ReadAdf", path})["result"], true);
    ask({"set", "PubACTLocation", 1});
    json reply = ask({"ReadStock", path, 13, "", "", "Next", "01/01/1980"});
    ASSERT_EQ(reply["ok"], true) << reply;
    // Filler record 1, header 2, continuation 3, lines 4 and 5.
    EXPECT_EQ(reply["result"], 5);
    EXPECT_EQ(reply["messages"], json::array());
    const json& state = reply["state"];
    EXPECT_EQ(state["PubACTLocation"], 2);
    EXPECT_EQ(state["PubPrevLocation"], 2);

    const json& controls = state["controls"];
    EXPECT_EQ(controls["txtAccountKey"], "1001");
    EXPECT_EQ(controls["txtCustomerName"], "משה כהן");
    EXPECT_EQ(controls["txtAddress1"], "רחוב הרצל");
    EXPECT_EQ(controls["txtAddress2"], "חיפה");
    EXPECT_EQ(controls["txtReference1"], "1234");
    EXPECT_EQ(controls["txtDate"], "15/03/2024");
    EXPECT_EQ(controls["txtTotalVat"], "213.78");
    EXPECT_EQ(controls["txtVatValue"], "36.34");
    EXPECT_EQ(controls["txtTotal1"], "250.12");

    const json& grid = state["grid"];
    ASSERT_EQ(grid.size(), 4u);
    EXPECT_EQ(grid[0][0], "שורה");
    EXPECT_EQ(grid[1], json({"1", "A100", "מסך", "שחור", "2", "100.00", "ש", "200.00"}));
    EXPECT_EQ(grid[2], json({"2", "B200", "מקלדת", "", "1.5", "10.50", "יורו", "13.78"}));
    EXPECT_EQ(grid[3], json(std::vector<std::string>(8, "")));
    EXPECT_EQ(state["progress"]["fill"], 0);
    EXPECT_EQ(state["progress"]["frame"], 3015);

    const json& doc = state["doc"];
    EXPECT_EQ(doc["lineCount"], 2);
    EXPECT_EQ(doc["header"]["type"], 20);
    EXPECT_EQ(doc["header"]["warehouse"], 3);
    EXPECT_DOUBLE_EQ(doc["header"]["totalBeforeDiscount"].get<double>(), 213.78125);
    EXPECT_DOUBLE_EQ(doc["header"]["foreignTotal"].get<double>(), 213.78125);
    EXPECT_EQ(doc["header"]["remarksLogical"], json({"הערה אחת", "", ""}));
    EXPECT_EQ(doc["header"]["customerVisual"], "ןהכ השמ");
    ASSERT_EQ(doc["lines"].size(), 2u);
    EXPECT_EQ(doc["lines"][0]["itemKey"], "A100        ");
    EXPECT_EQ(doc["lines"][1]["descriptionVisual"], "תדלקמ");
    EXPECT_EQ(doc["amounts"].size(), 2u);
    EXPECT_EQ(doc["amounts"]["2"],
              json({{"price", 10.5}, {"currency", 10}, {"quantity", 1.5}, {"discount", 12.5}}));

    json items = ask({"ReadITM", path});
    EXPECT_EQ(items["result"], true);
    EXPECT_EQ(items["state"]["doc"]["lines"][0]["catCode"], "07 ");
    EXPECT_EQ(items["state"]["doc"]["lines"][0]["foreignName"], "Screen");
}

TEST_F(HostSessionTest, MissingDocumentFileAnswersTheMessageBox) {
    TestCompany company(R"({"company": {"title": "x"}})");
    ask({"set", "txtCustomerName", "קודם"});
    json reply = ask({"ReadStock", company.path().string(), 13, "", "", "First", ""});
    ASSERT_EQ(reply["ok"], true) << reply;
    EXPECT_EQ(reply["result"], 0);
    EXPECT_EQ(reply["messages"], json::parse(R"([{"icon": "critical", "title": "שגיאה",
        "text": "קבצי מסמכים לא נמצאו", "buttons": "ok"}])"));
    EXPECT_EQ(reply["state"]["controls"]["txtCustomerName"], "קודם");
    // A message is answered once, not again with the next request.
    EXPECT_EQ(ask({"state"})["messages"], json::array());
}

TEST_F(HostSessionTest, DamagedAmountIsReportedAndTheSessionGoesOn) {
    TestCompany company(R"({"documents": [{"type": 20, "lines": [
        {"key": "A1", "price": {"hex": "00 00 00 00 00 00 F8 7F"}, "quantity": 1}]}]})");
    json reply = ask({"ReadStock", company.path().string(), 13, "", "", "First", ""});
    ASSERT_EQ(reply["ok"], true) << reply;
    EXPECT_EQ(reply["result"], 0);
    ASSERT_EQ(reply["messages"].size(), 1u);
    EXPECT_EQ(reply["messages"][0]["title"], "שגיאה");
    EXPECT_EQ(ask({"get", "PubSearchBy"})["ok"], true);
}

TEST_F(HostSessionTest, AccountsAndCurrencies) {
    TestCompany company(kCompany);
    std::string path = company.path().string();
    json loaded = ask({"ReadACT", path});
    EXPECT_EQ(loaded["result"], true);
    EXPECT_EQ(loaded["state"]["accounts"], json({{"count", 2}, {"loaded", true}}));

    json found = ask({"FindAccount", "1001"})["result"];
    EXPECT_EQ(found, json({{"Key", "1001"},
                           {"Phone", "03-1234567"},
                           {"Details", "לקוח קבוע"},
                           {"District", "מרכז"}}));
    json missing = ask({"FindAccount", "9999"})["result"];
    EXPECT_EQ(missing,
              json({{"Key", ""}, {"Phone", "ריק"}, {"Details", "ריק"}, {"District", "ריק"}}));

    EXPECT_EQ(ask({"CurrencyNames", 2})["result"], json({"לש", "£"}));
    EXPECT_EQ(ask({"CurrencyNames", 0})["result"], json({"", ""}));
    EXPECT_EQ(ask({"CurrencyNames", 12})["result"], json({"12", "12"}));
    EXPECT_EQ(ask({"ReadAdf", path})["result"], true);
    EXPECT_EQ(ask({"CurrencyNames", 10})["result"], json({"יורו", "יורו"}));
    EXPECT_EQ(ask({"ReadAdf", path + "/nothing-here"})["result"], false);

    json failed = ask({"ReadACT", path + "/nothing-here"});
    EXPECT_EQ(failed["ok"], false);
    EXPECT_FALSE(failed["error"].get<std::string>().empty());
}

TEST_F(HostSessionTest, NumbersThatAreNotFiniteAreWrittenAsNull) {
    shared.Doc.header.foreignTotal = std::numeric_limits<double>::quiet_NaN();
    shared.Doc.header.totalBeforeDiscount = std::numeric_limits<double>::infinity();
    shared.Doc.amounts[7].price = -std::numeric_limits<double>::infinity();
    shared.Doc.amounts[7].quantity = 2;
    session.card().PubSearchValue = Variant(std::nan(""));
    std::optional<std::string> line = session.handle(R"(["state"])");
    ASSERT_TRUE(line);
    json state = json::parse(*line)["state"];
    EXPECT_TRUE(state["doc"]["header"]["foreignTotal"].is_null());
    EXPECT_TRUE(state["doc"]["header"]["totalBeforeDiscount"].is_null());
    EXPECT_TRUE(state["doc"]["amounts"]["7"]["price"].is_null());
    EXPECT_EQ(state["doc"]["amounts"]["7"]["quantity"], 2);
    EXPECT_TRUE(state["PubSearchValue"].is_null());
}

TEST_F(HostSessionTest, ServeAnswersEveryLineAndFlushes) {
    std::istringstream in("[\"get\", \"PubACTLocation\"]\n\n{oops\n[\"Nope\"]\n");
    std::ostringstream out;
    EXPECT_EQ(session.serve(in, out), 0);
    std::istringstream lines(out.str());
    std::vector<json> replies;
    for (std::string line; std::getline(lines, line);)
        replies.push_back(json::parse(line));
    ASSERT_EQ(replies.size(), 3u);
    EXPECT_EQ(replies[0]["value"], 2);
    EXPECT_EQ(replies[1]["ok"], false);
    EXPECT_EQ(replies[2]["ok"], false);
}

} // namespace
} // namespace dovrel
