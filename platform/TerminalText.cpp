#include "platform/TerminalText.h"

namespace dovrel {

std::string TerminalText(const Utf8& text) {
    std::string_view utf8 = text.view();
    const char* const replacement = "\xEF\xBF\xBD";
    std::string safe;
    safe.reserve(utf8.size());
    for (size_t i = 0; i < utf8.size(); ++i) {
        auto c = static_cast<unsigned char>(utf8[i]);
        auto next = i + 1 < utf8.size() ? static_cast<unsigned char>(utf8[i + 1]) : 0;
        if (c < 0x20 || c == 0x7F) {
            safe += replacement;
        } else if (c == 0xC2 && next >= 0x80 && next <= 0x9F) {
            safe += replacement; // a C1 control, two bytes in UTF-8
            ++i;
        } else {
            safe += static_cast<char>(c);
        }
    }
    return safe;
}

} // namespace dovrel
