#include "Tests/Platform/PortsFixture.h"

#include <numeric>

#include <sys/resource.h>
#include <sys/socket.h>
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
    /// A delivering port whose connections make room after so long.
    std::shared_ptr<LocalPort> makeImpatientPort(std::chrono::milliseconds idleLimit)
    {
        makePort().reset(); // for the directory
        const std::string path = directory + "/port";
        auto port = std::make_shared<LinuxLocalPort>(
            LinuxLocalPort::Parts{"port", listenSocket(path), SocketFile(path),
                                  PortSenders::SameUser, geteuid(),
                                  [this](const PortMessage& message) -> std::optional<Bytes> {
                                      received.push_back({message.id, {}, true});
                                      return std::nullopt;
                                  },
                                  idleLimit},
            log);
        port->deliverOnMainQueue();
        return port;
    }
    /// So many silent connections, accepted in this order.
    std::vector<FileDescriptor> fillTable(std::size_t count)
    {
        std::vector<FileDescriptor> connections;
        for (std::size_t i = 0; i < count; ++i) {
            connections.push_back(connectRaw());
            if (i % 16 == 0)
                runReadyEvents();
        }
        runReadyEvents();
        return connections;
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
    reply = Bytes(std::size_t{64} << 10);
    const FileDescriptor raw = connectRaw();
    for (std::uint32_t serial = 1; serial <= 40; ++serial)
        writeHeader(raw, {0, 1, FrameFlag::wantsReply, serial});
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

TEST_F(LinuxLocalPortTest, HasLostItsStreamWhenThatConnectionEnds)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    local->expectStreamOf(getpid());
    FileDescriptor stream = connectRaw();
    runReadyEvents();
    EXPECT_FALSE(local->hasLostStream());
    stream.reset();
    EXPECT_TRUE(runUntil([&] { return local->hasLostStream(); }));
}

TEST_F(LinuxLocalPortTest, HasLostItsStreamWhenThatConnectionIsHalfClosed)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    local->expectStreamOf(getpid());
    const FileDescriptor stream = connectRaw();
    shutdown(stream.get(), SHUT_WR);
    EXPECT_TRUE(runUntil([&] { return local->hasLostStream(); }));
}

TEST_F(LinuxLocalPortTest, HasLostItsStreamWhenThatConnectionBreaksTheFraming)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    local->expectStreamOf(getpid());
    const FileDescriptor stream = connectRaw();
    writeHeader(stream, {1, 0, 0x80, 1});
    EXPECT_TRUE(runUntil([&] { return local->hasLostStream(); }));
}

TEST_F(LinuxLocalPortTest, HasNotLostItsStreamWhileOneConnectionOfTheProcessIsThere)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    local->expectStreamOf(getpid());
    FileDescriptor probe = connectRaw();
    const FileDescriptor stream = connectRaw();
    probe.reset();
    runReadyEvents();
    EXPECT_FALSE(local->hasLostStream());
}

TEST_F(LinuxLocalPortTest, TakesConnectionsOfOthersForNoStreamOnceTheProcessHasConnected)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    ASSERT_EQ(startSender("port"), "sent");
    ASSERT_TRUE(runUntilReceived(1));
    local->expectStreamOf(getpid());
    const FileDescriptor stream = connectRaw();
    runReadyEvents();
    killHelper();
    runReadyEvents();
    EXPECT_FALSE(local->hasLostStream());
}

TEST_F(LinuxLocalPortTest, TakesWhoeverSendsForTheStreamWhereTheProcessNeverConnects)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    local->expectStreamOf(1);
    FileDescriptor silent = connectRaw();
    silent.reset();
    runReadyEvents();
    EXPECT_FALSE(local->hasLostStream());
    FileDescriptor stream = connectRaw();
    writeHeader(stream, {0, 1, 0, 1});
    ASSERT_TRUE(runUntilReceived(1));
    stream.reset();
    EXPECT_TRUE(runUntil([&] { return local->hasLostStream(); }));
}

TEST_F(LinuxLocalPortTest, LosesNoStreamBeforeOneIsExpected)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    FileDescriptor raw = connectRaw();
    writeHeader(raw, {0, 1, 0, 1});
    ASSERT_TRUE(runUntilReceived(1));
    raw.reset();
    runReadyEvents();
    EXPECT_FALSE(local->hasLostStream());
}

