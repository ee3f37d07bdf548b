#include "Tests/Process/DecodeFixture.h"

#include "PropertyList/PropertyListWriter.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;
using testing::StartsWith;

constexpr const char* cellText = R"(Ventrik
  Serving Cell Info
    Num Tx Antennas: 2
    Physical Cell ID: 301
    Download Frequency: 1300
    Upload Frequency: 19300
    Download Bandwidth: 10 MHz
    Upload Bandwidth: 20 MHz
    Cell Identity: 27447299
    Tracking Area Code: 4711
    Freq Band Indicator: 3
  Note: none
)";

constexpr const char* cellJson =
    R"({"technology": "lte", "packets": 2, "display": {"Serving Cell Info": )"
    R"({"Num Tx Antennas": "2", "Physical Cell ID": "301", "Download Frequency": "1300", )"
    R"("Upload Frequency": "19300", "Download Bandwidth": "10 MHz", "Upload Bandwidth": "20 MHz", )"
    R"("Cell Identity": "27447299", "Tracking Area Code": "4711", "Freq Band Indicator": "3"}, )"
    R"("Note": "none"}}
)";

class DecodeResult : public DecodeFixture
{
};

/// A property-list message whose list is not one.
Bytes brokenCellMonitor()
{
    return PacketBuilder(0xFF0001).u8(13, 'x').build();
}

} // namespace

TEST_F(DecodeResult, IsATreeAsText)
{
    const Result result = decode(cellCapture());
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_EQ(result.output, cellText);
}

TEST_F(DecodeResult, IsOneDocumentAsJson)
{
    const Result result = decode(cellCapture(), {"--format", "json"});
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_EQ(result.output, cellJson);
}

TEST_F(DecodeResult, IsALineAMessageAsJsonLines)
{
    const PcapBytes capture = lteCapture()
                                  .record(captureStart, 7, antennaMessage(1))
                                  .record(captureStart + 9, 999999, antennaMessage(2));
    const Result result = decode(capture, {"--format", "jsonl"});
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_EQ(result.output,
              R"({"packet": 0, "time": 1000000000.000007, "display": {"Serving Cell Info": )"
              R"({"Num Tx Antennas": "1", "Physical Cell ID": "-"}, "Note": "none"}})"
              "\n"
              R"({"packet": 1, "time": 1000000009.999999, "display": {"Serving Cell Info": )"
              R"({"Num Tx Antennas": "2", "Physical Cell ID": "-"}, "Note": "none"}})"
              "\n");
}

TEST_F(DecodeResult, ShowsNanosecondsWhereTheCaptureHasThem)
{
    const PcapBytes capture = PcapBytes(lteLinkType, nanosecondMagic)
                                  .record(captureStart, 123456789, antennaMessage(2))
                                  .record(captureStart + 1, 5000, antennaMessage(2));
    const Result result = decode(capture, {"--format", "jsonl"});
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_THAT(linesOf(result.output),
                ElementsAre(StartsWith(R"({"packet": 0, "time": 1000000000.123456789, )"),
                            StartsWith(R"({"packet": 1, "time": 1000000001.000005, )")));
}

TEST_F(DecodeResult, IsTheSameFromStandardInput)
{
    const Result result = decodeInput(cellCapture());
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_EQ(result.output, cellText);
}

TEST_F(DecodeResult, StandsAloneOnStandardOutput)
{
    const Result result = decode(cellCapture());
    EXPECT_EQ(result.output, cellText);
    EXPECT_THAT(result.errors, IsEmpty());
}

TEST_F(DecodeResult, OfAnEmptyCaptureIsUnknownAsText)
{
    const Result result = decode(lteCapture());
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_EQ(result.output, "Ventrik: (unknown)\n");
}

TEST_F(DecodeResult, OfAnEmptyCaptureIsNullAsJson)
{
    const Result result = decode(lteCapture(), {"--format", "json"});
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_EQ(result.output, R"({"technology": "lte", "packets": 0, "display": null})"
                             "\n");
}

TEST_F(DecodeResult, OfAnEmptyCaptureIsNothingAsJsonLines)
{
    const Result result = decode(lteCapture(), {"--format", "jsonl"});
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_THAT(result.output, IsEmpty());
}

TEST_F(DecodeResult, IsNullWithoutATemplate)
{
    std::remove(path("resources/LTE.plist").c_str());
    const Result result = decode(cellCapture(), {"--format", "jsonl"});
    EXPECT_EQ(result.status, 1) << result.errors;
    EXPECT_EQ(result.output, R"({"packet": 0, "time": 1000000000.000000, "display": null})"
                             "\n"
                             R"({"packet": 1, "time": 1000000000.000001, "display": null})"
                             "\n");
}

TEST_F(DecodeResult, OfAnUnknownLinkTypeFollowsTheTechnologyOption)
{
    const PcapBytes capture = PcapBytes(1).record(captureStart, 0, antennaMessage(2));
    const Result result = decode(capture, {"--technology", "lte", "--format", "json"});
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_EQ(result.output, std::string(R"({"technology": "lte", "packets": 1, "display": )") +
                                 twoAntennas + "}\n");
}

TEST_F(DecodeResult, ComesWithTheSystemLogInAFile)
{
    const PcapBytes capture = lteCapture()
                                  .record(captureStart, 0, antennaMessage(2))
                                  .record(captureStart, 1, brokenCellMonitor());
    const std::string file = path("system.log");
    EXPECT_EQ(decode(capture, {"--system-log", file}).status, 0);
    auto lines = linesOf(withoutAddresses(readFile(file)));
    // The sections tell of themselves first, each in a line.
    std::erase_if(lines, [](const auto& line) { return line.starts_with("4\tArray Count: "); });
    EXPECT_THAT(lines,
                ElementsAre("3\tCreating LTELogGenerator object",
                            "3\tCreating OrbelLogGenerator2 object with %p",
                            "4\tCreating Log object: %p", "3\tClass Index: 1",
                            "4\tInitialized class index: %p, Self: %p", "4\tDictionary = 1",
                            "4\tString = 0", "4\tServing Cell Info", "4\tLTE Serving Cell Info",
                            "3\tReceived an unknown log message: 45249", "4\tLTE Serving Cell Info",
                            "3\tCell Info Array data could not be constructed",
                            "3\tFailed to get Cell Array\\n", "4\tLTELogGenerator is destructed %p",
                            "4\tOrbel_GSMLogGenerator is destructed %p"));
}

} // namespace ventrik
