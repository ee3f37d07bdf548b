#include "TelephonyService/StreamRecording.h"

#include "Capture/CaptureReader.h"
#include "Packets/PacketBuilder.h"
#include "PropertyList/PropertyListWriter.h"
#include "Tests/Support/FakePlatform.h"
#include "Tests/Support/TemporaryFile.h"
#include "Tests/TelephonyService/ListSource.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;

class StreamRecordingTest : public testing::Test
{
  protected:
    StreamRecordingTest()
    {
        fake.ports.listen("client");
        recorder->setTechnology(Technologies::lte);
    }

    // A channel that streams messages of this number, one each 50 ms.
    std::unique_ptr<LogChannel> startChannel(std::uint8_t number)
    {
        nextNumber = number;
        auto channel = std::make_unique<LogChannel>(fake.mainQueue, fake.log, content,
                                                    fake.ports.createRemotePort("client"));
        channel->handleCommand(
            *propertyListBytes(PlistDictionary{{"SetState", "Streaming"},
                                               {"SetOrbelLogCodes", PlistArray{7}},
                                               {"SetQxExtraCodes", PlistArray()}}));
        return channel;
    }
    std::vector<int> recorded()
    {
        recorder.reset();
        std::vector<int> result;
        std::string error;
        auto reader = CaptureReader::open(file.path(), error);
        EXPECT_TRUE(reader) << error;
        while (const auto message = reader ? reader->next() : std::nullopt)
            result.push_back(message->data.back());
        return result;
    }

    FakePlatform fake;
    const TemporaryFile file{"recorded.pcap"};
    std::optional<CaptureRecorder> recorder{
        std::in_place, fake.mainQueue, fake.clock,
        RecordingOptions{.path = file.path(), .rotationSize = {}, .rotationTime = {}},
        [](const std::string& line) { ADD_FAILURE() << line; }};
    StreamRecording recording{*recorder};
    std::uint8_t nextNumber = 0;
    LogChannelContent content{
        "technology",
        [this] {
            std::deque<TimedMessage> messages;
            for (int i = 1; i <= 4; ++i) {
                messages.push_back({50ms * i, PacketBuilder(7).u8(13, nextNumber).build()});
                messages.push_back({50ms * i, PacketBuilder(8).u8(13, 99).build()});
            }
            return std::make_unique<ListSource>(messages);
        },
        &recording};
};

} // namespace

TEST_F(StreamRecordingTest, HoldsWhatAChannelStreams)
{
    const auto channel = startChannel(1);
    fake.mainQueue.advance(1s);
    EXPECT_THAT(recorded(), ElementsAre(1, 1, 1, 1));
}

TEST_F(StreamRecordingTest, HoldsAlsoWhatASlowClientLoses)
{
    fake.ports.setDefaultResult({PortError::sendTimeout, std::nullopt});
    const auto channel = startChannel(1);
    fake.mainQueue.advance(1s);
    EXPECT_THAT(recorded(), ElementsAre(1, 1, 1, 1));
}

TEST_F(StreamRecordingTest, HoldsOneChannelAtATime)
{
    auto first = startChannel(1);
    fake.mainQueue.advance(50ms);
    const auto second = startChannel(2);
    fake.mainQueue.advance(50ms);
    first.reset();
    fake.mainQueue.advance(50ms);
    EXPECT_THAT(recorded(), ElementsAre(1, 1, 2));
}

} // namespace ventrik
