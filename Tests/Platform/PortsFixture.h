#pragma once

#include "Platform/Linux/LinuxMessagePorts.h"
#include "Platform/Linux/MessageFrame.h"
#include "Platform/Linux/Socket.h"
#include "Tests/Support/CapturingSystemLog.h"

#include <QEventLoop>
#include <QProcess>
#include <QTemporaryDir>
#include <QTimer>

#include <chrono>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{

/// Runs the event loop until it is so; false after 10 s. These tests are on real sockets, so they
/// wait for real.
inline bool runUntil(const std::function<bool()>& isDone)
{
    const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(10);
    QEventLoop loop;
    QTimer poll;
    QObject::connect(&poll, &QTimer::timeout, [&] {
        if (isDone() || std::chrono::steady_clock::now() > end)
            loop.quit();
    });
    poll.start(1);
    if (!isDone())
        loop.exec();
    return isDone();
}

/// Runs what is ready in the event loop, several times over.
inline void runReadyEvents()
{
    int rounds = 0;
    runUntil([&] { return ++rounds > 20; });
}

inline double secondsOf(const std::function<void()>& action)
{
    const auto start = std::chrono::steady_clock::now();
    action();
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

/// Message ports in a directory of their own, and what a test needs around them.
class PortsTest : public ::testing::Test
{
  protected:
    using Seconds = RemotePort::Seconds;
    static constexpr auto wanted = RemotePort::Reply::Wanted;
    static constexpr auto notWanted = RemotePort::Reply::NotWanted;

    struct Received {
        std::int32_t id;
        Bytes data;
        bool trusted;
    };

    /// A local port that delivers into `received` and answers nothing.
    std::shared_ptr<LocalPort> makePort(PortSenders senders = PortSenders::SameUser)
    {
        return makePort(ports, senders);
    }
    std::shared_ptr<LocalPort> makePort(MessagePorts& owner, PortSenders senders)
    {
        return owner
            .createLocalPort("port", senders,
                             [this](const PortMessage& message) {
                                 received.push_back(
                                     {message.id, Bytes(message.data.begin(), message.data.end()),
                                      message.senderIsTrusted});
                                 return reply;
                             })
            .port;
    }

    int send(RemotePort& port, std::int32_t id, const Bytes& data = {})
    {
        return port.send(id, data, Seconds(1), Seconds(1), notWanted).error;
    }

    std::vector<std::int32_t> receivedIds() const
    {
        std::vector<std::int32_t> ids;
        for (const Received& message : received)
            ids.push_back(message.id);
        return ids;
    }
    bool runUntilReceived(std::size_t count)
    {
        return runUntil([&] { return received.size() >= count; });
    }

    /// Starts the helper process as the owner of the port of that name; gives its first line.
    std::string startHelper(const std::string& name, const QStringList& more = {})
    {
        helper.start(VENTRIK_PORT_HELPER,
                     QStringList{QString::fromStdString(directory), QString::fromStdString(name)} +
                         more);
        while (!helper.canReadLine() && helper.waitForReadyRead(10000)) {
        }
        return helper.readLine().trimmed().toStdString();
    }
    /// Starts the helper process as one that has sent a message to the port of that name.
    std::string startSender(const std::string& name) { return startHelper(name, {"send"}); }
    void killHelper()
    {
        helper.kill();
        helper.waitForFinished();
    }
    ~PortsTest() override
    {
        if (helper.state() != QProcess::NotRunning)
            killHelper();
    }

    /// A socket that is connected to the port, to write anything to.
    FileDescriptor connectRaw() const { return connectSocket(directory + "/port").socket; }
    bool hasBeenClosed(const FileDescriptor& socket) const
    {
        return runUntil([&] { return hasHungUp(socket.get()); });
    }

    QTemporaryDir temporary;
    std::string directory = temporary.path().toStdString() + "/runtime";
    CapturingSystemLog log;
    LinuxMessagePorts ports{directory, log};
    std::vector<Received> received;
    std::optional<Bytes> reply;
    QProcess helper;
};

} // namespace ventrik
