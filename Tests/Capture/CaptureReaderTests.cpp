#include "Capture/CaptureReader.h"
#include "Tests/Capture/ContainerReading.h"
#include "Tests/Capture/OpenFiles.h"
#include "Tests/Capture/PcapBytes.h"
#include "Tests/Capture/SerialFrames.h"
#include "Tests/Support/TemporaryFile.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <limits>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

CaptureReader opened(const std::string& path)
{
    std::string error;
    auto reader = CaptureReader::open(path, error);
    EXPECT_TRUE(reader) << error;
    return std::move(reader.value());
}

Clock::TimePoint at(std::chrono::nanoseconds sinceEpoch)
{
    return Clock::TimePoint(sinceEpoch);
}

/// A capture in the newer form of the format, which counts 64-bit times in units of its own: here
/// in seconds. It holds one message of one byte.
class SecondsCapture
{
  public:
    explicit SecondsCapture(std::int64_t seconds)
    {
        const auto time = static_cast<std::uint64_t>(seconds);
        const auto high = static_cast<std::uint32_t>(time >> 32);
        const auto low = static_cast<std::uint32_t>(time);
        const std::uint32_t words[] = {
            0x0A0D0D0A, 28, 0x1A2B3C4D, 1,      0xFFFFFFFF, 0xFFFFFFFF, 28, // section header
            1,          32, 150,        262144, 0x00010009, 0,          0,
            32, // interface: resolution 10^0 s
            6,          36, 0,          high,   low,        1,          1,
            0x00000001, 36, // one message of one byte
        };
        std::ofstream stream(path(), std::ios::binary);
        for (const std::uint32_t word : words)
            for (unsigned shift = 0; shift < 32; shift += 8)
                stream.put(static_cast<char>(word >> shift));
    }
    const std::string& path() const { return _file.path(); }

  private:
    TemporaryFile _file{"seconds.pcapng"};
};

} // namespace

TEST(CaptureReader, GivesMessagesInOrderWithTheirTimes)
{
    auto reader = opened(PcapBytes(150).record(100, 5, {1, 2}).record(101, 999999, {3}).file());
    auto message = reader.next();
    ASSERT_TRUE(message);
    EXPECT_EQ(message->time, at(100s + 5us));
    EXPECT_TRUE(std::ranges::equal(message->data, Bytes{1, 2}));
    message = reader.next();
    ASSERT_TRUE(message);
    EXPECT_EQ(message->time, at(101s + 999999us));
    EXPECT_TRUE(std::ranges::equal(message->data, Bytes{3}));
    EXPECT_FALSE(reader.next());
    EXPECT_EQ(reader.error(), "");
}

TEST(CaptureReader, ReadsNanosecondCaptures)
{
    auto reader = opened(PcapBytes(150, 0xA1B23C4D).record(100, 5, {1}).file());
    EXPECT_EQ(reader.next()->time, at(100s + 5ns));
}

TEST(CaptureReader, ReadsEmptyMessages)
{
    auto reader = opened(PcapBytes(150).record(100, 0, {}).file());
    const auto message = reader.next();
    ASSERT_TRUE(message);
    EXPECT_TRUE(message->data.empty());
}

TEST(CaptureReader, TellsTheTechnologyByTheLinkType)
{
    EXPECT_EQ(opened(PcapBytes(147).file()).technology()->name, "ifx");
    EXPECT_EQ(opened(PcapBytes(151).file()).technology()->name, "utran");
}

TEST(CaptureReader, AnotherLinkTypeNamesNoTechnology)
{
    const auto reader = opened(PcapBytes(1).file());
    EXPECT_FALSE(reader.technology());
    EXPECT_EQ(reader.linkType(), 1);
}

TEST(CaptureReader, RefusesAMissingFileWithOneLine)
{
    std::string error;
    EXPECT_FALSE(CaptureReader::open("/nowhere/x.pcap", error));
    EXPECT_EQ(error, "/nowhere/x.pcap: No such file or directory");
}

TEST(CaptureReader, RefusesWhatIsNoCapture)
{
    const TemporaryFile file("no-capture.pcap");
    const std::string& path = file.path();
    std::ofstream(path) << "this is no capture, whatever its name may say";
    std::string error;
    EXPECT_FALSE(CaptureReader::open(path, error));
    EXPECT_THAT(error, testing::StartsWith(path + ": "));
    EXPECT_THAT(error, testing::Not(testing::HasSubstr("\n")));
}

TEST(CaptureReader, EveryTruncationInsideARecordIsDamage)
{
    const PcapBytes capture = PcapBytes(150).record(100, 0, {1, 2}).record(101, 0, {3, 4, 5});
    const std::size_t secondRecord = 24 + 16 + 2;
    for (std::size_t size = secondRecord + 1; size < capture.bytes().size(); ++size) {
        auto reader = opened(capture.file(size));
        EXPECT_TRUE(reader.next()) << size;
        EXPECT_FALSE(reader.next()) << size;
        EXPECT_THAT(reader.error(), testing::HasSubstr("message 1: truncated")) << size;
    }
}

TEST(CaptureReader, AMessageThatWasCutWhenCapturedIsDamage)
{
    auto reader = opened(PcapBytes(150).record(100, 0, {1, 2}, 40).file());
    EXPECT_FALSE(reader.next());
    EXPECT_THAT(reader.error(), testing::HasSubstr("cut short when it was captured (2 of 40"));
}

