// `dovrel print`: one page or a run of pages of a company's documents,
// printed with the user's saved settings.

#include "app/cli/PrintCommand.h"
#include "RunCli.h"
#include "TestCompany.h"
#include "platform/Error.h"

#include <gtest/gtest.h>

#include <filesystem>

namespace dovrel {
namespace {

using test::Doc;
using test::Line;
using test::ReadAll;
using test::RunCli;
namespace fs = std::filesystem;

class PrintCommandTest : public ::testing::Test {
protected:
    test::TempDir temp;
    test::ScopedEnv config{"XDG_CONFIG_HOME", (temp.path() / "config").string()};
};

TEST_F(PrintCommandTest, OnePageWithTheSavedLanguageOrTheOneGiven) {
    test::TestCompany company(nlohmann::json{
        {"documents",
         {Doc(20, "100", "A", {Line("A1", "x")}), Doc(21, "200", "B"),
          Doc(20, "101", "C")}}}.dump());
    std::string page = (temp.path() / "page.htm").string();
    auto result = RunCli({"print", company.path().string(), "--out", page, "--no-open", "--today",
                          "2026-02-03", "--start", "3"});
    ASSERT_EQ(result.code, 0) << result.err;
    EXPECT_EQ(result.out, page + "\n");
    std::string text = ReadAll(page);
    // The control's default language is English; the first delivery note at
    // or after record 3 is 101 (record 3 holds the continuation of 100).
    EXPECT_NE(text.find("<Font class=TD1>02-03-2026</Font>\r\n"), std::string::npos);
    EXPECT_NE(text.find("&nbsp;101</Font>\r\n"), std::string::npos);

    // A saved language is used: Hebrew without amounts.
    ASSERT_EQ(RunCli({"settings", "set", "DocLang", "2"}).code, 0);
    ASSERT_EQ(RunCli({"print", company.path().string(), "--out", page, "--no-open"}).code, 0);
    EXPECT_NE(ReadAll(page).find("name='Sel1'"), std::string::npos);
    ASSERT_EQ(
        RunCli({"print", company.path().string(), "--out", page, "--no-open", "--lang", "0"}).code,
        0);
    EXPECT_EQ(ReadAll(page).find("name='Sel1'"), std::string::npos);
}

TEST_F(PrintCommandTest, SeveralPagesGoIntoAFolderNamedByReference) {
    test::TestCompany company(nlohmann::json{
        {"documents",
         {Doc(20, "7/1", "A"), Doc(20, "7/1", "B"), Doc(20, "", "C"), Doc(21, "9", "D"),
          Doc(20, "8", "E")}}}.dump());
    fs::path folder = temp.path() / "pages";
    fs::create_directory(folder);
    auto result = RunCli({"print", company.path().string(), "--count", "10", "--out",
                          folder.string(), "--lang", "1"});
    ASSERT_EQ(result.code, 0) << result.err;
    std::vector<std::string> names;
    for (const auto& entry : fs::directory_iterator(folder))
        names.push_back(entry.path().filename().string());
    std::sort(names.begin(), names.end());
    EXPECT_EQ(names, (std::vector<std::string>{"20-7_1-2.htm", "20-7_1.htm", "20-8.htm",
                                               "20-document.htm"}));
    EXPECT_NE(result.err.find("4 pages written"), std::string::npos);
    EXPECT_NE(ReadAll(folder / "20-8.htm").find("<TD colspan='3' align='left' class=TD1>E</TD>"),
              std::string::npos);
}

TEST_F(PrintCommandTest, BadRequestsAreToldPlainly) {
    test::TestCompany company(nlohmann::json{{"documents", {Doc(21, "1", "A")}}}.dump());
    std::string dir = company.path().string();
    auto expectFailure = [](const std::vector<std::string>& args, const std::string& words) {
        auto result = RunCli(args);
        EXPECT_NE(result.code, 0);
        EXPECT_NE(result.err.find(words), std::string::npos) << result.err;
    };
    expectFailure({"print", dir, "--no-open"}, "no document of type 20");
    expectFailure({"print", dir, "--type", "21", "--count", "2"}, "--out");
    expectFailure({"print", dir, "--type", "21", "--lang", "3"}, "--lang");
    expectFailure({"print", dir, "--type", "21", "--no-open", "--out",
                   (temp.path() / "missing" / "p.htm").string()},
                  "Cannot write the page");

    EXPECT_EQ(PrintCommand::PageName(20, " a/b c "), "20-a_b c");
    EXPECT_EQ(PrintCommand::PageName(1, ".\x01אב"), "1-__אב");
    EXPECT_EQ(PrintCommand::PageName(7, "   "), "7-document");
    EXPECT_EQ(PrintCommand::ParseDay("2024-02-29").day, 29);
    EXPECT_THROW(PrintCommand::ParseDay("2024-2-29"), Error);
}

} // namespace
} // namespace dovrel
