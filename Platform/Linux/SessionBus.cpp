#include "Platform/Linux/SessionBus.h"

#include "Platform/Linux/BusMessage.h"
#include "Platform/Linux/Socket.h"

#include <array>
#include <cerrno>
#include <charconv>
#include <cstdlib>
#include <cstring>
#include <stdexcept>
#include <string_view>
#include <thread>

#include <fmt/format.h>
#include <poll.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

std::string environment(const char* name)
{
    const char* value = std::getenv(name);
    return value ? value : "";
}

[[noreturn]] void fail(const std::string& reason)
{
    throw std::runtime_error(reason);
}

// "%41" stands for "A" in the values of an address.
std::string unescaped(std::string_view value)
{
    std::string text;
    for (; !value.empty(); value.remove_prefix(1)) {
        unsigned code = 0;
        const bool isEscape = value.size() >= 3 && value[0] == '%' &&
                              std::from_chars(&value[1], &value[1] + 2, code, 16).ec == std::errc();
        text += isEscape ? static_cast<char>(code) : value[0];
        if (isEscape)
            value.remove_prefix(2);
    }
    return text;
}

// Takes what stands before the separator off the text's start.
std::string_view takeUntil(std::string_view& text, char separator)
{
    const std::string_view part = text.substr(0, text.find(separator));
    text.remove_prefix(std::min(part.size() + 1, text.size()));
    return part;
}

// The name of a socket as the kernel has it, an abstract one behind a zero byte; empty when the
// address is of another kind.
std::string socketName(std::string_view address)
{
    if (takeUntil(address, ':') != "unix")
        return {};
    while (!address.empty()) {
        const std::string_view entry = takeUntil(address, ',');
        if (entry.starts_with("path="))
            return unescaped(entry.substr(5));
        if (entry.starts_with("abstract="))
            return '\0' + unescaped(entry.substr(9));
        if (entry == "runtime=yes")
            return environment("XDG_RUNTIME_DIR") + "/bus";
    }
    return {};
}

// Closed, with errno, when there is no connection.
FileDescriptor connectTo(const std::string& name, const Deadline& deadline)
{
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    if (name.size() >= sizeof address.sun_path) {
        errno = ENAMETOOLONG;
        return FileDescriptor();
    }
    std::memcpy(address.sun_path, name.data(), name.size());
    const auto size = static_cast<socklen_t>(offsetof(sockaddr_un, sun_path) + name.size());
    FileDescriptor socket(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0));
    while (connect(socket.get(), reinterpret_cast<const sockaddr*>(&address), size) != 0) {
        // So many wait for the bus that there is no room for one more.
        if (errno != EAGAIN || deadline.hasPassed())
            return FileDescriptor();
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    return socket;
}

/// A connection to the bus. Whatever goes wrong is thrown as std::runtime_error.
class BusConnection
{
  public:
    BusConnection(FileDescriptor socket, const Deadline& deadline)
        : _socket(std::move(socket)), _deadline(deadline)
    {
    }

    void logIn()
    {
        std::string request(1, '\0');
        request += "AUTH EXTERNAL ";
        for (const char digit : std::to_string(getuid()))
            request += fmt::format("{:02x}", digit);
        send(request + "\r\n");
        if (!receiveLine().starts_with("OK "))
            fail("it refuses the login");
        send("BEGIN\r\n");
    }
    void send(const BusMessage& message)
    {
        const Bytes bytes = message.encode();
        send(std::string(bytes.begin(), bytes.end()));
    }
    /// Passes over signals to the next answer.
    void receiveAnswer()
    {
        for (;;) {
            const BusMessageStart start = BusMessageStart::decode(receive(BusMessageStart::size));
            if (start.messageSize > longestMessage)
                fail("it answers too much");
            receive(start.messageSize - BusMessageStart::size);
            if (start.type == BusMessage::Type::Error)
                fail("it refuses the message");
            if (start.type == BusMessage::Type::MethodReturn)
                return;
        }
    }

  private:
    static constexpr std::size_t longestLine = 1024;
    static constexpr std::size_t longestMessage = 64 * 1024;

    void waitFor(short events)
    {
        if (_deadline.hasPassed() || !waitForSocket(_socket.get(), events, _deadline))
            fail("it does not answer");
    }
    void send(std::string_view text)
    {
        ByteView rest(reinterpret_cast<const std::uint8_t*>(text.data()), text.size());
        while (!rest.empty()) {
            waitFor(POLLOUT);
            const IoResult result = sendBytes(_socket.get(), rest);
            if (result.status == IoStatus::Closed)
                fail("it closed the connection");
            rest = rest.subspan(result.count);
        }
    }
    Bytes receive(std::size_t size)
    {
        Bytes bytes(size);
        for (std::size_t count = 0; count < size;) {
            waitFor(POLLIN);
            const IoResult result = receiveBytes(_socket.get(), std::span(bytes).subspan(count));
            if (result.status == IoStatus::Closed)
                fail("it closed the connection");
            count += result.count;
        }
        return bytes;
    }
    std::string receiveLine()
    {
        std::string line;
        while (!line.ends_with("\r\n")) {
            line += static_cast<char>(receive(1).front());
            if (line.size() > longestLine)
                fail("it answers too much");
        }
        return line;
    }

    FileDescriptor _socket;
    const Deadline& _deadline;
};

FileDescriptor connectToBus(std::string_view addresses, const Deadline& deadline)
{
    std::string reason = "its address is of no kind that is known here";
    while (!addresses.empty()) {
        const std::string name = socketName(takeUntil(addresses, ';'));
        if (name.empty())
            continue;
        FileDescriptor socket = connectTo(name, deadline);
        if (socket.isOpen())
            return socket;
        reason = std::strerror(errno);
    }
    fail(reason);
}

BusMessage callOfBus(std::uint32_t serial, const char* interface, const char* member)
{
    return {BusMessage::Type::MethodCall, serial, "/org/freedesktop/DBus", interface, member,
            "org.freedesktop.DBus",       {}};
}

void sendSignal(const std::string& address, const BusSignal& signal, const Deadline& deadline)
{
    BusConnection bus(connectToBus(address, deadline), deadline);
    bus.logIn();
    bus.send(callOfBus(1, "org.freedesktop.DBus", "Hello"));
    bus.send({BusMessage::Type::Signal, 2, signal.path, signal.interface, signal.member, "",
              signal.arguments});
    // Its answer tells that what came before has been taken.
    bus.send(callOfBus(3, "org.freedesktop.DBus.Peer", "Ping"));
    bus.receiveAnswer();
    bus.receiveAnswer();
}

} // namespace

std::optional<std::string> sessionBusAddress()
{
    if (const std::string address = environment("DBUS_SESSION_BUS_ADDRESS"); !address.empty())
        return address;
    const std::string directory = environment("XDG_RUNTIME_DIR");
    if (directory.empty() || access((directory + "/bus").c_str(), F_OK) != 0)
        return std::nullopt;
    return "unix:runtime=yes";
}

std::optional<std::string> sendBusSignal(const std::string& address, const BusSignal& signal,
                                         std::chrono::milliseconds longestWait)
{
    try {
        sendSignal(address, signal, Deadline(longestWait));
        return std::nullopt;
    } catch (const std::runtime_error& error) {
        return error.what();
    }
}

} // namespace ventrik
