#include "Tools/RecordReports.h"

#include "Packets/PacketBuilder.h"

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using testing::HasSubstr;
using testing::Not;

// A measurement of a version that nobody knows: its payload is 07 and 32 bytes of CA.
PacketBuilder unknownMeasurement()
{
    PacketBuilder packet(0xB17F);
    packet.bytes(13, Bytes(33, 0xCA)).u8(13, 7);
    return packet;
}

// The state of the mobility management, which tells who somebody is.
PacketBuilder unknownIdentity()
{
    PacketBuilder packet(0xB0EE);
    packet.bytes(13, Bytes(20, 0xCB)).u8(13, 9);
    return packet;
}

RecordCensus unknownRecords()
{
    RecordCensus census(RecordsMode::Extended, RecordCensus::Payloads::Kept);
    for (int i = 0; i < 2; ++i)
        census.take(unknownMeasurement().build());
    census.take(unknownIdentity().build());
    return census;
}

} // namespace

TEST(RecordReports, AReportHoldsCodeVersionSizeAndCount)
{
    EXPECT_EQ(unknownRecordReport(unknownRecords(), false),
              "Records that cannot be read, by log code, version and size.\n"
              "0xB0EE version 9 size 33: 1 record, first payload of 20 bytes\n"
              "0xB17F version 7 size 46: 2 records, first payload of 33 bytes\n");
}

TEST(RecordReports, NoPayloadIsInAReportUnlessThatIsAskedFor)
{
    const std::string report = unknownRecordReport(unknownRecords(), false);
    EXPECT_THAT(report, Not(HasSubstr("caca")));
    EXPECT_THAT(report, Not(HasSubstr("cbcb")));
}

TEST(RecordReports, OnlyPayloadsOfMeasurementsAreInAReportWithBytes)
{
    const std::string report = unknownRecordReport(unknownRecords(), true);
    EXPECT_THAT(report, HasSubstr("bytes\n  07cacacacaca"));
    EXPECT_THAT(report, Not(HasSubstr("cbcb")));
}

// 0x50FF and 0x5200 lie beside the range.
TEST(RecordReports, MeasurementsAreThoseOfTheList)
{
    const auto isShown = [](std::uint32_t code) {
        RecordCensus census(RecordsMode::Extended, RecordCensus::Payloads::Kept);
        census.take(PacketBuilder(code).bytes(13, Bytes(9, 0xCA)).build());
        return unknownRecordReport(census, true).find("caca") != std::string::npos;
    };
    for (const std::uint32_t code : {0xB17FU, 0xB181U, 0x5100U, 0x51FEU, 0xB192U, 0xB195U})
        EXPECT_TRUE(isShown(code)) << std::hex << code;
    for (const std::uint32_t code : {0xB0C0U, 0xB0C1U, 0xB0C2U, 0xB0EEU, 0x50FFU, 0x5200U, 0x7150U})
        EXPECT_FALSE(isShown(code)) << std::hex << code;
}

TEST(RecordReports, RecordsThatCanBeReadAreInNoReport)
{
    RecordCensus census(RecordsMode::Extended, RecordCensus::Payloads::Kept);
    census.take(PacketBuilder(0xB0C2).size(38).u8(13, 2).build());
    EXPECT_EQ(unknownRecordReport(census, true),
              "Records that cannot be read, by log code, version and size.\n"
              "none\n");
}

TEST(RecordReports, TheNoticeSaysWhichBytesAreInTheReport)
{
    EXPECT_THAT(reportNotice("a.txt", false), HasSubstr("a.txt"));
    EXPECT_THAT(reportNotice("a.txt", false), HasSubstr("no bytes of any payload"));
    EXPECT_THAT(reportNotice("a.txt", true), HasSubstr("0xB179"));
}

TEST(RecordReports, TheTableHasALineForEachKind)
{
    RecordCensus census(RecordsMode::Newer);
    census.take(PacketBuilder(0xB0C2).size(42).u8(13, 3).build());
    census.take(unknownMeasurement().build());
    census.take(PacketBuilder(0x1234).size(20).build());
    const std::string table = recordTable(census);
    EXPECT_THAT(table, HasSubstr("0xB0C2         3      42 newer              1  LTE serving"));
    EXPECT_THAT(table, HasSubstr("0xB17F         7      46 not known          1  LTE serving"));
    EXPECT_THAT(table, HasSubstr("0x1234         -      20 -                  1  not decoded"));
}

TEST(RecordReports, TheTableOfCodesTellsSectionsAndWhatIsMissingAndWhatNobodyDecodes)
{
    CodeReport report;
    report.came = {{.logCode = 0xB0C2,
                    .records = 12,
                    .tooShort = 3,
                    .versions = {2, 3},
                    .sections = {"Serving Cell Info", "Other"},
                    .isAskedFor = true},
                   {.logCode = 0x1234, .records = 4}};
    report.missing = {0xB0C1, 0xFF0000};
    EXPECT_EQ(codeTable(report),
              "code        records  too short  versions      sections\n"
              "0xB0C2           12          3  2, 3          Serving Cell Info, Other\n"
              "asked for, never came: 0xB0C1, 0xFF0000\n"
              "came, nobody decodes: 0x1234 (4)\n");
}

TEST(RecordReports, TheTableOfCodesSaysThatNoneIsMissing)
{
    EXPECT_THAT(codeTable({}), HasSubstr("asked for, never came: none\n"
                                         "came, nobody decodes: none\n"));
}

} // namespace ventrik
