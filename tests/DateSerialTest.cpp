#include "fixfiles/DateSerial.h"

#include "platform/Error.h"

#include <gtest/gtest.h>

#include <limits>

namespace dovrel {
namespace {

void ExpectYmd(const Date& date, int year, int month, int day) {
    EXPECT_EQ(date.year(), year);
    EXPECT_EQ(date.month(), month);
    EXPECT_EQ(date.day(), day);
}

void ExpectError(std::string_view text, const std::string& message) {
    try {
        TextToDate(text);
        ADD_FAILURE() << "no error for \"" << text << "\"";
    } catch (const Error& error) {
        EXPECT_EQ(error.what(), message) << "for \"" << text << "\"";
    }
}

TEST(DateSerialTest, KnownSerials) {
    EXPECT_EQ(DateSerial(1899, 12, 30).serial, 0);
    EXPECT_EQ(DateSerial(1900, 1, 1).serial, 2);
    // 1900 is not a leap year: 28 February is 60 and 1 March is 61.
    EXPECT_EQ(DateSerial(1900, 2, 28).serial, 60);
    EXPECT_EQ(DateSerial(1900, 3, 1).serial, 61);
    EXPECT_EQ(DateSerial(1980, 1, 1).serial, 29221);
    EXPECT_EQ(DateSerial(2000, 2, 29).serial, 36585);
    ExpectYmd(Date{0}, 1899, 12, 30);
    ExpectYmd(Date{-1}, 1899, 12, 29);
}

TEST(DateSerialTest, EveryDayRoundTrips) {
    Date first = DateSerial(100, 1, 1);
    Date last = DateSerial(9999, 12, 31);
    for (int64_t serial = first.serial; serial <= last.serial; ++serial) {
        Date date{serial};
        ASSERT_EQ(DateSerial(date.year(), date.month(), date.day()).serial, serial);
    }
    EXPECT_EQ(last.serial - first.serial + 1, 9900 * 365 + 9900 / 4 - 99 + 24);
}

TEST(DateSerialTest, PartsRollOver) {
    EXPECT_EQ(DateSerial(2024, 13, 1), DateSerial(2025, 1, 1));
    EXPECT_EQ(DateSerial(2024, 0, 15), DateSerial(2023, 12, 15));
    EXPECT_EQ(DateSerial(2024, -1, 1), DateSerial(2023, 11, 1));
    EXPECT_EQ(DateSerial(2024, 25, 1), DateSerial(2026, 1, 1));
    EXPECT_EQ(DateSerial(2024, 3, 0), DateSerial(2024, 2, 29));
    EXPECT_EQ(DateSerial(2023, 3, 0), DateSerial(2023, 2, 28));
    EXPECT_EQ(DateSerial(2024, 1, 0), DateSerial(2023, 12, 31));
    EXPECT_EQ(DateSerial(2024, 3, -1), DateSerial(2024, 2, 28));
    EXPECT_EQ(DateSerial(2024, 1, 32), DateSerial(2024, 2, 1));
    EXPECT_EQ(DateSerial(2023, 2, 31), DateSerial(2023, 3, 3));
    EXPECT_EQ(DateSerial(2024, 1, 366), DateSerial(2024, 12, 31));
    EXPECT_EQ(DateSerial(2024, 0, 0), DateSerial(2023, 11, 30));
}

TEST(DateSerialTest, YearsOutsideTheRangeAreErrors) {
    EXPECT_NO_THROW(DateSerial(100, 1, 1));
    EXPECT_NO_THROW(DateSerial(9999, 12, 31));
    EXPECT_THROW(DateSerial(99, 12, 31), Error);
    EXPECT_THROW(DateSerial(100, 1, 0), Error);
    EXPECT_THROW(DateSerial(9999, 12, 32), Error);
    EXPECT_THROW(DateSerial(10000, 1, 1), Error);
    EXPECT_THROW(DateSerial(-5, 1, 1), Error);
    constexpr int64_t kMax = std::numeric_limits<int64_t>::max();
    constexpr int64_t kMin = std::numeric_limits<int64_t>::min();
    EXPECT_THROW(DateSerial(kMax, kMax, kMax), Error);
    EXPECT_THROW(DateSerial(2000, kMin, 1), Error);
    EXPECT_THROW(DateSerial(2000, 1, kMin), Error);
    EXPECT_THROW(Date{kMax}.year(), Error);
    EXPECT_THROW(FormatDate(Date{kMin}), Error);
}

TEST(TextToDateTest, DayMonthYearTexts) {
    ExpectYmd(TextToDate("01/01/1980"), 1980, 1, 1);
    ExpectYmd(TextToDate("1/2/05"), 2005, 2, 1);
    ExpectYmd(TextToDate("15/08/99"), 1999, 8, 15);
    ExpectYmd(TextToDate("1/12/80"), 1980, 12, 1);
    ExpectYmd(TextToDate("12/3/1980"), 1980, 3, 12);
    ExpectYmd(TextToDate("1/1/79"), 2079, 1, 1);
    ExpectYmd(TextToDate("1/1/0"), 2000, 1, 1);
    ExpectYmd(TextToDate("1/1/100"), 100, 1, 1);
    ExpectYmd(TextToDate(" 5/ 6 / 2024 "), 2024, 6, 5);
    ExpectYmd(TextToDate("+5/-1/2024"), 2023, 11, 5);
}

TEST(TextToDateTest, BadTextsAreErrors) {
    for (std::string_view text : {"", "1980", "01-01-1980", "aa/01/1980", "1.5/01/1980", "1//80",
                                  "/1/1980", "1/1/", "1/ /80", "1/1/80x", "1/1/- 5", "1/1/+",
                                  "01/01/1980/", "123/2/2024", "1/2/3/2024", " 1 / 2 / 2024"}) {
        ExpectError(text, "Type mismatch");
    }
    ExpectError("1/1/32768", "Overflow");
    ExpectError("1/-32768/1980", "Overflow");
    ExpectError("1/1/99999999999999999999999", "Overflow");
    ExpectError("1/1/32767", "Invalid date");
    ExpectError("1/32767/9000", "Invalid date");
}

TEST(TextToDateTest, RolledOverDatesCompareWithAFromDate) {
    Date from = TextToDate("01/03/2024");
    EXPECT_GT(TextToDate("31/02/2024"), from);
    EXPECT_LT(TextToDate("31/02/2024"), TextToDate("03/03/2024"));
    EXPECT_LT(TextToDate("0/3/2024"), from);
    EXPECT_EQ(TextToDate("30/02/2024"), from);
    EXPECT_GT(TextToDate("1/13/2023"), TextToDate("31/12/2023"));
    EXPECT_LT(TextToDate("1/0/2024"), TextToDate("1/1/2024"));
}

TEST(FormatDateTest, TwoDigitDayAndMonthFourDigitYear) {
    EXPECT_EQ(FormatDate(TextToDate("1/2/05")), "01/02/2005");
    EXPECT_EQ(FormatDate(DateSerial(1999, 12, 31)), "31/12/1999");
    EXPECT_EQ(FormatDate(DateSerial(100, 1, 1)), "01/01/0100");
    EXPECT_EQ(FormatDate(DateSerial(2024, 2, 30)), "01/03/2024");
    EXPECT_EQ(FormatDate(Date{}), "30/12/1899");
}

} // namespace
} // namespace dovrel