TEST(CaptureReader, ATimeBefore1970OrAfter2255IsDamage)
{
    for (const std::int64_t seconds : {std::int64_t{-1}, std::int64_t{9'000'000'001},
                                       std::numeric_limits<std::int64_t>::max()}) {
        const SecondsCapture capture(seconds);
        auto reader = opened(capture.path());
        EXPECT_FALSE(reader.next()) << seconds;
        EXPECT_THAT(reader.error(),
                    testing::HasSubstr(fmt::format("message 0: its time, {} s", seconds)));
    }
}

TEST(CaptureReader, TheFirstAndTheLastSecondAreInRange)
{
    for (const std::int64_t seconds : {std::int64_t{0}, std::int64_t{9'000'000'000}}) {
        const SecondsCapture capture(seconds);
        auto reader = opened(capture.path());
        const auto message = reader.next();
        ASSERT_TRUE(message) << reader.error();
        EXPECT_EQ(message->time, at(std::chrono::seconds(seconds)));
    }
}

TEST(CaptureReader, LeavesNoFileOpen)
{
    const PcapBytes capture(150);
    const std::size_t before = openFileCount();
    opened(capture.file());
    EXPECT_EQ(openFileCount(), before);
}

TEST(CaptureReader, AnAbsurdLengthIsDamage)
{
    PcapBytes capture(150);
    Bytes bytes = capture.record(100, 0, {1, 2}).bytes();
    bytes[24 + 8 + 3] = 0x7F; // the record's captured length
    const TemporaryFile file("absurd.pcap");
    const std::string& path = file.path();
    std::ofstream(path, std::ios::binary)
        .write(static_cast<const char*>(static_cast<const void*>(bytes.data())),
               static_cast<std::streamsize>(bytes.size()));
    auto reader = opened(path);
    EXPECT_FALSE(reader.next());
    EXPECT_NE(reader.error(), "");
}

// ---- Kinds of captures

namespace
{

CaptureReader openedBytes(const Bytes& bytes)
{
    const TemporaryFile file("capture");
    std::ofstream(file.path(), std::ios::binary)
        .write(reinterpret_cast<const char*>(bytes.data()),
               static_cast<std::streamsize>(bytes.size()));
    return opened(file.path());
}

Bytes records(std::initializer_list<std::uint16_t> codes)
{
    Bytes bytes;
    for (const std::uint16_t code : codes) {
        const Bytes record = logRecord(code, stampIn2025(), {1, 2, 3});
        bytes.insert(bytes.end(), record.begin(), record.end());
    }
    return bytes;
}

std::string guessedTechnology(std::initializer_list<std::uint16_t> codes)
{
    auto reader = openedBytes(records(codes));
    const auto technology = reader.guessTechnology();
    return technology ? std::string(technology->name) : "none";
}

std::size_t countMessages(CaptureReader& reader)
{
    std::size_t count = 0;
    while (reader.next())
        ++count;
    return count;
}

} // namespace

TEST(CaptureReader, TellsAFileOfRecordsByContent)
{
    auto reader = openedBytes(records({0xB17F, 0xB180}));
    EXPECT_FALSE(reader.linkType());
    EXPECT_EQ(countMessages(reader), 2U);
}

TEST(CaptureReader, TellsASerialStreamByContent)
{
    auto reader =
        openedBytes(joined({{5, 6, endMark}, logFrame(logRecord(0xB17F, stampIn2025(), {1}))}));
    EXPECT_EQ(countMessages(reader), 1U);
    EXPECT_THAT(reader.notes(), testing::SizeIs(1)); // what stands in front of the frame
}

TEST(CaptureReader, GuessesTheTechnologyThatDecodesMostOfTheRecords)
{
    EXPECT_EQ(guessedTechnology({0xB17F}), "lte");
    EXPECT_EQ(guessedTechnology({0x4127, 0x7135, 0x5134, 0xB17F}), "gsm");
    EXPECT_EQ(guessedTechnology({0xD00A, 0xD0E0, 0xB17F}), "utran");
    EXPECT_EQ(guessedTechnology({0x108A, 0x1183}), "c2k");
}

// 0xB0C3 is no record of ours, and the version report is nobody's.
TEST(CaptureReader, GuessesNothingFromRecordsThatNobodyDecodes)
{
    EXPECT_EQ(guessedTechnology({0xB0C3, 0x1FFD}), "none");
}

TEST(CaptureReader, AGuessTakesNoMessage)
{
    auto reader = openedBytes(records({0xB17F, 0xB180, 0xB0C2}));
    reader.guessTechnology();
    const auto first = reader.next();
    ASSERT_TRUE(first);
    EXPECT_EQ(first->data[3], 0x7F);
    EXPECT_EQ(countMessages(reader), 2U);
}

TEST(CaptureReader, OnlyTheFirstThousandRecordsCountForAGuess)
{
    Bytes bytes = records({0xB17F});
    const Bytes other = records({0x4127});
    const Bytes nobodys = records({0xB0C3});
    for (int i = 0; i < 999; ++i)
        bytes.insert(bytes.end(), nobodys.begin(), nobodys.end());
    for (int i = 0; i < 5; ++i)
        bytes.insert(bytes.end(), other.begin(), other.end());
    auto reader = openedBytes(bytes);
    EXPECT_EQ(reader.guessTechnology()->name, "lte");
}

} // namespace ventrik
