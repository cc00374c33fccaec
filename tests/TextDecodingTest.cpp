#include "fixfiles/TextDecoding.h"

#include "TestCompany.h"
#include "fixfiles/CompanyFile.h"

#include <gtest/gtest.h>

#include <array>
#include <sstream>

namespace dovrel {
namespace {

using test::W;
using Pair = std::pair<std::string, std::string>;

// "8D 85 8C 99" -> the four bytes.
std::string Bytes(std::string_view hex) {
    std::istringstream in{std::string(hex)};
    std::string result;
    unsigned value = 0;
    while (in >> std::hex >> value)
        result.push_back(static_cast<char>(value));
    return result;
}

// Stored bytes, the text they show, and the rule the case tries.
TEST(LogicalTextTest, RunsNeutralsAndPadding) {
    EXPECT_EQ(LogicalText(""), "");
    EXPECT_EQ(LogicalText("A1b2 "), "A1b2  "); // padding after Latin stays before the added space
    const std::vector<std::array<const char*, 3>> cases = {
        {"8D 85 8C 99", "F9 EC E5 ED", "one word"},
        {"8D 8C 85 92 20 8D 85 8C 99", "F9 EC E5 ED 20 F2 E5 EC ED", "two words"},
        {"41 42 43", "41 42 43 20", "Latin only"},
        {"31 32 33 20 8F 85 81 99 87", "31 32 33 20 E7 F9 E1 E5 EF 20", "number and word"},
        {"28 8D 85 8C 99 29", "29 F9 EC E5 ED 28", "brackets"},
        {"80 20 9A 20 20", "20 20 FA 20 E0", "padding moves to the front"},
        {"7F 80 9A 9B", "9B FA E0 7F", "both ends of the Hebrew range"},
        {"8D 2E 8C", "EC 2E ED", "neutral inside Hebrew"},
        {"8D 2E 8C 41", "41 20 EC 20 ED", "neutral before Latin becomes a space"},
        {"8D 2D 2D", "2D 2D ED", "neutral before any Hebrew goes in front"},
        {"2E 41 8D", "2E 41 20 ED", "neutral after Latin goes in front"},
        {"41 8D 42", "41 42 20 ED", "only the first Latin run adds a space"},
        {"E0 E1 E2", "E0 E1 E2", "code page 1255 letters are neutrals"},
        {"8D E0", "E0 ED", "code page 1255 letter after Hebrew"}};
    for (const auto& [stored, shown, rule] : cases)
        EXPECT_EQ(LogicalText(Bytes(stored)), Bytes(shown)) << rule;
}

TEST(LogicalTextTest, LongFieldsStayWithinInputPlusOne) {
    std::string allBytes;
    for (int i = 0; i < 256; ++i)
        allBytes.push_back(static_cast<char>(i));
    for (const std::string& text :
         {std::string(1000, '\x85'), std::string(1000, 'z'), std::string(1000, ' '),
          allBytes + allBytes, std::string(500, 'a') + std::string(500, '\x90')}) {
        size_t size = LogicalText(text).size();
        EXPECT_TRUE(size == text.size() || size == text.size() + 1) << size;
    }
    EXPECT_EQ(LogicalText(std::string(300, '\x80')), std::string(300, '\xE0'));
}

TEST(VisualTextTest, KeepsTheStoredOrderMirrorsBracketsAndMapsLetters) {
    EXPECT_EQ(VisualText("()<>[]{}=a/"), ")(><][}{=a/");
    EXPECT_EQ(VisualText(Bytes("28 8D 85 3D 41 29 00 80 9A 7F 9B E0 FF")),
              Bytes("29 ED E5 3D 41 28 00 E0 FA 7F 9B E0 FF"));
    EXPECT_EQ(VisualChar('\x9A'), '\xFA');
    EXPECT_EQ(VisualChar('}'), '{');
}

TEST(TrimTest, RemovesSpacesOnly) {
    for (auto [text, trimmed] :
         {std::pair{"  ab c  ", "ab c"}, {"    ", ""}, {"", ""}, {"\tab\t", "\tab\t"}})
        EXPECT_EQ(Trim(text), trimmed) << text;
    EXPECT_EQ(TrimCopy(std::string(" x\0 ", 4)), std::string("x\0", 2));
}

TEST(NoCaseTest, FoldsLatinLettersOnly) {
    EXPECT_TRUE(EqualsNoCase("Next", "NEXT"));
    EXPECT_FALSE(EqualsNoCase("Next", "Nex") || EqualsNoCase("@", "`"));
    // 0xC0 and 0xE0 differ only in the case bit but are not Latin letters.
    EXPECT_FALSE(EqualsNoCase("\xC0", "\xE0"));
    EXPECT_TRUE(EqualsNoCase(W("א-b"), W("א-B")));
    EXPECT_TRUE(ContainsNoCase("Widget Blue", "get b") && ContainsNoCase("abc", ""));
    EXPECT_FALSE(ContainsNoCase("ab", "abc"));
    EXPECT_FALSE(ContainsNoCase("\xE0\xE1", "\xC1"));
    EXPECT_TRUE(ContainsNoCase(W("שלום Dan"), W("ום dAN")));
}

void SetCurrencyName(CompanyRecord& company, int code, std::string_view stored) {
    std::string field(stored);
    field.resize(kCurrencyNameWidth, ' ');
    company.bytes.replace(kCurrencyNamesOffset + (code - 10) * kCurrencyNameWidth,
                          kCurrencyNameWidth, field);
}

TEST(CurrencyNamesTest, FixedCodesCompanyCodesAndCodesWithoutNames) {
    CompanyRecord company;
    // A record never read holds code 0 bytes: its names count as empty.
    EXPECT_EQ(CurrencyNames(11, company), Pair("11", "11"));
    SetCurrencyName(company, 12, Bytes("20 20 8D 85 8C 99"));
    SetCurrencyName(company, 13, std::string("\0A", 2));
    SetCurrencyName(company, 10, "USD");
    SetCurrencyName(company, 17, std::string(15, 'X'));
    SetCurrencyName(company, 18, std::string(15, 'X'));
    SetCurrencyName(company, 18, "   ");
    const Pair word(Bytes("F9 EC E5 ED"), Bytes("F9 EC E5 ED"));
    EXPECT_EQ(CurrencyNames(12, company), word);
    EXPECT_EQ(CurrencyNames(10, company), Pair("USD ", "USD "));
    EXPECT_EQ(CurrencyNames(18, company), Pair("18", "18"));
    EXPECT_EQ(CurrencyNames(21, company), Pair(W("ש"), "NIS")); // a fixed code
    for (int16_t code : {0, 22, -1, INT16_MAX, INT16_MIN})
        EXPECT_EQ(CurrencyNames(code, company), Pair()) << code;
    EXPECT_EQ(CurrencyNames(13, company).first, std::string("\0A ", 3));
    EXPECT_EQ(CurrencyNames(17, company).first, std::string(15, 'X') + " ");
}

} // namespace
} // namespace dovrel