// Both wait for 5 s for real.
TEST_F(LinuxLocalPortTest, EndsAConnectionThatStallsWithinAMessageAndNoOther)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    local->expectStreamOf(getpid());
    const FileDescriptor betweenMessages = connectRaw();
    writeHeader(betweenMessages, {0, 1, 0, 1});
    const FileDescriptor withinPayload = connectRaw();
    writeHeader(withinPayload, {100, 1, 0, 1});
    const FileDescriptor withinHeader = connectRaw();
    sendBytes(withinHeader.get(), Bytes{1, 0, 0});
    const auto start = std::chrono::steady_clock::now();
    EXPECT_TRUE(runUntil([&] {
        return log.count("port port dropped a connection: it stalled within a message") == 2;
    }));
    EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(4900));
    EXPECT_FALSE(hasHungUp(betweenMessages.get()));
    EXPECT_TRUE(hasHungUp(withinPayload.get()));
    EXPECT_TRUE(hasHungUp(withinHeader.get()));
    EXPECT_FALSE(local->hasLostStream());
}

TEST_F(LinuxLocalPortTest, MakesRoomForANewConnectionByTheOneThatIsIdleLongest)
{
    const auto local = makeImpatientPort(std::chrono::milliseconds(0));
    const FileDescriptor speaker = connectRaw();
    writeHeader(speaker, {0, 1, 0, 1});
    ASSERT_TRUE(runUntilReceived(1));
    std::vector<FileDescriptor> idle = fillTable(255);
    const auto remote = ports.createRemotePort("port");
    send(*remote, 2);
    ASSERT_TRUE(runUntilReceived(2));
    EXPECT_TRUE(hasHungUp(idle.front().get()));
    EXPECT_FALSE(hasHungUp(idle[1].get()));
    EXPECT_FALSE(hasHungUp(speaker.get()));
}

TEST_F(LinuxLocalPortTest, MakesNoRoomByTheConnectionThatCarriesTheStream)
{
    const auto local = makeImpatientPort(std::chrono::milliseconds(0));
    local->expectStreamOf(getpid());
    std::vector<FileDescriptor> streams = fillTable(256);
    const FileDescriptor late = connectRaw();
    EXPECT_TRUE(hasBeenClosed(late));
    EXPECT_TRUE(log.contains("port port refused a connection: it has 256 already"));
    EXPECT_FALSE(hasHungUp(streams.front().get()));
}

TEST_F(LinuxLocalPortTest, RefusesAConnectionWhileNoOtherHasBeenIdleForLong)
{
    const auto local = makeImpatientPort(std::chrono::seconds(30));
    std::vector<FileDescriptor> idle = fillTable(256);
    const FileDescriptor late = connectRaw();
    EXPECT_TRUE(hasBeenClosed(late));
    EXPECT_FALSE(hasHungUp(idle.front().get()));
}

// The sanitizers need descriptors of their own.
#if !defined(VENTRIK_SANITIZED)
TEST_F(LinuxLocalPortTest, SaysOnceThatItIsOutOfDescriptors)
{
    const auto local = makePort();
    local->deliverOnMainQueue();
    rlimit limits{};
    getrlimit(RLIMIT_NOFILE, &limits);
    const FileDescriptor waiting = connectRaw();
    // The lowest free number is above the limit from now on.
    const rlimit none{static_cast<rlim_t>(waiting.get()) + 1, limits.rlim_max};
    setrlimit(RLIMIT_NOFILE, &none);
    const auto start = std::chrono::steady_clock::now();
    runUntil([&] { return std::chrono::steady_clock::now() - start > std::chrono::seconds(1); });
    setrlimit(RLIMIT_NOFILE, &limits);
    EXPECT_EQ(log.count("port port cannot take connections for now: Too many open files"), 1U);
    sendBytes(waiting.get(), encodeFrameHeader({0, 7, 0, 1}));
    EXPECT_TRUE(runUntilReceived(1));
}
#endif

} // namespace
} // namespace ventrik
