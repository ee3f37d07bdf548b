#include "PropertyList/IsoDate.h"

#include <cmath>
#include <limits>

#include <gtest/gtest.h>

namespace ventrik
{

TEST(IsoDate, WritesTheSecondThatHasBegun)
{
    EXPECT_EQ(formatIsoDate({0}), "1970-01-01T00:00:00Z");
    EXPECT_EQ(formatIsoDate({86399.999}), "1970-01-01T23:59:59Z");
    EXPECT_EQ(formatIsoDate({-0.5}), "1969-12-31T23:59:59Z");
    EXPECT_EQ(formatIsoDate({978307200}), "2001-01-01T00:00:00Z");
}

TEST(IsoDate, WritesOnlyTheYears1To9999)
{
    EXPECT_EQ(formatIsoDate({-62135596800.0}), "0001-01-01T00:00:00Z");
    EXPECT_EQ(formatIsoDate({253402300799.0}), "9999-12-31T23:59:59Z");
    EXPECT_FALSE(formatIsoDate({-62135596801.0}));
    EXPECT_FALSE(formatIsoDate({253402300800.0}));
    EXPECT_FALSE(formatIsoDate({std::numeric_limits<double>::infinity()}));
    EXPECT_FALSE(formatIsoDate({std::nan("")}));
}

TEST(IsoDate, ReadsLeapDays)
{
    EXPECT_EQ(parseIsoDate("2000-02-29T00:00:01Z"), PlistDate{951782401});
    EXPECT_FALSE(parseIsoDate("1900-02-29T00:00:00Z"));
    EXPECT_FALSE(parseIsoDate("2023-02-29T00:00:00Z"));
}

TEST(IsoDate, RefusesDaysAndTimesThatDoNotExist)
{
    for (const char* text : {"2020-00-01T00:00:00Z", "2020-13-01T00:00:00Z", "2020-04-31T00:00:00Z",
                             "2020-01-00T00:00:00Z", "2020-01-01T24:00:00Z", "2020-01-01T00:60:00Z",
                             "2020-01-01T00:00:60Z", "0000-01-01T00:00:00Z"})
        EXPECT_FALSE(parseIsoDate(text)) << text;
}

TEST(IsoDate, RefusesOtherForms)
{
    for (const char* text :
         {"", "2020-01-01", "2020-01-01T00:00:00", "2020-01-01 00:00:00Z", "2020-1-01T00:00:000Z",
          "+020-01-01T00:00:00Z", "2020-01-01T00:00:00+", "2020-01-01T00:00:00.5Z"})
        EXPECT_FALSE(parseIsoDate(text)) << text;
}

} // namespace ventrik
