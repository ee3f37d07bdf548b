#include "Capture/CaptureReader.h"
#include "TelephonyService/ScenarioCapture.h"
#include "Tests/Support/TemporaryFile.h"
#include "Tests/TelephonyService/ListSource.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

class ScenarioCaptureTest : public testing::Test
{
  protected:
    bool write(std::uint64_t count)
    {
        ListSource source({{0ms, Bytes{1}}, {50ms, Bytes{2}}, {100ms, Bytes{3}}});
        return writeScenarioCapture(source, count, *technologyNamed("lte"), path, error);
    }
    std::size_t countWritten()
    {
        auto reader = CaptureReader::open(path, error);
        std::size_t count = 0;
        while (reader->next())
            ++count;
        return count;
    }

    const TemporaryFile file{"scenario.pcap"};
    std::string path = file.path();
    std::string error;
};

} // namespace

TEST_F(ScenarioCaptureTest, WritesTheMessagesWithTheirDueTimes)
{
    ASSERT_TRUE(write(3)) << error;
    auto reader = CaptureReader::open(path, error);
    EXPECT_EQ(reader->technology()->name, "lte");
    const auto first = reader->next()->time;
    // 2026-11-16 06:10:28 UTC
    EXPECT_EQ(first, Clock::TimePoint(1794809428s));
    const auto second = reader->next();
    EXPECT_EQ(second->time - first, 50ms);
    EXPECT_TRUE(std::ranges::equal(second->data, Bytes{2}));
}

TEST_F(ScenarioCaptureTest, StopsAtTheCountOrAtTheEnd)
{
    ASSERT_TRUE(write(2)) << error;
    EXPECT_EQ(countWritten(), 2U);
    ASSERT_TRUE(write(10)) << error;
    EXPECT_EQ(countWritten(), 3U);
}

TEST_F(ScenarioCaptureTest, TellsWhyItCannotWrite)
{
    path = "/nowhere/x.pcap";
    EXPECT_FALSE(write(3));
    EXPECT_EQ(error, "/nowhere/x.pcap: No such file or directory");
}

} // namespace ventrik
