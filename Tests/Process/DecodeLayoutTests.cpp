#include "Tests/Process/DecodeFixture.h"

#include <filesystem>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

class DecodeLayouts : public DecodeFixture
{
  protected:
    /// The part of the program's own complaint that follows on the capture's name.
    static std::string behindName(const std::string& complaint)
    {
        return complaint.substr(complaint.find(".pcap: ") + 7);
    }
};

// Version 3 of the cell info: the frequencies have 32 bits.
Bytes newerCellInfo()
{
    return PacketBuilder(0xB0C2)
        .size(42)
        .u8(13, 3)
        .u16(14, 301)
        .u32(16, 66786)
        .u32(20, 132322)
        .build();
}

// A measurement of the serving cell in a version that nobody knows.
Bytes unknownMeasurement()
{
    return PacketBuilder(0xB17F).size(60).u8(13, 7).u8(14, 0xCA).u8(15, 0xFE).build();
}

Bytes mobilityState()
{
    return PacketBuilder(0xB0EE).size(32).u8(13, 2).u8(14, 3).build();
}

PcapBytes captureOf(const std::vector<Bytes>& messages)
{
    PcapBytes capture(lteLinkType);
    for (const Bytes& message : messages)
        capture.record(captureStart, 0, message);
    return capture;
}

} // namespace

TEST_F(DecodeLayouts, ARecordIsReadByTheLayoutThatItHas)
{
    EXPECT_THAT(decode(captureOf({newerCellInfo()})).output,
                HasSubstr("Upload Frequency: 132322\n"));
}

// Its upload frequency would stand at 18, in the upper half of the newer one: 1.
TEST_F(DecodeLayouts, BaseReadsEveryRecordByTheFirstLayout)
{
    const Result result = decode(captureOf({newerCellInfo()}), {"--records", "base"});
    EXPECT_THAT(result.output, HasSubstr("Upload Frequency: 1\n"));
    EXPECT_THAT(result.complaints, IsEmpty());
}

TEST_F(DecodeLayouts, AnUnknownLayoutIsTold)
{
    const Result result = decode(captureOf({unknownMeasurement()}));
    EXPECT_EQ(result.status, 0);
    ASSERT_EQ(result.complaints.size(), 1U);
    EXPECT_EQ(behindName(result.complaints[0]),
              "0xB17F version 7: layout not known, values may be wrong");
}

TEST_F(DecodeLayouts, RecordsThatOnlyExtendedDecodesAreCounted)
{
    const PcapBytes capture = captureOf({mobilityState(), newerCellInfo(), mobilityState()});
    const Result newer = decode(capture);
    ASSERT_EQ(newer.complaints.size(), 1U);
    EXPECT_EQ(behindName(newer.complaints[0]), "2 records that only --records extended decodes");
}

TEST_F(DecodeLayouts, ExtendedDecodesThem)
{
    const std::string file = writeFile("extended.pcap", captureOf({mobilityState()}).bytes());
    const auto program = start("ventrik-decode", {"--records", "extended", file});
    const Result result = finish(*program);
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.output, HasSubstr("EMM State: EMM_REGISTERED\n"));
    EXPECT_THAT(result.complaints, IsEmpty());
}

TEST_F(DecodeLayouts, StatisticsCountRecordsByLayout)
{
    const Result result = decode(
        captureOf({newerCellInfo(), newerCellInfo(), unknownMeasurement()}), {"--statistics"});
    EXPECT_THAT(result.errors,
                HasSubstr("0xB0C2         3      42 newer              2  LTE serving cell info"));
    EXPECT_THAT(result.errors, HasSubstr("0xB17F         7      60 not known          1"));
    EXPECT_THAT(result.output, Not(HasSubstr("0xB0C2")));
}

TEST_F(DecodeLayouts, UnknownRecordsOfSeveralCapturesMakeOneReport)
{
    const std::string first =
        writeFile("first.pcap", captureOf({unknownMeasurement(), newerCellInfo()}).bytes());
    const std::string second = writeFile("second.pcap", captureOf({unknownMeasurement()}).bytes());
    const auto program =
        start("ventrik-decode", {"--report-unknown", path("report.txt"), first, second});
    const Result result = finish(*program);
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(readFile(path("report.txt")),
              "Records that cannot be read, by log code, version and size.\n"
              "0xB17F version 7 size 60: 2 records, first payload of 47 bytes\n");
    EXPECT_THAT(result.output, IsEmpty());
    EXPECT_THAT(result.complaints, ElementsAre(HasSubstr("no bytes of any payload")));
    EXPECT_EQ(std::filesystem::status(path("report.txt")).permissions(),
              std::filesystem::perms::owner_read | std::filesystem::perms::owner_write);
}

TEST_F(DecodeLayouts, AReportWithBytesSaysSo)
{
    const std::string file = writeFile("one.pcap", captureOf({unknownMeasurement()}).bytes());
    const auto program =
        start("ventrik-decode", {"--with-bytes", "--report-unknown", path("report.txt"), file});
    const Result result = finish(*program);
    EXPECT_THAT(readFile(path("report.txt")), HasSubstr("\n  07cafe00"));
    EXPECT_THAT(result.complaints, ElementsAre(HasSubstr("0xB17F")));
}

TEST_F(DecodeLayouts, ACaptureThatCannotBeReadLeavesTheOthersInTheReport)
{
    const std::string file = writeFile("one.pcap", captureOf({unknownMeasurement()}).bytes());
    const auto program = start(
        "ventrik-decode", {"--report-unknown", path("report.txt"), path("missing.pcap"), file});
    const Result result = finish(*program);
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(readFile(path("report.txt")), HasSubstr("0xB17F version 7"));
    EXPECT_THAT(result.complaints[0], HasSubstr("missing.pcap: No such file"));
}

} // namespace ventrik
