#include "fixfiles/Formats.h"

#include "platform/Error.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

namespace dovrel {
namespace {

TEST(FormatAmountTest, GroupsAndDecimals) {
    EXPECT_EQ(FormatAmount(0), "0.00");
    EXPECT_EQ(FormatAmount(0.5), "0.50");
    EXPECT_EQ(FormatAmount(7), "7.00");
    EXPECT_EQ(FormatAmount(100), "100.00");
    EXPECT_EQ(FormatAmount(999.99), "999.99");
    EXPECT_EQ(FormatAmount(1000), "1,000.00");
    EXPECT_EQ(FormatAmount(1234.5), "1,234.50");
    EXPECT_EQ(FormatAmount(123456.78), "123,456.78");
    EXPECT_EQ(FormatAmount(-1234567.89), "-1,234,567.89");
    EXPECT_EQ(FormatAmount(-999), "-999.00");
    EXPECT_EQ(FormatAmount(999999.999), "1,000,000.00");
    EXPECT_EQ(FormatAmount(1e20), "100,000,000,000,000,000,000.00");
    EXPECT_EQ(FormatAmount(-1e20), "-100,000,000,000,000,000,000.00");
}

TEST(FormatAmountTest, ExactHalvesRoundAwayFromZero) {
    EXPECT_EQ(FormatAmount(0.125), "0.13");
    EXPECT_EQ(FormatAmount(-0.125), "-0.13");
    // An even cent below the half: plain printing would round to it.
    EXPECT_EQ(FormatAmount(0.625), "0.63");
    EXPECT_EQ(FormatAmount(1234.875), "1,234.88");
    EXPECT_EQ(FormatAmount(-98765.625), "-98,765.63");
    // Doubles near a half are rounded by their exact value.
    EXPECT_EQ(FormatAmount(999.995), "1,000.00");
    EXPECT_EQ(FormatAmount(9999999.995), "9,999,999.99");
    EXPECT_EQ(FormatAmount(0.375), "0.38");
    // 2.675 is stored a little below the half, so it rounds down.
    EXPECT_EQ(FormatAmount(2.675), "2.67");
    EXPECT_EQ(FormatAmount(1.005), "1.00");
    // Large amounts: halves still round up, whole cents stay exact.
    EXPECT_EQ(FormatAmount(1e15 + 0.125), "1,000,000,000,000,000.13");
    EXPECT_EQ(FormatAmount(-4e14 - 0.625), "-400,000,000,000,000.63");
    EXPECT_EQ(FormatAmount(5e13), "50,000,000,000,000.00");
    EXPECT_EQ(FormatAmount(5e13 + 0.5), "50,000,000,000,000.50");
    EXPECT_EQ(FormatAmount(9e14 + 0.25), "900,000,000,000,000.25");
}

TEST(FormatAmountTest, NoNegativeZero) {
    EXPECT_EQ(FormatAmount(-0.0), "0.00");
    EXPECT_EQ(FormatAmount(-0.001), "0.00");
    EXPECT_EQ(FormatAmount(-0.004999), "0.00");
    EXPECT_EQ(FormatAmount(-0.005001), "-0.01");
    EXPECT_EQ(FormatAmount(std::numeric_limits<double>::denorm_min() * -1), "0.00");
}

TEST(FormatAmountTest, ExtremeValues) {
    std::string largest = FormatAmount(std::numeric_limits<double>::max());
    EXPECT_EQ(largest.substr(0, 8), "179,769,");
    EXPECT_EQ(largest.substr(largest.size() - 3), ".00");
    EXPECT_EQ(largest.size(), 309u + 102u + 3u);
    std::string lowest = FormatAmount(std::numeric_limits<double>::lowest());
    EXPECT_EQ(lowest, "-" + largest);
}

TEST(FormatAmountTest, NonFiniteValuesAreErrors) {
    for (double value :
         {std::numeric_limits<double>::quiet_NaN(), std::numeric_limits<double>::infinity(),
          -std::numeric_limits<double>::infinity()}) {
        try {
            FormatAmount(value);
            ADD_FAILURE() << "no error for " << value;
        } catch (const Error& error) {
            EXPECT_STREQ(error.what(), "Overflow");
        }
    }
}

} // namespace
} // namespace dovrel
