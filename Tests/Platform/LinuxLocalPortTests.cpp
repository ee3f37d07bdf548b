#include "Tests/Platform/PortsFixture.h"

#include <numeric>

#include <unistd.h>

namespace ventrik
{
namespace
{

using ::testing::ElementsAre;
using ::testing::HasSubstr;

class LinuxLocalPortTest : public PortsTest
{
  protected:
    void writeHeader(const FileDescriptor& socket, const FrameHeader& header)
    {
        sendBytes(socket.get(), encodeFrameHeader(header));
    }
};

TEST_F(LinuxLocalPortTest, DeliversOnlyAfterItWasAskedTo)
{
    const auto local = makePort();
    const auto remote = ports.createRemotePort("port");
    EXPECT_EQ(send(*remote, 7, {1, 2, 3}), PortError::success);
    runReadyEvents();
    EXPECT_TRUE(received.empty());
    local->deliverOnMainQueue();
    ASSERT_TRUE(runUntilReceived(1));
    EXPECT_EQ(received[0].id, 7);
    EXPECT_EQ(received[0].data, (Bytes{1, 2, 3}));
    EXPECT_TRUE(received[0].trusted);
}

TEST_F(LinuxLocalPortTest, KeepsTheOrderOfMessages)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    const auto remote = ports.createRemotePort("port");
    std::vector<std::int32_t> ids(150);
    std::iota(ids.begin(), ids.end(), -75);
    for (const auto id : ids)
        ASSERT_EQ(send(*remote, id, Bytes(10)), PortError::success);
    ASSERT_TRUE(runUntilReceived(150));
    EXPECT_EQ(receivedIds(), ids);
}

TEST_F(LinuxLocalPortTest, TakesManyConnections)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    std::vector<std::shared_ptr<RemotePort>> remotes;
    for (int i = 0; i < 100; ++i) {
        remotes.push_back(ports.createRemotePort("port"));
        ASSERT_NE(remotes.back(), nullptr);
        send(*remotes.back(), i);
    }
    EXPECT_TRUE(runUntilReceived(100));
}

TEST_F(LinuxLocalPortTest, TakesALargeMessage)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    const auto remote = ports.createRemotePort("port");
    Bytes data(std::size_t{32} << 20);
    for (std::size_t i = 0; i < data.size(); i += 1000)
        data[i] = static_cast<std::uint8_t>(i / 1000);
    ASSERT_EQ(remote->send(1, data, Seconds(0), Seconds(0), notWanted).error, PortError::success);
    ASSERT_TRUE(runUntilReceived(1));
    EXPECT_TRUE(received[0].data == data);
}

TEST_F(LinuxLocalPortTest, EndsOnlyTheConnectionThatAnnouncesTooMuch)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    const auto remote = ports.createRemotePort("port");
    const FileDescriptor raw = connectRaw();
    writeHeader(raw, {(64U << 20) + 1, 0, 0, 1});
    EXPECT_TRUE(hasBeenClosed(raw));
    EXPECT_TRUE(log.contains("port port dropped a connection: it sent a malformed message header"));
    send(*remote, 5);
    ASSERT_TRUE(runUntilReceived(1));
    EXPECT_THAT(receivedIds(), ElementsAre(5));
}

TEST_F(LinuxLocalPortTest, EndsAConnectionThatSendsGarbage)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    const FileDescriptor raw = connectRaw();
    sendBytes(raw.get(), Bytes(100, 0xEE));
    EXPECT_TRUE(hasBeenClosed(raw));
    EXPECT_TRUE(received.empty());
    EXPECT_TRUE(local->isValid());
}

TEST_F(LinuxLocalPortTest, EndsAConnectionThatRepliesUnasked)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    const FileDescriptor raw = connectRaw();
    writeHeader(raw, {0, 0, FrameFlag::isReply, 1});
    EXPECT_TRUE(hasBeenClosed(raw));
}

TEST_F(LinuxLocalPortTest, ForgetsAMessageWhoseSenderWentInTheMiddle)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    FileDescriptor raw = connectRaw();
    writeHeader(raw, {100, 1, 0, 1});
    raw.reset();
    const auto remote = ports.createRemotePort("port");
    send(*remote, 2);
    ASSERT_TRUE(runUntilReceived(1));
    EXPECT_THAT(receivedIds(), ElementsAre(2));
}

