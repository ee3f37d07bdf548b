#include "Capture/CaptureWriter.h"
#include "Tests/Capture/OpenFiles.h"
#include "Tests/Capture/PcapBytes.h"
#include "Tests/Support/TemporaryFile.h"

#include <gmock/gmock.h>

#include <csignal>
#include <filesystem>

#include <unistd.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

class CaptureWriterTest : public testing::Test
{
  protected:
    Bytes written()
    {
        std::ifstream stream(path, std::ios::binary);
        return {std::istreambuf_iterator<char>(stream), {}};
    }

    const TemporaryFile file{"written.pcap"};
    const std::string& path = file.path();
    std::string error;
};

} // namespace

TEST_F(CaptureWriterTest, WritesTheFormatByteByByte)
{
    auto writer = CaptureWriter::create(path, *technologyNamed("lte"), error);
    ASSERT_TRUE(writer) << error;
    EXPECT_TRUE(writer->write(Clock::TimePoint(100s + 7us + 999ns), Bytes{1, 2}));
    EXPECT_TRUE(writer->write(Clock::TimePoint(101s), Bytes{}));
    EXPECT_TRUE(writer->commit(error)) << error;
    EXPECT_EQ(written(), PcapBytes(150).record(100, 7, {1, 2}).record(101, 0, {}).bytes());
}

TEST_F(CaptureWriterTest, RefusesAMessageThatNoReaderTakes)
{
    auto writer = CaptureWriter::create(path, *technologyNamed("lte"), error);
    ASSERT_TRUE(writer) << error;
    EXPECT_TRUE(writer->write({}, Bytes(262144)));
    EXPECT_FALSE(writer->write({}, Bytes(262145)));
}

TEST_F(CaptureWriterTest, RefusesAPlaceItCannotWriteTo)
{
    EXPECT_FALSE(CaptureWriter::create("/nowhere/x.pcap", *technologyNamed("lte"), error));
    EXPECT_EQ(error, "/nowhere/x.pcap: No such file or directory");
}

TEST_F(CaptureWriterTest, LeavesNoFileOpen)
{
    const std::size_t before = openFileCount();
    CaptureWriter::create(path, *technologyNamed("lte"), error);
    EXPECT_EQ(openFileCount(), before);
}

// The sanitizers need descriptors of their own.
#if !defined(VENTRIK_SANITIZED)
TEST_F(CaptureWriterTest, FailsWithAReasonWhereNoMoreFilesMayBeOpen)
{
    // One more is left: for the file that takes the name at the end.
    const int next = ::dup(STDIN_FILENO);
    ::close(next);
    const LoweredLimit files(RLIMIT_NOFILE, static_cast<rlim_t>(next) + 1);
    EXPECT_FALSE(CaptureWriter::create(path, *technologyNamed("lte"), error));
    EXPECT_EQ(error, path + ": Too many open files");
}
#endif

namespace
{

/// No file may grow above 64 bytes: the format's header and one small message fit.
class FullDiskTest : public CaptureWriterTest
{
  protected:
    FullDiskTest() { std::signal(SIGXFSZ, SIG_IGN); } // the writing fails instead
    ~FullDiskTest() override { std::signal(SIGXFSZ, SIG_DFL); }

    std::optional<LoweredLimit> size{std::in_place, RLIMIT_FSIZE, rlim_t{64}};
    std::optional<CaptureWriter> writer =
        CaptureWriter::create(path, *technologyNamed("lte"), error);
};

} // namespace

TEST_F(FullDiskTest, FailsAtTheMessageThatDoesNotFit)
{
    ASSERT_TRUE(writer) << error;
    EXPECT_TRUE(writer->write({}, Bytes(8)));
    EXPECT_FALSE(writer->write({}, Bytes(100'000)));
    EXPECT_FALSE(writer->write({}, Bytes(8)));
    EXPECT_FALSE(writer->commit(error));
    EXPECT_EQ(error, path + ": File too large");
    EXPECT_FALSE(std::filesystem::exists(path));
}

TEST_F(FullDiskTest, FailsAtTheEndWhereMessagesWaitedInMemory)
{
    ASSERT_TRUE(writer) << error;
    EXPECT_TRUE(writer->write({}, Bytes(100)));
    EXPECT_FALSE(writer->commit(error));
    EXPECT_EQ(error, path + ": File too large");
    EXPECT_FALSE(std::filesystem::exists(path));
}

TEST_F(FullDiskTest, IsNotMendedByRoomThatComesLater)
{
    ASSERT_TRUE(writer) << error;
    EXPECT_FALSE(writer->write({}, Bytes(100'000)));
    size.reset();
    EXPECT_FALSE(writer->commit(error));
    EXPECT_EQ(error, path + ": File too large");
    EXPECT_FALSE(std::filesystem::exists(path));
}

} // namespace ventrik
