#include "Packets/PacketBuilder.h"
#include "PropertyList/PropertyListReader.h"
#include "PropertyList/PropertyListWriter.h"
#include "TelephonyService/LogChannel.h"
#include "Tests/Support/FakePlatform.h"
#include "Tests/TelephonyService/ListSource.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;

Bytes xml(const PlistValue& value)
{
    return propertyListBytes(value).value();
}

class LogChannelTest : public testing::Test
{
  protected:
    LogChannelTest() { fake.ports.listen("client"); }

    std::unique_ptr<LogChannel> makeChannel()
    {
        return std::make_unique<LogChannel>(fake.mainQueue, fake.log, content,
                                            fake.ports.createRemotePort("client"));
    }
    static Bytes startCommand(PlistArray codes, PlistArray extraCodes = {})
    {
        return xml(PlistDictionary{{"SetState", "Streaming"},
                                   {"SetOrbelLogCodes", std::move(codes)},
                                   {"SetQxExtraCodes", std::move(extraCodes)}});
    }
    void add(std::chrono::milliseconds due, Bytes data) { messages.push_back({due, data}); }
    // The first payload byte of each message that was sent.
    std::vector<int> sent()
    {
        std::vector<int> numbers;
        for (const RecordedSend& send : fake.ports.sends())
            numbers.push_back(send.data.back());
        return numbers;
    }
    // Until further notice the client takes nothing.
    void stopReading() { fake.ports.setDefaultResult({PortError::sendTimeout, std::nullopt}); }
    void goOnReading()
    {
        fake.ports.clearSends();
        fake.ports.setDefaultResult({});
    }

    static Bytes packet(std::uint32_t code, std::uint8_t number)
    {
        return PacketBuilder(code).u8(13, number).build();
    }

    // A source that is pushed, whose start and stop the test sees.
    struct PushedSource : MessageSource {
        explicit PushedSource(LogChannelTest& itsTest) : test(itsTest) {}
        ~PushedSource() override { test.receiver = {}; }
        void start(const WantedCodes& codes, Receiver itsReceiver) override
        {
            ++test.starts;
            test.wanted = codes;
            test.receiver = std::move(itsReceiver);
        }
        std::optional<TimedMessage> next() override { return std::nullopt; }

        LogChannelTest& test;
    };
    void usePushedSource()
    {
        content.makeSource = [this] { return std::make_unique<PushedSource>(*this); };
    }

    int starts = 0;
    WantedCodes wanted;
    MessageSource::Receiver receiver;
    FakePlatform fake;
    std::deque<TimedMessage> messages;
    bool isPaced = true;
    LogChannelContent content{"some technology",
                              [this] { return std::make_unique<ListSource>(messages, isPaced); }};
};

} // namespace

TEST_F(LogChannelTest, AnswersGetTechnology)
{
    const auto channel = makeChannel();
    const auto reply =
        channel->handleCommand(xml(PlistDictionary{{"GetTechnology", "GetTechnology"}}));
    ASSERT_TRUE(reply);
    EXPECT_EQ(*readPropertyList(*reply).value,
              PlistValue(PlistDictionary{{"GetTechnology", "some technology"}}));
}

TEST_F(LogChannelTest, ReportsWhatBecameOfTheMessages)
{
    for (std::uint8_t i = 0; i < 3; ++i)
        add(0ms, packet(7, i));
    add(0ms, packet(8, 9));
    const auto channel = makeChannel();
    channel->handleCommand(startCommand({7}));
    fake.mainQueue.advance(1s);
    const auto reply = channel->handleCommand(xml(PlistDictionary{{"GetReport", "GetReport"}}));
    ASSERT_TRUE(reply);
    EXPECT_EQ(*readPropertyList(*reply).value,
              PlistValue(PlistDictionary{
                  {"GetReport", PlistDictionary{{"Messages Sent", "3"},
                                                {"Messages Not Asked For", "1"},
                                                {"Messages Dropped by the Service", "0"}}}}));
}

TEST_F(LogChannelTest, StreamsNothingBeforeTheStartCommand)
{
    add(0ms, packet(7, 1));
    const auto channel = makeChannel();
    fake.mainQueue.advance(10s);
    EXPECT_TRUE(fake.ports.sends().empty());
}

