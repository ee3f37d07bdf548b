#include "Tests/Process/CellMonitorCaptures.h"
#include "Tests/Process/DecodeFixture.h"

#include <csignal>

namespace ventrik
{

namespace
{

using testing::AllOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

class DecodeFailure : public DecodeFixture
{
  protected:
    /// An antenna count and a second message that ends too soon.
    Bytes damagedCapture() const
    {
        const PcapBytes capture = lteCapture()
                                      .record(captureStart, 0, antennaMessage(2))
                                      .record(captureStart, 1, antennaMessage(4));
        return Bytes(capture.bytes().begin(), capture.bytes().end() - 5);
    }
};

} // namespace

TEST_F(DecodeFailure, OfDamageComesBehindWhatWasDecoded)
{
    const std::string file = writeFile("damaged.pcap", damagedCapture());
    const Result result = decode({"--format", "json", file});
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.output, std::string(R"({"technology": "lte", "packets": 1, "display": )") +
                                 twoAntennas + "}\n");
    EXPECT_THAT(result.complaints,
                ElementsAre(StartsWith("ventrik-decode: " + file + ": message 1: ")));
}

TEST_F(DecodeFailure, OfDamageLeavesTheLinesBeforeIt)
{
    const std::string file = writeFile("damaged.pcap", damagedCapture());
    const Result result = decode({"--format", "jsonl", file});
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(linesOf(result.output), ElementsAre(StartsWith(R"({"packet": 0, )")));
}

TEST_F(DecodeFailure, OfDamageStillWritesTheSnapshot)
{
    const std::string file = writeFile("damaged.pcap", damagedCapture());
    EXPECT_EQ(decode({"--snapshot", path("s.ventrik"), file}).status, 1);
    EXPECT_THAT(readFile(path("s.ventrik")), HasSubstr("2001-09-09 01:46:40 +0000"));
}

TEST_F(DecodeFailure, OfAMessageThatWasCutWhenCapturedSaysSo)
{
    const PcapBytes capture = lteCapture().record(captureStart, 0, antennaMessage(2), 100);
    const Result result = decode(capture);
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(result.complaints, ElementsAre(HasSubstr("message 0: cut short")));
}

TEST_F(DecodeFailure, OfAMissingFileNamesIt)
{
    const Result result = decode(Arguments{path("missing.pcap")});
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(result.output, IsEmpty());
    EXPECT_THAT(linesOf(result.errors),
                ElementsAre(AllOf(StartsWith("ventrik-decode: "), HasSubstr("missing.pcap"))));
}

TEST_F(DecodeFailure, OfAFileThatIsNoCaptureNamesIt)
{
    const std::string file = writeFile("letter.txt", "Dear reader, this is not a capture at all.");
    const Result result = decode(Arguments{file});
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(result.output, IsEmpty());
    EXPECT_THAT(linesOf(result.errors), ElementsAre(StartsWith("ventrik-decode: " + file)));
}

TEST_F(DecodeFailure, OfEmptyStandardInputNamesIt)
{
    const auto program = start("ventrik-decode", {"-"});
    program->closeInput();
    EXPECT_EQ(program->waitForEnd(), 1);
    EXPECT_THAT(linesOf(program->errors()),
                ElementsAre(StartsWith("ventrik-decode: standard input: ")));
}

TEST_F(DecodeFailure, OfAnUnknownLinkTypeIsWrongUsage)
{
    const Result result = decode(PcapBytes(1).record(captureStart, 0, antennaMessage(2)));
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.output, IsEmpty());
    EXPECT_THAT(linesOf(result.errors), ElementsAre(HasSubstr("link type 1 names no technology")));
}

// The cell monitor's service is trusted to send texts only.
TEST_F(DecodeFailure, OfACellMonitorMessageEndsTheProcessBehindWhatWasDecoded)
{
    const PcapBytes capture = PcapBytes(cellMonitorLinkType)
                                  .record(captureStart, 0, cellMonitorMessage("<string>a</string>"))
                                  .record(captureStart, 1, cellMonitorMessage("<real>7</real>"));
    const std::string log = path("system.log");
    const Result result = decode(capture, {"--format", "jsonl", "--system-log", log});
    EXPECT_EQ(result.status, 128 + SIGABRT);
    EXPECT_EQ(result.output, R"({"packet": 0, "time": 1000000000.000000, "display": )"
                             R"({"Cell": "a"}})"
                             "\n");
    const std::string line = "Assertion failure: Unknown object of type real encountered "
                             "(LogGenerator/GSM/GSMLogGenerator, line 78)";
    EXPECT_EQ(linesOf(result.errors).back(), line);
    EXPECT_EQ(linesOf(readFile(log)).back(), "3\t" + line);
}

TEST_F(DecodeFailure, ToWriteTheSystemLogOrTheSnapshotIsTold)
{
    for (const char* option : {"--system-log", "--snapshot"}) {
        const Result result = decode(cellCapture(), {option, path("missing/file")});
        EXPECT_EQ(result.status, 1) << option;
        EXPECT_THAT(result.complaints, ElementsAre(HasSubstr(path("missing/file")))) << option;
    }
}

} // namespace ventrik
