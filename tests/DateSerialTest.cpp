#include "fixfiles/DateSerial.h"

#include "platform/Error.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <limits>

namespace dovrel {
namespace {

TEST(DateSerialTest, KnownSerialsAndEveryDayRoundTrips) {
    EXPECT_EQ(DateSerial(1899, 12, 30).serial, 0);
    // 1900 is not a leap year: 28 February is 60 and 1 March is 61.
    EXPECT_EQ(DateSerial(1900, 2, 28).serial, 60);
    EXPECT_EQ(DateSerial(1900, 3, 1).serial, 61);
    EXPECT_EQ(DateSerial(2000, 2, 29).serial, 36585);
    EXPECT_EQ(FormatDate(Date{-1}), "29/12/1899");
    EXPECT_EQ(FormatDate(Date{}), "30/12/1899");

    Date first = DateSerial(100, 1, 1), last = DateSerial(9999, 12, 31);
    for (int64_t serial = first.serial; serial <= last.serial; ++serial) {
        Date date{serial};
        ASSERT_EQ(DateSerial(date.year(), date.month(), date.day()).serial, serial);
    }
    EXPECT_EQ(last.serial - first.serial + 1, 9900 * 365 + 9900 / 4 - 99 + 24);
}

TEST(DateSerialTest, PartsRollOver) {
    struct Case {
        int64_t year, month, day;
        const char* date;
    };
    // clang-format off
    const Case cases[] = {
        {2024, 13, 1, "01/01/2025"}, {2024, 25, 1, "01/01/2026"}, {2024, 0, 15, "15/12/2023"},
        {2024, -1, 1, "01/11/2023"}, {2024, 3, 0, "29/02/2024"}, {2023, 3, 0, "28/02/2023"},
        {2024, 1, 0, "31/12/2023"}, {2024, 3, -1, "28/02/2024"}, {2024, 0, 0, "30/11/2023"},
        {2023, 2, 31, "03/03/2023"}, {2024, 1, 366, "31/12/2024"}, {100, 1, 1, "01/01/0100"}};
    // clang-format on
    for (const Case& c : cases)
        EXPECT_EQ(FormatDate(DateSerial(c.year, c.month, c.day)), c.date)
            << c.year << " " << c.month << " " << c.day;
}

TEST(DateSerialTest, ResultsOutsideTheYears100To9999AreErrors) {
    constexpr int64_t kMax = std::numeric_limits<int64_t>::max();
    constexpr int64_t kMin = std::numeric_limits<int64_t>::min();
    EXPECT_THROW(DateSerial(99, 12, 31), Error);
    EXPECT_THROW(DateSerial(100, 1, 0), Error);
    EXPECT_THROW(DateSerial(9999, 12, 32), Error);
    EXPECT_THROW(DateSerial(-5, 1, 1), Error);
    EXPECT_THROW(DateSerial(kMax, kMax, kMax), Error);
    EXPECT_THROW(DateSerial(2000, kMin, 1), Error);
    EXPECT_THROW(DateSerial(2000, 1, kMin), Error);
    EXPECT_THROW(Date{kMax}.year(), Error);
    EXPECT_THROW(FormatDate(Date{kMin}), Error);
}

TEST(TextToDateTest, DayMonthYearTextsRollOverLikeTheirParts) {
    const std::pair<const char*, const char*> cases[] = {
        {"01/01/1980", "01/01/1980"}, {"1/2/05", "01/02/2005"},        {"15/08/99", "15/08/1999"},
        {"1/12/80", "01/12/1980"},    {"1/1/79", "01/01/2079"},        {"1/1/0", "01/01/2000"},
        {"1/1/100", "01/01/0100"},    {" 5/ 6 / 2024 ", "05/06/2024"}, {"+5/-1/2024", "05/11/2023"},
        {"31/02/2024", "02/03/2024"}, {"0/3/2024", "29/02/2024"},      {"1/13/2023", "01/01/2024"},
        {"1/0/2024", "01/12/2023"}};
    for (auto [text, date] : cases)
        EXPECT_EQ(FormatDate(TextToDate(text)), date) << text;
}

TEST(TextToDateTest, BadTextsAreErrors) {
    auto fails = [](const char* message) { return testing::ThrowsMessage<Error>(message); };
    for (const char* text : {"", "1980", "01-01-1980", "aa/01/1980", "1.5/01/1980", "1//80",
                             "/1/1980", "1/1/", "1/ /80", "1/1/80x", "1/1/- 5", "1/1/+",
                             "01/01/1980/", "123/2/2024", "1/2/3/2024", " 1 / 2 / 2024"})
        EXPECT_THAT([&] { TextToDate(text); }, fails("Type mismatch")) << text;
    for (const char* text : {"1/1/32768", "1/-32768/1980", "1/1/99999999999999999999999"})
        EXPECT_THAT([&] { TextToDate(text); }, fails("Overflow")) << text;
    for (const char* text : {"1/1/32767", "1/32767/9000"})
        EXPECT_THAT([&] { TextToDate(text); }, fails("Invalid date")) << text;
}

} // namespace
} // namespace dovrel
