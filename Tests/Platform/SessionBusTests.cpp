#include "Platform/Linux/LinuxNotices.h"
#include "Platform/Linux/SessionBus.h"
#include "Platform/Linux/Socket.h"
#include "Tests/Support/CapturingSystemLog.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <thread>

#include <QTemporaryDir>

#include <poll.h>
#include <sys/socket.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

const BusSignal someSignal{"/a", "b.c", "D", {"e"}};

/// A bus that sends what it was told as soon as it has a connection, and then nothing more; what
/// really takes signals is tested with a real bus and the real window.
class FakeBus
{
  public:
    explicit FakeBus(std::string_view words)
        : _thread([this, words = std::string(words)] {
              const Deadline deadline(20s);
              waitForSocket(_listener.get(), POLLIN, deadline);
              const FileDescriptor client(accept(_listener.get(), nullptr, nullptr));
              sendBytes(client.get(), Bytes(words.begin(), words.end()));
              while (!hasHungUp(client.get()) && !deadline.hasPassed())
                  std::this_thread::sleep_for(1ms);
          })
    {
    }
    ~FakeBus() { _thread.join(); }

    std::string address() const { return "unix:path=" + _path; }

    std::optional<std::string> send(std::chrono::milliseconds longestWait) const
    {
        return sendBusSignal(address(), someSignal, longestWait);
    }

  private:
    QTemporaryDir _directory;
    std::string _path = _directory.filePath("bus").toStdString();
    FileDescriptor _listener = listenSocket(_path);
    std::thread _thread;
};

std::optional<std::string> failureOf(std::string_view words, std::chrono::milliseconds longestWait)
{
    return FakeBus(words).send(longestWait);
}

} // namespace

TEST(SessionBus, ThatDoesNotAnswerIsNotWaitedForLongerThanThat)
{
    EXPECT_EQ(failureOf("", 20ms), "it does not answer");
    EXPECT_EQ(failureOf("OK ", 20ms), "it does not answer");
    // It accepts the login and says nothing more.
    EXPECT_EQ(failureOf("OK 0123456789abcdef0123456789abcdef\r\nAGREE_UNIX_FD\r\n", 20ms),
              "it does not answer");
}

TEST(SessionBus, ThatRefusesTheLoginIsGivenUp)
{
    const auto failure = failureOf("REJECTED EXTERNAL\r\nERROR\r\nERROR\r\n", 20s);
    ASSERT_TRUE(failure);
    EXPECT_NE(*failure, "it does not answer");
}

TEST(SessionBus, WithNoRoomForOneMoreConnectionIsNotWaitedFor)
{
    QTemporaryDir directory;
    const std::string path = directory.filePath("bus").toStdString();
    const FileDescriptor listener = listenSocket(path);
    listen(listener.get(), 0);
    std::vector<FileDescriptor> waiting;
    while (true) {
        Connecting connecting = connectSocket(path);
        if (connecting.status != ConnectStatus::Connected)
            break;
        waiting.push_back(std::move(connecting.socket));
    }
    EXPECT_TRUE(sendBusSignal("unix:path=" + path, someSignal, 20ms));
}

TEST(SessionBus, ThatIsNotThereOrOfAnotherKindIsTold)
{
    EXPECT_EQ(sendBusSignal("unix:path=/nowhere/%62us", someSignal, 1s),
              "No such file or directory");
    EXPECT_TRUE(sendBusSignal("carrier-pigeon:", someSignal, 1s));
}

TEST(SessionBus, ThatDoesNotAnswerIsNotWaitedForByNotices)
{
    const QTemporaryDir directory;
    const std::string path = directory.filePath("bus").toStdString();
    const FileDescriptor listener = listenSocket(path);
    qputenv("DBUS_SESSION_BUS_ADDRESS", QByteArray::fromStdString("unix:path=" + path));
    CapturingSystemLog log;
    const auto start = std::chrono::steady_clock::now();
    {
        LinuxNotices notices(log);
        notices.post("RSRP is -112 dBm");
        notices.post("RSRP is -113 dBm");
        EXPECT_LT(std::chrono::steady_clock::now() - start, LinuxNotices::longestWait / 2);
    }
    EXPECT_LT(std::chrono::steady_clock::now() - start, 2 * LinuxNotices::longestWait);
    EXPECT_THAT(
        log.texts(LogPriority::error),
        testing::ElementsAre("The session bus did not take the notice: it does not answer"));
    qunsetenv("DBUS_SESSION_BUS_ADDRESS");
}

TEST(SessionBus, IsAskedToShowNoticesThatAreNotUtf8)
{
    const FakeBus bus("");
    EXPECT_EQ(sendBusNotice(bus.address(), "RSRP \xff", 20ms), "it does not answer");
}

TEST(SessionBus, IsWhereTheEnvironmentSays)
{
    qunsetenv("DBUS_SESSION_BUS_ADDRESS");
    qunsetenv("XDG_RUNTIME_DIR");
    EXPECT_EQ(sessionBusAddress(), std::nullopt);
    QTemporaryDir directory(QStringLiteral("/tmp/a,b-XXXXXX"));
    qputenv("XDG_RUNTIME_DIR", directory.path().toUtf8());
    EXPECT_EQ(sessionBusAddress(), std::nullopt);
    const FileDescriptor listener = listenSocket(directory.filePath("bus").toStdString());
    EXPECT_THAT(sessionBusAddress().value_or(""), testing::StartsWith("unix:path=/tmp/a%2Cb-"));
    qputenv("DBUS_SESSION_BUS_ADDRESS", "unix:path=/x");
    EXPECT_EQ(sessionBusAddress(), "unix:path=/x");
    qunsetenv("DBUS_SESSION_BUS_ADDRESS");
    qunsetenv("XDG_RUNTIME_DIR");
}

} // namespace ventrik
