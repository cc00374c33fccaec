#include "platform/Encoding.h"

#include <unicode/ucnv.h>
#include <unicode/utf8.h>

#include <array>

namespace dovrel {
namespace {

// The code page's 256 characters as Unicode code points (0xFFFD where the
// byte is undefined or a control byte we do not pass on), and the reverse
// map, built once from ICU's converter.
struct Cp1255Table {
    std::array<UChar32, 256> toUnicode{};

    Cp1255Table() {
        UErrorCode status = U_ZERO_ERROR;
        UConverter* conv = ucnv_open("windows-1255", &status);
        for (int b = 0; b < 256; ++b) {
            toUnicode[static_cast<size_t>(b)] = 0xFFFD;
            if (b < 0x20 && b != '\t' && b != '\n' && b != '\r')
                continue;
            if (b < 0x80) {
                toUnicode[static_cast<size_t>(b)] = b;
                continue;
            }
            if (U_FAILURE(status) || conv == nullptr)
                continue;
            char in = static_cast<char>(b);
            const char* src = &in;
            UChar out[4];
            UChar* dst = out;
            UErrorCode err = U_ZERO_ERROR;
            ucnv_reset(conv);
            ucnv_setToUCallBack(conv, UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &err);
            ucnv_toUnicode(conv, &dst, out + 4, &src, src + 1, nullptr, true, &err);
            if (U_SUCCESS(err) && dst == out + 1 && out[0] != 0xFFFD && out[0] != 0x1A)
                toUnicode[static_cast<size_t>(b)] = out[0];
        }
        if (conv != nullptr)
            ucnv_close(conv);
    }

    int fromUnicode(UChar32 c) const {
        if (c < 0x80)
            return static_cast<int>(c);
        for (size_t b = 0x80; b < 256; ++b)
            if (toUnicode[b] == c)
                return static_cast<int>(b);
        return -1;
    }
};

const Cp1255Table& Table() {
    static const Cp1255Table table;
    return table;
}

void AppendUtf8(std::string& out, UChar32 c) {
    uint8_t buf[4];
    int32_t len = 0;
    UBool error = false;
    U8_APPEND(buf, len, 4, c, error);
    if (!error)
        out.append(reinterpret_cast<const char*>(buf), static_cast<size_t>(len));
}

} // namespace

std::string ToUtf8(std::string_view cp1255) {
    const Cp1255Table& table = Table();
    std::string out;
    out.reserve(cp1255.size() * 2);
    for (char ch : cp1255) {
        auto b = static_cast<unsigned char>(ch);
        if (b < 0x80 && (b >= 0x20 || b == '\t' || b == '\n' || b == '\r'))
            out.push_back(ch);
        else
            AppendUtf8(out, table.toUnicode[b]);
    }
    return out;
}

std::string FromUtf8(std::string_view utf8) {
    const Cp1255Table& table = Table();
    std::string out;
    out.reserve(utf8.size());
    const auto* s = reinterpret_cast<const uint8_t*>(utf8.data());
    auto length = static_cast<int32_t>(utf8.size());
    int32_t i = 0;
    while (i < length) {
        UChar32 c = 0;
        U8_NEXT(s, i, length, c);
        int b = c < 0 ? -1 : table.fromUnicode(c);
        out.push_back(b < 0 ? '?' : static_cast<char>(b));
    }
    return out;
}

} // namespace dovrel
