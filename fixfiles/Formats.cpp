#include "fixfiles/Formats.h"

#include "platform/Error.h"

#include <cmath>
#include <cstdint>
#include <cstdio>

namespace dovrel {

namespace {

// Above this the cents of a double are no longer exact and there is no tie
// worth detecting.
constexpr double kTieCheckLimit = 1e15;

// True when |value| * 100 lies exactly halfway between two whole cents.
bool IsExactHalfCent(double magnitude, double& lowerCents) {
    lowerCents = std::floor(magnitude * 100.0);
    return std::fma(magnitude, 100.0, -(lowerCents + 0.5)) == 0.0;
}

// The digits of the magnitude with two decimals: integer digits, then the two
// decimal digits, without a separator.
std::string CentsDigits(double magnitude) {
    char buffer[400];
    double lowerCents = 0;
    if (magnitude < kTieCheckLimit && IsExactHalfCent(magnitude, lowerCents)) {
        auto cents = static_cast<int64_t>(lowerCents) + 1;
        std::snprintf(buffer, sizeof buffer, "%lld%02lld", static_cast<long long>(cents / 100),
                      static_cast<long long>(cents % 100));
        return buffer;
    }
    int length = std::snprintf(buffer, sizeof buffer, "%.2f", magnitude);
    // The decimal point is taken out by position, whatever the locale made it.
    std::string digits(buffer, static_cast<size_t>(length) - 3);
    digits.append(buffer + length - 2, 2);
    return digits;
}

} // namespace

std::string FormatAmount(double value) {
    if (!std::isfinite(value)) {
        throw Error("Overflow");
    }
    std::string digits = CentsDigits(std::fabs(value));
    size_t integerDigits = digits.size() - 2;
    bool negative = value < 0 && digits.find_first_not_of('0') != std::string::npos;

    std::string result;
    result.reserve(digits.size() + integerDigits / 3 + 2);
    if (negative) {
        result.push_back('-');
    }
    for (size_t i = 0; i < integerDigits; ++i) {
        if (i > 0 && (integerDigits - i) % 3 == 0) {
            result.push_back(',');
        }
        result.push_back(digits[i]);
    }
    result.push_back('.');
    result.append(digits, integerDigits, 2);
    return result;
}

} // namespace dovrel
