#include "Capture/CaptureReader.h"
#include "Capture/CaptureRecorder.h"
#include "Tests/Capture/OpenFiles.h"
#include "Tests/Capture/PcapBytes.h"
#include "Tests/Support/FixedClock.h"
#include "Tests/Support/ManualMainQueue.h"
#include "Tests/Support/TemporaryFile.h"

#include <gmock/gmock.h>

#include <csignal>
#include <filesystem>
#include <fstream>
#include <set>

#include <sys/stat.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

class CaptureRecorderTest : public testing::Test
{
  protected:
    CaptureRecorderTest()
    {
        std::filesystem::create_directory(directory.path());
        makeRecorder();
    }
    ~CaptureRecorderTest() override
    {
        recorder.reset();
        std::filesystem::remove_all(directory.path());
    }

    void makeRecorder()
    {
        recorder.reset();
        recorder = std::make_unique<CaptureRecorder>(
            queue, clock, options, [this](const std::string& line) { failures.push_back(line); });
        recorder->setTechnology(Technologies::lte);
    }
    std::string path(const std::string& name) const { return directory.path() + "/" + name; }
    void write(const std::string& name) const { std::ofstream(path(name)) << "precious"; }
    std::set<std::string> names() const
    {
        std::set<std::string> result;
        for (const auto& entry : std::filesystem::directory_iterator(directory.path()))
            result.insert(entry.path().filename());
        return result;
    }
    // The first byte of each message in a file that is whole.
    std::vector<int> messagesIn(const std::string& name) const
    {
        std::vector<int> result;
        std::string error;
        auto reader = CaptureReader::open(path(name), error);
        EXPECT_TRUE(reader) << error;
        while (const auto message = reader ? reader->next() : std::nullopt)
            result.push_back(message->data[0]);
        EXPECT_EQ(reader ? reader->error() : "", "");
        return result;
    }
    static Bytes message(std::uint8_t number, std::size_t size = 100)
    {
        return Bytes(size, number);
    }

    const TemporaryFile directory{"recordings"};
    ManualMainQueue queue;
    FixedClock clock;
    RecordingOptions options{.path = path("drive.pcap"), .rotationSize = {}, .rotationTime = {}};
    std::vector<std::string> failures;
    std::unique_ptr<CaptureRecorder> recorder;
};

} // namespace

