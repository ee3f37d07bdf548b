#include "LogGenerator/Orbel/ValueText.h"

#include <gtest/gtest.h>

#include <limits>

namespace ventrik
{

TEST(ValueText, WholeNumbersCarryTheirUnit)
{
    EXPECT_EQ(decimal(-2147483647 - 1), "-2147483648");
    EXPECT_EQ(decimal(0), "0");
    EXPECT_EQ(wholeDb(-3), "-3 dB");
    EXPECT_EQ(wholeDbm(23), "23 dBm");
}

TEST(ValueText, LevelsHaveTwoDecimals)
{
    EXPECT_EQ(db(-10.75), "-10.75 dB");
    EXPECT_EQ(dbm(0), "0.00 dBm");
}

TEST(ValueText, SignedLevelsCarryTheirSignAlways)
{
    EXPECT_EQ(signedWholeDbm(5), "+5 dBm");
    EXPECT_EQ(signedWholeDbm(0), "+0 dBm");
    EXPECT_EQ(signedWholeDbm(-71), "-71 dBm");
    EXPECT_EQ(signedDb(0), "+0.00 dB");
    EXPECT_EQ(signedDb(-3.014), "-3.01 dB");
    EXPECT_EQ(signedDb(-std::numeric_limits<double>::infinity()), "-inf dB");
    EXPECT_EQ(signedDbm(12.5), "+12.50 dBm");
}

TEST(ValueText, SixDecimalsAreRoundedAndNeverCut)
{
    EXPECT_EQ(sixDecimals(0), "0.000000");
    EXPECT_EQ(sixDecimals(0.5), "0.500000");
    EXPECT_EQ(sixDecimals(0.99609375), "0.996094");
    EXPECT_EQ(sixDecimals(0.00390625), "0.003906");
}

} // namespace ventrik
