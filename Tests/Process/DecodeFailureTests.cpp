#include "Tests/Process/CellMonitorCaptures.h"
#include "Tests/Process/DecodeFixture.h"
#include "Tests/Process/LargePropertyLists.h"

#include <filesystem>

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
    /// With the display templates that are shipped, and little address space.
    Result decodeInLittleMemory(const Arguments& arguments) const
    {
        constexpr int limit = 150'000; // KiB
        Arguments all{"-c", "ulimit -v \"$1\"; shift; exec \"$@\"", "sh", std::to_string(limit),
                      VENTRIK_PROGRAMS "/ventrik-decode"};
        all.insert(all.end(), arguments.begin(), arguments.end());
        Program program("/bin/sh", all, environment);
        return finish(program);
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
TEST_F(DecodeFailure, OfACellMonitorMessageLeavesWhatWasDecodedBefore)
{
    const PcapBytes capture =
        PcapBytes(cellMonitorLinkType)
            .record(captureStart, 0, cellMonitorMessage("<string>a</string>"))
            .record(captureStart, 1, cellMonitorMessage("<real>7</real>"))
            .record(captureStart, 2, cellMonitorMessage("<string>b</string>"));
    const std::string file = writeFile("cells.pcap", capture.bytes());
    const std::string log = path("system.log");
    const std::string snapshot = path("snapshot");
    const std::string line = "Assertion failure: Unknown object of type real encountered "
                             "(LogGenerator/GSM/GSMLogGenerator, line 78)";
    const std::vector<std::pair<std::string, std::string>> results{
        {"jsonl", "{\"packet\": 0, \"time\": 1000000000.000000, \"display\": {\"Cell\": \"a\"}}\n"},
        {"json", "{\"technology\": \"ifx\", \"packets\": 1, \"display\": {\"Cell\": \"a\"}}\n"},
        {"text", "Ventrik\n  Cell: a\n"}};
    for (const auto& [format, expected] : results) {
        const Result result = decode(
            Arguments{"--format", format, "--system-log", log, "--snapshot", snapshot, file});
        EXPECT_EQ(result.status, 1);
        EXPECT_EQ(result.output, expected);
        EXPECT_THAT(result.complaints,
                    ElementsAre("ventrik-decode: " + file + ": message 1: " + line));
        EXPECT_EQ(linesOf(readFile(log)).back(), "3\t" + line);
        EXPECT_THAT(readFile(snapshot), HasSubstr("<string>a</string>"));
    }
}

TEST_F(DecodeFailure, OfATemplateThatIsMissingOrBrokenNamesIt)
{
    const std::string file = writeFile("lte.pcap", lteCapture()
                                                       .record(captureStart, 0, antennaMessage(2))
                                                       .record(captureStart, 1, antennaMessage(2))
                                                       .bytes());
    const std::string directory = path("templates");
    std::filesystem::create_directory(directory);
    const auto complaint = [&] {
        const Result result = decode(Arguments{"--resources", directory, file});
        EXPECT_EQ(result.status, 1);
        EXPECT_EQ(result.output, "Ventrik: (unknown)\n");
        EXPECT_EQ(result.complaints.size(), 1U) << result.errors;
        return result.complaints.empty() ? std::string() : result.complaints.front();
    };
    EXPECT_EQ(complaint(), "ventrik-decode: display template LTE.plist is missing");
    const std::string bad = writeFile("templates/LTE.plist", "<plist><array/></plist>");
    EXPECT_EQ(complaint(), "ventrik-decode: display template " + bad +
                               ": it is no dictionary but of type array");
    writeFile("templates/LTE.plist", "no property list");
    EXPECT_THAT(complaint(), StartsWith("ventrik-decode: display template " + bad + ": "));
    writeFile("templates/LTE.plist", "<plist><dict><key>a</key><real>1</real></dict></plist>");
    EXPECT_EQ(complaint(), "ventrik-decode: display template " + bad +
                               ": it holds a value that is neither text nor array nor "
                               "dictionary");
}

// The sanitizers need more address space than any limit leaves.
#if !defined(VENTRIK_SANITIZED)
TEST_F(DecodeFailure, ForWantOfMemoryLeavesWhatWasDecodedBefore)
{
    const PcapBytes capture = lteCapture()
                                  .record(captureStart, 0, antennaMessage(2))
                                  .record(captureStart, 1, pdpMessage(oneTextManyTimes()));
    const std::string file = writeFile("large.pcap", capture.bytes());
    const Result result = decodeInLittleMemory({file});
    EXPECT_EQ(result.status, 1) << result.errors;
    EXPECT_THAT(result.complaints,
                ElementsAre("ventrik-decode: " + file + ": message 1: out of memory"));
    EXPECT_THAT(result.output, HasSubstr("Num Tx Antennas: 2\n"));
}

// The paths alone would take 5 GB.
TEST_F(DecodeFailure, DoesNotComeOfALongNameOverManyValues)
{
    const PcapBytes capture =
        lteCapture().record(captureStart, 0, pdpMessage(longNameOverManyValues()));
    const std::string file = writeFile("long.pcap", capture.bytes());
    const Result result = decodeInLittleMemory({file});
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_THAT(result.output, HasSubstr("49999: v\n"));
}
#endif

TEST_F(DecodeFailure, ToWriteTheSystemLogOrTheSnapshotIsTold)
{
    for (const char* option : {"--system-log", "--snapshot"}) {
        const Result result = decode(cellCapture(), {option, path("missing/file")});
        EXPECT_EQ(result.status, 1) << option;
        EXPECT_THAT(result.complaints, ElementsAre(HasSubstr(path("missing/file")))) << option;
    }
}

} // namespace ventrik
