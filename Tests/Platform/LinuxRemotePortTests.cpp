#include "Tests/Platform/PortsFixture.h"

#include <thread>

#include <poll.h>
#include <sys/socket.h>

namespace ventrik
{
namespace
{

using ::testing::ElementsAre;

class LinuxRemotePortTest : public PortsTest
{
  protected:
    RemotePort::SendResult ask(RemotePort& port, std::int32_t id, const Bytes& data = {},
                               double receiveTimeout = 5)
    {
        return port.send(id, data, Seconds(1), Seconds(receiveTimeout), wanted);
    }

    /// Fills the way to a receiver that does not read, until nothing more is taken.
    void fill(RemotePort& port)
    {
        while (port.send(0, Bytes(10000), Seconds(0), Seconds(0), notWanted).error ==
               PortError::success)
            ++filled;
    }

    /// Answers the first message on a listening socket with these bytes.
    std::thread answerRaw(const FileDescriptor& listener, Bytes bytes)
    {
        return std::thread([&listener, bytes = std::move(bytes)] {
            const Deadline deadline(std::chrono::seconds(10));
            waitForSocket(listener.get(), POLLIN, deadline);
            const FileDescriptor peer(accept(listener.get(), nullptr, nullptr));
            waitForSocket(peer.get(), POLLIN, deadline);
            sendBytes(peer.get(), bytes);
            while (!hasHungUp(peer.get()) && !deadline.hasPassed())
                std::this_thread::sleep_for(std::chrono::milliseconds(1));
        });
    }
    RemotePort::SendResult askRawServer(Bytes answer)
    {
        const auto made = makePort(); // makes the directory
        made->invalidate();
        const FileDescriptor listener = listenSocket(directory + "/port");
        auto remote = ports.createRemotePort("port");
        std::thread server = answerRaw(listener, std::move(answer));
        const auto result = ask(*remote, 9);
        stayedValid = remote->isValid();
        remote.reset();
        server.join();
        return result;
    }

