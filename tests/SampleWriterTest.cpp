#include "tools/SampleWriter.h"

#include "TestCompany.h"
#include "platform/Error.h"

#include <gtest/gtest.h>

#include <bit>
#include <cstdint>
#include <filesystem>
#include <initializer_list>
#include <map>
#include <set>
#include <string>
#include <tuple>

namespace dovrel {
namespace {

using sample::DosVisual;
using test::ReadAll;
using test::TestCompany;

std::string B(std::initializer_list<unsigned char> bytes) {
    return {bytes.begin(), bytes.end()};
}

std::string Spaces(size_t n) {
    return std::string(n, ' ');
}

int ByteAt(const std::string& data, size_t offset) {
    return static_cast<unsigned char>(data.at(offset));
}

// Numbers are stored little-endian.
double DoubleAt(const std::string& data, size_t offset) {
    uint64_t bits = 0;
    for (size_t i = 8; i-- > 0;)
        bits = (bits << 8) | static_cast<uint64_t>(ByteAt(data, offset + i));
    return std::bit_cast<double>(bits);
}

// The error a description gives; the target directory must not be created.
std::string ErrorOf(std::string_view description) {
    test::TempDir dir;
    try {
        sample::WriteCompany(description, dir.path() / "company");
    } catch (const Error& e) {
        EXPECT_FALSE(std::filesystem::exists(dir.path() / "company")) << description;
        return e.what();
    }
    return "no error";
}

TEST(DosVisual, HandWorkedExamples) {
    EXPECT_EQ(DosVisual("שלום עולם"), B({0x8D, 0x8C, 0x85, 0x92, ' ', 0x8D, 0x85, 0x8C, 0x99}));
    // Latin and digit runs (with joiners inside) keep their order; other brackets are mirrored.
    EXPECT_EQ(DosVisual("טל 03-1234567"), "03-1234567 " + B({0x8C, 0x88}));
    EXPECT_EQ(DosVisual("מחיר 1.5 ש\"ח"),
              B({0x87, '"', 0x99}) + " 1.5 " + B({0x98, 0x89, 0x87, 0x8E}));
    EXPECT_EQ(DosVisual("א 1-"), B({'-', '1', ' ', 0x80}));
    EXPECT_EQ(DosVisual("[א] {ב} <ג>"),
              B({'<', 0x82, '>', ' ', '{', 0x81, '}', ' ', '[', 0x80, ']'}));
    EXPECT_EQ(DosVisual("Invoice (No. 5) <A>"), "Invoice (No. 5) <A>");
    EXPECT_EQ(sample::DosBytes("(א) A1 ₪"), B({'(', 0x80, ')', ' ', 'A', '1', ' ', 0xA4}));
    // No byte, or a code page 1255 byte that would read back as a Hebrew letter.
    for (const char* text : {"שלום 中", "5 €", "א–ב", "\xFF"})
        EXPECT_THROW(DosVisual(text), Error) << text;
}

TEST(SampleWriter, DocumentRecordsHoldTheirFieldsAtTheirOffsets) {
    TestCompany company(R"({"documents": [{  // comments are allowed
        "type": 21, "account": "1001", "customer": "כהן", "address1": "Main St",
        "address2": "חיפה", "reference": "123", "remarks": ["א", "ב", "ג"],
        "date": "2024-03-15", "discountPercent": 10, "vatPercent": 17, "warehouse": 2,
        "lines": [{"key": "A100", "description": "Widget", "details": "x", "currency": 1,
                   "price": 10.5, "quantity": 2, "discount": 12.5},
                  {"key": "#", "price": 100, "quantity": 1},
                  {"key": "B7", "docType": 1, "price": 100, "quantity": 1}]}]})");
    std::string data = ReadAll(company.file("ISHP.FIX"));
    ASSERT_EQ(data.size(), 170u * 6);
    EXPECT_EQ(data.substr(0, 275), B({0}) + Spaces(169) + B({1, 21}) + "1001" + Spaces(31) +
                                       B({0x8F, 0x84, 0x8B}) + "Main St" + Spaces(49) +
                                       B({0x84, 0x94, 0x89, 0x87}) + "123  ");
    EXPECT_EQ(data.substr(170 + 110, 49), Spaces(47) + B({0x80, 3}));
    std::string more = data.substr(340, 170);
    EXPECT_EQ(more.substr(0, 1) + more.substr(5, 96) + more.substr(102, 3),
              B({2}) + Spaces(47) + B({0x81}) + Spaces(47) + B({0x82, 124, 3, 15}));
    // Hidden lines and lines of another document type are not in the totals.
    EXPECT_EQ(std::tuple(DoubleAt(more, 112), DoubleAt(more, 128), DoubleAt(more, 154)),
              std::tuple(10, 17, 18.375));
    EXPECT_EQ(ByteAt(more, 138), 2);
    EXPECT_DOUBLE_EQ(DoubleAt(more, 120), 19.348875);
    std::string line = data.substr(510, 170);
    EXPECT_EQ(line.substr(0, 53), B({3}) + "A100" + Spaces(8) + "Widget" + Spaces(34));
    EXPECT_EQ(line.substr(64, 9), "x       " + B({1}));
    EXPECT_EQ(std::tuple(DoubleAt(line, 108), DoubleAt(line, 116), DoubleAt(line, 124)),
              std::tuple(10.5, 18.375, 2));
    // Currency, 12.5% as 1250, and the line's document kind.
    EXPECT_EQ(line.substr(93, 1) + line.substr(156, 2) + line.substr(162, 1),
              B({21, 0xE2, 0x04, 1}));
}

