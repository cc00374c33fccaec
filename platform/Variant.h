#pragma once

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

} // namespace dovrel
