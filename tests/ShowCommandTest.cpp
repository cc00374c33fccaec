#include "app/cli/ShowCommand.h"

#include "TestCompany.h"
#include "app/cli/HostSession.h"
#include "platform/Error.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sstream>

namespace dovrel {
namespace {

using nlohmann::json;
using test::TestCompany;
using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::Not;
using ::testing::StartsWith;

const char* const kCompany = R"({
  "company": {"title": "דמו מחשבים", "currencies": ["יורו"]},
  "documents": [
    {"type": 30, "account": "1", "customer": "לא זה"},
    {"type": 20, "account": "1001", "customer": "משה כהן", "address1": "רחוב הרצל",
     "address2": "חיפה", "reference": "1234", "remarks": ["", "הערה שנייה", ""],
     "date": "2024-03-15", "vatPercent": 17,
     "lines": [
       {"key": "A100", "description": "מסך", "details": "שחור", "price": 100, "quantity": 2},
       {"key": "*", "description": "שורת טקסט"},
       {"key": "B200", "description": "מקלדת", "currency": 10, "price": 10.5,
        "quantity": 1.5, "discount": 12.5}
     ]},
    {"type": 20, "account": "1002", "customer": "דנה לוי", "date": "2024-04-01",
     "lines": [{"key": "C3", "price": 1, "quantity": 1}]}
  ]
})";

struct Output {
    int code = -1;
    std::string out;
    std::string err;
};

Output Show(ShowOptions options) {
    ModuleState shared;
    std::ostringstream out, err;
    Output result;
    result.code = ShowCommand(std::move(options), shared).run(out, err);
    result.out = out.str();
    result.err = err.str();
    return result;
}

// The line of the text that contains the word, and the display column where
// the word starts in it.
std::pair<std::string, size_t> Locate(const std::string& text, const std::string& word) {
    std::istringstream lines(text);
    for (std::string line; std::getline(lines, line);) {
        size_t at = line.find(word);
        if (at != std::string::npos)
            return {line, ShowCommand::DisplayWidth(line.substr(0, at))};
    }
    return {"", std::string::npos};
}

TEST(ShowCommandTest, PrintsTheDocumentInReadingOrder) {
    TestCompany company(kCompany);
    Output shown = Show({company.path().string(), 20, 2, false});
    ASSERT_EQ(shown.code, 0) << shown.err;
    EXPECT_EQ(shown.err, "");
    const std::string& text = shown.out;
    EXPECT_THAT(text, HasSubstr("דמו מחשבים\n"));
    EXPECT_THAT(text, HasSubstr("תעודת משלוח (20)"));
    EXPECT_THAT(text, HasSubstr("משה כהן"));
    EXPECT_THAT(text, HasSubstr("רחוב הרצל"));
    EXPECT_THAT(text, HasSubstr("חיפה"));
    EXPECT_THAT(text, HasSubstr("15/03/2024"));
    EXPECT_THAT(text, HasSubstr("1234"));
    EXPECT_THAT(text, Not(HasSubstr("לא זה")));
    EXPECT_THAT(text, Not(HasSubstr("דנה לוי")));

    // The lines: every column starts at the same display column as its
    // heading, although Hebrew letters take two bytes each.
    for (const char* heading : {"פריט", "תאור", "כמות", "מחיר", "מטבע"})
        EXPECT_NE(Locate(text, heading).second, std::string::npos) << heading;
    EXPECT_EQ(Locate(text, "A100").second, Locate(text, "פריט").second);
    EXPECT_EQ(Locate(text, "מקלדת").second, Locate(text, "תאור").second);
    EXPECT_EQ(Locate(text, "שורת טקסט").second, Locate(text, "תאור").second);
    EXPECT_EQ(Locate(text, "10.50").second, Locate(text, "מחיר").second);
    EXPECT_EQ(Locate(text, "יורו").second, Locate(text, "מטבע").second);
    EXPECT_THAT(Locate(text, "A100").first, HasSubstr("200.00"));

    EXPECT_THAT(Locate(text, "213.78").first, HasSubstr("סה\"כ:"));
    EXPECT_THAT(Locate(text, "36.34").first, HasSubstr("מע\"מ:"));
    EXPECT_THAT(Locate(text, "250.12").first, HasSubstr("סה\"כ כולל מע\"מ:"));
    EXPECT_THAT(text, HasSubstr("הערה שנייה"));
}

