#include "fixfiles/Formats.h"

#include "platform/Error.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <iomanip>
#include <limits>

namespace dovrel {
namespace {

using Limits = std::numeric_limits<double>;

TEST(FormatAmountTest, GroupsDigitsAndRoundsExactHalvesAwayFromZero) {
    // clang-format off
    const std::pair<double, const char*> cases[] = {
        {0, "0.00"}, {0.5, "0.50"}, {999.99, "999.99"}, {1000, "1,000.00"},
        {123456.78, "123,456.78"}, {-1234567.89, "-1,234,567.89"}, {999999.999, "1,000,000.00"},
        {-999, "-999.00"}, {-1e20, "-100,000,000,000,000,000,000.00"},
        // Exact halves, also where plain printing would pick the even cent below.
        {0.125, "0.13"}, {-0.125, "-0.13"}, {0.625, "0.63"}, {-98765.625, "-98,765.63"},
        {1e15 + 0.125, "1,000,000,000,000,000.13"}, {-4e14 - 0.625, "-400,000,000,000,000.63"},
        {9e14 + 0.25, "900,000,000,000,000.25"},
        // Near a half the exact stored value decides: 2.675 is a little below it.
        {999.995, "1,000.00"}, {9999999.995, "9,999,999.99"}, {2.675, "2.67"}, {1.005, "1.00"},
        // Amounts that round to zero have no sign.
        {-0.0, "0.00"}, {-0.004999, "0.00"}, {-0.005001, "-0.01"}, {-Limits::denorm_min(), "0.00"}};
    // clang-format on
    for (auto [value, expected] : cases)
        EXPECT_EQ(FormatAmount(value), expected) << std::setprecision(17) << value;
}

TEST(FormatAmountTest, ExtremeAndNonFiniteValues) {
    std::string largest = FormatAmount(Limits::max());
    EXPECT_EQ(largest.substr(0, 8), "179,769,");
    EXPECT_EQ(largest.substr(largest.size() - 3), ".00");
    EXPECT_EQ(largest.size(), 309u + 102u + 3u);
    EXPECT_EQ(FormatAmount(Limits::lowest()), "-" + largest);
    for (double value : {Limits::quiet_NaN(), Limits::infinity(), -Limits::infinity()})
        EXPECT_THAT([&] { FormatAmount(value); },
                    testing::ThrowsMessage<Error>(testing::StrEq("Overflow")))
            << value;
}

} // namespace
} // namespace dovrel
