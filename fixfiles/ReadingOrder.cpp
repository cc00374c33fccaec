#include "fixfiles/ReadingOrder.h"

#include "platform/Ascii.h"

#include <unicode/ubidi.h>
#include <unicode/unistr.h>

#include <algorithm>
#include <memory>
#include <vector>

namespace dovrel {

namespace {

constexpr unsigned char kDosAlef = 0x80;
constexpr unsigned char kDosTav = 0x9A;
constexpr unsigned char kWindowsOffset = 0x60;

bool IsDosHebrew(char c) {
    auto u = static_cast<unsigned char>(c);
    return u >= kDosAlef && u <= kDosTav;
}

struct BidiCloser {
    void operator()(UBiDi* bidi) const { ubidi_close(bidi); }
};

// The visual UTF-16 text in logical order, or the text as given when ICU
// refuses it (it does not for text of a field's length).
icu::UnicodeString InverseReorder(const icu::UnicodeString& visual) {
    UErrorCode status = U_ZERO_ERROR;
    std::unique_ptr<UBiDi, BidiCloser> bidi(ubidi_open());
    ubidi_setReorderingMode(bidi.get(), UBIDI_REORDER_INVERSE_NUMBERS_AS_L);
    ubidi_setPara(bidi.get(), visual.getBuffer(), visual.length(), UBIDI_RTL, nullptr, &status);
    if (U_FAILURE(status))
        return visual;
    // Inverse reordering may add marks; room for twice the text is ample.
    std::vector<UChar> out(static_cast<size_t>(visual.length()) * 2 + 8);
    int32_t length = ubidi_writeReordered(bidi.get(), out.data(), static_cast<int32_t>(out.size()),
                                          UBIDI_DO_MIRRORING | UBIDI_REMOVE_BIDI_CONTROLS, &status);
    if (U_FAILURE(status))
        return visual;
    return icu::UnicodeString(out.data(), length);
}

} // namespace

std::string ReadingOrderText(std::string_view dosField) {
    std::string_view field = Trim(dosField);
    if (field.empty())
        return {};
    if (std::none_of(field.begin(), field.end(), IsDosHebrew))
        return std::string(field);

    // Hebrew letters to their code page 1255 bytes, everything else as
    // stored; then through UTF-16 for ICU and back.
    std::string cp1255(field);
    for (char& c : cp1255)
        if (IsDosHebrew(c))
            c = static_cast<char>(static_cast<unsigned char>(c) + kWindowsOffset);
    icu::UnicodeString visual(cp1255.data(), static_cast<int32_t>(cp1255.size()), "windows-1255");
    icu::UnicodeString logical = InverseReorder(visual);

    std::string result(static_cast<size_t>(logical.length()) * 2 + 1, '\0');
    int32_t length = logical.extract(0, logical.length(), result.data(),
                                     static_cast<uint32_t>(result.size()), "windows-1255");
    result.resize(static_cast<size_t>(std::max<int32_t>(length, 0)));
    return result;
}

} // namespace dovrel
