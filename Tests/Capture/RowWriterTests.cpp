#include "Capture/RowWriter.h"

#include <algorithm>
#include <limits>

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::HasSubstr;
using testing::StartsWith;

// 2001-09-09 01:46:40 UTC and some microseconds.
constexpr Clock::TimePoint moment(1000000000s + 250us);

class RowWriterTest : public testing::Test
{
  protected:
    static std::string rowOf(RowFormat format, const RowRecord& record, const RowPlace& place,
                             const RowValue& value)
    {
        const auto writer = RowWriter::create(format, "drive, \"one\".pcap", "lte");
        const RecordPart part = writer->recordPart(record);
        return std::string(part.front) + writer->placePart(place) + valueOf(*writer, value) +
               std::string(part.back);
    }
    static std::string valueOf(const RowWriter& writer, const RowValue& value)
    {
        std::string row;
        writer.addValue(row, value);
        return row;
    }
    static std::string closingOf(RowFormat format, const RowClosing& closing)
    {
        std::string row;
        RowWriter::create(format, "drive.pcap", "lte")->appendClosing(row, closing);
        return row;
    }
    /// A row of a value with a number.
    static std::string numberRow(RowFormat format, double number)
    {
        return rowOf(format, {1, moment}, {"S", "/S/n", {}, "n"}, {number, "dB", "text"});
    }
};

const RowRecord wholeRecord{7, moment, 1U, RecordKind{0xB17F, 3, 33, LayoutKind::Base}};
const RowPlace wholePlace{"Measurements", "/A/0/RSRP", 0U, "RSRP"};
const RowValue wholeValue{-63.75, "dBm", "-63.75 dBm"};

} // namespace

TEST_F(RowWriterTest, WritesARowAsAnObject)
{
    EXPECT_EQ(rowOf(RowFormat::JsonLines, wholeRecord, wholePlace, wholeValue),
              R"({"capture":"drive, \"one\".pcap","record":7,"time":"2001-09-09T01:46:40.000250Z",)"
              R"("subscription":1,"technology":"lte","code":"0xB17F","version":3,"layout":"base",)"
              R"("section":"Measurements","path":"/A/0/RSRP","index":0,"name":"RSRP",)"
              R"("number":-63.75,"unit":"dBm","text":"-63.75 dBm"})"
              "\n");
}

TEST_F(RowWriterTest, WritesARowOfATable)
{
    EXPECT_EQ(rowOf(RowFormat::Csv, wholeRecord, wholePlace, wholeValue),
              R"("drive, ""one"".pcap",7,2001-09-09T01:46:40.000250Z,1,lte,0xB17F,3,base,)"
              R"(Measurements,/A/0/RSRP,0,RSRP,-63.75,dBm,-63.75 dBm,,,,,,,)"
              "\n");
}

TEST_F(RowWriterTest, WritesNothingKnownAsNull)
{
    EXPECT_EQ(rowOf(RowFormat::JsonLines, {0, moment}, {"", "/a", {}, "a"}, {}),
              R"({"capture":"drive, \"one\".pcap","record":0,"time":"2001-09-09T01:46:40.000250Z",)"
              R"("subscription":null,"technology":"lte","code":null,"version":null,"layout":null,)"
              R"("section":"","path":"/a","index":null,"name":"a","number":null,"unit":null,)"
              R"("text":null})"
              "\n");
}

TEST_F(RowWriterTest, TellsAnEmptyTextFromNoneInATable)
{
    EXPECT_THAT(rowOf(RowFormat::Csv, {0, moment}, {"s", "/a", {}, "a"}, {.text = ""}),
                HasSubstr(R"(,s,/a,,a,,,"",)"));
    EXPECT_THAT(rowOf(RowFormat::Csv, {0, moment}, {"s", "/a", {}, "a"}, {}),
                HasSubstr(R"(,s,/a,,a,,,,)"));
}

TEST_F(RowWriterTest, WritesNumbersWithAllTheirDigitsAndNoMore)
{
    EXPECT_THAT(numberRow(RowFormat::Csv, 12), HasSubstr(",12,dB,"));
    EXPECT_THAT(numberRow(RowFormat::Csv, 0.1), HasSubstr(",0.1,dB,"));
    EXPECT_THAT(numberRow(RowFormat::Csv, -0.0625), HasSubstr(",-0.0625,dB,"));
    EXPECT_THAT(numberRow(RowFormat::Csv, 100.5), HasSubstr(",100.5,dB,"));
    EXPECT_THAT(numberRow(RowFormat::Csv, 7.0009), HasSubstr(",7.0009,dB,"));
    EXPECT_THAT(numberRow(RowFormat::Csv, 0.1 + 0.2), HasSubstr(",0.30000000000000004,dB,"));
    EXPECT_THAT(numberRow(RowFormat::Csv, 0.03125), HasSubstr(",0.03125,dB,"));
    EXPECT_THAT(numberRow(RowFormat::Csv, -0.00001), HasSubstr(",-1e-05,dB,"));
    EXPECT_THAT(numberRow(RowFormat::Csv, 12345678901.5), HasSubstr(",12345678901.5,dB,"));
}

