#include "tools/SampleWriter.h"

#include "TestCompany.h"
#include "platform/Error.h"

#include <gtest/gtest.h>

#include <bit>
#include <cmath>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <initializer_list>
#include <map>
#include <set>
#include <sstream>
#include <string>

namespace dovrel {
namespace {

using sample::DosBytes;
using sample::DosVisual;
using test::TempDir;
using test::TestCompany;

std::string B(std::initializer_list<int> bytes) {
    std::string out;
    for (int b : bytes)
        out.push_back(static_cast<char>(b));
    return out;
}

std::string Spaces(size_t n) {
    return std::string(n, ' ');
}

std::string ReadAll(const std::filesystem::path& path) {
    std::ifstream in(path, std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    return text.str();
}

double DoubleAt(const std::string& data, size_t offset) {
    uint64_t bits = 0;
    for (size_t i = 8; i-- > 0;)
        bits = (bits << 8) | static_cast<unsigned char>(data.at(offset + i));
    return std::bit_cast<double>(bits);
}

int Int16At(const std::string& data, size_t offset) {
    auto low = static_cast<unsigned char>(data.at(offset));
    auto high = static_cast<unsigned char>(data.at(offset + 1));
    return static_cast<int16_t>(static_cast<uint16_t>(low | (high << 8)));
}

int ByteAt(const std::string& data, size_t offset) {
    return static_cast<unsigned char>(data.at(offset));
}

// The error a description gives; the target directory must not be created.
std::string ErrorOf(std::string_view description) {
    TempDir dir;
    std::filesystem::path target = dir.path() / "company";
    try {
        sample::WriteCompany(description, target);
    } catch (const Error& e) {
        EXPECT_FALSE(std::filesystem::exists(target)) << description;
        return e.what();
    }
    ADD_FAILURE() << "no error for " << description;
    return "";
}

TEST(DosVisual, HebrewWordsAreStoredReversedInDosLetters) {
    EXPECT_EQ(DosVisual("שלום"), B({0x8D, 0x85, 0x8C, 0x99}));
    EXPECT_EQ(DosVisual("שלום עולם"), B({0x8D, 0x8C, 0x85, 0x92, 0x20, 0x8D, 0x85, 0x8C, 0x99}));
    EXPECT_EQ(DosVisual("אבגת"), B({0x9A, 0x82, 0x81, 0x80}));
    EXPECT_EQ(DosVisual(""), "");
}

TEST(DosVisual, LatinAndDigitRunsKeepTheirOrder) {
    EXPECT_EQ(DosVisual("חשבון 123"), "123 " + B({0x8F, 0x85, 0x81, 0x99, 0x87}));
    EXPECT_EQ(DosVisual("טל 03-1234567"), "03-1234567 " + B({0x8C, 0x88}));
    EXPECT_EQ(DosVisual("פריט A-100"), "A-100 " + B({0x88, 0x89, 0x98, 0x94}));
    EXPECT_EQ(DosVisual("מחיר 1.5 ש\"ח"),
              B({0x87, '"', 0x99}) + " 1.5 " + B({0x98, 0x89, 0x87, 0x8E}));
    EXPECT_EQ(DosVisual("פריט Widget Pro"), "Widget Pro " + B({0x88, 0x89, 0x98, 0x94}));
    // A joiner that is not between two Latin characters is reversed with the rest.
    EXPECT_EQ(DosVisual("א 1-"), B({'-', '1', ' ', 0x80}));
}

TEST(DosVisual, TextWithoutHebrewIsStoredAsItIs) {
    EXPECT_EQ(DosVisual("Invoice (No. 5) <A>"), "Invoice (No. 5) <A>");
    EXPECT_EQ(DosVisual("03-1234567"), "03-1234567");
    EXPECT_EQ(DosVisual("5 ₪"), B({'5', ' ', 0xA4}));
}

TEST(DosVisual, BracketsOutsideLatinRunsAreMirrored) {
    EXPECT_EQ(DosVisual("(שלום)"), B({0x28, 0x8D, 0x85, 0x8C, 0x99, 0x29}));
    EXPECT_EQ(DosVisual("שלום (A1)"), B({0x28, 'A', '1', 0x29, ' ', 0x8D, 0x85, 0x8C, 0x99}));
    EXPECT_EQ(DosVisual("[א] {ב} <ג>"),
              B({'<', 0x82, '>', ' ', '{', 0x81, '}', ' ', '[', 0x80, ']'}));
}

TEST(DosVisual, CharactersWithoutADosByteAreErrors) {
    EXPECT_EQ(DosVisual("מחיר ₪"), B({0xA4, ' ', 0x98, 0x89, 0x87, 0x8E}));
    EXPECT_THROW(DosVisual("שלום 中"), Error);
    // Their code page 1255 bytes would read back as Hebrew letters.
    EXPECT_THROW(DosVisual("5 €"), Error);
    EXPECT_THROW(DosVisual("א–ב"), Error);
    EXPECT_THROW(DosVisual("\xFF"), Error);
}

TEST(DosBytes, MapsLettersWithoutReordering) {
    EXPECT_EQ(DosBytes("םולש"), B({0x8D, 0x85, 0x8C, 0x99}));
    EXPECT_EQ(DosBytes("(א) A1"), B({'(', 0x80, ')', ' ', 'A', '1'}));
    EXPECT_THROW(DosBytes("€"), Error);
}

TEST(SampleWriter, DocumentRecordsHoldTheirFieldsAtTheirOffsets) {
    TestCompany company(R"({"documents": [{
        "type": 21, "account": "1001", "customer": "כהן", "address1": "Main St",
        "address2": "חיפה", "reference": "123", "remarks": ["א", "ב", "ג"],
        "date": "2024-03-15", "discountPercent": 10, "vatPercent": 17, "warehouse": 2,
        "lines": [
          {"key": "A100", "description": "Widget", "details": "x", "currency": 1,
           "price": 10.5, "quantity": 2, "discount": 12.5},
          {"key": "*", "description": "הערה"},
          {"key": "#", "price": 100, "quantity": 1},
          {"key": "B7", "docType": 1, "price": 100, "quantity": 1}]}]})");
    std::string data = ReadAll(company.file("ISHP.FIX"));
    ASSERT_EQ(data.size(), 170u * 7);
    EXPECT_EQ(data.substr(0, 170), B({0}) + Spaces(169));

