// `dovrel companies` and `dovrel account`: the chooser's list and the account
// window's texts on the command line.
#include "app/cli/CompaniesCommand.h"
#include "app/cli/AccountCommand.h"

#include "RunCli.h"
#include "TestCompany.h"
#include "platform/Error.h"

#include <gtest/gtest.h>

#include <sstream>

namespace dovrel {
namespace {

using nlohmann::json;
using test::TempDir;

std::string Companies(const std::string& dir, bool asJson, std::string* err = nullptr) {
    std::ostringstream out, errors;
    EXPECT_EQ(CompaniesCommand({dir, asJson}).run(out, errors), 0);
    if (err)
        *err = errors.str();
    return out.str();
}

std::string Account(const std::string& dir, const std::string& key, bool asJson) {
    std::ostringstream out;
    EXPECT_EQ(AccountCommand({dir, key, asJson}).run(out), 0);
    return out.str();
}

TEST(CompaniesCommandTest, ListsNamedCompaniesInTheChoosersOrder) {
    TempDir main;
    sample::WriteCompany(R"({"company": {"name": "בית"}})", main.path() / "b");
    sample::WriteCompany(R"({"company": {"name": "אלף"}})", main.path() / "a with space");
    sample::WriteCompany(R"({"company": {"name": "   "}})", main.path() / "blank");
    std::string dir = main.str();
    EXPECT_EQ(Companies(dir, false), "אלף\t" + dir + "/a with space\nבית\t" + dir + "/b\n");
    EXPECT_EQ(json::parse(Companies(dir + "/", true)), json::parse(R"([{"name": "אלף", "path": ")" +
                                                                   dir + R"(/a with space"},
                              {"name": "בית", "path": ")" + dir + R"(/b"}])"));

    std::string err;
    EXPECT_EQ(Companies(dir + "/blank", false, &err), "");
    EXPECT_NE(err.find("No companies found"), std::string::npos);
    EXPECT_EQ(Companies(dir + "/blank", true), "[]\n");
    std::ostringstream out;
    EXPECT_THROW(CompaniesCommand({dir + "/missing", false}).run(out, out), Error);
    EXPECT_THROW(CompaniesCommand({"", false}).run(out, out), Error);
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
}

TEST(CompaniesCommandTest, TheCommandRunsBoth) {
    TempDir main;
    sample::WriteCompany(
        R"({"company": {"name": "דמו"}, "accounts": [{"key": "1", "phone": "050"}]})",
        main.path() / "demo");
    std::string dir = main.str();
    test::CliResult listed = test::RunCli({"companies", dir, "--json"});
    EXPECT_EQ(listed.code, 0) << listed.err;
    EXPECT_EQ(json::parse(listed.out),
              json::parse(R"([{"name": "דמו", "path": ")" + dir + R"(/demo"}])"));
    test::CliResult shown = test::RunCli({"account", dir + "/demo", "1", "--json"});
    EXPECT_EQ(shown.code, 0) << shown.err;
    EXPECT_EQ(json::parse(shown.out)["phone"], "050");
    test::CliResult missing = test::RunCli({"companies", dir + "/no-such-dir"});
    EXPECT_EQ(missing.code, 1);
    EXPECT_NE(missing.err.find("no-such-dir"), std::string::npos);
}

} // namespace
} // namespace dovrel
