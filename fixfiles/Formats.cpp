#include "fixfiles/Formats.h"

#include "platform/Error.h"

#include <cmath>
#include <cstdio>

namespace dovrel {

namespace {

// The digits of the magnitude with two decimals: integer digits, then the two
// decimal digits, without a separator.
std::string CentsDigits(double magnitude) {
    char buffer[400];
    // The tie test runs on the fractional part alone: it is exact (below 1,
    // so fraction * 100 and its half cents are exact too), which a test on
    // magnitude * 100 stops being once that passes 2^52.
    double whole = std::floor(magnitude);
    double fraction = magnitude - whole;
    double lowerCents = std::floor(fraction * 100.0);
    if (std::fma(fraction, 100.0, -(lowerCents + 0.5)) == 0.0) {
        // Only .125, .375, .625 and .875 are exact halves, so rounding up never
        // carries into the whole part.
        std::snprintf(buffer, sizeof buffer, "%.0f%02d", whole, static_cast<int>(lowerCents) + 1);
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
