#include "platform/Variant.h"

#include "platform/Error.h"

#include <charconv>
#include <cmath>
#include <cstdio>

namespace dovrel {

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
    char buf[40];
    std::snprintf(buf, sizeof buf, "%.15G", value);
    std::string s(buf);
    auto e = s.find('E');
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
    size_t first = text.find_first_not_of(' ');
    size_t last = text.find_last_not_of(' ');
    if (first == std::string::npos)
        throw Error("Type mismatch");
    const char* begin = text.data() + first;
    const char* end = text.data() + last + 1;
    if (*begin == '+')
        ++begin;
    double number = 0;
    auto [ptr, ec] = std::from_chars(begin, end, number);
    if (ec != std::errc() || ptr != end || !std::isfinite(number))
        throw Error("Type mismatch");
    return number;
}

} // namespace dovrel
