#include "Tests/Support/FakeMessagePorts.h"
#include "Tests/Support/ManualMainQueue.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{
namespace
{

using ::testing::ElementsAre;

class FakeMessagePortsTest : public ::testing::Test
{
  protected:
    std::shared_ptr<LocalPort> makePort()
    {
        return ports
            .createLocalPort("port", PortSenders::SameUser,
                             [this](const PortMessage& m) {
                                 ids.push_back(m.id);
                                 return std::optional(Bytes(m.data.begin(), m.data.end()));
                             })
            .port;
    }
    RemotePort::SendResult send(RemotePort& port, RemotePort::Reply reply)
    {
        return port.send(4, Bytes{1, 2}, RemotePort::Seconds(0.5), RemotePort::Seconds(2), reply);
    }

    static constexpr auto wanted = RemotePort::Reply::Wanted;
    static constexpr auto notWanted = RemotePort::Reply::NotWanted;
    ManualMainQueue queue;
    FakeMessagePorts ports{queue};
    std::vector<std::int32_t> ids;
};

TEST_F(FakeMessagePortsTest, FailsTheNextCreationOnDemand)
{
    ports.failNextLocalPort("no room");
    const auto failed = ports.createLocalPort("port", PortSenders::SameUser, nullptr);
    EXPECT_EQ(failed.port, nullptr);
    EXPECT_EQ(failed.error, "no room");
    EXPECT_NE(makePort(), nullptr);
}

TEST_F(FakeMessagePortsTest, HandsBackALivePortOfTheSameName)
{
    const auto first = makePort();
    const auto second = ports.createLocalPort("port", PortSenders::AnyUser, nullptr);
    EXPECT_TRUE(second.alreadyExists);
    EXPECT_EQ(second.port, first);
    first->invalidate();
    EXPECT_FALSE(ports.createLocalPort("port", PortSenders::AnyUser, nullptr).alreadyExists);
}

TEST_F(FakeMessagePortsTest, PretendsThatANameIsTaken)
{
    ports.reportNextLocalPortAsExisting();
    const auto creation = ports.createLocalPort("port", PortSenders::SameUser, nullptr);
    EXPECT_TRUE(creation.alreadyExists);
    ASSERT_NE(creation.port, nullptr);
    EXPECT_TRUE(creation.port->isValid());
}

TEST_F(FakeMessagePortsTest, DeliversThroughTheQueueOnceAsked)
{
    const auto port = makePort();
    std::optional<Bytes> answer;
    EXPECT_TRUE(ports.deliver("port", 1, {9}, [&](const auto& reply) { answer = reply; }));
    queue.run();
    EXPECT_TRUE(ids.empty());
    port->deliverOnMainQueue();
    EXPECT_TRUE(ids.empty());
    queue.run();
    EXPECT_THAT(ids, ElementsAre(1));
    EXPECT_EQ(answer, Bytes{9});
}

TEST_F(FakeMessagePortsTest, KeepsTheOrderOfMessages)
{
    const auto port = makePort();
    ports.deliver("port", 1, {});
    port->deliverOnMainQueue();
    ports.deliver("port", 2, {});
    queue.run();
    EXPECT_THAT(ids, ElementsAre(1, 2));
}

TEST_F(FakeMessagePortsTest, DeliversNothingToAnInvalidPort)
{
    const auto port = makePort();
    port->deliverOnMainQueue();
    ports.deliver("port", 1, {});
    port->invalidate();
    queue.run();
    EXPECT_TRUE(ids.empty());
    EXPECT_FALSE(ports.deliver("port", 2, {}));
}

TEST_F(FakeMessagePortsTest, LetsAReceiverDropItsPort)
{
    std::shared_ptr<LocalPort> port;
    port = ports
               .createLocalPort("port", PortSenders::SameUser,
                                [&](const PortMessage&) {
                                    port->invalidate();
                                    port.reset();
                                    return std::optional<Bytes>();
                                })
               .port;
    port->deliverOnMainQueue();
    ports.deliver("port", 1, {});
    ports.deliver("port", 2, {});
    queue.run();
    EXPECT_EQ(port, nullptr);
}

TEST_F(FakeMessagePortsTest, GivesRemotePortsOnlyWhereSomebodyListens)
{
    EXPECT_EQ(ports.createRemotePort("service"), nullptr);
    ports.listen("service");
    EXPECT_NE(ports.createRemotePort("service"), nullptr);
}

TEST_F(FakeMessagePortsTest, RecordsSends)
{
    ports.listen("service");
    const auto port = ports.createRemotePort("service");
    EXPECT_EQ(send(*port, wanted).error, PortError::success);
    ASSERT_EQ(ports.sends().size(), 1U);
    const RecordedSend& sent = ports.sends().front();
    EXPECT_EQ(sent.portName, "service");
    EXPECT_EQ(sent.id, 4);
    EXPECT_EQ(sent.data, (Bytes{1, 2}));
    EXPECT_EQ(sent.sendTimeout, 0.5);
    EXPECT_EQ(sent.receiveTimeout, 2.0);
    EXPECT_TRUE(sent.replyWanted);
}

TEST_F(FakeMessagePortsTest, GivesScriptedResultsInTurnThenTheDefault)
{
    ports.listen("service");
    const auto port = ports.createRemotePort("service");
    ports.queueError(PortError::sendTimeout);
    ports.queueReply({5});
    ports.setDefaultResult({PortError::receiveTimeout, std::nullopt});
    EXPECT_EQ(send(*port, wanted).error, PortError::sendTimeout);
    EXPECT_EQ(send(*port, wanted).reply, Bytes{5});
    EXPECT_EQ(send(*port, wanted).error, PortError::receiveTimeout);
}

TEST_F(FakeMessagePortsTest, AsksTheHandlerFirst)
{
    ports.listen("service");
    const auto port = ports.createRemotePort("service");
    ports.queueReply({1});
    ports.setSendHandler([](const RecordedSend& sent) -> std::optional<RemotePort::SendResult> {
        if (!sent.replyWanted)
            return std::nullopt;
        return RemotePort::SendResult{PortError::success, Bytes{2}};
    });
    EXPECT_EQ(send(*port, wanted).reply, Bytes{2});
    EXPECT_EQ(send(*port, notWanted).reply, std::nullopt);
}

TEST_F(FakeMessagePortsTest, KillsARemotePort)
{
    ports.listen("service");
    const auto port = ports.createRemotePort("service");
    int invalidations = 0;
    port->setInvalidationCallback([&] { ++invalidations; });
    ports.killRemote("service");
    EXPECT_FALSE(port->isValid());
    EXPECT_EQ(invalidations, 0);
    queue.run();
    EXPECT_EQ(invalidations, 1);
    EXPECT_EQ(send(*port, wanted).error, PortError::invalidPort);
    EXPECT_EQ(ports.createRemotePort("service"), nullptr);
}

TEST_F(FakeMessagePortsTest, RecordsTheOrderOfATearDown)
{
    auto port = makePort();
    port->setInvalidationCallback([] {});
    ports.clearOperations();
    port->setInvalidationCallback(nullptr);
    port->invalidate();
    port.reset();
    EXPECT_THAT(ports.operations(), ElementsAre("local callback cleared port",
                                                "local invalidated port", "local released port"));
}

} // namespace
} // namespace ventrik