TEST_F(CaptureRecorderTest, WritesTheFormatByteByByteInAPrivateFile)
{
    clock.set(Clock::TimePoint(100s + 7us + 999ns));
    recorder->record(Bytes{1, 2});
    recorder.reset();
    std::ifstream stream(path("drive.pcap"), std::ios::binary);
    EXPECT_EQ(Bytes(std::istreambuf_iterator<char>(stream), {}),
              PcapBytes(150).record(100, 7, {1, 2}).bytes());
    struct stat status {
    };
    ASSERT_EQ(stat(path("drive.pcap").c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777, 0600U);
}

TEST_F(CaptureRecorderTest, MakesNoFileBeforeAMessageOfAKnownTechnologyComes)
{
    recorder->setTechnology(std::nullopt);
    recorder->record(message(1));
    recorder->setTechnology(Technologies::lte);
    EXPECT_THAT(names(), IsEmpty());
    recorder->record(message(2));
    EXPECT_THAT(names(), ElementsAre("drive.pcap"));
    recorder.reset();
    EXPECT_THAT(messagesIn("drive.pcap"), ElementsAre(2));
}

TEST_F(CaptureRecorderTest, CanBeReadUpToTheLastSecondWhileItGrows)
{
    recorder->record(message(1));
    EXPECT_THAT(messagesIn("drive.pcap"), IsEmpty());
    queue.advance(1s);
    EXPECT_THAT(messagesIn("drive.pcap"), ElementsAre(1));
    recorder->record(message(2));
    queue.advance(999ms);
    EXPECT_THAT(messagesIn("drive.pcap"), ElementsAre(1));
    queue.advance(1ms);
    EXPECT_THAT(messagesIn("drive.pcap"), ElementsAre(1, 2));
}

TEST_F(CaptureRecorderTest, IsWholeWheneverItIsReadHoweverMuchComes)
{
    for (int i = 0; i < 200; ++i) {
        recorder->record(message(7, 1 + static_cast<std::size_t>(i) * 997));
        for (const int number : messagesIn("drive.pcap"))
            EXPECT_EQ(number, 7);
    }
    recorder.reset();
    EXPECT_EQ(messagesIn("drive.pcap").size(), 200U);
}

TEST_F(CaptureRecorderTest, HasNothingToDoWhileNothingComes)
{
    recorder->record(message(1));
    queue.advance(1s);
    EXPECT_EQ(queue.pendingCount(), 0U);
}

TEST_F(CaptureRecorderTest, OverwritesNoFileThatIsThere)
{
    write("drive.pcap");
    EXPECT_EQ(CaptureRecorder::faultOf(options),
              path("drive.pcap") + ": is there already, and a recording overwrites nothing");
    recorder->record(message(1));
    recorder->record(message(2));
    EXPECT_THAT(failures,
                ElementsAre("the recording ends: " + path("drive.pcap") + ": File exists"));
    EXPECT_EQ(std::filesystem::file_size(path("drive.pcap")), 8U);
}

TEST_F(CaptureRecorderTest, SaysBeforehandWhereNothingCanBeRecorded)
{
    EXPECT_EQ(CaptureRecorder::faultOf(options), "");
    const auto faultOf = [](const std::string& path) {
        return CaptureRecorder::faultOf({.path = path, .rotationSize = {}, .rotationTime = {}});
    };
    EXPECT_EQ(faultOf("/nowhere/x.pcap"), "/nowhere/x.pcap: No such file or directory");
    EXPECT_EQ(faultOf(directory.path() + "/"), directory.path() + "/: Is a directory");
    std::filesystem::create_symlink("nowhere", path("link"));
    EXPECT_NE(faultOf(path("link")), "");
}

TEST_F(CaptureRecorderTest, BeginsANumberedFileForAnotherTechnology)
{
    recorder->record(message(1));
    recorder->setTechnology(Technologies::gsm);
    recorder->record(message(2));
    recorder.reset();
    EXPECT_THAT(names(), ElementsAre("drive-0002.pcap", "drive.pcap"));
    EXPECT_THAT(messagesIn("drive.pcap"), ElementsAre(1));
    EXPECT_THAT(messagesIn("drive-0002.pcap"), ElementsAre(2));
    std::string error;
    EXPECT_EQ(CaptureReader::open(path("drive-0002.pcap"), error)->technology()->name, "gsm");
}

TEST_F(CaptureRecorderTest, GoesOnInItsFileWhenTheTechnologyComesBack)
{
    recorder->record(message(1));
    recorder->setTechnology(Technologies::lte);
    recorder->setTechnology(std::nullopt);
    recorder->record(message(2));
    recorder->setTechnology(Technologies::lte);
    recorder->record(message(3));
    recorder.reset();
    EXPECT_THAT(names(), ElementsAre("drive.pcap"));
    EXPECT_THAT(messagesIn("drive.pcap"), ElementsAre(1, 3));
}

TEST_F(CaptureRecorderTest, BeginsANewFileBeforeOneIsLargerThanItMay)
{
    options.rotationSize = 24 + 3 * (16 + 100);
    makeRecorder();
    for (std::uint8_t i = 1; i <= 7; ++i)
        recorder->record(message(i));
    recorder.reset();
    EXPECT_THAT(messagesIn("drive-0001.pcap"), ElementsAre(1, 2, 3));
    EXPECT_THAT(messagesIn("drive-0002.pcap"), ElementsAre(4, 5, 6));
    EXPECT_THAT(messagesIn("drive-0003.pcap"), ElementsAre(7));
}

TEST_F(CaptureRecorderTest, GivesAMessageAboveTheSizeAFileOfItsOwn)
{
    options.rotationSize = 200;
    makeRecorder();
    recorder->record(message(1, 1000));
    recorder->record(message(2));
    recorder.reset();
    EXPECT_THAT(names(), ElementsAre("drive-0001.pcap", "drive-0002.pcap"));
}

TEST_F(CaptureRecorderTest, BeginsANewFileAtAnAge)
{
    options.rotationTime = 1h;
    makeRecorder();
    recorder->record(message(1));
    clock.advance(1h - 1ns);
    recorder->record(message(2));
    clock.advance(1ns);
    recorder->record(message(3));
    recorder.reset();
    EXPECT_THAT(messagesIn("drive-0001.pcap"), ElementsAre(1, 2));
    EXPECT_THAT(messagesIn("drive-0002.pcap"), ElementsAre(3));
}

TEST_F(CaptureRecorderTest, NumbersOnAboveWhatIsThere)
{
    write("drive-0041.pcap");
    write("drive-x.pcap");
    write("drive-99.txt");
    options.rotationSize = 100000;
    makeRecorder();
    recorder->record(message(1));
    recorder.reset();
    EXPECT_THAT(messagesIn("drive-0042.pcap"), ElementsAre(1));
}

TEST_F(CaptureRecorderTest, EndsOnAFullDeviceAndTellsItOnce)
{
    options.path = "/dev/full";
    EXPECT_EQ(CaptureRecorder::faultOf(options), "");
    makeRecorder();
    recorder->record(message(1));
    recorder->record(message(2));
    queue.advance(5s);
    EXPECT_THAT(failures, ElementsAre("the recording ends: /dev/full: No space left on device"));
}

TEST_F(CaptureRecorderTest, LeavesOutAMessageThatNoReaderTakesAndSaysSoOnce)
{
    recorder->record(message(1, 262145));
    recorder->record(message(2, 262145));
    recorder->record(message(3, 262144));
    recorder.reset();
    EXPECT_THAT(messagesIn("drive.pcap"), ElementsAre(3));
    EXPECT_THAT(failures,
                ElementsAre(path("drive.pcap") + ": a message of 262145 bytes, and any such, is "
                                                 "too large for a capture and is left out"));
}

TEST_F(CaptureRecorderTest, DoesNothingMoreWhenItHasGone)
{
    recorder->record(message(1));
    recorder.reset();
    queue.advance(5s);
    EXPECT_THAT(failures, IsEmpty());
}

namespace
{

/// No file may grow above 1000 bytes.
class FullRecordingTest : public CaptureRecorderTest
{
  protected:
    FullRecordingTest() { std::signal(SIGXFSZ, SIG_IGN); } // the writing fails instead
    ~FullRecordingTest() override { std::signal(SIGXFSZ, SIG_DFL); }

    std::optional<LoweredLimit> limit{std::in_place, RLIMIT_FSIZE, rlim_t{1000}};
};

} // namespace

TEST_F(FullRecordingTest, LeavesWholeRecordsAndGoesOnWithout)
{
    recorder->record(message(1));
    queue.advance(1s);
    for (std::uint8_t i = 2; i <= 20; ++i)
        recorder->record(message(i));
    queue.advance(1s);
    EXPECT_THAT(failures,
                ElementsAre("the recording ends: " + path("drive.pcap") + ": File too large"));
    EXPECT_THAT(messagesIn("drive.pcap"), ElementsAre(1, 2, 3, 4, 5, 6, 7, 8));
}

TEST_F(FullRecordingTest, IsNotMendedByRoomThatComesLater)
{
    recorder->record(message(1, 2000));
    queue.advance(1s);
    limit.reset();
    recorder->record(message(2));
    recorder.reset();
    EXPECT_EQ(failures.size(), 1U);
    EXPECT_THAT(messagesIn("drive.pcap"), IsEmpty());
}

TEST_F(FullRecordingTest, WritesNothingBehindWhatHasFailedAlsoWhenThereIsRoomAtItsEnd)
{
    std::string error;
    auto capture = GrowingCapture::create(path("drive.pcap"), Technologies::lte, error);
    ASSERT_TRUE(capture) << error;
    EXPECT_TRUE(capture->write({}, message(1)));
    EXPECT_TRUE(capture->write({}, message(2, 2000)));
    EXPECT_FALSE(capture->flush());
    limit.reset();
    EXPECT_FALSE(capture->write({}, message(3)));
    EXPECT_FALSE(capture->flush());
    capture.reset();
    EXPECT_THAT(messagesIn("drive.pcap"), ElementsAre(1));
}

} // namespace ventrik