    std::string header = data.substr(170, 170);
    EXPECT_EQ(ByteAt(header, 0), 1);
    EXPECT_EQ(ByteAt(header, 1), 21);
    EXPECT_EQ(header.substr(2, 8), "1001    ");
    EXPECT_EQ(header.substr(10, 30), Spaces(27) + B({0x8F, 0x84, 0x8B}));
    EXPECT_EQ(header.substr(40, 30), "Main St" + Spaces(23));
    EXPECT_EQ(header.substr(70, 30), Spaces(26) + B({0x84, 0x94, 0x89, 0x87}));
    EXPECT_EQ(header.substr(100, 5), "123  ");
    EXPECT_EQ(header.substr(110, 48), Spaces(47) + B({0x80}));
    EXPECT_EQ(ByteAt(header, 158), 4);

    std::string more = data.substr(340, 170);
    EXPECT_EQ(ByteAt(more, 0), 2);
    EXPECT_EQ(more.substr(5, 48), Spaces(47) + B({0x81}));
    EXPECT_EQ(more.substr(53, 48), Spaces(47) + B({0x82}));
    EXPECT_EQ(more.substr(102, 3), B({124, 3, 15}));
    EXPECT_EQ(DoubleAt(more, 112), 10.0);
    EXPECT_EQ(DoubleAt(more, 128), 17.0);
    EXPECT_EQ(ByteAt(more, 138), 2);
    // Hidden lines and lines of another document type are not in the totals.
    EXPECT_EQ(DoubleAt(more, 154), 18.375);
    EXPECT_DOUBLE_EQ(DoubleAt(more, 120), 19.348875);