TEST_F(LinuxLocalPortTest, DropsAPeerThatDoesNotReadItsReplies)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    reply = Bytes(std::size_t{40} << 20);
    const FileDescriptor raw = connectRaw();
    writeHeader(raw, {0, 1, FrameFlag::wantsReply, 1});
    writeHeader(raw, {0, 2, FrameFlag::wantsReply, 2});
    EXPECT_TRUE(hasBeenClosed(raw));
    EXPECT_TRUE(log.contains("port port dropped a connection: it does not read its replies"));
}

TEST_F(LinuxLocalPortTest, LeavesRoomForOtherWorkUnderAFlood)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    const FileDescriptor raw = connectRaw();
    Bytes flood;
    for (int i = 0; i < 4000; ++i) {
        const auto header = encodeFrameHeader({0, i, 0, 0});
        flood.insert(flood.end(), header.begin(), header.end());
    }
    ASSERT_EQ(sendBytes(raw.get(), flood).count, flood.size());
    std::size_t turnsInBetween = 0;
    QTimer otherWork;
    QObject::connect(&otherWork, &QTimer::timeout, [&] {
        if (!received.empty() && received.size() < 4000)
            ++turnsInBetween;
    });
    otherWork.start(0);
    ASSERT_TRUE(runUntilReceived(4000));
    EXPECT_GT(turnsInBetween, 10U);
}

TEST_F(LinuxLocalPortTest, ClosesConnectionsOfOtherUsersUnread)
{
    LinuxMessagePorts distrusting(directory, log, geteuid() + 1);
    const auto local = makePort(distrusting, PortSenders::SameUser);
    local->deliverOnMainQueue();
    const auto remote = ports.createRemotePort("port");
    ASSERT_NE(remote, nullptr);
    send(*remote, 1);
    EXPECT_TRUE(runUntil([&] { return !remote->isValid(); }));
    EXPECT_TRUE(received.empty());
    EXPECT_TRUE(
        log.contains("port port refused a connection of user " + std::to_string(geteuid())));
}

TEST_F(LinuxLocalPortTest, TellsOtherUsersApartWhereAllMaySend)
{
    LinuxMessagePorts distrusting(directory, log, geteuid() + 1);
    const auto local = makePort(distrusting, PortSenders::AnyUser);
    local->deliverOnMainQueue();
    const auto remote = ports.createRemotePort("port");
    send(*remote, 1);
    ASSERT_TRUE(runUntilReceived(1));
    EXPECT_FALSE(received[0].trusted);
}

TEST_F(LinuxLocalPortTest, MayBeInvalidatedAndDroppedByItsOwnReceiver)
{
    std::shared_ptr<LocalPort> local;
    int messages = 0;
    int invalidations = 0;
    local = ports
                .createLocalPort("port", PortSenders::SameUser,
                                 [&](const PortMessage&) {
                                     ++messages;
                                     local->invalidate();
                                     local.reset();
                                     return std::optional(Bytes{1});
                                 })
                .port;
    local->setInvalidationCallback([&] { ++invalidations; });
    local->deliverOnMainQueue();
    const auto remote = ports.createRemotePort("port");
    send(*remote, 1);
    send(*remote, 2);
    EXPECT_TRUE(runUntil([&] { return !remote->isValid(); }));
    runReadyEvents();
    EXPECT_EQ(messages, 1);
    EXPECT_EQ(invalidations, 1);
}

TEST_F(LinuxLocalPortTest, RunsTheInvalidationCallbackOnceAndLetsItDropThePort)
{
    auto local = makePort();
    int invalidations = 0;
    local->setInvalidationCallback([&] {
        ++invalidations;
        EXPECT_FALSE(local->isValid());
        local->invalidate();
        local.reset();
    });
    LocalPort& port = *local;
    port.invalidate();
    EXPECT_EQ(invalidations, 1);
    EXPECT_EQ(local, nullptr);
}

TEST_F(LinuxLocalPortTest, DoesNotRunAClearedInvalidationCallback)
{
    const auto local = makePort();
    int invalidations = 0;
    local->setInvalidationCallback([&] { ++invalidations; });
    local->setInvalidationCallback(nullptr);
    local->invalidate();
    EXPECT_EQ(invalidations, 0);
}

} // namespace
} // namespace ventrik
