#include "platform/Encoding.h"

#include <unicode/ucnv.h>
#include <unicode/utf8.h>

#include <array>
#include <cstdint>

namespace dovrel {
namespace {

// The code page's 256 characters as Unicode code points, and the reverse
// map, built once from ICU's converter. Bytes below 0x80 are themselves; a
// byte the converter leaves undefined is the code point of its own number.
struct Cp1255Table {
    std::array<UChar32, 256> toUnicode{};

    Cp1255Table() {
        UErrorCode status = U_ZERO_ERROR;
        UConverter* conv = ucnv_open("windows-1255", &status);
        for (int b = 0; b < 256; ++b)
            toUnicode[static_cast<size_t>(b)] = b;
        for (int b = 0x80; b < 256 && U_SUCCESS(status) && conv != nullptr; ++b) {
            UChar32 c = Convert(conv, static_cast<char>(b));
            if (c >= 0)
                toUnicode[static_cast<size_t>(b)] = c;
        }
        if (conv != nullptr)
            ucnv_close(conv);
    }

    static UChar32 Convert(UConverter* conv, char in) {
        const char* src = &in;
        UChar out[4];
        UChar* dst = out;
        UErrorCode err = U_ZERO_ERROR;
        ucnv_reset(conv);
        ucnv_setToUCallBack(conv, UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &err);
        ucnv_toUnicode(conv, &dst, out + 4, &src, src + 1, nullptr, true, &err);
        if (U_SUCCESS(err) && dst == out + 1 && out[0] != 0xFFFD && out[0] != 0x1A)
            return out[0];
        return -1;
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

namespace {

bool IsControl(UChar32 c) {
    return (c < 0x20 && c != '\t' && c != '\n' && c != '\r') || (c >= 0x7F && c < 0xA0);
}

} // namespace

Utf8 ToUtf8(std::string_view cp1255) {
    const Cp1255Table& table = Table();
    std::string out;
    out.reserve(cp1255.size() * 2);
    for (char ch : cp1255) {
        auto b = static_cast<unsigned char>(ch);
        if (b < 0x80)
            out.push_back(ch);
        else
            AppendUtf8(out, table.toUnicode[b]);
    }
    return Utf8(std::move(out));
}

std::string ToTerminal(std::string_view cp1255) {
    const Cp1255Table& table = Table();
    std::string out;
    out.reserve(cp1255.size() * 2);
    for (char ch : cp1255) {
        UChar32 c = table.toUnicode[static_cast<unsigned char>(ch)];
        // Every control, TAB and the line ends too: a text must not split or
        // forge a line of the commands' line-oriented output.
        AppendUtf8(out, c < 0x20 || IsControl(c) ? 0xFFFD : c);
    }
    return out;
}

std::vector<int32_t> CodePoints(std::string_view bytes) {
    std::vector<int32_t> out;
    out.reserve(bytes.size());
    const auto* s = reinterpret_cast<const uint8_t*>(bytes.data());
    auto length = static_cast<int32_t>(bytes.size());
    int32_t i = 0;
    while (i < length) {
        UChar32 c = 0;
        U8_NEXT(s, i, length, c);
        out.push_back(c < 0 ? -1 : c);
    }
    return out;
}

Utf8 ValidUtf8(std::string_view bytes) {
    std::string out;
    out.reserve(bytes.size());
    for (int32_t c : CodePoints(bytes))
        AppendUtf8(out, c < 0 ? 0xFFFD : c);
    return Utf8(std::move(out));
}

std::string FromUtf8(const Utf8& utf8) {
    const Cp1255Table& table = Table();
    std::string out;
    out.reserve(utf8.str().size());
    for (int32_t c : CodePoints(utf8.view())) {
        int b = c < 0 ? -1 : table.fromUnicode(c);
        out.push_back(b < 0 ? '?' : static_cast<char>(b));
    }
    return out;
}

} // namespace dovrel
