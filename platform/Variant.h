#pragma once

#include <cstdint>
#include <string>
#include <variant>

namespace dovrel {

// The value a host passes where the control takes a COM VARIANT: empty, null,
// text (code page 1255), number or boolean.
class Variant {
public:
    enum class Kind { Empty, Null, Text, Number, Boolean };

    Variant() = default;
    Variant(std::string text) : value_(std::move(text)) {}
    Variant(const char* text) : value_(std::string(text)) {}
    Variant(double number) : value_(number) {}
    Variant(int number) : value_(static_cast<double>(number)) {}
    Variant(bool flag) : value_(flag) {}
    static Variant Null();

    Kind kind() const { return static_cast<Kind>(value_.index()); }
    bool isNull() const { return kind() == Kind::Null; }
    bool isEmpty() const { return kind() == Kind::Empty; }

    // The value as text: empty gives "", a number its shortest decimal form
    // ("10", "10.5"), a boolean "True" or "False". Null is an error
    // ("Invalid use of Null"), as it is when a host passes it where text is due.
    std::string toText() const;
    // The value as a number: text must be a decimal number (surrounding
    // spaces allowed), empty counts as 0, a boolean as -1 or 0. Null and
    // other text are errors ("Type mismatch").
    double toNumber() const;
    // The value as a whole number of the given width, as the host's type
    // conversion gives it: rounded to the nearest, halves to even (10.5 -> 10,
    // 11.5 -> 12); out of range is an error ("Overflow").
    int32_t toInt32() const;
    int16_t toInt16() const;
    uint8_t toByte() const;
    // The value as a flag: a number is true unless 0; text "True"/"False"
    // (any case) or a number; other text is an error ("Type mismatch").
    bool toBool() const;
    // True when toNumber would succeed on a text or number.
    bool isNumeric() const;

    bool operator==(const Variant&) const = default;

private:
    struct NullTag {
        bool operator==(const NullTag&) const = default;
    };
    std::variant<std::monostate, NullTag, std::string, double, bool> value_;
};

// A double as the shortest plain decimal text that reads back the same,
// with no grouping and no trailing zeros ("2", "1.5", "-0.25"). Very large
// or very small magnitudes use an exponent ("1E+20").
std::string PlainNumber(double value);

// Rounds to the nearest whole number, halves to even, and checks the result
// lies within [min, max] ("Overflow" otherwise).
int64_t RoundToWhole(double value, int64_t min, int64_t max);

} // namespace dovrel
