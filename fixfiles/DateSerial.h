#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace dovrel {

// A calendar date as a day number (0 is 30 December 1899, the classic date
// serial), so that dates compare as numbers.
struct Date {
    int64_t serial = 0;
    auto operator<=>(const Date&) const = default;

    int year() const;
    int month() const;
    int day() const;
};

// The date of a year, month and day. Parts outside their ranges roll over the
// way a date-serial function does: month 13 of 2024 is January 2025, day 0 is
// the last day of the month before, month 0 is December of the year before.
// A result outside the years 100 to 9999 is an error.
Date DateSerial(int64_t year, int64_t month, int64_t day);

// Reads a day/month/year text ("01/01/1980", "1/2/05"). Two-digit years from
// 80 to 99 are 1980 to 1999, below 80 they are 2000 onward. A text without its
// two "/" separators, or with a part that is not a whole number, is an error.
Date TextToDate(std::string_view text);

// "dd/mm/yyyy".
std::string FormatDate(const Date& date);

} // namespace dovrel
