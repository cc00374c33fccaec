#pragma once

#include <string>
#include <string_view>

namespace dovrel {

// Case and character classes of the ASCII letters and digits alone, the
// same in every locale: keys, names and direction words compare this way,
// and Hebrew letters have no case.

constexpr char AsciiLower(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

constexpr bool IsAsciiDigit(char c) {
    return c >= '0' && c <= '9';
}

constexpr bool IsAsciiAlnum(char c) {
    return IsAsciiDigit(c) || (AsciiLower(c) >= 'a' && AsciiLower(c) <= 'z');
}

// The text with its ASCII capitals made small.
std::string AsciiFold(std::string_view text);

// True when the two texts differ at most in the case of ASCII letters.
bool EqualsNoCase(std::string_view a, std::string_view b);

// True when needle stands in haystack, ASCII case aside.
bool ContainsNoCase(std::string_view haystack, std::string_view needle);

// The text without its leading and trailing spaces (spaces only: tabs and
// other blanks are part of a stored field).
std::string_view Trim(std::string_view text);
std::string TrimCopy(std::string_view text);

} // namespace dovrel
