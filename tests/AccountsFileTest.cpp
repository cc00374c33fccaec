#include "fixfiles/AccountsFile.h"

#include "TestCompany.h"
#include "platform/Error.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

namespace dovrel {
namespace {

using nlohmann::json;
using test::TestCompany;
using test::W;

struct Progress {
    Shape frame{"ProgressFrame", 0, 0, 3015, 495};
    Shape fill{"ProgressFill", 0, 0, 0, 495};
    bool moved = false;

    Progress() {
        fill.changed.connect([this] { moved = moved || fill.Width() > 0; });
    }
    ProgressBar bar() { return ProgressBar{frame, fill}; }
};

json Account(const std::string& key, const json& phone, const std::string& district,
             const std::string& details) {
    return {{"key", key},
            {"name", "x"},
            {"phone", phone},
            {"district", district},
            {"details", details}};
}

std::vector<std::string> Keys(const AccountsTable& table) {
    std::vector<std::string> keys;
    for (const AccountEntry& entry : table.Accounts)
        keys.push_back(entry.Key);
    return keys;
}

TEST(AccountsFileTest, LoadsEveryAccountInFileOrder) {
    TestCompany company(json{{"accounts",
                              {Account("1001", "03-1234567", "מרכז", "לקוח קבוע"),
                               Account("", "09-0000000", "צפון", "skipped"),
                               Account("ab1", json{{"hex", "20 20 80 31 20"}}, "", ""),
                               Account("  77", "  04-7654321  ", "  דרום  ", "  שני  "),
                               Account("1001", "02-2222222", "", "second of the key")}}}
                            .dump());
    AccountsTable table;
    Progress progress;
    ASSERT_TRUE(ReadACT(company.compPath(), table, progress.bar()));

    EXPECT_TRUE(table.AccountsLoaded);
    ASSERT_EQ(table.AccountCount, 4);
    EXPECT_EQ(Keys(table), (std::vector<std::string>{"", "1001", "ab1", "77", "1001"}));
    const AccountEntry& first = table.Accounts[1];
    EXPECT_EQ(first.Phone, "03-1234567");
    EXPECT_EQ(first.District, W("מרכז"));
    EXPECT_EQ(first.Details, W("לקוח קבוע"));
    EXPECT_EQ(table.Accounts[2].Phone, "\x80"
                                       "1");
    EXPECT_EQ(table.Accounts[2].District, "");
    EXPECT_EQ(table.Accounts[2].Details, "");
    EXPECT_EQ(table.Accounts[3].Phone, "04-7654321");
    EXPECT_EQ(table.Accounts[3].District, W("דרום"));
    EXPECT_EQ(table.Accounts[3].Details, W("שני"));
    EXPECT_EQ(table.Accounts[0].Key, "");
    EXPECT_EQ(table.Accounts[0].Phone, "");
    EXPECT_TRUE(progress.moved);
    EXPECT_EQ(progress.fill.Width(), 0);
}

TEST(AccountsFileTest, FindAccountTakesTheFirstKeyWithoutRegardToCase) {
    TestCompany company(json{{"accounts",
                              {Account("1001", "first", "", ""), Account("AB1", "upper", "", ""),
                               Account("1001", "second", "", "")}}}
                            .dump());
    AccountsTable table;
    Progress progress;
    ASSERT_TRUE(ReadACT(company.compPath(), table, progress.bar()));

    EXPECT_EQ(FindAccount(table, "1001").Phone, "first");
    AccountEntry upper = FindAccount(table, "ab1");
    EXPECT_EQ(upper.Key, "AB1");
    EXPECT_EQ(upper.Phone, "upper");

    std::string empty = W("ריק");
    for (const std::string& key : {std::string("9999"), std::string(""), std::string("1001 ")}) {
        AccountEntry missing = FindAccount(table, key);
        EXPECT_EQ(missing.Key, "");
        EXPECT_EQ(missing.Phone, empty);
        EXPECT_EQ(missing.Details, empty);
        EXPECT_EQ(missing.District, empty);
    }

    // A count that runs past the entries is held to them.
    table.AccountCount = 50;
    EXPECT_EQ(FindAccount(table, "none").Phone, empty);
}

TEST(AccountsFileTest, ANewReadReplacesTheTable) {
    TestCompany big(
        json{{"accounts",
              {Account("1", "", "", ""), Account("2", "", "", ""), Account("3", "", "", "")}}}
            .dump());
    TestCompany small(json{{"accounts", {Account("9", "", "", "")}}}.dump());
    AccountsTable table;
    Progress progress;
    ASSERT_TRUE(ReadACT(big.compPath(), table, progress.bar()));
    ASSERT_TRUE(ReadACT(small.compPath(), table, progress.bar()));
    EXPECT_EQ(table.AccountCount, 1);
    EXPECT_EQ(Keys(table), (std::vector<std::string>{"", "9"}));

    // Two records of 650 bytes hold no account to read.
    TestCompany tiny(
        json{{"accounts", {{"trailer", false}, {"list", {Account("5", "", "", "")}}}}}.dump());
    ASSERT_EQ(std::filesystem::file_size(tiny.file("ACT.fix")), 1300u);
    EXPECT_TRUE(ReadACT(tiny.compPath(), table, progress.bar()));
    EXPECT_EQ(table.AccountCount, 0);
    EXPECT_EQ(table.Accounts.size(), 1u);
    EXPECT_TRUE(table.AccountsLoaded);
}

TEST(AccountsFileTest, AMissingFileLeavesTheTableAsItWas) {
    TestCompany company(json{{"accounts", {Account("1001", "03", "", "")}}}.dump());
    TestCompany without(json{{"items", json::array()}}.dump());
    AccountsTable table;
    Progress progress;
    EXPECT_THROW(ReadACT(without.compPath(), table, progress.bar()), Error);
    EXPECT_FALSE(table.AccountsLoaded);

    ASSERT_TRUE(ReadACT(company.compPath(), table, progress.bar()));
    progress.fill.setWidth(100);
    EXPECT_THAT([&] { ReadACT(without.compPath(), table, progress.bar()); },
                testing::ThrowsMessage<Error>(testing::HasSubstr("ACT.fix")));
    EXPECT_EQ(table.AccountCount, 1);
    EXPECT_EQ(Keys(table), (std::vector<std::string>{"", "1001"}));
    EXPECT_TRUE(table.AccountsLoaded);
    EXPECT_EQ(progress.fill.Width(), 100);
}

} // namespace
} // namespace dovrel