TEST_F(LogChannelTest, StreamsEachMessageAtItsDueTime)
{
    add(0ms, packet(7, 1));
    add(1000ms, packet(7, 2));
    const auto channel = makeChannel();
    EXPECT_FALSE(channel->handleCommand(startCommand({7})));
    fake.mainQueue.advance(950ms);
    EXPECT_THAT(sent(), ElementsAre(1));
    fake.mainQueue.advance(50ms);
    EXPECT_THAT(sent(), ElementsAre(1, 2));
}

TEST_F(LogChannelTest, SendsWithoutWaitingUnderId0)
{
    add(0ms, packet(7, 1));
    const auto channel = makeChannel();
    channel->handleCommand(startCommand({7}));
    fake.mainQueue.advance(1s);
    ASSERT_EQ(fake.ports.sends().size(), 1U);
    EXPECT_EQ(fake.ports.sends()[0].id, 0);
    EXPECT_EQ(fake.ports.sends()[0].sendTimeout, 0.0);
    EXPECT_FALSE(fake.ports.sends()[0].replyWanted);
}

TEST_F(LogChannelTest, StreamsOnlyTheCodesThatWereAskedFor)
{
    add(0ms, packet(7, 1));
    add(0ms, packet(8, 2));
    add(0ms, packet(0xFF0007, 3));
    add(0ms, packet(0xFF0001, 4));
    add(0ms, PacketBuilder(7).u8(13, 5).withPrefix().build());
    add(0ms, Bytes{1, 2, 3, 4});
    const auto channel = makeChannel();
    channel->handleCommand(startCommand({7}, {1}));
    fake.mainQueue.advance(1s);
    EXPECT_THAT(sent(), ElementsAre(1, 4, 5));
}

TEST_F(LogChannelTest, AStartCommandWithoutCodesWantsEverything)
{
    add(0ms, Bytes{9});
    const auto channel = makeChannel();
    channel->handleCommand(xml(PlistDictionary{{"SetState", "Streaming"}}));
    fake.mainQueue.advance(1s);
    EXPECT_THAT(sent(), ElementsAre(9));
}

TEST_F(LogChannelTest, ASecondStartCommandBeginsAgain)
{
    add(0ms, packet(7, 1));
    const auto channel = makeChannel();
    channel->handleCommand(startCommand({7}));
    fake.mainQueue.advance(1s);
    channel->handleCommand(startCommand({7}));
    fake.mainQueue.advance(1s);
    EXPECT_THAT(sent(), ElementsAre(1, 1));
}

TEST_F(LogChannelTest, CommandsThatAreNotUnderstoodAreReported)
{
    const auto channel = makeChannel();
    EXPECT_FALSE(channel->handleCommand(Bytes{'x'}));
    EXPECT_FALSE(channel->handleCommand(xml("text")));
    EXPECT_FALSE(channel->handleCommand(xml(PlistDictionary{{"SetState", "Sleeping"}})));
    EXPECT_EQ(fake.log.texts(LogPriority::error).size(), 3U);
}

TEST_F(LogChannelTest, WhatAClientCannotTakeNowIsSentLaterInOrder)
{
    for (std::uint8_t i = 1; i <= 3; ++i)
        add(0ms, packet(7, i));
    const auto channel = makeChannel();
    channel->handleCommand(startCommand({7}));
    stopReading();
    fake.mainQueue.advance(5s);
    goOnReading();
    fake.mainQueue.advance(50ms);
    EXPECT_THAT(sent(), ElementsAre(1, 2, 3));
    EXPECT_EQ(channel->droppedCount(), 0U);
}

TEST_F(LogChannelTest, ASlowClientLosesTheOldestMessagesAndTheCountIsLogged)
{
    for (int i = 0; i < 1002; ++i)
        add(0ms, packet(7, static_cast<std::uint8_t>(i)));
    const auto channel = makeChannel();
    channel->handleCommand(startCommand({7}));
    stopReading();
    fake.mainQueue.advance(1s);
    EXPECT_EQ(channel->droppedCount(), 2U);
    EXPECT_TRUE(fake.log.contains(
        "Log channel for client: the client does not keep up, 2 messages dropped so far"));
    goOnReading();
    fake.mainQueue.advance(50ms);
    ASSERT_EQ(sent().size(), 1000U);
    EXPECT_EQ(sent().front(), 2);
}

