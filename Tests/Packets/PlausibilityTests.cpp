#include "Packets/LTERecords.h"
#include "Packets/Plausibility.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

namespace ventrik
{

namespace
{

struct RangeCase {
    double first;
    double last;
};

// The ranges stand in ascending order and do not touch; beside each of their ends is a doubt.
void expectRanges(Quantity quantity, double step, std::span<const RangeCase> ranges)
{
    for (const auto [first, last] : ranges) {
        EXPECT_NE(doubtOf(quantity, first - step), "") << first;
        EXPECT_EQ(doubtOf(quantity, first), "") << first;
        EXPECT_EQ(doubtOf(quantity, last), "") << last;
        EXPECT_NE(doubtOf(quantity, last + step), "") << last;
    }
}

constexpr std::array<Mark, 1> noLevel{{{0, "Not Present"}}};
constexpr Field level{"Level", u16(0), rsrp(0.25, -180)};
constexpr Field markedLevel{"Level", u16(0), marked(rsrp(0.25, -180), noLevel)};
constexpr Field identity{"Identity", u16(0), physicalCellIdentity};

} // namespace

TEST(Plausibility, RSRPGoesFromMinus144ToMinus44)
{
    const RangeCase range[]{{-144, -44}};
    expectRanges(Quantity::RSRP, 0.25, range);
    EXPECT_EQ(doubtOf(Quantity::RSRP, -200), "RSRP is outside -144 to -44 dBm");
}

TEST(Plausibility, RSRQGoesFromMinus30To3)
{
    const RangeCase range[]{{-30, 3}};
    expectRanges(Quantity::RSRQ, 0.125, range);
    EXPECT_EQ(doubtOf(Quantity::RSRQ, 20), "RSRQ is outside -30 to 3 dB");
}

TEST(Plausibility, APhysicalCellIdentityIs503AtMost)
{
    const RangeCase range[]{{0, 503}};
    expectRanges(Quantity::PhysicalCellIdentity, 1, range);
    EXPECT_EQ(doubtOf(Quantity::PhysicalCellIdentity, 504), "Physical cell identity is above 503");
}

TEST(Plausibility, ADownlinkEARFCNIsInABand)
{
    const RangeCase ranges[]{{0, 4949},     {5010, 5379},   {5730, 7399},
                             {7500, 10359}, {36000, 60304}, {65536, 73335}};
    expectRanges(Quantity::DownlinkEARFCN, 1, ranges);
    EXPECT_EQ(doubtOf(Quantity::DownlinkEARFCN, 65535), "Downlink EARFCN is in no band");
}

TEST(Plausibility, AnUplinkEARFCNIsInABand)
{
    const RangeCase ranges[]{{18000, 22949}, {23010, 23379}, {23730, 25399},
                             {25500, 27809}, {36000, 60304}, {131072, 134341}};
    expectRanges(Quantity::UplinkEARFCN, 1, ranges);
    EXPECT_EQ(doubtOf(Quantity::UplinkEARFCN, 0), "Uplink EARFCN is in no band");
}

TEST(Plausibility, WhatHasNoKnownLimitsIsNeverInDoubt)
{
    EXPECT_EQ(doubtOf(Quantity::Any, 1e300), "");
}

TEST(Plausibility, WhatIsNoNumberIsInNoRange)
{
    EXPECT_NE(doubtOf(Quantity::RSRP, std::numeric_limits<double>::quiet_NaN()), "");
}

TEST(Plausibility, ARawNumberIsJudgedAsTheFieldScalesIt)
{
    EXPECT_EQ(doubtOf(level, 4 * 36), "");                                    // -144.00
    EXPECT_EQ(doubtOf(level, 4 * 36 - 1), "RSRP is outside -144 to -44 dBm"); // -144.25
    EXPECT_EQ(doubtOf(identity, 503), "");
    EXPECT_EQ(doubtOf(identity, 504), "Physical cell identity is above 503");
}

TEST(Plausibility, ARawNumberThatShowsAsATextIsNotInDoubt)
{
    EXPECT_NE(doubtOf(level, 0), ""); // -180.00
    EXPECT_EQ(doubtOf(markedLevel, 0), "");
    EXPECT_NE(doubtOf(markedLevel, 1), "");
}

TEST(Plausibility, AShownTextIsJudgedByItsNumber)
{
    EXPECT_EQ(doubtOfText(level, "-144.00 dBm"), "");
    EXPECT_EQ(doubtOfText(level, "-144.25 dBm"), "RSRP is outside -144 to -44 dBm");
    EXPECT_EQ(doubtOfText(identity, "503"), "");
    EXPECT_EQ(doubtOfText(identity, "504"), "Physical cell identity is above 503");
}

TEST(Plausibility, AShownTextThatIsNoNumberOfTheFieldIsNotInDoubt)
{
    for (const std::string_view text :
         {"", "-", "Unknown", "-200.00", "-200.00 dB", "-200.00dBm", "-200.00 dBm and more"})
        EXPECT_EQ(doubtOfText(level, text), "") << text;
    EXPECT_EQ(doubtOfText(identity, "504 "), "");
    EXPECT_EQ(doubtOfText(identity, "Cell 504"), "");
}

TEST(Plausibility, ADateIsOf1980AtTheEarliest)
{
    EXPECT_EQ(doubtOf(PlistDate{315532800}), ""); // 1980-01-01 00:00:00 UTC
    EXPECT_EQ(doubtOf(PlistDate{315532799}), "Date is before 1980");
    EXPECT_EQ(doubtOf(PlistDate{-1}), "Date is before 1980");
}

} // namespace ventrik
