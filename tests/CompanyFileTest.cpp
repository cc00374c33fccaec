#include "fixfiles/CompanyFile.h"

#include "TestCompany.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Error.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

namespace dovrel {
namespace {

using nlohmann::json;
using test::TestCompany;

// The first bytes of a file, as written there.
std::string FileBytes(const std::filesystem::path& path, size_t count) {
    std::ifstream in(path, std::ios::binary);
    std::string bytes(count, '\0');
    in.read(bytes.data(), static_cast<std::streamsize>(count));
    bytes.resize(static_cast<size_t>(in.gcount()));
    return bytes;
}

std::string Stored(std::string_view utf8) {
    return sample::DosVisual(utf8);
}

json Company(const std::string& title) {
    return {{"company",
             {{"name", "Demo"},
              {"title", title},
              {"currencies", {"יורו", "", "", "", "", "", "", "", "ין יפני"}}}}};
}

TEST(CompanyFileTest, ReadsRecordOneWhole) {
    TestCompany company(Company("דמו מחשבים בע\"מ").dump());
    CompanyRecord record;
    ASSERT_TRUE(ReadAdf(company.compPath(), record));

    EXPECT_EQ(record.bytes, FileBytes(company.file("adf.fix"), kAdfRecordLength));
    ASSERT_EQ(record.title().size(), 60u);
    EXPECT_EQ(Trim(record.title()), Stored("דמו מחשבים בע\"מ"));
    EXPECT_EQ(Trim(record.currencyName(1)), Stored("יורו"));
    EXPECT_EQ(record.currencyName(2), std::string(15, ' '));
    EXPECT_EQ(Trim(record.currencyName(9)), Stored("ין יפני"));
}

TEST(CompanyFileTest, AFailedReadKeepsWhatTheRecordHad) {
    CompanyRecord record;
    EXPECT_EQ(record.title(), std::string(60, '\0'));

    TestCompany without(json{{"items", json::array()}}.dump());
    EXPECT_FALSE(ReadAdf(without.compPath(), record));
    EXPECT_EQ(record.title(), std::string(60, '\0'));
    EXPECT_FALSE(ReadAdf(without.compPath() + "\\missing", record));

    TestCompany good(Company("Good").dump());
    ASSERT_TRUE(ReadAdf(good.compPath(), record));
    std::string kept = record.bytes;

    json shortFile = Company("Short");
    shortFile["damage"] = {{{"file", "adf.fix"}, {"truncate", 1}}};
    TestCompany truncated(shortFile.dump());
    EXPECT_FALSE(ReadAdf(truncated.compPath(), record));
    EXPECT_EQ(record.bytes, kept);

    EXPECT_FALSE(ReadAdf(without.compPath(), record));
    std::filesystem::create_directory(without.file("adf.fix"));
    EXPECT_FALSE(ReadAdf(without.compPath(), record));
    EXPECT_EQ(record.bytes, kept);
}

TEST(CompanyFileTest, FindsTheFileByAnyCaseAndIgnoresWhatFollowsRecordOne) {
    json longer = Company("Longer");
    longer["damage"] = {{{"file", "adf.fix"}, {"append", "41 42 43"}}};
    TestCompany company(longer.dump());
    std::filesystem::rename(company.file("adf.fix"), company.file("ADF.FIX"));
    CompanyRecord record;
    ASSERT_TRUE(ReadAdf(company.compPath(), record));
    EXPECT_EQ(record.bytes, FileBytes(company.file("ADF.FIX"), kAdfRecordLength));
    EXPECT_EQ(record.title(), "Longer" + std::string(54, ' '));
}

TEST(CompanyFileTest, SetTitleFillsTheFieldAndNothingElse) {
    CompanyRecord record;
    record.setTitle("Short");
    EXPECT_EQ(record.title(), "Short" + std::string(55, ' '));
    EXPECT_EQ(record.bytes.size(), kAdfRecordLength);
    EXPECT_EQ(record.bytes.substr(0, 20), std::string(20, '\0'));
    EXPECT_EQ(record.bytes[80], '\0');

    record.setTitle(std::string(70, 'x'));
    EXPECT_EQ(record.title(), std::string(60, 'x'));
    EXPECT_EQ(record.bytes[80], '\0');

    EXPECT_THROW(record.currencyName(0), Error);
    EXPECT_THROW(record.currencyName(10), Error);
    EXPECT_EQ(record.currencyName(9), std::string(15, '\0'));
}

} // namespace
} // namespace dovrel
