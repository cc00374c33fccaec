// `dovrel companies` and `dovrel account`: the chooser's list and the account
// window's texts on the command line.
#include "app/cli/CompaniesCommand.h"
#include "app/cli/AccountCommand.h"

#include "RunCli.h"
#include "TestCompany.h"
#include "platform/Error.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <sstream>

#include <stdlib.h>

namespace dovrel {
namespace {

using nlohmann::json;

// The listing's output, then what it wrote to the error stream.
std::pair<std::string, std::string> Companies(const std::string& dir, bool asJson) {
    std::ostringstream out, errors;
    int code = CompaniesCommand({dir, asJson}).run(out, errors);
    EXPECT_EQ(code, errors.str().empty() ? 0 : 3); // 3: none found
    return {out.str(), errors.str()};
}

std::string Account(const std::string& dir, const std::string& key, bool asJson) {
    std::ostringstream out;
    int code = AccountCommand({dir, key, asJson}).run(out);
    EXPECT_EQ(code, out.str().find("ריק") == std::string::npos ? 0 : 3); // 3: not found
    return out.str();
}

json Listed(const std::string& name, const std::string& path) {
    return {{"name", name}, {"path", path}};
}

TEST(CompaniesCommandTest, ListsNamedCompaniesInTheChoosersOrder) {
    test::TempDir main;
    sample::WriteCompany(R"({"company": {"name": "בית"}})", main.path() / "b");
    sample::WriteCompany(R"({"company": {"name": "אלף"}})", main.path() / "a with space");
    sample::WriteCompany(R"({"company": {"name": "   "}})", main.path() / "blank");
    std::string dir = main.str();
    EXPECT_EQ(Companies(dir, false).first, "אלף\t" + dir + "/a with space\nבית\t" + dir + "/b\n");
    EXPECT_EQ(json::parse(Companies(dir + "/", true).first),
              json::array({Listed("אלף", dir + "/a with space"), Listed("בית", dir + "/b")}));

    auto [none, err] = Companies(dir + "/blank", false);
    EXPECT_EQ(none, "");
    EXPECT_NE(err.find("No companies found"), std::string::npos);
    EXPECT_EQ(Companies(dir + "/blank", true).first, "[]\n");
    std::ostringstream out;
    EXPECT_THROW(CompaniesCommand({dir + "/missing", false}).run(out, out), Error);
    EXPECT_THROW(CompaniesCommand({"", false}).run(out, out), Error);
}

// Folders the Hebrew code page cannot name (Cyrillic) are listed and used
// under their own names.
TEST(CompaniesCommandTest, FoldersOfAnyNameWork) {
    test::TempDir main;
    std::filesystem::path folder = main.path() / "Документы";
    setenv("XDG_CONFIG_HOME", (main.path() / "config").c_str(), 1);
    nlohmann::json company = {{"company", {{"name", "אלף"}}},
                              {"documents", {test::Doc(20, "7", "A")}}};
    sample::WriteCompany(company.dump(), folder / "Компания");
    test::CliResult shown = test::RunCli({"show", (folder / "Компания").string()});
    EXPECT_EQ(shown.code, 0) << shown.err;
    std::string page = (folder / "page.htm").string();
    test::CliResult printed =
        test::RunCli({"print", (folder / "Компания").string(), "--out", page, "--no-open"});
    EXPECT_EQ(printed.out, page + "\n") << printed.err;
    test::CliResult listed = test::RunCli({"companies", folder.string(), "--json"});
    EXPECT_EQ(json::parse(listed.out), json::array({Listed("אלף", (folder / "Компания").string())}))
        << listed.err;
    auto pictures = [&](std::vector<std::string> args) {
        args.insert(args.begin(), {"pictures", "--db", folder.string()});
        return test::RunCli(args);
    };
    EXPECT_EQ(pictures({"init"}).code, 0);
    EXPECT_EQ(pictures({"add", "1", "2", "p.jpg"}).out, "Added range 1\n");
    EXPECT_TRUE(std::filesystem::is_regular_file(folder / "Dovrel.def"));
    unsetenv("XDG_CONFIG_HOME");
}

TEST(CompaniesCommandTest, ShowsAnAccountOrEmptyWords) {
    test::TestCompany company(R"({"accounts": [
        {"key": "AB12", "phone": "03-1234567", "district": "מרכז", "details": "לקוח"}]})");
    std::string dir = company.path().string();
    EXPECT_EQ(Account(dir, " ab12 ", false), "טלפונים: 03-1234567\nפרטים: לקוח\nשכונה: מרכז\n");
    EXPECT_EQ(json::parse(Account(dir, "nope", true)),
              json::parse(R"({"key": "nope", "found": false, "phone": "ריק",
                              "details": "ריק", "district": "ריק"})"));
    std::ostringstream out;
    EXPECT_THROW(AccountCommand({dir, "  ", false}).run(out), Error);
    EXPECT_THROW(AccountCommand({dir + "/missing", "AB12", false}).run(out), Error);

    test::CliResult shown = test::RunCli({"account", dir, "ab12", "--json"});
    EXPECT_EQ(shown.code, 0) << shown.err;
    EXPECT_EQ(json::parse(shown.out)["phone"], "03-1234567");
}

} // namespace
} // namespace dovrel