TEST(SampleWriter, ItemAccountAndCompanyRecordsHoldTheirFieldsAtTheirOffsets) {
    TestCompany company(R"({
        "items": [{"key": "A100", "name": "מברג", "category": "אב", "foreignName": "Screw"}],
        "accounts": [{"key": "1001", "name": "Acme", "phone": "03-1234567",
                      "district": "מרכז", "details": "לקוח"}],
        "company": {"name": "דמו", "title": "Demo Ltd", "currencies": ["יורו", "", "CAD"]}})");
    // Filler records of spaces around items and accounts; category and foreign name as given.
    EXPECT_EQ(ReadAll(company.file("ITM.fix")), Spaces(500) + "A100" + Spaces(44) +
                                                    B({0x82, 0x98, 0x81, 0x8E, 0x80, 0x81}) +
                                                    Spaces(31) + "Screw" + Spaces(910));
    EXPECT_EQ(ReadAll(company.file("ACT.fix")), Spaces(650) + "1001    Acme" + Spaces(48) +
                                                    "03-1234567" + Spaces(61) +
                                                    B({0x86, 0x8B, 0x98, 0x8E}) + Spaces(78) +
                                                    B({0x87, 0x85, 0x97, 0x8C}) + Spaces(1083));
    EXPECT_EQ(ReadAll(company.file("adf.fix")), Spaces(17) + B({0x85, 0x8E, 0x83}) + "Demo Ltd" +
                                                    Spaces(7343) + B({0x85, 0x98, 0x85, 0x89}) +
                                                    Spaces(15) + "CAD" + Spaces(102));
}

TEST(SampleWriter, HexVisualLongAndExtremeValuesAreStoredAsAsked) {
    TestCompany company(R"({"documents": [{"type": 255, "kind": 0, "file": "IBD.FIX",
        "date": {"year": 255, "month": 13, "day": 0}, "reference": "אבגדהו",
        "account": {"hex": "31 32 33 34 35 36 37 38 39"}, "address2": {"hex": "01 02FF"},
        "customer": "ABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789", "address1": {"visual": "(םולש) A1"},
        "lines": [{"key": {"hex": "23"}, "price": 100, "quantity": 1},
                  {"details": "רח' הרצל 45", "discount": -2.25, "price": 4, "quantity": 1,
                   "rate": 3.5, "currency": 255}]}]})");
    std::string data = ReadAll(company.file("IBD.FIX"));
    // A Hebrew text keeps its beginning when cut: "אבגדה", stored reversed.
    EXPECT_EQ(data.substr(170, 105), B({0, 255}) + "12345678ABCDEFGHIJKLMNOPQRSTUVWXYZ0123" +
                                         B({'(', 0x8D, 0x85, 0x8C, 0x99, ')', ' ', 'A', '1'}) +
                                         Spaces(21) + B({1, 2, 0xFF}) + Spaces(27) +
                                         B({0x84, 0x83, 0x82, 0x81, 0x80}));
    EXPECT_EQ(data.substr(340 + 102, 3), B({255, 13, 0}));
    // The "#" line is left out of the total; the other is priced at a rate of 3.5.
    for (size_t offset : {340 + 154, 680 + 116})
        EXPECT_DOUBLE_EQ(DoubleAt(data, offset), 14.315) << offset;
    // The first eight characters, "רח' הרצל", stored reversed; the number is cut off.
    EXPECT_EQ(data.substr(680 + 64, 9), B({0x8C, 0x96, 0x98, 0x84, ' ', '\'', 0x87, 0x98, 255}));
    EXPECT_EQ(data.substr(680 + 156, 2), B({0x1F, 0xFF})); // -2.25% as -225
}

