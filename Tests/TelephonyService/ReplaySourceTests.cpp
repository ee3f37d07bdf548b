#include "Capture/CaptureWriter.h"
#include "TelephonyService/ReplaySource.h"
#include "Tests/Support/TemporaryFile.h"

#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

class ReplaySourceTest : public testing::Test
{
  protected:
    ReplaySourceTest()
    {
        std::string error;
        auto writer = CaptureWriter::create(path, *technologyNamed("lte"), error);
        EXPECT_TRUE(writer) << error;
        writer->write(Clock::TimePoint(100s), Bytes{1});
        writer->write(Clock::TimePoint(103s), Bytes{2});
        writer->write(Clock::TimePoint(102s), Bytes{3});
        writer->write(Clock::TimePoint(104s), Bytes{4});
        EXPECT_TRUE(writer->commit(error)) << error;
    }

    std::unique_ptr<ReplaySource> open(const ReplayOptions& options)
    {
        std::string error;
        auto source = ReplaySource::open(options, error);
        EXPECT_TRUE(source) << error;
        return source;
    }
    static std::vector<std::chrono::nanoseconds> dueTimes(ReplaySource& source, int count)
    {
        std::vector<std::chrono::nanoseconds> times;
        for (int i = 0; i < count; ++i)
            times.push_back(source.next().value().due);
        return times;
    }

    const TemporaryFile file{"replayed.pcap"};
    const std::string& path = file.path();
};

} // namespace

TEST_F(ReplaySourceTest, KeepsTheRecordedPausesAndTakesBackwardOnesAsNone)
{
    const auto source = open({.capture = path});
    EXPECT_TRUE(source->isPaced());
    EXPECT_EQ(dueTimes(*source, 4), (std::vector<std::chrono::nanoseconds>{0s, 3s, 3s, 5s}));
    EXPECT_FALSE(source->next());
}

TEST_F(ReplaySourceTest, DividesThePausesByTheSpeed)
{
    const auto source = open({.capture = path, .speed = 2.0});
    EXPECT_EQ(dueTimes(*source, 2), (std::vector<std::chrono::nanoseconds>{0s, 1500ms}));
}

TEST_F(ReplaySourceTest, GivesTheMessagesUnchanged)
{
    const auto source = open({.capture = path});
    EXPECT_EQ(source->next()->data, Bytes{1});
    EXPECT_EQ(source->next()->data, Bytes{2});
}

TEST_F(ReplaySourceTest, WithoutASpeedItHasNoPace)
{
    const auto source = open({.capture = path, .speed = std::nullopt});
    EXPECT_FALSE(source->isPaced());
    EXPECT_EQ(dueTimes(*source, 2), (std::vector<std::chrono::nanoseconds>{0s, 0s}));
}

TEST_F(ReplaySourceTest, BeginsAgainInALoop)
{
    const auto source = open({.capture = path, .loop = true});
    dueTimes(*source, 4);
    const auto again = source->next();
    ASSERT_TRUE(again);
    EXPECT_EQ(again->data, Bytes{1});
    EXPECT_EQ(again->due, 5s + 50ms);
}

TEST_F(ReplaySourceTest, AnEmptyCaptureDoesNotLoopForEver)
{
    std::string error;
    CaptureWriter::create(path, *technologyNamed("lte"), error)->commit(error);
    EXPECT_FALSE(open({.capture = path, .loop = true})->next());
}

TEST_F(ReplaySourceTest, RefusesACaptureThatIsNotThere)
{
    std::string error;
    EXPECT_FALSE(ReplaySource::open({.capture = "/nowhere/x.pcap"}, error));
    EXPECT_EQ(error, "/nowhere/x.pcap: No such file or directory");
}

} // namespace ventrik
