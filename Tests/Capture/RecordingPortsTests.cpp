#include "Capture/CaptureReader.h"
#include "Capture/RecordingPorts.h"
#include "Platform/TelephonyConstants.h"
#include "PropertyList/PropertyListWriter.h"
#include "Tests/Support/FakeMessagePorts.h"
#include "Tests/Support/FixedClock.h"
#include "Tests/Support/ManualMainQueue.h"
#include "Tests/Support/TemporaryFile.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

namespace ventrik
{

namespace
{

using testing::ElementsAre;

class RecordingPortsTest : public testing::Test
{
  protected:
    RecordingPortsTest() { inner.listen("service"); }

    // The service says what it speaks.
    void tellTechnology(const PlistValue& technology)
    {
        inner.queueReply(*propertyListBytes(PlistDictionary{{"GetTechnology", technology}}));
        ports.createRemotePort("service")->send(0, Bytes{1}, {}, {}, RemotePort::Reply::Wanted);
    }
    std::shared_ptr<LocalPort> openLocalPort(std::string_view name)
    {
        auto creation =
            ports.createLocalPort(name, PortSenders::SameUser, [this](const PortMessage& message) {
                delivered.push_back(message.data[0]);
                return std::nullopt;
            });
        creation.port->deliverOnMainQueue();
        return creation.port;
    }
    void deliver(std::string_view name, std::int32_t id, std::uint8_t number)
    {
        inner.deliver(name, id, Bytes{number});
        queue.run();
    }
    std::vector<int> recorded()
    {
        recorder.reset();
        std::vector<int> result;
        std::string error;
        auto reader = CaptureReader::open(file.path(), error);
        EXPECT_TRUE(reader) << error;
        while (const auto message = reader ? reader->next() : std::nullopt)
            result.push_back(message->data[0]);
        return result;
    }

    const TemporaryFile file{"recorded.pcap"};
    ManualMainQueue queue;
    FixedClock clock;
    FakeMessagePorts inner{queue};
    std::optional<CaptureRecorder> recorder{
        std::in_place, queue, clock,
        RecordingOptions{.path = file.path(), .rotationSize = {}, .rotationTime = {}},
        [](const std::string& line) { ADD_FAILURE() << line; }};
    RecordingPorts ports{inner, *recorder};
    std::vector<int> delivered;
};

} // namespace

TEST_F(RecordingPortsTest, RecordTheLogChannelsMessagesAndDeliverThem)
{
    tellTechnology(Technologies::lte.identifier);
    const auto port = openLocalPort(logChannelLocalPortName);
    deliver(logChannelLocalPortName, 0, 7);
    EXPECT_THAT(delivered, ElementsAre(7));
    EXPECT_THAT(recorded(), ElementsAre(7));
}

TEST_F(RecordingPortsTest, RecordNothingBeforeTheTechnologyIsKnown)
{
    const auto port = openLocalPort(logChannelLocalPortName);
    deliver(logChannelLocalPortName, 0, 7);
    EXPECT_FALSE(std::filesystem::exists(file.path()));
    tellTechnology("speaks nothing");
    deliver(logChannelLocalPortName, 0, 8);
    EXPECT_FALSE(std::filesystem::exists(file.path()));
    EXPECT_THAT(delivered, ElementsAre(7, 8));
}

TEST_F(RecordingPortsTest, RecordNeitherOtherMessagesNorOtherPorts)
{
    tellTechnology(Technologies::lte.identifier);
    const auto port = openLocalPort(logChannelLocalPortName);
    const auto other = openLocalPort("other");
    deliver(logChannelLocalPortName, 1, 6);
    deliver("other", 0, 7);
    deliver(logChannelLocalPortName, 0, 8);
    EXPECT_THAT(delivered, ElementsAre(6, 7, 8));
    EXPECT_THAT(recorded(), ElementsAre(8));
}

TEST_F(RecordingPortsTest, RecordWhatTheDeliveryDoesNotOutlive)
{
    tellTechnology(Technologies::lte.identifier);
    auto creation = ports.createLocalPort(
        logChannelLocalPortName, PortSenders::SameUser,
        [](const PortMessage&) -> std::optional<Bytes> { throw std::runtime_error("ends here"); });
    creation.port->deliverOnMainQueue();
    inner.deliver(logChannelLocalPortName, 0, Bytes{7});
    EXPECT_THROW(queue.run(), std::runtime_error);
    EXPECT_THAT(recorded(), ElementsAre(7));
}

TEST_F(RecordingPortsTest, PassOnWhatTheInnerPortsSay)
{
    EXPECT_EQ(ports.createRemotePort("nobody"), nullptr);
    inner.failNextLocalPort("no more");
    EXPECT_EQ(ports.createLocalPort(logChannelLocalPortName, PortSenders::SameUser, {}).error,
              "no more");
    const auto port = ports.createRemotePort("service");
    EXPECT_EQ(port->name(), "service");
    EXPECT_EQ(port->process(), FakeRemotePort::processNumber);
    bool isTold = false;
    port->setInvalidationCallback([&] { isTold = true; });
    inner.killRemote("service");
    queue.run();
    EXPECT_TRUE(isTold);
    EXPECT_FALSE(port->isValid());
}

} // namespace ventrik
