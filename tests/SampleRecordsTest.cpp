// The sample writer's document records, assembled from fields for the big
// company, give the same bytes as a description of the same document. (Items
// and accounts go through the description writer's own functions.)

#include "tools/SampleWriter.h"

#include "TestCompany.h"
#include "platform/Error.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <filesystem>
#include <string>

namespace dovrel {
namespace {

using nlohmann::json;
using sample::StoredText;
using test::ReadAll;

// The file as the description writer makes it, without its first record.
std::string Described(const json& description, const std::string& file, size_t recordLength) {
    test::TempDir dir;
    sample::WriteCompany(description, dir.path());
    return ReadAll(dir.path() / file).substr(recordLength);
}

TEST(SampleRecordsTest, DocumentRecordsMatchTheDescriptionWriter) {
    json doc = json::parse(R"json({"type": 5, "account": "1001", "customer": "משה כהן (בע\"מ)",
        "address1": "רח' הרצל 45", "address2": "תל אביב", "reference": "4711",
        "remarks": ["הערה ראשונה", "", "Remark 3"], "date": "2019-02-28",
        "discountPercent": 7.5, "vatPercent": 18, "warehouse": 3,
        "lines": [{"key": "A100", "description": "מברג חשמלי", "details": "X1", "price": 1234.5,
                   "quantity": 2, "discount": 12.5},
                  {"key": "*", "description": "שורת טקסט"},
                  {"key": "#", "description": "נסתרת", "price": 99, "quantity": 1},
                  {"key": "B-200", "currency": 1, "price": 0.1, "quantity": 0.5,
                   "rate": 3.7}]})json");
    sample::DocumentData data;
    data.type = 5;
    data.account = StoredText("1001", 8), data.reference = StoredText("4711", 5);
    data.customer = StoredText("משה כהן (בע\"מ)", 30);
    data.address1 = StoredText("רח' הרצל 45", 30), data.address2 = StoredText("תל אביב", 30);
    data.remarks = {StoredText("הערה ראשונה", 48), "", StoredText("Remark 3", 48)};
    data.year = 2019, data.month = 2, data.day = 28;
    data.discountPercent = 7.5, data.vatPercent = 18, data.warehouse = 3;
    data.lines = {
        {StoredText("A100", 12), StoredText("מברג חשמלי", 40), "X1", 21, 1234.5, 2, 12.5, 1},
        {"*", StoredText("שורת טקסט", 40), "", 21, 0, 0, 0, 1},
        {"#", StoredText("נסתרת", 40), "", 21, 99, 1, 0, 1},
        {"B-200", "", "", 1, 0.1, 0.5, 0, 3.7}};
    std::string records;
    sample::AppendDocumentRecords(data, records);
    EXPECT_EQ(records, Described({{"documents", {doc}}}, "IMV.FIX", 170));
    EXPECT_EQ(records.size(), 6u * 170);
}

TEST(SampleRecordsTest, BadValuesWriteNothing) {
    sample::DocumentData badDate, badType, badDiscount, tooManyLines;
    badDate.month = 2, badDate.day = 30;
    badType.type = 256;
    badDiscount.lines = {{"A1", "", "", 21, 1, 1, 400, 1}};
    tooManyLines.lines.resize(256);
    for (const sample::DocumentData& bad : {badDate, badType, badDiscount, tooManyLines}) {
        std::string out;
        EXPECT_THROW(sample::AppendDocumentRecords(bad, out), Error);
        EXPECT_TRUE(out.empty());
    }
    EXPECT_THROW(sample::ItemRecordOf({{"key", "A1"}, {"price", 3}}), Error);
}

} // namespace
} // namespace dovrel
