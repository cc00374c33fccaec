#include "fixfiles/CompanyFile.h"

#include "TestCompany.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Error.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>

namespace dovrel {
namespace {

using nlohmann::json;
using sample::DosVisual;
using test::TestCompany;

json Company(const std::string& title, const json& damage = json::array()) {
    return {{"company",
             {{"title", title}, {"currencies", {"יורו", "", "", "", "", "", "", "", "ין יפני"}}}},
            {"damage", damage}};
}

TEST(CompanyFileTest, ReadsRecordOneWholeFromTheFileInAnyCase) {
    // Bytes after record 1 are not part of it.
    TestCompany company(
        Company("דמו מחשבים בע\"מ", {{{"file", "adf.fix"}, {"append", "41 42 43"}}}).dump());
    std::filesystem::rename(company.file("adf.fix"), company.file("ADF.FIX"));
    CompanyRecord record;
    ASSERT_TRUE(ReadAdf(PathFromCp1255(company.compPath()), record));
    std::ifstream in(company.file("ADF.FIX"), std::ios::binary);
    std::string stored{std::istreambuf_iterator<char>(in), {}};
    EXPECT_EQ(record.bytes, stored.substr(0, kAdfRecordLength));
    EXPECT_EQ(Trim(record.title()), DosVisual("דמו מחשבים בע\"מ"));
    EXPECT_EQ(Trim(record.currencyName(1)), DosVisual("יורו"));
    EXPECT_EQ(Trim(record.currencyName(9)), DosVisual("ין יפני"));
    EXPECT_THROW(record.currencyName(0), Error);
    EXPECT_THROW(record.currencyName(10), Error);
}

TEST(CompanyFileTest, AFailedReadKeepsWhatTheRecordHad) {
    CompanyRecord record;
    TestCompany without(json{{"items", json::array()}}.dump());
    EXPECT_FALSE(ReadAdf(PathFromCp1255(without.compPath()), record));
    EXPECT_EQ(record.bytes, std::string(kAdfRecordLength, '\0'));
    EXPECT_FALSE(ReadAdf(PathFromCp1255(without.compPath() + "\\missing"), record));
    TestCompany good(Company("Good").dump());
    ASSERT_TRUE(ReadAdf(PathFromCp1255(good.compPath()), record));
    std::string kept = record.bytes;
    TestCompany truncated(Company("Short", {{{"file", "adf.fix"}, {"truncate", 1}}}).dump());
    EXPECT_FALSE(ReadAdf(PathFromCp1255(truncated.compPath()), record));
    EXPECT_EQ(record.bytes, kept);
    std::filesystem::create_directory(without.file("adf.fix"));
    EXPECT_FALSE(ReadAdf(PathFromCp1255(without.compPath()), record));
    EXPECT_EQ(record.bytes, kept);
}

} // namespace
} // namespace dovrel
