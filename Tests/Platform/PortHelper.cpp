// platform-port-helper DIRECTORY NAME: owns that local port. Answers each message with its own
// data; id 1 without data, id 2 after 0.3 s, id 3 by ending at once, id 4 with 64 KiB, id 5 with a
// byte more.
// platform-port-helper DIRECTORY NAME send: sends one message to that port and stays connected.
#include "Platform/Linux/LinuxMessagePorts.h"
#include "Platform/Linux/LinuxSystemLog.h"

#include <QCoreApplication>
#include <QThread>

#include <cstdio>
#include <cstdlib>

using namespace ventrik;

namespace
{

std::optional<Bytes> answer(const PortMessage& message)
{
    if (message.id == 1)
        return std::nullopt;
    if (message.id == 2)
        QThread::msleep(300);
    if (message.id == 3)
        std::_Exit(0);
    if (message.id == 4)
        return Bytes(std::size_t{64} << 10, 4);
    if (message.id == 5)
        return Bytes((std::size_t{64} << 10) + 1, 5);
    return Bytes(message.data.begin(), message.data.end());
}

int tell(std::string_view line)
{
    fmt::print("{}\n", line);
    std::fflush(stdout);
    return QCoreApplication::exec();
}

} // namespace

int main(int argc, char** argv)
{
    const QCoreApplication application(argc, argv);
    if (argc != 3 && argc != 4)
        return 2;
    LinuxSystemLog log("platform-port-helper");
    LinuxMessagePorts ports(std::string(argv[1]), log);
    if (argc == 4) {
        const auto remote = ports.createRemotePort(argv[2]);
        constexpr RemotePort::Seconds time{1.0};
        remote->send(1, {}, time, time, RemotePort::Reply::NotWanted);
        return tell("sent");
    }
    const auto creation = ports.createLocalPort(argv[2], PortSenders::SameUser, answer);
    if (creation.port == nullptr) {
        fmt::print("{}\n", creation.error);
        return 1;
    }
    creation.port->deliverOnMainQueue();
    return tell("ready");
}
