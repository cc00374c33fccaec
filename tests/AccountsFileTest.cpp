#include "fixfiles/AccountsFile.h"

#include "TestCompany.h"
#include "platform/Error.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <utility>

namespace dovrel {
namespace {

using nlohmann::json;
using test::TestCompany;
using test::W;
using Keys = std::vector<std::string>;

class AccountsFileTest : public testing::Test {
protected:
    Shape frame{"ProgressFrame", 0, 0, 3015, 495};
    Shape fill{"ProgressFill", 0, 0, 0, 495};
    ProgressBar progress{frame, fill};
    AccountsTable table;
};

json Account(const std::string& key, const json& phone = "", const std::string& district = "",
             const std::string& details = "") {
    return {{"key", key}, {"phone", phone}, {"district", district}, {"details", details}};
}

std::string Fields(const AccountEntry& e) {
    return e.Key + "|" + e.Phone + "|" + e.District + "|" + e.Details;
}

Keys KeysOf(const AccountsTable& table) {
    Keys keys;
    for (const AccountEntry& entry : table.Accounts)
        keys.push_back(entry.Key);
    return keys;
}

TEST_F(AccountsFileTest, LoadsEveryAccountInFileOrderAndFindsTheFirstOfAKey) {
    TestCompany company(json{{"accounts",
                              {Account("1001", "03-1234567", "מרכז", "לקוח קבוע"),
                               Account("", "09-0000000", "צפון", "skipped"),
                               Account("ab1", json{{"hex", "20 20 80 31 20"}}),
                               Account("  דן", "  04-7654321  ", "  דרום  ", "  שני  "),
                               Account("1001", "02-2222222", "", "second of the key")}}}
                            .dump());
    bool moved = false;
    Connection watching = fill.changed.connect([&] { moved = moved || fill.Width() > 0; });
    ASSERT_TRUE(ReadACT(PathFromCp1255(company.compPath()), table, progress));
    EXPECT_EQ(table.AccountCount, 4);
    ASSERT_EQ(KeysOf(table), (Keys{"", "1001", "ab1", W("דן"), "1001"}));
    EXPECT_EQ(Fields(table.Accounts[1]), W("1001|03-1234567|מרכז|לקוח קבוע"));
    EXPECT_EQ(Fields(table.Accounts[2]), "ab1|\x80\x31||"); // the phone is stored as given
    EXPECT_EQ(Fields(table.Accounts[3]), W("דן|04-7654321|דרום|שני"));
    EXPECT_TRUE(moved && fill.Width() == 0) << fill.Width();
    // FindAccount takes the first entry of a key, without regard to case.
    EXPECT_EQ(Fields(FindAccount(table, "1001")), W("1001|03-1234567|מרכז|לקוח קבוע"));
    EXPECT_EQ(FindAccount(table, "AB1").Key, "ab1");
    table.AccountCount = 50; // a count past the entries is held to them
    for (const char* key : {"9999", "", "1001 ", "none"})
        EXPECT_EQ(Fields(FindAccount(table, key)), W("|ריק|ריק|ריק")) << key;
}

TEST_F(AccountsFileTest, ANewReadReplacesTheTableAndAFailedOneLeavesIt) {
    TestCompany without(json{{"items", json::array()}}.dump());
    EXPECT_THROW(ReadACT(PathFromCp1255(without.compPath()), table, progress), Error);
    EXPECT_FALSE(table.AccountsLoaded);
    TestCompany big(json{{"accounts", {Account("1"), Account("2"), Account("3")}}}.dump());
    TestCompany small(json{{"accounts", {Account("1001", "03")}}}.dump());
    ASSERT_TRUE(ReadACT(PathFromCp1255(big.compPath()), table, progress));
    ASSERT_TRUE(ReadACT(PathFromCp1255(small.compPath()), table, progress));
    fill.setWidth(100);
    EXPECT_THAT([&] { ReadACT(PathFromCp1255(without.compPath()), table, progress); },
                testing::ThrowsMessage<Error>(testing::HasSubstr("ACT.fix")));
    EXPECT_EQ(table.AccountCount, 1);
    EXPECT_EQ(KeysOf(table), (Keys{"", "1001"}));
    EXPECT_TRUE(table.AccountsLoaded);
    EXPECT_EQ(fill.Width(), 100);
    // Two records of 650 bytes hold no account to read.
    TestCompany tiny(json{{"accounts", {{"trailer", false}, {"list", {Account("5")}}}}}.dump());
    ASSERT_EQ(std::filesystem::file_size(tiny.file("ACT.fix")), 1300u);
    EXPECT_TRUE(ReadACT(PathFromCp1255(tiny.compPath()), table, progress));
    EXPECT_EQ(std::pair(table.AccountCount, KeysOf(table)), std::pair(0, Keys{""}));
}

} // namespace
} // namespace dovrel