    std::string line = data.substr(510, 170);
    EXPECT_EQ(ByteAt(line, 0), 3);
    EXPECT_EQ(line.substr(1, 12), "A100        ");
    EXPECT_EQ(line.substr(13, 40), "Widget" + Spaces(34));
    EXPECT_EQ(line.substr(64, 8), "x       ");
    EXPECT_EQ(ByteAt(line, 72), 1);
    EXPECT_EQ(ByteAt(line, 93), 21);
    EXPECT_EQ(DoubleAt(line, 108), 10.5);
    EXPECT_EQ(DoubleAt(line, 116), 18.375);
    EXPECT_EQ(DoubleAt(line, 124), 2.0);
    EXPECT_EQ(Int16At(line, 156), 1250);
    EXPECT_EQ(ByteAt(line, 162), 1);

    std::string text = data.substr(680, 170);
    EXPECT_EQ(text.substr(1, 12), "*" + Spaces(11));
    EXPECT_EQ(text.substr(13, 40), Spaces(36) + B({0x84, 0x98, 0x92, 0x84}));
    EXPECT_EQ(ByteAt(text, 72), 21);
    EXPECT_EQ(DoubleAt(text, 116), 0.0);
    EXPECT_EQ(ByteAt(text, 162), 2);
    EXPECT_EQ(ByteAt(data, 1020 + 93), 1);
    EXPECT_EQ(ByteAt(data, 1020 + 162), 4);
}

TEST(SampleWriter, EmptyDocumentTakesTheDefaults) {
    TestCompany company(R"({"documents": [{}]})");
    std::string data = ReadAll(company.file("ISHP.FIX"));
    ASSERT_EQ(data.size(), 510u);
    EXPECT_EQ(data.substr(170, 2), B({1, 20}));
    EXPECT_EQ(data.substr(172, 156), Spaces(156));
    EXPECT_EQ(ByteAt(data, 328), 0);
    EXPECT_EQ(data.substr(340 + 102, 3), B({124, 1, 1}));
    EXPECT_EQ(DoubleAt(data, 340 + 112), 0.0);
    EXPECT_EQ(DoubleAt(data, 340 + 120), 0.0);
    EXPECT_EQ(DoubleAt(data, 340 + 128), 17.0);
    EXPECT_EQ(ByteAt(data, 340 + 138), 1);
    EXPECT_EQ(DoubleAt(data, 340 + 154), 0.0);
    for (const char* name : {"IORDR.FIX", "IMV.FIX", "IBD.FIX"})
        EXPECT_EQ(ReadAll(company.file(name)), B({0}) + Spaces(169)) << name;
    for (const char* name : {"ITM.fix", "ACT.fix", "adf.fix"})
        EXPECT_FALSE(std::filesystem::exists(company.file(name))) << name;
}

TEST(SampleWriter, DocumentsGoToTheFileOfTheirType) {
    TestCompany company(R"({"documents": [
        {"type": 1}, {"type": 20}, {"type": 23}, {"type": 30}, {"type": 36},
        {"type": 40}, {"type": 41}, {"type": 99}, {"type": 0, "kind": 7},
        {"file": "IBD.FIX", "filler": 3}, {"type": 20, "file": "IBD.FIX"},
        {"file": "IBD.FIX", "filler": 0}]})");
    // Kind and type bytes of every record after the first.
    std::map<std::string, std::string> expected = {
        {"ISHP.FIX", B({1, 20, 2, 0, 1, 23, 2, 0})},
        {"IORDR.FIX", B({1, 30, 2, 0, 1, 36, 2, 0})},
        {"IMV.FIX", B({1, 1, 2, 0, 1, 99, 2, 0, 7, 0, 2, 0})},
        {"IBD.FIX", B({1, 40, 2, 0, 1, 41, 2, 0, 0, ' ', 0, ' ', 0, ' ', 1, 20, 2, 0})}};
    for (const auto& [name, records] : expected) {
        std::string data = ReadAll(company.file(name));
        ASSERT_EQ(data.size(), 170 + 85 * records.size()) << name;
        std::string found;
        for (size_t at = 170; at < data.size(); at += 170)
            found += data.substr(at, 2);
        EXPECT_EQ(found, records) << name;
    }
}

