// platform-port-helper DIRECTORY NAME: owns that local port. Answers each message with its own
// data; id 1 without data, id 2 after 0.3 s, id 3 by ending at once, id 4 with 40 MiB.
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
        return Bytes(std::size_t{40} << 20, 4);
    return Bytes(message.data.begin(), message.data.end());
}

} // namespace

int main(int argc, char** argv)
{
    const QCoreApplication application(argc, argv);
    if (argc != 3)
        return 2;
    LinuxSystemLog log("platform-port-helper");
    LinuxMessagePorts ports(argv[1], log);
    const auto creation = ports.createLocalPort(argv[2], PortSenders::SameUser, answer);
    if (creation.port == nullptr) {
        fmt::print("{}\n", creation.error);
        return 1;
    }
    creation.port->deliverOnMainQueue();
    fmt::print("ready\n");
    std::fflush(stdout);
    return QCoreApplication::exec();
}
