#include "fixfiles/DateSerial.h"

#include "platform/Ascii.h"

#include "platform/Error.h"

#include <chrono>
#include <cstdio>

namespace dovrel {

namespace {

namespace chr = std::chrono;

// The day of serial 0.
constexpr chr::sys_days kSerialEpoch = chr::sys_days(chr::year(1899) / 12 / 30);
// Serials of 0100-01-01 and 9999-12-31, the range a date may take.
constexpr int64_t kFirstSerial = -657434;
constexpr int64_t kLastSerial = 2958465;
// Larger parts cannot be handled without overflow; no such part names a
// date in range unless another part cancels it out by as much.
constexpr int64_t kPartLimit = 1'000'000'000;
// The Gregorian calendar repeats every 400 years, which are this many days.
constexpr int64_t kDaysPer400Years = 146097;

int64_t FloorDiv(int64_t a, int64_t b) {
    int64_t q = a / b;
    return (a % b != 0 && (a < 0) != (b < 0)) ? q - 1 : q;
}

// The serial of the first day of a month (1..12) of any year: the year is
// brought into the calendar types' range by whole 400-year cycles.
int64_t SerialOfMonth(int64_t year, int64_t month) {
    int64_t cycles = FloorDiv(year, 400);
    chr::year_month_day first(chr::year(static_cast<int>(year - cycles * 400)),
                              chr::month(static_cast<unsigned>(month)), chr::day(1));
    return (chr::sys_days(first) - kSerialEpoch).count() + cycles * kDaysPer400Years;
}

chr::year_month_day CivilFromSerial(int64_t serial) {
    if (serial < kFirstSerial || serial > kLastSerial) {
        throw Error("Invalid date");
    }
    return chr::year_month_day(kSerialEpoch + chr::days(serial));
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
    return static_cast<int>(CivilFromSerial(serial).year());
}
int Date::month() const {
    return static_cast<int>(static_cast<unsigned>(CivilFromSerial(serial).month()));
}
int Date::day() const {
    return static_cast<int>(static_cast<unsigned>(CivilFromSerial(serial).day()));
}

Date DateSerial(int64_t year, int64_t month, int64_t day) {
    auto outOfReach = [](int64_t part) { return part < -kPartLimit || part > kPartLimit; };
    if (outOfReach(year) || outOfReach(month) || outOfReach(day)) {
        throw Error("Invalid date");
    }
    int64_t monthIndex = month - 1;
    int64_t fullYear = year + FloorDiv(monthIndex, 12);
    int64_t monthOfYear = monthIndex - FloorDiv(monthIndex, 12) * 12 + 1;
    int64_t serial = SerialOfMonth(fullYear, monthOfYear) + (day - 1);
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
    chr::year_month_day civil = CivilFromSerial(date.serial);
    char buffer[48];
    std::snprintf(buffer, sizeof buffer, "%02u/%02u/%04d", static_cast<unsigned>(civil.day()),
                  static_cast<unsigned>(civil.month()), static_cast<int>(civil.year()));
    return buffer;
}

} // namespace dovrel
