#include "platform/Ascii.h"

#include <algorithm>

namespace dovrel {

std::string AsciiFold(std::string_view text) {
    std::string folded(text);
    std::transform(folded.begin(), folded.end(), folded.begin(), AsciiLower);
    return folded;
}

bool EqualsNoCase(std::string_view a, std::string_view b) {
    return std::ranges::equal(a, b, {}, AsciiLower, AsciiLower);
}

bool ContainsNoCase(std::string_view haystack, std::string_view needle) {
    auto same = [](char x, char y) { return AsciiLower(x) == AsciiLower(y); };
    return std::search(haystack.begin(), haystack.end(), needle.begin(), needle.end(), same) !=
               haystack.end() ||
           needle.empty();
}

std::string_view Trim(std::string_view text) {
    size_t first = text.find_first_not_of(' ');
    if (first == std::string_view::npos)
        return {};
    return text.substr(first, text.find_last_not_of(' ') - first + 1);
}

std::string TrimCopy(std::string_view text) {
    return std::string(Trim(text));
}

} // namespace dovrel