    int filled = 0;
    bool stayedValid = false;
};

TEST_F(LinuxRemotePortTest, GetsTheReply)
{
    ASSERT_EQ(startHelper("port"), "ready");
    const auto remote = ports.createRemotePort("port");
    const auto result = ask(*remote, 0, {1, 2, 3});
    EXPECT_EQ(result.error, PortError::success);
    EXPECT_EQ(result.reply, (Bytes{1, 2, 3}));
}

TEST_F(LinuxRemotePortTest, TellsNoDataFromEmptyData)
{
    ASSERT_EQ(startHelper("port"), "ready");
    const auto remote = ports.createRemotePort("port");
    EXPECT_EQ(ask(*remote, 0).reply, Bytes());
    const auto none = ask(*remote, 1, {1});
    EXPECT_EQ(none.error, PortError::success);
    EXPECT_EQ(none.reply, std::nullopt);
}

TEST_F(LinuxRemotePortTest, ExchangesLargeData)
{
    ASSERT_EQ(startHelper("port"), "ready");
    const auto remote = ports.createRemotePort("port");
    const auto result = ask(*remote, 4, Bytes(std::size_t{32} << 20));
    ASSERT_EQ(result.error, PortError::success);
    EXPECT_TRUE(result.reply == Bytes(std::size_t{64} << 10, 4));
}

TEST_F(LinuxRemotePortTest, GetsNoDataInThePlaceOfAReplyAboveTheLimit)
{
    ASSERT_EQ(startHelper("port"), "ready");
    const auto remote = ports.createRemotePort("port");
    const auto result = ask(*remote, 5);
    EXPECT_EQ(result.error, PortError::success);
    EXPECT_EQ(result.reply, std::nullopt);
}

TEST_F(LinuxRemotePortTest, KnowsTheProcessBehindIt)
{
    ASSERT_EQ(startHelper("port"), "ready");
    EXPECT_EQ(ports.createRemotePort("port")->process(), helper.processId());
}

TEST_F(LinuxRemotePortTest, RefusesDataAboveTheLimit)
{
    const auto local = makePort();
    const auto remote = ports.createRemotePort("port");
    EXPECT_EQ(ask(*remote, 0, Bytes((std::size_t{64} << 20) + 1)).error, PortError::transportFault);
    EXPECT_TRUE(remote->isValid());
}

// The following few measure real time-outs of 0.2 s.

TEST_F(LinuxRemotePortTest, GivesUpSendingToAReceiverThatNeverReads)
{
    const auto local = makePort();
    const auto remote = ports.createRemotePort("port");
    fill(*remote);
    const double seconds = secondsOf([&] {
        EXPECT_EQ(remote->send(0, Bytes(1), Seconds(0.2), Seconds(5), wanted).error,
                  PortError::sendTimeout);
    });
    EXPECT_GE(seconds, 0.199);
    EXPECT_LT(seconds, 0.5);
    EXPECT_TRUE(remote->isValid());
}

TEST_F(LinuxRemotePortTest, GivesUpWaitingForAReply)
{
    const auto local = makePort();
    const auto remote = ports.createRemotePort("port");
    const double seconds =
        secondsOf([&] { EXPECT_EQ(ask(*remote, 0, {}, 0.2).error, PortError::receiveTimeout); });
    EXPECT_GE(seconds, 0.199);
    EXPECT_LT(seconds, 0.5);
    EXPECT_TRUE(remote->isValid());
}

TEST_F(LinuxRemotePortTest, DropsAReplyThatComesAfterItsTimeout)
{
    ASSERT_EQ(startHelper("port"), "ready");
    const auto remote = ports.createRemotePort("port");
    EXPECT_EQ(ask(*remote, 2, {1}, 0.1).error, PortError::receiveTimeout);
    EXPECT_EQ(ask(*remote, 0, {2}).reply, (Bytes{2}));
}

TEST_F(LinuxRemotePortTest, NeverBlocksWithoutTimeout)
{
    const auto local = makePort();
    const auto remote = ports.createRemotePort("port");
    const double seconds = secondsOf([&] { fill(*remote); });
    EXPECT_GT(filled, 0);
    EXPECT_LT(seconds, 1.0);
}

TEST_F(LinuxRemotePortTest, CompletesAMessageThatWasTakenInPart)
{
    const auto local = makePort();
    const auto remote = ports.createRemotePort("port");
    const Bytes large(std::size_t{1} << 20, 7);
    ASSERT_EQ(remote->send(1, large, Seconds(0), Seconds(0), notWanted).error, PortError::success);
    EXPECT_EQ(remote->send(2, {}, Seconds(0), Seconds(0), notWanted).error, PortError::sendTimeout);
    local->deliverOnMainQueue();
    ASSERT_TRUE(runUntilReceived(1));
    EXPECT_TRUE(received[0].data == large);
    EXPECT_EQ(send(*remote, 3), PortError::success);
    ASSERT_TRUE(runUntilReceived(2));
    EXPECT_THAT(receivedIds(), ElementsAre(1, 3));
}

TEST_F(LinuxRemotePortTest, NoticesThatItsPeerWasKilled)
{
    ASSERT_EQ(startHelper("port"), "ready");
    const auto remote = ports.createRemotePort("port");
    int invalidations = 0;
    remote->setInvalidationCallback([&] { ++invalidations; });
    killHelper();
    EXPECT_TRUE(runUntil([&] { return invalidations > 0; }));
    EXPECT_FALSE(remote->isValid());
    EXPECT_EQ(ask(*remote, 0).error, PortError::invalidPort);
    runReadyEvents();
    EXPECT_EQ(invalidations, 1);
}

TEST_F(LinuxRemotePortTest, IsInvalidAtOnceWhenItsPeerIsGone)
{
    const auto local = makePort();
    const auto remote = ports.createRemotePort("port");
    local->deliverOnMainQueue();
    send(*remote, 1);
    ASSERT_TRUE(runUntilReceived(1));
    local->invalidate();
    EXPECT_FALSE(remote->isValid());
    EXPECT_EQ(send(*remote, 2), PortError::invalidPort);
}

TEST_F(LinuxRemotePortTest, FailsWhenThePeerEndsBeforeItsReply)
{
    ASSERT_EQ(startHelper("port"), "ready");
    const auto remote = ports.createRemotePort("port");
    int invalidations = 0;
    remote->setInvalidationCallback([&] { ++invalidations; });
    EXPECT_EQ(ask(*remote, 3).error, PortError::transportFault);
    EXPECT_FALSE(remote->isValid());
    EXPECT_EQ(invalidations, 0); // it comes on the main queue
    EXPECT_TRUE(runUntil([&] { return invalidations == 1; }));
}

TEST_F(LinuxRemotePortTest, FailsOnAMalformedReply)
{
    EXPECT_EQ(askRawServer(Bytes(16, 0xEE)).error, PortError::transportFault);
    EXPECT_FALSE(stayedValid);
}

TEST_F(LinuxRemotePortTest, FailsOnAReplyAboveTheLimit)
{
    const auto header = encodeFrameHeader({(64U << 10) + 1, 0, FrameFlag::isReply, 1});
    const Bytes tooLarge(header.begin(), header.end());
    EXPECT_EQ(askRawServer(tooLarge).error, PortError::transportFault);
    EXPECT_FALSE(stayedValid);
}

TEST_F(LinuxRemotePortTest, FailsOnAMessageInPlaceOfAReply)
{
    const auto header = encodeFrameHeader({0, 0, FrameFlag::wantsReply, 1});
    EXPECT_EQ(askRawServer(Bytes(header.begin(), header.end())).error, PortError::transportFault);
}

TEST_F(LinuxRemotePortTest, SkipsRepliesToOtherMessages)
{
    Bytes answers;
    for (const std::uint32_t serial : {77U, 1U}) {
        const auto header = encodeFrameHeader({1, 0, FrameFlag::isReply, serial});
        answers.insert(answers.end(), header.begin(), header.end());
        answers.push_back(static_cast<std::uint8_t>(serial));
    }
    EXPECT_EQ(askRawServer(answers).reply, (Bytes{1}));
    EXPECT_TRUE(stayedValid);
}

TEST_F(LinuxRemotePortTest, RunsTheInvalidationCallbackAtOnceAndLetsItDropThePort)
{
    const auto local = makePort();
    auto remote = ports.createRemotePort("port");
    int invalidations = 0;
    remote->setInvalidationCallback([&] {
        ++invalidations;
        remote.reset();
    });
    RemotePort& port = *remote;
    port.invalidate();
    EXPECT_EQ(invalidations, 1);
    EXPECT_EQ(remote, nullptr);
}

TEST_F(LinuxRemotePortTest, MayBeDroppedByTheCallbackAboutItsPeer)
{
    const auto local = makePort();
    auto remote = ports.createRemotePort("port");
    remote->setInvalidationCallback([&] { remote.reset(); });
    local->deliverOnMainQueue();
    runReadyEvents();
    local->invalidate();
    EXPECT_TRUE(runUntil([&] { return remote == nullptr; }));
}

TEST_F(LinuxRemotePortTest, RunsNoCallbackAfterItWasDropped)
{
    const auto local = makePort();
    auto remote = ports.createRemotePort("port");
    int invalidations = 0;
    remote->setInvalidationCallback([&] { ++invalidations; });
    local->invalidate();
    remote.reset();
    runReadyEvents();
    EXPECT_EQ(invalidations, 0);
}

} // namespace
} // namespace ventrik
