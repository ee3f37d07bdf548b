#include "LogGenerator/Orbel/CellMonitor.h"
#include "Packets/SharedRecords.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

#include <limits>

namespace ventrik
{

namespace
{

std::optional<std::int32_t> numberUnderKey(PlistValue value)
{
    return cellNumber(PlistDictionary{{"k", std::move(value)}}, "k");
}

} // namespace

TEST(CellMonitor, ParsesTheArrayBehindTheHeader)
{
    CapturingSystemLog log;
    const Bytes packet = propertyListPacket(SharedRecords::cellMonitor.logCode, PlistArray{"a"});
    const auto cells = parseCellMonitorArray(LogPacket(packet), log);
    ASSERT_TRUE(cells);
    EXPECT_EQ(*cells, PlistArray{"a"});
    EXPECT_TRUE(log.lines().empty());
}

TEST(CellMonitor, ReportsDataThatDoesNotParse)
{
    CapturingSystemLog log;
    const Bytes packet = PacketBuilder(SharedRecords::cellMonitor.logCode).u8(13, 'x').build();
    EXPECT_FALSE(parseCellMonitorArray(LogPacket(packet), log));
    EXPECT_THAT(log.lines(), testing::ElementsAre(CapturingSystemLog::Line{
                                 3, "Cell Info Array data could not be constructed"}));
}

TEST(CellMonitor, ARootThatIsNoArrayCountsAsUnparsed)
{
    CapturingSystemLog log;
    const Bytes packet = propertyListPacket(SharedRecords::cellMonitor.logCode, PlistDictionary());
    EXPECT_FALSE(parseCellMonitorArray(LogPacket(packet), log));
    EXPECT_TRUE(log.contains("Cell Info Array data could not be constructed"));
}

TEST(CellMonitor, IntegersGiveTheirLow32BitsSigned)
{
    EXPECT_EQ(numberUnderKey(5), 5);
    EXPECT_EQ(numberUnderKey(-5), -5);
    EXPECT_EQ(numberUnderKey(std::int64_t{4294967295}), -1);
    EXPECT_EQ(numberUnderKey(std::int64_t{4294967296 + 7}), 7);
    EXPECT_EQ(numberUnderKey(std::numeric_limits<std::uint64_t>::max()), -1);
}

TEST(CellMonitor, RealsAreTruncatedTowardZero)
{
    EXPECT_EQ(numberUnderKey(7.9), 7);
    EXPECT_EQ(numberUnderKey(-7.9), -7);
    EXPECT_EQ(numberUnderKey(4294967296.0 + 3.5), 3);
}

TEST(CellMonitor, WhatIsNoFiniteNumberDoesNotConvert)
{
    EXPECT_FALSE(numberUnderKey(std::numeric_limits<double>::infinity()));
    EXPECT_FALSE(numberUnderKey(std::numeric_limits<double>::quiet_NaN()));
    EXPECT_FALSE(numberUnderKey(true));
    EXPECT_FALSE(numberUnderKey("5"));
    EXPECT_FALSE(cellNumber(PlistDictionary(), "k"));
}

} // namespace ventrik