TEST(ShowCommandTest, StartTypeAndNothingFound) {
    TestCompany company(kCompany);
    std::string path = company.path().string();
    // The first delivery note takes records 2 to 6; from 4 on the next one shows.
    Output later = Show({path, 20, 4, false});
    EXPECT_EQ(later.code, 0);
    EXPECT_THAT(later.out, HasSubstr("דנה לוי"));

    Output order = Show({path, 30, 2, false});
    EXPECT_EQ(order.code, 0);
    EXPECT_THAT(order.out, HasSubstr("לא זה"));
    EXPECT_THAT(order.out, HasSubstr("הזמנת לקוח (30)"));

    Output none = Show({path, 20, 100, false});
    EXPECT_EQ(none.code, 0);
    EXPECT_EQ(none.out, "לא נמצא מסמך\n");

    // A code without a document type shows the first type, and says so.
    Output unknown = Show({path, 8, 2, false});
    EXPECT_THAT(unknown.err, HasSubstr("no document type 8"));
    EXPECT_EQ(unknown.out, "לא נמצא מסמך\n");
}

TEST(ShowCommandTest, MissingFilesAndDirectories) {
    TestCompany company(R"({"company": {"title": "ריקה"}})");
    Output shown = Show({company.path().string(), 20, 2, false});
    EXPECT_EQ(shown.code, 1);
    EXPECT_EQ(shown.out, "");
    EXPECT_EQ(shown.err, "dovrel: שגיאה: קבצי מסמכים לא נמצאו\n");

    std::string missing = company.path().string() + "/no-such-company";
    try {
        Show({missing, 20, 2, false});
        ADD_FAILURE() << "a missing directory was accepted";
    } catch (const Error& e) {
        EXPECT_THAT(e.what(), HasSubstr("Company directory not found"));
        EXPECT_THAT(e.what(), HasSubstr("no-such-company"));
    }
    EXPECT_THROW(Show({company.path().string(), 20, 0, false}), Error);
}

TEST(ShowCommandTest, JsonIsTheHostsState) {
    TestCompany company(kCompany);
    std::string path = company.path().string();
    Output shown = Show({path, 20, 2, true});
    ASSERT_EQ(shown.code, 0) << shown.err;
    json state = json::parse(shown.out);
    EXPECT_EQ(state["CompDir"], path);
    EXPECT_EQ(state["controls"]["txtCustomerName"], "משה כהן");

    ModuleState shared;
    HostSession session(shared);
    session.handle(json({"ReadAdf", path}).dump());
    session.handle(R"(["set", "PubACTLocation", 1])");
    json reply = json::parse(
        *session.handle(json({"ReadStock", path, 13, "", "", "Next", "01/01/1980"}).dump()));
    ASSERT_EQ(reply["ok"], true);
    json hostState = reply["state"];
    // The host's ReadStock leaves the company directory alone; show sets it
    // as the control's ShowDoc does.
    EXPECT_EQ(hostState["CompDir"], "");
    state.erase("CompDir");
    hostState.erase("CompDir");
    EXPECT_EQ(state, hostState);
}

TEST(ShowCommandTest, ShowsTheScanProgressWhenAsked) {
    TestCompany company(R"({"documents": [{"file": "ISHP.FIX", "filler": 30},
        {"type": 20, "customer": "אחרי", "lines": [{"key": "A", "price": 1, "quantity": 1}]}]})");
    ModuleState shared;
    std::ostringstream out, err, progress;
    ShowCommand command({company.path().string(), 20, 2, false}, shared);
    command.setProgress(&progress);
    EXPECT_EQ(command.run(out, err), 0);
    EXPECT_THAT(out.str(), HasSubstr("אחרי"));
    EXPECT_THAT(progress.str(), StartsWith("\r"));
    EXPECT_THAT(progress.str(), HasSubstr("%"));
    EXPECT_THAT(progress.str(), EndsWith("\r     \r"));
}

} // namespace
} // namespace dovrel
