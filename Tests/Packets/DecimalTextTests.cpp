#include "Packets/DecimalText.h"

#include <cmath>
#include <cstdio>
#include <limits>
#include <random>

#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

std::string twoDecimals(double number, bool hasSignAlways = false)
{
    std::string text;
    appendTwoDecimals(text, number, hasSignAlways);
    return text;
}

// What the C library makes of it.
std::string printed(double number, const char* format)
{
    char text[400];
    std::snprintf(text, sizeof text, format, number);
    return text;
}

void expectAsPrinted(double number)
{
    ASSERT_EQ(twoDecimals(number), printed(number, "%4.2f"));
    ASSERT_EQ(twoDecimals(number, true), printed(number, "%+.2f"));
}

} // namespace

TEST(DecimalText, LevelsHaveTwoDecimals)
{
    EXPECT_EQ(twoDecimals(-63.75), "-63.75");
    EXPECT_EQ(twoDecimals(0), "0.00");
    EXPECT_EQ(twoDecimals(7.006), "7.01");
    EXPECT_EQ(twoDecimals(12.5, true), "+12.50");
    EXPECT_EQ(twoDecimals(-0.001), "-0.00");
}

TEST(DecimalText, HalvesAreRoundedAsTheCLibraryDoes)
{
    EXPECT_EQ(twoDecimals(0.125), "0.12");
    EXPECT_EQ(twoDecimals(0.375), "0.38");
    EXPECT_EQ(twoDecimals(1.005), "1.00"); // a little less than that in binary
    for (int eighths = -8000; eighths <= 8000; ++eighths)
        expectAsPrinted(eighths * 0.125);
    for (int thousandths = -20000; thousandths <= 20000; ++thousandths)
        expectAsPrinted(thousandths * 0.001);
}

TEST(DecimalText, AnyNumberIsRoundedAsTheCLibraryDoes)
{
    std::mt19937_64 random(7);
    std::uniform_real_distribution<double> levels(-200, 200);
    std::uniform_real_distribution<double> exponents(-12, 12);
    for (int i = 0; i < 100000; ++i) {
        expectAsPrinted(levels(random));
        expectAsPrinted(std::pow(10.0, exponents(random)));
    }
}

TEST(DecimalText, WhatIsNoFiniteNumberIsPrintedToo)
{
    expectAsPrinted(std::numeric_limits<double>::infinity());
    expectAsPrinted(-std::numeric_limits<double>::infinity());
    expectAsPrinted(std::numeric_limits<double>::quiet_NaN());
    expectAsPrinted(-std::numeric_limits<double>::quiet_NaN());
    expectAsPrinted(1e300);
}

} // namespace ventrik
