#include "Capture/CaptureWriter.h"
#include "Tests/Capture/PcapBytes.h"
#include "Tests/Support/TemporaryFile.h"

#include <gmock/gmock.h>

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

} // namespace ventrik