TEST(SampleWriter, ItemsFileHasFillerRecordsAroundTheItems) {
    TestCompany company(R"({"items": [
        {"key": "A100", "name": "מברג", "category": "01", "foreignName": "Screwdriver"},
        {"key": "ב1", "category": "אב"}]})");
    std::string data = ReadAll(company.file("ITM.fix"));
    ASSERT_EQ(data.size(), 2000u);
    EXPECT_EQ(data.substr(0, 500), Spaces(500));
    EXPECT_EQ(data.substr(1500, 500), Spaces(500));
    std::string item = data.substr(500, 500);
    EXPECT_EQ(item.substr(0, 12), "A100" + Spaces(8));
    EXPECT_EQ(item.substr(12, 40), Spaces(36) + B({0x82, 0x98, 0x81, 0x8E}));
    EXPECT_EQ(item.substr(52, 3), "01 ");
    EXPECT_EQ(item.substr(85, 40), "Screwdriver" + Spaces(29));
    std::string second = data.substr(1000, 500);
    EXPECT_EQ(second.substr(0, 12), Spaces(10) + B({'1', 0x81}));
    EXPECT_EQ(second.substr(52, 3), B({0x80, 0x81, ' '}));

    TestCompany bare(R"({"items": {"trailer": false, "list": [{"key": "A"}]}})");
    EXPECT_EQ(std::filesystem::file_size(bare.file("ITM.fix")), 1000u);
    TestCompany none(R"({"items": []})");
    EXPECT_EQ(std::filesystem::file_size(none.file("ITM.fix")), 1000u);
}

TEST(SampleWriter, AccountsFileHoldsKeysPhonesDistrictsAndDetails) {
    TestCompany company(R"({"accounts": {"list": [
        {"key": "1001", "name": "Acme", "phone": "03-1234567", "district": "מרכז",
         "details": "לקוח"}]}})");
    std::string data = ReadAll(company.file("ACT.fix"));
    ASSERT_EQ(data.size(), 1950u);
    EXPECT_EQ(data.substr(0, 650), Spaces(650));
    EXPECT_EQ(data.substr(1300, 650), Spaces(650));
    std::string account = data.substr(650, 650);
    EXPECT_EQ(account.substr(0, 8), "1001    ");
    EXPECT_EQ(account.substr(8, 30), "Acme" + Spaces(26));
    EXPECT_EQ(account.substr(60, 30), "03-1234567" + Spaces(20));
    EXPECT_EQ(account.substr(120, 15), Spaces(11) + B({0x86, 0x8B, 0x98, 0x8E}));
    EXPECT_EQ(account.substr(167, 50), Spaces(46) + B({0x87, 0x85, 0x97, 0x8C}));
    EXPECT_EQ(account.substr(217), Spaces(433));

    TestCompany bare(R"({"accounts": {"trailer": false, "list": []}})");
    EXPECT_EQ(std::filesystem::file_size(bare.file("ACT.fix")), 650u);
}

TEST(SampleWriter, CompanyFileHoldsNameTitleAndCurrencies) {
    TestCompany company(R"({"company": {"name": "דמו", "title": "Demo Ltd",
        "currencies": ["יורו", "", "CAD"]}})");
    std::string data = ReadAll(company.file("adf.fix"));
    ASSERT_EQ(data.size(), 7495u);
    EXPECT_EQ(data.substr(0, 20), Spaces(17) + B({0x85, 0x8E, 0x83}));
    EXPECT_EQ(data.substr(20, 60), "Demo Ltd" + Spaces(52));
    EXPECT_EQ(data.substr(80, 7280), Spaces(7280));
    EXPECT_EQ(data.substr(7360, 15), Spaces(11) + B({0x85, 0x98, 0x85, 0x89}));
    EXPECT_EQ(data.substr(7375, 15), Spaces(15));
    EXPECT_EQ(data.substr(7390, 15), "CAD" + Spaces(12));
    EXPECT_EQ(data.substr(7405), Spaces(90));
}

