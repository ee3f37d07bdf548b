#include "PropertyList/NumberText.h"

#include <cmath>
#include <limits>

#include <gtest/gtest.h>

namespace ventrik
{

TEST(NumberText, ReadsIntegersOfTheWholeRange)
{
    EXPECT_EQ(parseInteger("0"), PlistInteger(0));
    EXPECT_EQ(parseInteger("-0"), PlistInteger(0));
    EXPECT_EQ(parseInteger("+7"), PlistInteger(7));
    EXPECT_EQ(parseInteger("18446744073709551615"),
              PlistInteger(std::numeric_limits<std::uint64_t>::max()));
    EXPECT_EQ(parseInteger("-9223372036854775808"),
              PlistInteger(std::numeric_limits<std::int64_t>::min()));
}

TEST(NumberText, ReadsHexadecimalIntegers)
{
    EXPECT_EQ(parseInteger("0x1f"), PlistInteger(31));
    EXPECT_EQ(parseInteger("0XFF"), PlistInteger(255));
    EXPECT_EQ(parseInteger("-0x10"), PlistInteger(-16));
}

TEST(NumberText, RefusesWhatIsNoIntegerOfTheRange)
{
    for (const char* text : {"", "-", "+", "0x", "1.0", "1e3", "12a", "--1", "+-1", "0x-1", "1 2",
                             "18446744073709551616", "-9223372036854775809", "0x10000000000000000"})
        EXPECT_FALSE(parseInteger(text)) << text;
}

TEST(NumberText, ReadsReals)
{
    EXPECT_EQ(parseReal("1.5"), 1.5);
    EXPECT_EQ(parseReal("-2.5E-1"), -0.25);
    EXPECT_EQ(parseReal("+3"), 3.0);
    EXPECT_EQ(parseReal(".5"), 0.5);
    EXPECT_EQ(parseReal("5e-324"), std::numeric_limits<double>::denorm_min());
}

TEST(NumberText, ReadsTheNamesOfSpecialRealsInAnyCase)
{
    const double infinity = std::numeric_limits<double>::infinity();
    for (const char* text : {"inf", "INF", "+inf", "Infinity", "+INFINITY"})
        EXPECT_EQ(parseReal(text), infinity) << text;
    EXPECT_EQ(parseReal("-inf"), -infinity);
    EXPECT_EQ(parseReal("-Infinity"), -infinity);
    for (const char* text : {"nan", "NaN", "-nan"})
        EXPECT_TRUE(std::isnan(parseReal(text).value_or(0))) << text;
}

TEST(NumberText, RefusesWhatIsNoReal)
{
    for (const char* text : {"", "-", "1,5", "1.5x", "0x1p3", "nan(1)", "infinit", "infinityy",
                             "--1", "+-1", "+-inf", "e5", ".", "1e999", "1 2"})
        EXPECT_FALSE(parseReal(text)) << text;
}

TEST(NumberText, WritesRealsThatReadBackAsTheSame)
{
    for (const double value : {0.0, -0.0, 0.1, 1.0 / 3, 1e300, -5e-324, 123456789.125,
                               std::numeric_limits<double>::max()}) {
        const auto back = parseReal(formatReal(value));
        ASSERT_TRUE(back);
        EXPECT_EQ(*back, value);
        EXPECT_EQ(std::signbit(*back), std::signbit(value));
    }
}

TEST(NumberText, NamesSpecialReals)
{
    const double infinity = std::numeric_limits<double>::infinity();
    EXPECT_EQ(formatReal(infinity), "inf");
    EXPECT_EQ(formatReal(-infinity), "-inf");
    EXPECT_EQ(formatReal(-std::nan("")), "nan");
}

} // namespace ventrik
