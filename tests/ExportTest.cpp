// `dovrel export` against the description the demo company is written from:
// every text of it must come back as it was typed, in both formats.

#include "RunCli.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>
#include <sstream>
#include <string>
#include <vector>

namespace dovrel {
namespace {

using nlohmann::json;
using test::RunCli;
using testing::HasSubstr;

const std::string kBom = "\xEF\xBB\xBF";

// RFC 4180 records: quoted cells may hold commas, doubled quotes and line ends.
std::vector<std::vector<std::string>> ParseCsv(const std::string& text) {
    std::vector<std::vector<std::string>> rows(1, std::vector<std::string>(1));
    bool quoted = false;
    for (size_t i = 0; i < text.size(); ++i) {
        char c = text[i];
        std::string& cell = rows.back().back();
        if (quoted) {
            if (c == '"' && i + 1 < text.size() && text[i + 1] == '"')
                cell += text[++i];
            else if (c == '"')
                quoted = false;
            else
                cell += c;
        } else if (c == '"') {
            quoted = true;
        } else if (c == ',') {
            rows.back().emplace_back();
        } else if (c == '\r' && i + 1 < text.size() && text[i + 1] == '\n') {
            ++i;
            rows.emplace_back(1);
        } else {
            cell += c;
        }
    }
    rows.pop_back(); // after the last CR LF
    return rows;
}

json Demo() {
    return json::parse(test::ReadAll(std::string(DOVREL_SOURCE_DIR) + "/samples/demo.json"));
}

// The lines a description's document shows: not the hidden ones ("#") nor
// those of another document type.
std::vector<json> ShownLines(const json& document) {
    std::vector<json> lines;
    for (const json& line : document["lines"])
        if (line["key"] != "#" && line.value("docType", document["type"]) == document["type"])
            lines.push_back(line);
    return lines;
}

TEST(ExportTest, TheDemoComesBackAsItsDescriptionHasItInBothFormats) {
    auto [code, out, err] = RunCli({"export", DOVREL_DEMO_DIR});
    ASSERT_EQ(code, 0) << err;
    EXPECT_THAT(err, HasSubstr("exported 67 documents"));
    std::map<std::pair<int, std::string>, json> exported;
    std::istringstream lines(out);
    for (std::string line; std::getline(lines, line);) {
        json record = json::parse(line);
        exported[{record["type"], record["reference"]}] = record;
    }

    test::TempDir dir;
    std::string csvPath = (dir.path() / "demo.csv").string();
    auto csvRun = RunCli({"export", DOVREL_DEMO_DIR, "--format", "csv", "--output", csvPath});
    ASSERT_EQ(csvRun.code, 0) << csvRun.err;
    std::string csv = test::ReadAll(csvPath);
    ASSERT_EQ(csv.substr(0, 3), kBom);
    auto rows = ParseCsv(csv.substr(3));
    ASSERT_FALSE(rows.empty());
    std::map<std::string, size_t> column;
    for (size_t i = 0; i < rows[0].size(); ++i)
        column[rows[0][i]] = i;
    std::map<std::pair<std::string, std::string>, std::vector<std::vector<std::string>>> csvDocs;
    for (size_t r = 1; r < rows.size(); ++r) {
        ASSERT_EQ(rows[r].size(), rows[0].size()) << "row " << r;
        csvDocs[{rows[r][column["type"]], rows[r][column["reference"]]}].push_back(rows[r]);
    }

    json demo = Demo();
    std::vector<std::string> companyCurrencies = demo["company"]["currencies"];
    size_t documents = 0;
    for (const json& want : demo["documents"]) {
        if (!want.contains("type"))
            continue;
        ++documents;
        std::string where =
            std::to_string(int(want["type"])) + "/" + want["reference"].get<std::string>();
        const json& got = exported[{want["type"], want["reference"]}];
        ASSERT_TRUE(got.is_object()) << where;
        const auto& csvRows = csvDocs[{std::to_string(int(want["type"])), want["reference"]}];
        ASSERT_FALSE(csvRows.empty()) << where;
        for (const char* field : {"account", "customer", "address1", "address2"}) {
            EXPECT_EQ(got[field], want.value(field, "")) << where << " " << field;
            EXPECT_EQ(csvRows[0][column[field]], want.value(field, "")) << where << " " << field;
        }
        std::vector<std::string> remarks = want.value("remarks", std::vector<std::string>());
        remarks.resize(3);
        EXPECT_EQ(got["remarks"], json(remarks)) << where;
        for (size_t i = 0; i < 3; ++i)
            EXPECT_EQ(csvRows[0][column["remark" + std::to_string(i + 1)]], remarks[i]) << where;
        EXPECT_EQ(got["date"], want["date"]) << where;

        std::vector<json> shown = ShownLines(want);
        ASSERT_EQ(got["lines"].size(), shown.size()) << where;
        ASSERT_EQ(csvRows.size(), std::max<size_t>(shown.size(), 1)) << where;
        for (size_t i = 0; i < shown.size(); ++i) {
            const json& line = got["lines"][i];
            for (const char* field : {"key", "description", "details"}) {
                EXPECT_EQ(line[field], shown[i].value(field, "")) << where << " " << field;
                EXPECT_EQ(csvRows[i][column[field]], shown[i].value(field, "")) << where;
            }
            int currency = shown[i].value("currency", 21);
            if (shown[i]["key"] != "*" && currency >= 10 && currency <= 18) {
                EXPECT_EQ(line["currency"]["name"], companyCurrencies.at(size_t(currency - 10)));
            }
        }
    }
    EXPECT_EQ(exported.size(), documents);
}

TEST(ExportTest, ChoosesTypesAndDatesAndShowJsonIsOneRecord) {
    auto [code, out, err] = RunCli({"export", DOVREL_DEMO_DIR, "--type", "20", "--type", "החזרה",
                                    "--from-date", "01/01/2024", "--to-date", "20/01/2025"});
    ASSERT_EQ(code, 0) << err;
    std::vector<std::string> references;
    std::istringstream lines(out);
    for (std::string line; std::getline(lines, line);)
        references.push_back(json::parse(line)["reference"]);
    // Delivery notes and returns of 2024 up to the day, in the order of the file.
    EXPECT_EQ(references, (std::vector<std::string>{"532", "4104", "4105"}));

    auto shown = RunCli({"show", DOVREL_DEMO_DIR, "--type", "20", "--start", "2", "--json"});
    auto first = RunCli({"export", DOVREL_DEMO_DIR, "--type", "20", "--to-date", "16/01/2023"});
    ASSERT_EQ(shown.code, 0) << shown.err;
    EXPECT_EQ(json::parse(shown.out), json::parse(first.out));

    EXPECT_EQ(RunCli({"export", DOVREL_DEMO_DIR, "--from-date", "31/02/2024"}).code, 2);
    EXPECT_EQ(RunCli({"export", DOVREL_DEMO_DIR, "--format", "xml"}).code, 2);
}

// A damaged document is reported by its record and left out; those after it
// are still exported, and the exit code says that one was skipped.
TEST(ExportTest, DamagedDocumentsAreSkippedAndReported) {
    json tooMany = json::array();
    for (int i = 0; i < 41; ++i)
        tooMany.push_back({{"key", "K"}, {"price", 1}, {"quantity", 1}});
    json nan = {{"hex", "00 00 00 00 00 00 F8 7F"}};
    json documents = {
        {{"type", 20}, {"reference", "1"}, {"lines", {{{"key", "A"}, {"price", 1}}}}},
        {{"type", 20}, {"reference", "2"}, {"lines", tooMany}},
        {{"type", 20}, {"reference", "3"}, {"lines", {{{"key", "B"}, {"price", nan}}}}},
        {{"type", 20}, {"reference", "4"}, {"customer", "אחרון"}, {"lines", json::array()}}};
    test::TestCompany company(json{{"documents", documents}}.dump());
    auto [code, out, err] =
        RunCli({"export", company.path().string(), "--format", "csv", "--no-bom"});
    EXPECT_EQ(code, 4) << err;
    EXPECT_THAT(err, HasSubstr("ISHP.FIX record 5 (type 20): The document has more than 40"));
    EXPECT_THAT(err, HasSubstr("ISHP.FIX record 48 (type 20): Overflow"));
    EXPECT_THAT(err, HasSubstr("exported 2 documents, 1 line; skipped 2 damaged"));
    auto rows = ParseCsv(out);
    ASSERT_EQ(rows.size(), 3u); // the header, a line of "1", the empty "4"
    EXPECT_EQ(rows[0][0], "type");
    EXPECT_EQ(rows[2][4], "4");
    EXPECT_EQ(rows[2][7], "אחרון");
}

// The other lists people read: an account's texts and the company names.
TEST(ExportTest, AccountsAndCompaniesComeInReadingOrder) {
    json demo = Demo();
    for (const json& account : demo["accounts"]) {
        auto [code, out, err] = RunCli({"account", DOVREL_DEMO_DIR, account["key"], "--json"});
        ASSERT_EQ(code, 0) << err;
        json got = json::parse(out);
        for (const char* field : {"phone", "details", "district"})
            EXPECT_EQ(got[field], account[field]) << account["key"] << " " << field;
    }
    test::TempDir main;
    std::filesystem::copy(DOVREL_DEMO_DIR, main.path() / "demo");
    auto [code, out, err] = RunCli({"companies", main.str(), "--json"});
    ASSERT_EQ(code, 0) << err;
    EXPECT_EQ(json::parse(out)[0]["name"], demo["company"]["name"]);
}

} // namespace
} // namespace dovrel