TEST(SampleWriter, HexAndVisualFieldsAreStoredAsGiven) {
    TestCompany company(R"({"documents": [{"type": 40,
        "customer": {"hex": "01 02FF"}, "address1": {"visual": "(םולש) A1"},
        "totalWithVat": {"hex": "00 00 00 00 00 00 F0 7F"},
        "lines": [{"key": {"hex": "23"}, "price": {"hex": "00 00 00 00 00 00 F8 7F"},
                   "quantity": 3, "total": 7.25, "discount": {"hex": "FF FF"}},
                  {"discount": -2.25, "price": 4, "quantity": 1, "rate": 3.5}]}]})");
    std::string data = ReadAll(company.file("IBD.FIX"));
    EXPECT_EQ(data.substr(180, 30), B({1, 2, 0xFF}) + Spaces(27));
    EXPECT_EQ(data.substr(210, 30),
              B({'(', 0x8D, 0x85, 0x8C, 0x99, ')', ' ', 'A', '1'}) + Spaces(21));
    EXPECT_TRUE(std::isinf(DoubleAt(data, 340 + 120)));
    // The "#" line is left out of the total; the other is priced at a rate of 3.5.
    EXPECT_DOUBLE_EQ(DoubleAt(data, 340 + 154), 14.315);
    EXPECT_EQ(data.substr(511, 12), "#" + Spaces(11));
    EXPECT_TRUE(std::isnan(DoubleAt(data, 510 + 108)));
    EXPECT_EQ(DoubleAt(data, 510 + 116), 7.25);
    EXPECT_EQ(Int16At(data, 510 + 156), -1);
    EXPECT_EQ(Int16At(data, 680 + 156), -225);
    EXPECT_DOUBLE_EQ(DoubleAt(data, 680 + 116), 14.315);
    EXPECT_EQ(DoubleAt(data, 680 + 108), 4.0);
}

TEST(SampleWriter, TextsAreCutOrPaddedToTheirField) {
    TestCompany company(R"({"documents": [{
        "customer": "ABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789",
        "reference": "אבגדהו", "account": {"hex": "31 32 33 34 35 36 37 38 39"},
        "address1": {"visual": "םולש"},
        "lines": [{"details": "רח' הרצל 45"}]}]})");
    std::string data = ReadAll(company.file("ISHP.FIX"));
    EXPECT_EQ(data.substr(170 + 10, 30), "ABCDEFGHIJKLMNOPQRSTUVWXYZ0123");
    // A Hebrew text keeps its beginning when cut: "אבגדה", stored reversed.
    EXPECT_EQ(data.substr(170 + 100, 5), B({0x84, 0x83, 0x82, 0x81, 0x80}));
    EXPECT_EQ(data.substr(170 + 2, 8), "12345678");
    EXPECT_EQ(data.substr(170 + 40, 30), B({0x8D, 0x85, 0x8C, 0x99}) + Spaces(26));
    // The first eight characters, "רח' הרצל", stored reversed; the number is cut off.
    EXPECT_EQ(data.substr(510 + 64, 8), B({0x8C, 0x96, 0x98, 0x84, ' ', '\'', 0x87, 0x98}));
}

TEST(SampleWriter, EveryByteValueCanBeWritten) {
    TestCompany company(R"({"documents": [{"type": 255, "kind": 0, "lineCount": 255,
        "warehouse": 0, "date": {"year": 255, "month": 13, "day": 0},
        "lines": [{"lineNumber": 0, "docType": 0, "currency": 0, "kind": 255},
                  {"lineNumber": 41, "currency": 255}, {"lineNumber": 255}]}]})");
    std::string data = ReadAll(company.file("IMV.FIX"));
    ASSERT_EQ(data.size(), 170u * 6);
    EXPECT_EQ(data.substr(170, 2), B({0, 255}));
    EXPECT_EQ(ByteAt(data, 170 + 158), 255);
    EXPECT_EQ(data.substr(340 + 102, 3), B({255, 13, 0}));
    EXPECT_EQ(ByteAt(data, 340 + 138), 0);
    EXPECT_EQ(ByteAt(data, 510), 255);
    EXPECT_EQ(ByteAt(data, 510 + 93), 0);
    EXPECT_EQ(ByteAt(data, 510 + 72), 0);
    EXPECT_EQ(ByteAt(data, 510 + 162), 0);
    EXPECT_EQ(ByteAt(data, 680 + 72), 255);
    EXPECT_EQ(ByteAt(data, 680 + 93), 255);
    EXPECT_EQ(ByteAt(data, 680 + 162), 41);
    EXPECT_EQ(ByteAt(data, 850 + 162), 255);
}

