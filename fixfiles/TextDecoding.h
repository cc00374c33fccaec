#pragma once

#include "platform/Ascii.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <utility>

namespace dovrel {

struct CompanyRecord;

// The accounting system stores text in a single-byte DOS Hebrew code, in
// visual order. These functions turn such fields into code page 1255 text.
// A field is always taken whole, padding included; callers trim.

// Reorders a visual-order field into reading order and maps the Hebrew
// letters (0x80-0x9A) to code page 1255 (0xE0-0xFA).
std::string LogicalText(std::string_view text);
// Keeps the stored order, maps the Hebrew letters and mirrors brackets.
std::string VisualText(std::string_view text);
// Keeps the stored order and every other byte; maps only the Hebrew letters.
std::string MappedLetters(std::string_view text);
char VisualChar(char c);

// The Hebrew abbreviation and the printed code of a currency code. Codes 10
// to 18 take the company's own currency names from the company record.
std::pair<std::string, std::string> CurrencyNames(int16_t code, const CompanyRecord& company);

} // namespace dovrel
