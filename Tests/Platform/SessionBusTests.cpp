#include "Platform/Linux/BusMessage.h"
#include "Platform/Linux/SessionBus.h"
#include "Platform/Linux/Socket.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <thread>

#include <QTemporaryDir>

#include <fmt/format.h>
#include <poll.h>
#include <sys/socket.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

constexpr std::string_view accepted = "OK 0123456789abcdef\r\n";

std::string bytesOf(const BusMessage& message)
{
    const Bytes bytes = message.encode();
    return {bytes.begin(), bytes.end()};
}

std::string answer(BusMessage::Type type)
{
    return bytesOf({type, 7, "", "", "", "org.ventrik.Test", {"something"}});
}

/// A bus that sends what it was told as soon as it has a connection, and then nothing more.
class FakeBus
{
  public:
    explicit FakeBus(std::string_view words)
        : _thread([this, words = std::string(words)] {
              const Deadline deadline(20s);
              waitForSocket(_listener.get(), POLLIN, deadline);
              const FileDescriptor client(accept(_listener.get(), nullptr, nullptr));
              sendBytes(client.get(), ByteView(reinterpret_cast<const std::uint8_t*>(words.data()),
                                               words.size()));
              while (!hasHungUp(client.get()) && !deadline.hasPassed())
                  std::this_thread::sleep_for(1ms);
          })
    {
    }
    ~FakeBus() { _thread.join(); }

    std::optional<std::string> send(std::chrono::milliseconds longestWait) const
    {
        return sendBusSignal("unix:path=" + _path, {"/a", "b.c", "D", {}}, longestWait);
    }

  private:
    QTemporaryDir _directory;
    std::string _path = _directory.filePath("bus").toStdString();
    FileDescriptor _listener = listenSocket(_path);
    std::thread _thread;
};

std::optional<std::string> failureOf(std::string_view words,
                                     std::chrono::milliseconds longestWait = 20s)
{
    return FakeBus(words).send(longestWait);
}

} // namespace

TEST(BusMessage, IsEncodedWithItsFieldsAndItsBodyInTheirPlaces)
{
    const BusMessage message{BusMessage::Type::Signal, 2, "/a", "b.c", "D", "", {"xy", "z"}};
    const Bytes expected{
        'l', 4, 0,   1, 14,  0,   0,   0, 2,   0,   0,   0, 56,  0, 0, 0, // and then the fields:
        1,   1, 'o', 0, 2,   0,   0,   0, '/', 'a', 0,   0, 0,   0, 0, 0, // path
        2,   1, 's', 0, 3,   0,   0,   0, 'b', '.', 'c', 0, 0,   0, 0, 0, // interface
        3,   1, 's', 0, 1,   0,   0,   0, 'D', 0,   0,   0, 0,   0, 0, 0, // member
        8,   1, 'g', 0, 2,   's', 's', 0,                                 // the body's types
        2,   0, 0,   0, 'x', 'y', 0,   0, 1,   0,   0,   0, 'z', 0};
    EXPECT_EQ(message.encode(), expected);
}

TEST(BusMessage, TellsWhereTheNextOneBegins)
{
    const Bytes bytes = BusMessage{BusMessage::Type::Error, 2, "", "", "", "x", {"abc"}}.encode();
    const BusMessageStart start = BusMessageStart::decode(bytes);
    EXPECT_EQ(start.type, BusMessage::Type::Error);
    EXPECT_EQ(start.messageSize, bytes.size());
}

TEST(BusMessage, IsReadInEitherByteOrder)
{
    const Bytes bytes{'B', 2, 0, 1, 0, 0, 1, 2, 0, 0, 0, 0, 0, 0, 0, 9};
    EXPECT_EQ(BusMessageStart::decode(bytes).messageSize, 16U + 16 + 0x102);
}

TEST(SessionBus, HasTheSignalWhenItHasAnsweredWhatCameBehind)
{
    const std::string answers = answer(BusMessage::Type::MethodReturn) +
                                answer(BusMessage::Type::Signal) +
                                answer(BusMessage::Type::MethodReturn);
    EXPECT_EQ(failureOf(std::string(accepted) + answers), std::nullopt);
}

TEST(SessionBus, ThatDoesNotAnswerIsNotWaitedForLongerThanThat)
{
    EXPECT_EQ(failureOf("", 20ms), "it does not answer");
    EXPECT_EQ(failureOf("OK ", 20ms), "it does not answer");
    EXPECT_EQ(failureOf(accepted, 20ms), "it does not answer");
    EXPECT_EQ(failureOf(std::string(accepted) + answer(BusMessage::Type::MethodReturn), 20ms),
              "it does not answer");
}

TEST(SessionBus, ThatRefusesOrAnswersTooMuchIsGivenUp)
{
    EXPECT_EQ(failureOf("REJECTED EXTERNAL\r\n"), "it refuses the login");
    EXPECT_EQ(failureOf(std::string(2000, 'x')), "it answers too much");
    EXPECT_EQ(failureOf(std::string(accepted) + answer(BusMessage::Type::Error)),
              "it refuses the message");
    EXPECT_EQ(failureOf(std::string(accepted) + std::string(16, '\xff')), "it answers too much");
}

TEST(SessionBus, ThatIsNotThereOrOfAnotherKindIsTold)
{
    const BusSignal signal{"/a", "b.c", "D", {}};
    EXPECT_EQ(sendBusSignal("unix:path=/nowhere/%62us", signal, 1s), "No such file or directory");
    EXPECT_EQ(sendBusSignal("tcp:host=localhost", signal, 1s),
              "its address is of no kind that is known here");
    EXPECT_EQ(sendBusSignal("unix:path=/" + std::string(200, 'a'), signal, 1s),
              "File name too long");
}

} // namespace ventrik
