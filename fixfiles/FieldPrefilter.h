#pragma once

#include "platform/Ascii.h"

#include <array>
#include <cstdint>
#include <string_view>

namespace dovrel {

// Tells from a stored text field, without decoding it, that the field's
// LogicalText cannot equal or contain a given text (compared without regard
// to the case of Latin letters), so that a long scan decodes only the few
// fields that may match. It relies on what LogicalText does: it keeps every
// Latin letter and digit of the field, turns each DOS Hebrew letter into one
// code page 1255 letter, keeps or blanks every other character and adds
// spaces; it never makes a character that is not in the field in some form.
// So a decoded field can only hold (besides spaces) the field's own
// characters in their code page 1255 form, and exactly its Latin letters and
// digits.
class FieldPrefilter {
public:
    // text: the code page 1255 text to be looked for.
    explicit FieldPrefilter(std::string_view text) : digest_(LatinDigest(text)) {
        for (char c : text)
            if (c != ' ')
                set(needs_, Fold(static_cast<unsigned char>(c)));
    }

    // False only when LogicalText of the field, trimmed, cannot equal the text.
    bool mayEqual(std::string_view field) const {
        return LatinDigest(field) == digest_ && mayContain(field);
    }

    // False only when LogicalText of the field cannot contain the text.
    bool mayContain(std::string_view field) const {
        const ByteTables& tables = Tables();
        Mask has{};
        for (char c : field)
            set(has, tables.decoded[static_cast<unsigned char>(c)]);
        for (size_t i = 0; i < needs_.size(); ++i)
            if ((needs_[i] & ~has[i]) != 0)
                return false;
        return true;
    }

    // A digest of the Latin letters and digits of a text, case folded, that
    // does not depend on their order; 0 for a text without any.
    static uint64_t LatinDigest(std::string_view text) {
        const ByteTables& tables = Tables();
        uint64_t digest = 0;
        for (char c : text)
            digest += tables.latin[static_cast<unsigned char>(c)];
        return digest;
    }

private:
    using Mask = std::array<uint64_t, 4>;

    // Worked out once for every byte, since a scan asks for millions of
    // bytes: what each adds to a digest (0 for all but Latin letters and
    // digits), and the character it becomes when decoded.
    struct ByteTables {
        std::array<uint64_t, 256> latin{};
        std::array<unsigned char, 256> decoded{};
    };

    static const ByteTables& Tables() {
        static const ByteTables tables = [] {
            ByteTables t;
            for (int i = 0; i < 256; ++i) {
                auto c = static_cast<unsigned char>(i);
                bool latin = IsAsciiAlnum(static_cast<char>(c));
                t.latin[c] = latin ? Spread(Fold(c)) : 0;
                t.decoded[c] = Decoded(c);
            }
            return t;
        }();
        return tables;
    }

    static void set(Mask& mask, unsigned char c) { mask[c >> 6] |= uint64_t{1} << (c & 63); }

    static unsigned char Fold(unsigned char c) {
        return static_cast<unsigned char>(AsciiLower(static_cast<char>(c)));
    }

    // The character a stored byte becomes in the decoded text, case folded.
    static unsigned char Decoded(unsigned char c) {
        constexpr unsigned char kDosAlef = 0x80, kDosTav = 0x9A, kToWindows = 0x60;
        return (c >= kDosAlef && c <= kDosTav) ? static_cast<unsigned char>(c + kToWindows)
                                               : Fold(c);
    }

    // Spreads a byte over 64 bits, so that different sets of characters
    // rarely add up to the same digest.
    static uint64_t Spread(unsigned char c) {
        uint64_t x = (c + 1) * 0x9E3779B97F4A7C15ULL;
        x ^= x >> 31;
        return x * 0xBF58476D1CE4E5B9ULL;
    }

    Mask needs_{};
    uint64_t digest_;
};

} // namespace dovrel
