#include "LogGenerator/Orbel/CellMonitorArray.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

#include <limits>

namespace ventrik
{

namespace
{

std::optional<std::int32_t> numberOf(PlistValue value)
{
    return cellNumber(PlistDictionary{{"k", std::move(value)}}, "k");
}

} // namespace

TEST(CellMonitorArray, ParsesTheArrayBehindTheHeader)
{
    CapturingSystemLog log;
    const Bytes packet = propertyListPacket(cellMonitorLogCode, PlistArray{"a"});
    const auto cells = parseCellMonitorArray(LogPacket(packet), log);
    ASSERT_TRUE(cells);
    EXPECT_EQ(*cells, PlistArray{"a"});
    EXPECT_TRUE(log.lines().empty());
}

TEST(CellMonitorArray, ReportsDataThatDoesNotParse)
{
    CapturingSystemLog log;
    const Bytes packet = PacketBuilder(cellMonitorLogCode).u8(13, 'x').build();
    EXPECT_FALSE(parseCellMonitorArray(LogPacket(packet), log));
    EXPECT_THAT(log.lines(), testing::ElementsAre(CapturingSystemLog::Line{
                                 3, "Cell Info Array data could not be constructed"}));
}

TEST(CellMonitorArray, ARootThatIsNoArrayCountsAsUnparsed)
{
    CapturingSystemLog log;
    const Bytes packet = propertyListPacket(cellMonitorLogCode, PlistDictionary());
    EXPECT_FALSE(parseCellMonitorArray(LogPacket(packet), log));
    EXPECT_TRUE(log.contains("Cell Info Array data could not be constructed"));
}

TEST(CellMonitorArray, IntegersGiveTheirLow32BitsSigned)
{
    EXPECT_EQ(numberOf(5), 5);
    EXPECT_EQ(numberOf(-5), -5);
    EXPECT_EQ(numberOf(std::int64_t{4294967295}), -1);
    EXPECT_EQ(numberOf(std::int64_t{4294967296 + 7}), 7);
    EXPECT_EQ(numberOf(std::numeric_limits<std::uint64_t>::max()), -1);
}

TEST(CellMonitorArray, RealsAreTruncatedTowardZero)
{
    EXPECT_EQ(numberOf(7.9), 7);
    EXPECT_EQ(numberOf(-7.9), -7);
    EXPECT_EQ(numberOf(4294967296.0 + 3.5), 3);
}

TEST(CellMonitorArray, WhatIsNoFiniteNumberDoesNotConvert)
{
    EXPECT_FALSE(numberOf(std::numeric_limits<double>::infinity()));
    EXPECT_FALSE(numberOf(std::numeric_limits<double>::quiet_NaN()));
    EXPECT_FALSE(numberOf(true));
    EXPECT_FALSE(numberOf("5"));
    EXPECT_FALSE(cellNumber(PlistDictionary(), "k"));
}

} // namespace ventrik