TEST_F(LogChannelTest, WhatIsKeptForASlowClientIsBoundedInBytes)
{
    for (int i = 0; i < 10; ++i)
        add(0ms, PacketBuilder(7).size(std::size_t{1} << 20).build());
    const auto channel = makeChannel();
    channel->handleCommand(startCommand({7}));
    stopReading();
    fake.mainQueue.advance(1s);
    EXPECT_EQ(channel->droppedCount(), 6U); // 4 MiB are kept
}

TEST_F(LogChannelTest, TheDropCountIsLoggedOnlyWhenItChanges)
{
    for (int i = 0; i < 1001; ++i)
        add(0ms, packet(7, 1));
    const auto channel = makeChannel();
    channel->handleCommand(startCommand({7}));
    stopReading();
    fake.mainQueue.advance(60s);
    EXPECT_EQ(fake.log.count(
                  "Log channel for client: the client does not keep up, 1 messages dropped so far"),
              1U);
}

TEST_F(LogChannelTest, TheEndTellsTheWholeDropCount)
{
    for (int i = 0; i < 1001; ++i)
        add(0ms, packet(7, 1));
    auto channel = makeChannel();
    channel->handleCommand(startCommand({7}));
    stopReading();
    fake.mainQueue.advance(50ms);
    channel.reset();
    EXPECT_TRUE(fake.log.contains("Log channel for client ends: 1 messages dropped in all"));
}

TEST_F(LogChannelTest, AnUnpacedSourceLosesNothingToASlowClient)
{
    isPaced = false;
    for (int i = 0; i < 3000; ++i)
        add(1h, packet(7, 1));
    const auto channel = makeChannel();
    channel->handleCommand(startCommand({7}));
    stopReading();
    fake.mainQueue.advance(5s);
    goOnReading();
    fake.mainQueue.advance(5s);
    EXPECT_EQ(sent().size(), 3000U);
    EXPECT_EQ(channel->droppedCount(), 0U);
}

TEST_F(LogChannelTest, ASourceThatCannotBeMadeStreamsNothing)
{
    content.makeSource = [] { return nullptr; };
    const auto channel = makeChannel();
    channel->handleCommand(startCommand({7}));
    fake.mainQueue.advance(5s);
    EXPECT_TRUE(fake.ports.sends().empty());
}

TEST_F(LogChannelTest, TellsTheSourceWhichCodesAreWanted)
{
    usePushedSource();
    const auto channel = makeChannel();
    channel->handleCommand(startCommand({7, 0xB0C0}, {1}));
    EXPECT_EQ(starts, 1);
    EXPECT_FALSE(wanted.wantsAll());
    EXPECT_THAT(wanted.codes(), testing::UnorderedElementsAre(7, 0xB0C0, 0xFF0001));
}

TEST_F(LogChannelTest, StopsTheSourceBeforeItStartsANewOne)
{
    usePushedSource();
    const auto channel = makeChannel();
    channel->handleCommand(startCommand({7}));
    channel->handleCommand(startCommand({8}));
    EXPECT_EQ(starts, 2);
    EXPECT_TRUE(receiver);
}

TEST_F(LogChannelTest, StopsTheSourceWithTheChannel)
{
    usePushedSource();
    auto channel = makeChannel();
    channel->handleCommand(startCommand({7}));
    channel.reset();
    EXPECT_FALSE(receiver);
}

TEST_F(LogChannelTest, SendsWhatIsPushedAtOnceIfItIsWanted)
{
    usePushedSource();
    const auto channel = makeChannel();
    channel->handleCommand(startCommand({7}));
    receiver(packet(8, 1));
    receiver(packet(7, 2));
    EXPECT_THAT(sent(), ElementsAre(2));
}

TEST_F(LogChannelTest, KeepsWhatIsPushedForASlowClientInOrder)
{
    usePushedSource();
    const auto channel = makeChannel();
    channel->handleCommand(startCommand({7}));
    stopReading();
    receiver(packet(7, 1));
    receiver(packet(7, 2));
    goOnReading();
    receiver(packet(7, 3));
    EXPECT_THAT(sent(), ElementsAre());
    fake.mainQueue.advance(50ms);
    EXPECT_THAT(sent(), ElementsAre(1, 2, 3));
}

} // namespace ventrik