TEST_F(RowWriterTest, HasNoNumberThatIsNotFinite)
{
    EXPECT_THAT(numberRow(RowFormat::JsonLines, -std::numeric_limits<double>::infinity()),
                HasSubstr(R"("number":null,"unit":null,"text":"text")"));
    EXPECT_THAT(numberRow(RowFormat::JsonLines, std::numeric_limits<double>::quiet_NaN()),
                HasSubstr(R"("number":null)"));
}

TEST_F(RowWriterTest, KeepsATextOnOneLineOfJsonAndInOneFieldOfATable)
{
    const RowValue value{.text = "a\nb\"c"};
    EXPECT_THAT(rowOf(RowFormat::JsonLines, {0, moment}, wholePlace, value),
                HasSubstr(R"("text":"a\nb\"c"})"));
    EXPECT_THAT(rowOf(RowFormat::Csv, {0, moment}, wholePlace, value), HasSubstr("\"a\nb\"\"c\","));
}

TEST_F(RowWriterTest, HasNothingInATableThatATerminalWouldObey)
{
    const RowValue value{.text = "a\x1b[2J\tb\xc2\x9b\xff"};
    EXPECT_THAT(rowOf(RowFormat::Csv, {0, moment}, wholePlace, value),
                HasSubstr(",a [2J\tb \xef\xbf\xbd,"));
    EXPECT_THAT(rowOf(RowFormat::JsonLines, {0, moment}, wholePlace, value),
                HasSubstr(R"("text":"a\u001b[2J)"));
}

TEST_F(RowWriterTest, WritesAPointOfALineProtocol)
{
    EXPECT_EQ(rowOf(RowFormat::Influx, wholeRecord, wholePlace, wholeValue),
              R"(ventrik,capture=drive\,\ "one".pcap,technology=lte,section=Measurements,)"
              R"(path=/A/0/RSRP,index=0,name=RSRP )"
              R"(text="-63.75 dBm",number=-63.75,unit="dBm" 1000000000000250000)"
              "\n");
}

TEST_F(RowWriterTest, WritesAPointOfATextAndOneOfWhatIsGone)
{
    EXPECT_THAT(rowOf(RowFormat::Influx, {0, moment}, {"", "/a", {}, "a"}, {.text = "say \"a\\\""}),
                testing::EndsWith(R"(,technology=lte,path=/a,name=a text="say \"a\\\"" )"
                                  "1000000000000250000\n"));
    EXPECT_THAT(rowOf(RowFormat::Influx, {0, moment}, {"s", "/a", {}, "a"}, {}),
                HasSubstr(",name=a gone=true 1000000000000250000\n"));
}

TEST_F(RowWriterTest, APointIsOneLineAndItsTagsHoldNothingThatEndsThem)
{
    const RowPlace place{"a,b=c d", "/x\\", {}, "n\nm"};
    EXPECT_EQ(rowOf(RowFormat::Influx, {0, moment}, place, {.text = "1\n2"}),
              R"(ventrik,capture=drive\,\ "one".pcap,technology=lte,section=a\,b\=c\ d,)"
              R"(path=/x/,name=n\ m text="1 2" 1000000000000250000)"
              "\n");
}

TEST_F(RowWriterTest, APointHasNoNumberThatIsNotFinite)
{
    EXPECT_THAT(numberRow(RowFormat::Influx, -std::numeric_limits<double>::infinity()),
                HasSubstr(R"( text="text" 1)"));
}

TEST_F(RowWriterTest, ClosesACaptureWithAPointOfItsOwn)
{
    EXPECT_EQ(closingOf(RowFormat::Influx, {"damaged", 24, "cut \"short\"", 10, 8, 25, 360}),
              R"(ventrik_capture,capture=drive.pcap,technology=lte status="damaged",)"
              R"(reason="cut \"short\"",offset=24i,records=10i,decoded=8i,rows=25i,bytes=360i)"
              "\n");
}

