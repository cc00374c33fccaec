#include "fixfiles/DateSerial.h"

#include "platform/Ascii.h"

#include "platform/Error.h"

#include <cstdio>

namespace dovrel {

namespace {

// Days from 1970-01-01 to 1899-12-30, the day of serial 0.
constexpr int64_t kSerialEpoch = -25569;
// Serials of 0100-01-01 and 9999-12-31, the range a date may take.
constexpr int64_t kFirstSerial = -657434;
constexpr int64_t kLastSerial = 2958465;
// Larger parts cannot be handled without overflow; no such part names a
// date in range unless another part cancels it out by as much.
constexpr int64_t kPartLimit = 1'000'000'000;

int64_t FloorDiv(int64_t a, int64_t b) {
    int64_t q = a / b;
    return (a % b != 0 && (a < 0) != (b < 0)) ? q - 1 : q;
}

// Days since 1970-01-01 of a proleptic Gregorian date with month 1..12.
int64_t DaysFromCivil(int64_t y, int64_t m, int64_t d) {
    y -= m <= 2 ? 1 : 0;
    int64_t era = FloorDiv(y, 400);
    int64_t yoe = y - era * 400;
    int64_t doy = (153 * (m > 2 ? m - 3 : m + 9) + 2) / 5 + d - 1;
    int64_t doe = yoe * 365 + yoe / 4 - yoe / 100 + doy;
    return era * 146097 + doe - 719468;
}

struct Civil {
    int year;
    int month;
    int day;
};

Civil CivilFromSerial(int64_t serial) {
    if (serial < kFirstSerial || serial > kLastSerial) {
        throw Error("Invalid date");
    }
    int64_t z = serial + kSerialEpoch + 719468;
    int64_t era = FloorDiv(z, 146097);
    int64_t doe = z - era * 146097;
    int64_t yoe = (doe - doe / 1460 + doe / 36524 - doe / 146096) / 365;
    int64_t doy = doe - (365 * yoe + yoe / 4 - yoe / 100);
    int64_t mp = (5 * doy + 2) / 153;
    int64_t d = doy - (153 * mp + 2) / 5 + 1;
    int64_t m = mp < 10 ? mp + 3 : mp - 9;
    int64_t y = yoe + era * 400 + (m <= 2 ? 1 : 0);
    return {static_cast<int>(y), static_cast<int>(m), static_cast<int>(d)};
}

constexpr int kMaxPart = 32767;

// A whole number as the date text allows it: spaces around it, an optional
// sign, then digits only.
int ParsePart(std::string_view text) {
    std::string_view number = Trim(text);
    if (number.empty()) {
        throw Error("Type mismatch");
    }
    bool negative = number.front() == '-';
    if (number.front() == '-' || number.front() == '+') {
        number.remove_prefix(1);
    }
    if (number.empty()) {
        throw Error("Type mismatch");
    }
    int64_t value = 0;
    for (char c : number) {
        if (c < '0' || c > '9') {
            throw Error("Type mismatch");
        }
        value = value * 10 + (c - '0');
        if (value > kMaxPart) {
            value = kMaxPart + 1;
        }
    }
    if (value > kMaxPart) {
        throw Error("Overflow");
    }
    return static_cast<int>(negative ? -value : value);
}

int64_t FullYear(int year) {
    if (year >= 80 && year <= 99) {
        return 1900 + year;
    }
    return year < 80 ? year + 2000 : year;
}

} // namespace

int Date::year() const {
    return CivilFromSerial(serial).year;
}
int Date::month() const {
    return CivilFromSerial(serial).month;
}
int Date::day() const {
    return CivilFromSerial(serial).day;
}

Date DateSerial(int64_t year, int64_t month, int64_t day) {
    auto outOfReach = [](int64_t part) { return part < -kPartLimit || part > kPartLimit; };
    if (outOfReach(year) || outOfReach(month) || outOfReach(day)) {
        throw Error("Invalid date");
    }
    int64_t monthIndex = month - 1;
    int64_t fullYear = year + FloorDiv(monthIndex, 12);
    int64_t monthOfYear = monthIndex - FloorDiv(monthIndex, 12) * 12 + 1;
    int64_t serial = DaysFromCivil(fullYear, monthOfYear, 1) + (day - 1) - kSerialEpoch;
    if (serial < kFirstSerial || serial > kLastSerial) {
        throw Error("Invalid date");
    }
    return Date{serial};
}

Date TextToDate(std::string_view text) {
    size_t s1 = text.find('/');
    size_t s2 = text.find('/', 3);
    if (s1 == std::string_view::npos || s2 == std::string_view::npos || s2 <= s1) {
        throw Error("Type mismatch");
    }
    int year = ParsePart(text.substr(s2 + 1));
    int month = ParsePart(text.substr(s1 + 1, s2 - s1 - 1));
    int day = ParsePart(text.substr(0, s1));
    return DateSerial(FullYear(year), month, day);
}

std::string FormatDate(const Date& date) {
    Civil civil = CivilFromSerial(date.serial);
    char buffer[48];
    std::snprintf(buffer, sizeof buffer, "%02d/%02d/%04d", civil.day, civil.month, civil.year);
    return buffer;
}

} // namespace dovrel