TEST(SampleWriter, DamageIsAppliedInOrder) {
    TestCompany company(R"({"documents": [{"type": 1}, {"type": 20}],
        "items": [{"key": "A"}], "accounts": [],
        "damage": [
          {"file": "ISHP.FIX", "truncate": 100},
          {"file": "ITM.fix", "append": "01 02 03"},
          {"file": "IMV.FIX", "length": 1000},
          {"file": "IORDR.FIX", "length": 10},
          {"file": "ACT.fix", "truncate": 1300},
          {"file": "adf.fix", "length": 4}]})");
    EXPECT_EQ(std::filesystem::file_size(company.file("ISHP.FIX")), 410u);
    std::string items = ReadAll(company.file("ITM.fix"));
    ASSERT_EQ(items.size(), 1503u);
    EXPECT_EQ(items.substr(1500), B({1, 2, 3}));
    std::string moves = ReadAll(company.file("IMV.FIX"));
    ASSERT_EQ(moves.size(), 1000u);
    EXPECT_EQ(moves.substr(170, 2), B({1, 1}));
    EXPECT_EQ(moves.substr(510), std::string(490, '\0'));
    EXPECT_EQ(ReadAll(company.file("IORDR.FIX")), B({0}) + Spaces(9));
    EXPECT_EQ(std::filesystem::file_size(company.file("ACT.fix")), 0u);
    EXPECT_EQ(ReadAll(company.file("adf.fix")), std::string(4, '\0'));
}

TEST(SampleWriter, BadDescriptionsAreErrorsThatNameTheEntry) {
    EXPECT_EQ(ErrorOf(R"({"documents": [{}, {}, {}, {"lines": [{}, {}, {"price": "x"}]}]})"),
              "documents[3].lines[2].price: expected a number");
    EXPECT_EQ(ErrorOf(R"({"documents": [{"colour": 1}]})"), "documents[0].colour: unknown key");
    EXPECT_EQ(ErrorOf(R"({"colour": 1})"), "colour: unknown key");
    EXPECT_EQ(ErrorOf(R"([])"), "description: expected an object");
    EXPECT_EQ(ErrorOf(R"({"documents": [{"type": 300}]})"),
              "documents[0].type: expected a whole number from 0 to 255");
    EXPECT_EQ(ErrorOf(R"({"documents": [{"lines": [{"lineNumber": 256}]}]})"),
              "documents[0].lines[0].lineNumber: expected a whole number from 0 to 255");
    EXPECT_EQ(ErrorOf(R"({"documents": [{"warehouse": 1.5}]})"),
              "documents[0].warehouse: expected a whole number from 0 to 255");
    EXPECT_EQ(ErrorOf(R"({"documents": [{"lines": [{"discount": 400}]}]})"),
              "documents[0].lines[0].discount: expected a number from -327.68 to 327.67");
    EXPECT_EQ(ErrorOf(R"({"items": [{"key": 5}]})"),
              R"(items[0].key: expected a string, {"visual": "..."} or {"hex": "..."})");
    EXPECT_EQ(ErrorOf(R"({"accounts": [{"name": {"hex": "4G"}}]})"),
              R"(accounts[0].name.hex: expected hexadecimal bytes such as "8D 85 0A")");
    EXPECT_EQ(ErrorOf(R"({"company": {"title": "שלום 中"}})"),
              "company.title: character U+4E2D has no byte in code page 1255");
    EXPECT_EQ(ErrorOf(R"({"documents": [{"lines": [{"price": {"hex": "00"}}]}]})"),
              "documents[0].lines[0].price.hex: expected exactly 8 bytes");
    EXPECT_EQ(ErrorOf(R"({"items": {"trailer": "no"}})"), "items.trailer: expected true or false");
    EXPECT_EQ(ErrorOf(R"({"company": {"currencies": ["", "", "", "", "", "", "", "", "", ""]}})"),
              "company.currencies: expected an array of at most 9 texts");
    EXPECT_EQ(
        ErrorOf(R"({"documents": [{"file": "ITM.fix", "filler": 1}]})"),
        R"(documents[0].file: expected one of "ISHP.FIX", "IORDR.FIX", "IMV.FIX", "IBD.FIX")");
    EXPECT_EQ(ErrorOf(R"({"damage": [{"file": "IMV.FIX", "truncate": 1}]})"),
              "damage[0].file: IMV.FIX is not written by this description");
    EXPECT_EQ(ErrorOf(R"({"documents": [], "damage": [{"file": "IMV.FIX", "truncate": 171}]})"),
              "damage[0].truncate: expected a whole number from 0 to 170");
    EXPECT_EQ(
        ErrorOf(R"({"items": [], "damage": [{"file": "ITM.fix", "length": 1, "append": ""}]})"),
        R"(damage[0]: expected exactly one of "truncate", "length" and "append")");
    for (const char* date : {"\"2024-02-30\"", "\"2024-1-5\"", "\"1899-12-31\"", "20240101"})
        EXPECT_TRUE(ErrorOf(std::string(R"({"documents": [{"date": )") + date + "}]}")
                        .starts_with("documents[0].date: expected a date"))
            << date;
    EXPECT_NE(ErrorOf(R"({"documents": [)").find("not valid JSON"), std::string::npos);
}