TEST_F(RowWriterTest, ClosesACapture)
{
    EXPECT_EQ(closingOf(RowFormat::JsonLines, {"ok", {}, {}, 10, 8, 25, 360}),
              R"({"capture":"drive.pcap","status":"ok","offset":null,"reason":null,)"
              R"("records":10,"decoded":8,"rows":25,"bytes":360})"
              "\n");
    EXPECT_EQ(closingOf(RowFormat::Csv, {"damaged", 24, "cut, short", 10, 8, 25, 360}),
              "drive.pcap,,,,,,,,,,,,,,,damaged,24,\"cut, short\",10,8,25,360\n");
}

TEST_F(RowWriterTest, HasATableWithAsManyNamesAsFields)
{
    const auto commas = [](const std::string& line) { return std::ranges::count(line, ','); };
    const auto inHeading = commas(rowHeading(RowFormat::Csv));
    const auto writer = RowWriter::create(RowFormat::Csv, "c", "lte");
    EXPECT_EQ(commas(std::string(writer->recordPart(wholeRecord).front) +
                     writer->placePart(wholePlace) + valueOf(*writer, wholeValue)),
              inHeading);
    EXPECT_EQ(commas(closingOf(RowFormat::Csv, {"ok"})), inHeading);
}

TEST_F(RowWriterTest, TellsARecordBehindAnother)
{
    const auto writer = RowWriter::create(RowFormat::Csv, "c", "lte");
    EXPECT_EQ(
        writer->recordPart({0, moment, 1U, RecordKind{0xB17F, 3, 33, LayoutKind::Base}}).front,
        "c,0,2001-09-09T01:46:40.000250Z,1,lte,0xB17F,3,base");
    EXPECT_EQ(
        writer->recordPart({1, moment + 2s, 2U, RecordKind{0xB17F, 3, 33, LayoutKind::Base}}).front,
        "c,1,2001-09-09T01:46:42.000250Z,2,lte,0xB17F,3,base");
    EXPECT_EQ(
        writer->recordPart({2, moment, {}, RecordKind{0xB17F, 4, 33, LayoutKind::NotKnown}}).front,
        "c,2,2001-09-09T01:46:40.000250Z,,lte,0xB17F,4,not known");
}

TEST_F(RowWriterTest, TellsEachRecordAnewThatIsMuchLikeTheLast)
{
    const RecordKind kind{0xB17F, 3, 33, LayoutKind::Base};
    const auto writer = RowWriter::create(RowFormat::Csv, "c", "lte");
    EXPECT_EQ(writer->recordPart({9, moment, 1U, kind}).front,
              "c,9,2001-09-09T01:46:40.000250Z,1,lte,0xB17F,3,base");
    EXPECT_EQ(writer->recordPart({10, moment + 1us, 1U, kind}).front,
              "c,10,2001-09-09T01:46:40.000251Z,1,lte,0xB17F,3,base");
    EXPECT_EQ(writer->recordPart({11, moment + 999ms, 1U, kind}).front,
              "c,11,2001-09-09T01:46:40.999250Z,1,lte,0xB17F,3,base");
    EXPECT_EQ(writer->recordPart({12, moment + 1s, 1U, kind}).front,
              "c,12,2001-09-09T01:46:41.000250Z,1,lte,0xB17F,3,base");
    EXPECT_EQ(writer->recordPart({12, moment + 1s, 2U, kind}).front,
              "c,12,2001-09-09T01:46:41.000250Z,2,lte,0xB17F,3,base");
}

// More kinds than are kept take each other's place.
TEST_F(RowWriterTest, TellsRecordsOfManyKinds)
{
    const auto writer = RowWriter::create(RowFormat::Csv, "c", "lte");
    for (int round = 0; round < 2; ++round)
        for (std::uint32_t code = 0x1000; code < 0x1400; ++code)
            EXPECT_EQ(writer->recordPart({7, moment, {}, RecordKind{code, {}, 33, {}}}).front,
                      fmt::format("c,7,2001-09-09T01:46:40.000250Z,,lte,0x{:04X},,", code));
}

TEST_F(RowWriterTest, TellsTimesBefore1970)
{
    const auto writer = RowWriter::create(RowFormat::Csv, "c", "lte");
    EXPECT_EQ(writer->recordPart({0, Clock::TimePoint(-1us)}).front,
              "c,0,1969-12-31T23:59:59.999999Z,,lte,,,");
}

TEST_F(RowWriterTest, HasNoHeadingForObjects)
{
    EXPECT_EQ(rowHeading(RowFormat::JsonLines), "");
}

TEST_F(RowWriterTest, HasASchemaWithANumber)
{
    EXPECT_THAT(rowSchema(), StartsWith("schema\t1\ncapture\ttext\t"));
    EXPECT_THAT(rowSchema(), HasSubstr("\nlayout\ttext or null\t"));
}

} // namespace ventrik
