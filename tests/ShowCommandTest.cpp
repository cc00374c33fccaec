#include "app/cli/ShowCommand.h"

#include "TestCompany.h"
#include "app/session/HostSession.h"
#include "platform/Error.h"
#include "platform/Variant.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <locale>
#include <sstream>
#include <tuple>
#include <utility>

namespace dovrel {
namespace {

using nlohmann::json;
using ::testing::ContainsRegex, ::testing::HasSubstr, ::testing::MatchesRegex, ::testing::Not;

const char* const kCompany = R"({"company": {"title": "דמו מחשבים", "currencies": ["יורו"]},
  "documents": [{"type": 20, "customer": "משה כהן", "address1": "רחוב הרצל", "address2": "חיפה",
     "reference": "1234", "remarks": ["", "הערה שנייה", ""], "date": "2024-03-15", "lines": [
       {"key": "A100", "description": "מסך", "price": 100, "quantity": 2},
       {"key": "B200", "description": "מקלדת", "currency": 10, "price": 10.5,
        "quantity": 1.5, "discount": 12.5}]},
    {"type": 20, "customer": "דנה לוי", "lines": [{"key": "C3", "price": 1, "quantity": 1}]},
    {"file": "ISHP.FIX", "filler": 30}]})";

struct Output {
    int code = -1;
    std::string out, err, progress;
};

Output Show(ShowOptions options) {
    ModuleState shared;
    std::ostringstream out, err, progress;
    ShowCommand command(std::move(options), shared);
    command.setProgress(&progress);
    int code = command.run(out, err);
    return {code, out.str(), err.str(), progress.str()};
}

// The display column where the word starts in the first line that holds it.
size_t ColumnOf(const std::string& text, const std::string& word) {
    std::istringstream lines(text);
    for (std::string line; std::getline(lines, line);)
        if (size_t at = line.find(word); at != std::string::npos)
            return ShowCommand::DisplayWidth(line.substr(0, at));
    ADD_FAILURE() << word << " is not shown";
    return std::string::npos;
}

// A decimal comma for the whole process: the German locale when it is
// installed (it reaches printf too), else a facet of our own.
struct CommaLocale {
    std::locale saved = std::locale();
    CommaLocale() {
        struct Comma : std::numpunct<char> {
            char do_decimal_point() const override { return ','; }
        };
        try {
            std::locale::global(std::locale("de_DE.UTF-8"));
        } catch (const std::runtime_error&) {
            std::locale::global(std::locale(std::locale::classic(), new Comma));
        }
        std::ostringstream probe;
        probe << 1.5;
        EXPECT_EQ(probe.str(), "1,5") << "the locale must format with a comma";
    }
    ~CommaLocale() { std::locale::global(saved); }
};

TEST(ShowCommandTest, NumbersReadWithAPointUnderAnyLocale) {
    test::TestCompany company(kCompany);
    CommaLocale comma;
    Output shown = Show({company.path().string(), 20, 2, false});
    ASSERT_EQ(shown.code, 0) << shown.err;
    EXPECT_THAT(shown.out, HasSubstr("10.50"));
    EXPECT_THAT(shown.out, ContainsRegex("\\b1\\.5\\b"));
    EXPECT_THAT(shown.out, HasSubstr("213.78"));
    Output json = Show({company.path().string(), 20, 2, true});
    EXPECT_THAT(json.out, Not(HasSubstr("1,5")));
    EXPECT_EQ(Variant(1.5).toText(), "1.5");
}

TEST(ShowCommandTest, PrintsTheFirstDocumentOfTheTypeFromTheStartRecordOrItsState) {
    test::TestCompany company(kCompany);
    std::string path = company.path().string();
    Output shown = Show({path, 20, 2, false});
    ASSERT_EQ(shown.code, 0) << shown.err;
    EXPECT_EQ(shown.err, "");
    for (const char* part : {"דמו מחשבים\n", "תעודת משלוח (20)", "משה כהן", "רחוב הרצל", "חיפה",
                             "15/03/2024", "1234", "הערה שנייה"})
        EXPECT_THAT(shown.out, HasSubstr(part));
    EXPECT_THAT(shown.out, Not(HasSubstr("דנה לוי")));
    // Columns line up on the screen although Hebrew letters take two bytes each.
    for (auto [cell, heading] :
         {std::pair{"A100", "פריט"}, {"מקלדת", "תאור"}, {"10.50", "מחיר"}, {"יורו", "מטבע"}})
        EXPECT_EQ(ColumnOf(shown.out, cell), ColumnOf(shown.out, heading)) << cell;
    EXPECT_THAT(shown.out, ContainsRegex("\nסה\"כ: +213.78\nמע\"מ: +36.34\n"
                                         "סה\"כ כולל מע\"מ: +250.12\n"));
    // The first delivery note takes records 2 to 5; from 4 on the next one shows.
    EXPECT_THAT(Show({path, 20, 4, false}).out, HasSubstr("דנה לוי"));
    // Nothing after record 9: the scan's progress shows, then the line is cleared.
    Output none = Show({path, 20, 9, false});
    EXPECT_EQ(std::tie(none.code, none.out), std::make_tuple(3, ""));
    EXPECT_THAT(none.err, HasSubstr("לא נמצא מסמך"));
    EXPECT_THAT(none.progress, MatchesRegex("\r[0-9]+%.*\r     \r"));
    EXPECT_THROW(Show({path, 8, 2, false}), Error); // no document type 8

    // As JSON the output is the document as `dovrel export` writes it.
    json record = json::parse(Show({path, 20, 2, true}).out);
    EXPECT_EQ(json({record["customer"], record["reference"], record["lines"][0]["key"]}),
              json({"משה כהן", "1234", "A100"}));
}

TEST(ShowCommandTest, MissingFilesAndDirectories) {
    test::TestCompany company(R"({"company": {"title": "ריקה"}})");
    std::string path = company.path().string();
    Output shown = Show({path, 20, 2, false});
    EXPECT_EQ(std::tie(shown.code, shown.out, shown.err),
              std::make_tuple(1, "", "dovrel: שגיאה: קבצי מסמכים לא נמצאו\n"));
    EXPECT_THROW(Show({path + "/no-such-company", 20, 2, false}), Error);
    EXPECT_THROW(Show({path, 20, 0, false}), Error);
}

} // namespace
} // namespace dovrel
