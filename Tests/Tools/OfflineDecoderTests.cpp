#include "Tests/Support/FakePlatform.h"
#include "Tests/Support/IdleGenerator.h"
#include "Tools/OfflineDecoder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;

// Notes when a display is generated, in milliseconds of capture time, and how many messages it saw.
class NotingGenerator : public IdleGenerator
{
  public:
    explicit NotingGenerator(const Clock& clock) : _clock(clock) {}
    void updateState(PlistDictionary& state, ByteView) override
    {
        ++_messages;
        state.set("Display", fmt::format("{}", _messages));
    }
    std::optional<PlistValue> generateLogUsingState(PlistDictionary&) override
    {
        const auto time = std::chrono::floor<std::chrono::milliseconds>(_clock.now());
        notes.push_back(fmt::format("{}:{}", time.time_since_epoch().count(), _messages));
        return std::nullopt;
    }
    PlistValue getSaveContentsFromState(const PlistDictionary&) const override
    {
        return PlistArray();
    }

    std::vector<std::string> notes;

  private:
    const Clock& _clock;
    int _messages = 0;
};

class OfflineDecoderTest : public testing::Test
{
  protected:
    void take(std::chrono::nanoseconds time) { decoder.take({Clock::TimePoint(time), {}}); }

    FakePlatform fake;
    CaptureClock clock{fake.clock};
    NotingGenerator generator{clock};
    OfflineDecoder decoder{generator, clock};
};

} // namespace

TEST_F(OfflineDecoderTest, GeneratesAtTheTickAfterAMessage)
{
    take(10s);
    take(11s);
    EXPECT_TRUE(generator.notes.empty());
    take(12s + 1ns);
    EXPECT_THAT(generator.notes, ElementsAre("12000:2"));
}

TEST_F(OfflineDecoderTest, GeneratesAtTheEndAloneWhereNobodyWantsTheHistory)
{
    OfflineDecoder without(generator, clock, OfflineDecoder::History::NotWanted);
    for (const auto time : {10s, 20s, 5s, 40s})
        without.take({Clock::TimePoint(time), {}});
    EXPECT_TRUE(generator.notes.empty());
    without.finish();
    EXPECT_THAT(generator.notes, ElementsAre("40000:4"));
}

TEST_F(OfflineDecoderTest, AMessageAtATickBelongsToIt)
{
    take(10s);
    take(12s);
    EXPECT_TRUE(generator.notes.empty());
    decoder.finish();
    EXPECT_THAT(generator.notes, ElementsAre("12000:2"));
}

TEST_F(OfflineDecoderTest, TicksCountFromTheFirstMessage)
{
    take(10s + 500ms);
    take(13s);
    take(15s);
    EXPECT_THAT(generator.notes, ElementsAre("12500:1", "14500:2"));
}

TEST_F(OfflineDecoderTest, TicksWithoutNewsGenerateNothing)
{
    take(10s);
    take(100s);
    EXPECT_THAT(generator.notes, ElementsAre("12000:1"));
    take(100s); // at the tick of 100 s, as the one before
    take(102s + 1ms);
    EXPECT_THAT(generator.notes, ElementsAre("12000:1", "100000:3"));
}

TEST_F(OfflineDecoderTest, ALongGapKeepsTheTicksGrid)
{
    take(10s);
    take(100s + 1ms); // the ticks go on at 102 s
    take(101s + 999ms);
    EXPECT_THAT(generator.notes, ElementsAre("12000:1"));
    take(102s + 1ms);
    EXPECT_THAT(generator.notes, ElementsAre("12000:1", "102000:3"));
}

TEST_F(OfflineDecoderTest, TheEndGeneratesOnceMoreAtTheLastMessagesTime)
{
    take(10s);
    take(10s + 700ms);
    decoder.finish();
    decoder.finish();
    EXPECT_THAT(generator.notes, ElementsAre("10700:2"));
}

TEST_F(OfflineDecoderTest, TheEndWithoutAMessageGeneratesNothing)
{
    decoder.finish();
    EXPECT_TRUE(generator.notes.empty());
    EXPECT_EQ(decoder.display(), nullptr);
}

TEST_F(OfflineDecoderTest, TimesThatRunBackByATickAtMostTickNothing)
{
    take(10s);
    take(8s);
    take(12s);
    EXPECT_TRUE(generator.notes.empty());
}

TEST_F(OfflineDecoderTest, AMessageMoreThanATickEarlierRunsATickAndTicksCountFromIt)
{
    take(10s);
    take(11s);
    take(8999ms);
    EXPECT_THAT(generator.notes, ElementsAre("11000:2"));
    take(10999ms);
    EXPECT_EQ(generator.notes.size(), 1U);
    take(11s);
    EXPECT_THAT(generator.notes, ElementsAre("11000:2", "10999:4"));
}

TEST_F(OfflineDecoderTest, AfterOneMessageFarAheadTicksComeAsBefore)
{
    take(10s);
    take(100'000s);
    take(11s);
    take(14s);
    EXPECT_THAT(generator.notes, ElementsAre("12000:1", "100000000:2", "13000:3"));
}

TEST_F(OfflineDecoderTest, TheDisplayStandsAsAfterTheLastMessage)
{
    take(10s);
    EXPECT_EQ(*decoder.display(), PlistValue("1"));
    take(10s);
    EXPECT_EQ(*decoder.display(), PlistValue("2"));
}

} // namespace ventrik