TEST(SampleWriter, DamageIsAppliedInOrder) {
    TestCompany company(R"({"documents": [{"type": 1}], "items": [], "damage": [
        {"file": "ITM.fix", "append": "01 02 03"}, {"file": "IMV.FIX", "length": 1000},
        {"file": "IMV.FIX", "truncate": 100}, {"file": "adf.fix", "length": 4}]})");
    EXPECT_EQ(ReadAll(company.file("ITM.fix")), Spaces(1000) + B({1, 2, 3}));
    std::string moves = ReadAll(company.file("IMV.FIX"));
    EXPECT_EQ(moves.substr(170, 2) + moves.substr(510), B({1, 1}) + std::string(390, '\0'));
    EXPECT_EQ(ReadAll(company.file("adf.fix")), std::string(4, '\0'));
}

TEST(SampleWriter, BadDescriptionsAreErrorsThatNameTheEntry) {
    const std::pair<const char*, const char*> cases[] = {
        {R"({"documents": [{}, {"lines": [{}, {"price": "x"}]}]})",
         "documents[1].lines[1].price: expected a number"},
        {R"({"documents": [{"colour": 1}]})", "documents[0].colour: unknown key"},
        {R"({"documents": [{"lines": [{"discount": 400}]}]})",
         "documents[0].lines[0].discount: expected a number from -327.68 to 327.67"},
        {R"({"company": {"title": "שלום 中"}})",
         "company.title: character U+4E2D has no byte in code page 1255"},
        {R"({"documents": [{"lines": [{"price": {"hex": "00"}}]}]})",
         "documents[0].lines[0].price.hex: expected exactly 8 bytes"},
        {R"({"damage": [{"file": "IMV.FIX", "truncate": 1}]})",
         "damage[0].file: IMV.FIX is not written by this description"},
        {R"({"documents": [], "damage": [{"file": "IMV.FIX", "truncate": 171}]})",
         "damage[0].truncate: expected a whole number from 0 to 170"},
        {R"({"documents": [{"warehouse": 256}]})",
         "documents[0].warehouse: expected a whole number from 0 to 255"}};
    for (const auto& [description, message] : cases)
        EXPECT_EQ(ErrorOf(description), message);
    for (const char* date : {"\"2024-02-30\"", "\"2024-1-5\"", "\"1899-12-31\"", "20240101"})
        EXPECT_TRUE(ErrorOf(std::string(R"({"documents": [{"date": )") + date + "}]}")
                        .starts_with("documents[0].date: expected a date"))
            << date;
    EXPECT_NE(ErrorOf(R"({"documents": [)").find("not valid JSON"), std::string::npos);
}

// Every document type twice or more, each in the file of its type.
TEST(SampleWriter, DemoCompanyHoldsEveryDocumentType) {
    test::TempDir dir;
    sample::WriteCompany(ReadAll(DOVREL_SOURCE_DIR "/samples/demo.json"), dir.path());
    std::multiset<int> headers;
    std::map<std::string, std::set<int>> typesIn;
    for (const char* name : {"ISHP.FIX", "IORDR.FIX", "IMV.FIX", "IBD.FIX"}) {
        std::string data = ReadAll(dir.path() / name);
        for (size_t at = 170; at + 170 <= data.size(); at += 170)
            if (ByteAt(data, at) == 1)
                typesIn[name].insert(*headers.insert(ByteAt(data, at + 1)));
    }
    EXPECT_EQ(typesIn, (std::map<std::string, std::set<int>>{
                           {"ISHP.FIX", {20, 21, 22, 23}},
                           {"IORDR.FIX", {30, 31, 32, 33, 34, 35, 36}},
                           {"IMV.FIX", {1, 2, 3, 4, 5, 6, 7, 9, 10, 12, 14, 15, 19}},
                           {"IBD.FIX", {40, 41}}}));
    for (int type : headers)
        EXPECT_GE(headers.count(type), 2u) << "type " << type;
    EXPECT_GE(headers.size(), 60u);
    EXPECT_LE(headers.size(), 90u);
}

} // namespace
} // namespace dovrel
