// Text decoding, dates and amounts on arbitrary bytes. The input is taken as
// a stored text field, split at its first TAB for the comparisons, read in
// 8-byte pieces as doubles, and laid over a company record for the currency
// names.

#include "FuzzSupport.h"

#include "fixfiles/CompanyFile.h"
#include "fixfiles/DateSerial.h"
#include "fixfiles/Formats.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Error.h"
#include "platform/Variant.h"

#include <algorithm>
#include <bit>
#include <cstring>

using namespace dovrel;
using dovrel::fuzz::Require;

namespace {

void Decode(std::string_view text) {
    std::string logical = LogicalText(text);
    std::string visual = VisualText(text);
    Require(visual.size() == text.size(), "VisualText keeps the length");
    Require(logical.size() <= 2 * text.size() + 2, "LogicalText grows at most twice");
    std::string_view trimmed = Trim(text);
    Require(trimmed.empty() || (trimmed.front() != ' ' && trimmed.back() != ' '),
            "Trim leaves no outer spaces");
    Require(TrimCopy(text) == trimmed, "TrimCopy equals Trim");
    LogicalText(trimmed);
}

void Compare(std::string_view text) {
    size_t tab = text.find('\t');
    std::string_view a = text.substr(0, tab);
    std::string_view b = tab == std::string_view::npos ? std::string_view() : text.substr(tab + 1);
    bool equal = EqualsNoCase(a, b);
    Require(equal == EqualsNoCase(b, a), "EqualsNoCase is symmetric");
    Require(!equal || ContainsNoCase(a, b), "equal texts contain each other");
    Require(ContainsNoCase(a, std::string_view()), "every text contains the empty text");
    ContainsNoCase(b, a);
}

void Dates(std::string_view text) {
    for (std::string_view part : {text, text.substr(0, text.find('\t'))}) {
        try {
            Date date = TextToDate(part);
            std::string printed = FormatDate(date);
            Require(TextToDate(printed) == date, "a printed date reads back");
        } catch (const Error&) {
        }
    }
}

void Numbers(std::string_view text) {
    for (size_t at = 0; at + 8 <= text.size() && at < 256; at += 8) {
        uint64_t bits = 0;
        std::memcpy(&bits, text.data() + at, 8);
        double value = std::bit_cast<double>(bits);
        try {
            std::string amount = FormatAmount(value);
            Require(!amount.empty() && amount != "-0.00", "an amount is printed");
        } catch (const Error&) {
        }
        try {
            PlainNumber(value);
        } catch (const Error&) {
        }
    }
}

void Currencies(std::string_view text) {
    CompanyRecord exact;
    exact.bytes.assign(text); // a record of any length, as a damaged file may leave it
    CompanyRecord laid;
    laid.bytes.replace(kCurrencyNamesOffset,
                       std::min(text.size(), laid.bytes.size() - kCurrencyNamesOffset),
                       text.substr(0, laid.bytes.size() - kCurrencyNamesOffset));
    int16_t code = text.size() >= 2 ? static_cast<int16_t>(static_cast<uint8_t>(text[0]) |
                                                           (static_cast<uint8_t>(text[1]) << 8))
                                    : 0;
    for (int16_t c :
         {code, static_cast<int16_t>(0), static_cast<int16_t>(9), static_cast<int16_t>(10),
          static_cast<int16_t>(18), static_cast<int16_t>(19), static_cast<int16_t>(21)}) {
        CurrencyNames(c, exact);
        CurrencyNames(c, laid);
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    std::string_view text(reinterpret_cast<const char*>(data), size);
    Decode(text);
    Compare(text);
    Dates(text);
    Numbers(text);
    Currencies(text);
    return 0;
}