TEST(SampleWriter, DescriptionMayHoldComments) {
    TestCompany company(R"({
        // a delivery note
        "documents": [{"type": 22 /* a return */}]})");
    EXPECT_EQ(ByteAt(ReadAll(company.file("ISHP.FIX")), 171), 22);
}

TEST(SampleWriter, DemoCompanyHoldsEveryDocumentType) {
    std::ifstream in(DOVREL_SOURCE_DIR "/samples/demo.json", std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    TempDir dir;
    ASSERT_NO_THROW(sample::WriteCompany(text.str(), dir.path()));

    std::set<std::string> itemKeys;
    std::string items = ReadAll(dir.path() / "ITM.fix");
    for (size_t at = 500; at + 500 < items.size(); at += 500)
        itemKeys.insert(items.substr(at, 12));
    std::set<std::string> accountKeys;
    std::string accounts = ReadAll(dir.path() / "ACT.fix");
    for (size_t at = 650; at + 650 < accounts.size(); at += 650)
        accountKeys.insert(accounts.substr(at, 8));

    std::map<int, int> perType;
    int documents = 0;
    for (const char* name : {"ISHP.FIX", "IORDR.FIX", "IMV.FIX", "IBD.FIX"}) {
        std::string data = ReadAll(dir.path() / name);
        ASSERT_EQ(data.size() % 170, 0u) << name;
        for (size_t at = 170; at < data.size(); at += 170) {
            if (ByteAt(data, at) == 1) {
                ++perType[ByteAt(data, at + 1)];
                ++documents;
                std::string account = data.substr(at + 2, 8);
                EXPECT_TRUE(account == Spaces(8) || accountKeys.count(account)) << account;
            }
            std::string key = data.substr(at + 1, 12);
            if (ByteAt(data, at) == 3 && key[0] != '*' && key[0] != '#') {
                EXPECT_TRUE(itemKeys.count(key)) << name << " " << key;
            }
        }
    }
    for (int type : {1,  2,  3,  4,  5,  6,  7,  9,  10, 12, 14, 15, 19,
                     20, 21, 22, 23, 30, 31, 32, 33, 34, 35, 36, 40, 41})
        EXPECT_GE(perType[type], 2) << "type " << type;
    EXPECT_EQ(perType.size(), 26u);
    EXPECT_GE(documents, 60);
    EXPECT_LE(documents, 90);
}

} // namespace
} // namespace dovrel
