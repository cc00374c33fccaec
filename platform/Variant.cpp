#include "platform/Variant.h"

#include "platform/Ascii.h"

#include "platform/Error.h"

#include <charconv>
#include <cmath>
#include <cstdint>

namespace dovrel {

namespace {} // namespace

Variant Variant::Null() {
    Variant v;
    v.value_ = NullTag{};
    return v;
}

std::string PlainNumber(double value) {
    if (!std::isfinite(value))
        throw Error("Overflow");
    if (value == 0)
        return "0";
    // Fifteen significant digits, as the classic basic conversion gives:
    // 0.1 + 0.2 shows as 0.3, not 0.30000000000000004.
    // to_chars ignores the locale: the point is a point under every locale.
    char buf[40];
    auto end = std::to_chars(buf, buf + sizeof buf, value, std::chars_format::general, 15).ptr;
    std::string s(buf, end);
    auto e = s.find('e');
    std::string mantissa = s.substr(0, e);
    std::string exponent = e == std::string::npos ? std::string() : s.substr(e);
    if (mantissa.find('.') != std::string::npos) {
        while (mantissa.back() == '0')
            mantissa.pop_back();
        if (mantissa.back() == '.')
            mantissa.pop_back();
    }
    if (!exponent.empty()) {
        // "E+020" and "E-05" become "E+20" and "E-5".
        char sign = exponent[1];
        std::string digits = exponent.substr(2);
        while (digits.size() > 1 && digits.front() == '0')
            digits.erase(digits.begin());
        exponent = std::string("E") + sign + digits;
    }
    return mantissa + exponent;
}

std::string Variant::toText() const {
    switch (kind()) {
    case Kind::Empty:
        return {};
    case Kind::Null:
        throw Error("Invalid use of Null");
    case Kind::Text:
        return std::get<std::string>(value_);
    case Kind::Number:
        return PlainNumber(std::get<double>(value_));
    case Kind::Boolean:
        return std::get<bool>(value_) ? "True" : "False";
    }
    return {};
}

double Variant::toNumber() const {
    switch (kind()) {
    case Kind::Empty:
        return 0;
    case Kind::Null:
        throw Error("Invalid use of Null");
    case Kind::Number:
        return std::get<double>(value_);
    case Kind::Boolean:
        return std::get<bool>(value_) ? -1 : 0;
    case Kind::Text:
        break;
    }
    const std::string& text = std::get<std::string>(value_);
    std::string_view trimmed = Trim(text);
    if (trimmed.empty())
        throw Error("Type mismatch");
    const char* begin = trimmed.data();
    const char* end = trimmed.data() + trimmed.size();
    if (*begin == '+')
        ++begin;
    double number = 0;
    auto [ptr, ec] = std::from_chars(begin, end, number);
    if (ec != std::errc() || ptr != end || !std::isfinite(number))
        throw Error("Type mismatch");
    return number;
}

int64_t RoundToWhole(double value, int64_t min, int64_t max) {
    if (!std::isfinite(value))
        throw Error("Overflow");
    double rounded = std::nearbyint(value); // the default mode rounds halves to even
    if (rounded < static_cast<double>(min) || rounded > static_cast<double>(max))
        throw Error("Overflow");
    return static_cast<int64_t>(rounded);
}

int32_t Variant::toInt32() const {
    return static_cast<int32_t>(RoundToWhole(toNumber(), INT32_MIN, INT32_MAX));
}

int16_t Variant::toInt16() const {
    return static_cast<int16_t>(RoundToWhole(toNumber(), INT16_MIN, INT16_MAX));
}

uint8_t Variant::toByte() const {
    return static_cast<uint8_t>(RoundToWhole(toNumber(), 0, UINT8_MAX));
}

bool Variant::toBool() const {
    if (kind() == Kind::Boolean)
        return std::get<bool>(value_);
    if (kind() == Kind::Text) {
        const std::string& text = std::get<std::string>(value_);
        if (EqualsNoCase(text, "True"))
            return true;
        if (EqualsNoCase(text, "False"))
            return false;
    }
    return toNumber() != 0;
}

bool Variant::isNumeric() const {
    if (kind() != Kind::Text && kind() != Kind::Number)
        return false;
    try {
        toNumber();
        return true;
    } catch (const Error&) {
        return false;
    }
}

} // namespace dovrel
