#include "Platform/Linux/Socket.h"

#include <algorithm>
#include <cerrno>
#include <cstring>

#include <fcntl.h>
#include <poll.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

FileDescriptor makeSocket()
{
    return FileDescriptor(::socket(AF_UNIX, SOCK_STREAM | SOCK_NONBLOCK | SOCK_CLOEXEC, 0));
}

// Calls bind or connect with the path's address; false and errno on failure.
template <typename Call>
bool withAddress(const std::string& path, Call call)
{
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    if (path.size() > socketPathMaximumLength()) {
        errno = ENAMETOOLONG;
        return false;
    }
    std::ranges::copy(path, address.sun_path);
    return call(reinterpret_cast<const sockaddr*>(&address), sizeof address) == 0;
}

IoResult ioResult(ssize_t count)
{
    if (count >= 0)
        return {IoStatus::Done, static_cast<std::size_t>(count)};
    const bool wouldBlock = errno == EAGAIN || errno == EWOULDBLOCK;
    return {wouldBlock ? IoStatus::WouldBlock : IoStatus::Closed, 0};
}

} // namespace

void FileDescriptor::reset()
{
    if (_descriptor >= 0)
        ::close(std::exchange(_descriptor, -1));
}

std::size_t socketPathMaximumLength()
{
    return sizeof(sockaddr_un::sun_path) - 1;
}

Connecting connectSocket(const std::string& path)
{
    FileDescriptor socket = makeSocket();
    if (!socket.isOpen())
        return {ConnectStatus::Failed, FileDescriptor(), errno};
    const bool connected = withAddress(path, [&](const sockaddr* address, socklen_t length) {
        return ::connect(socket.get(), address, length);
    });
    if (connected)
        return {ConnectStatus::Connected, std::move(socket), 0};
    const int error = errno;
    const auto status = error == ECONNREFUSED || error == ENOENT ? ConnectStatus::NobodyListens
                        : error == EAGAIN                        ? ConnectStatus::Busy
                                                                 : ConnectStatus::Failed;
    return {status, FileDescriptor(), error};
}

FileDescriptor listenSocket(const std::string& path)
{
    FileDescriptor socket = makeSocket();
    if (!socket.isOpen())
        return socket;
    const bool bound = withAddress(path, [&](const sockaddr* address, socklen_t length) {
        return ::bind(socket.get(), address, length);
    });
    if (!bound)
        return FileDescriptor();
    if (::listen(socket.get(), SOMAXCONN) == 0)
        return socket;
    const int error = errno;
    ::unlink(path.c_str());
    errno = error;
    return FileDescriptor();
}

std::optional<Peer> peerOf(int socket)
{
    ucred credentials{};
    socklen_t length = sizeof credentials;
    if (getsockopt(socket, SOL_SOCKET, SO_PEERCRED, &credentials, &length) != 0)
        return std::nullopt;
    return Peer{credentials.uid, credentials.pid};
}

IoResult receiveBytes(int socket, std::span<std::uint8_t> buffer)
{
    ssize_t count = 0;
    do
        count = ::recv(socket, buffer.data(), buffer.size(), MSG_DONTWAIT);
    while (count < 0 && errno == EINTR);
    return count == 0 ? IoResult{IoStatus::Closed, 0} : ioResult(count);
}

IoResult sendBytes(int socket, ByteView data)
{
    ssize_t count = 0;
    do
        count = ::send(socket, data.data(), data.size(), MSG_DONTWAIT | MSG_NOSIGNAL);
    while (count < 0 && errno == EINTR);
    return ioResult(count);
}

Deadline::Deadline(std::chrono::duration<double> timeFromNow)
    : _end(std::chrono::steady_clock::now())
{
    constexpr double longest = 24 * 60 * 60;
    if (timeFromNow.count() > 0)
        _end += std::chrono::nanoseconds(
            static_cast<std::int64_t>(std::min(timeFromNow.count(), longest) * 1e9));
}

std::chrono::nanoseconds Deadline::remaining() const
{
    return std::max<std::chrono::nanoseconds>(_end - std::chrono::steady_clock::now(),
                                              std::chrono::nanoseconds(0));
}

bool waitForSocket(int socket, short events, const Deadline& deadline)
{
    while (true) {
        pollfd descriptor{socket, events, 0};
        const auto remaining = deadline.remaining();
        const auto seconds = std::chrono::floor<std::chrono::seconds>(remaining);
        const timespec timeout{seconds.count(), (remaining - seconds).count()};
        const int count = ::ppoll(&descriptor, 1, &timeout, nullptr);
        if (count > 0)
            return true;
        if (count == 0 && deadline.hasPassed())
            return false;
        if (count < 0 && errno != EINTR)
            return false;
    }
}

bool hasHungUp(int socket)
{
    pollfd descriptor{socket, POLLRDHUP, 0};
    return ::poll(&descriptor, 1, 0) > 0 &&
           (descriptor.revents & (POLLRDHUP | POLLHUP | POLLERR)) != 0;
}

void SendBuffer::append(ByteView bytes)
{
    if (empty())
        clear();
    // More than half of it is waste: worth moving the rest.
    if (_taken > _bytes.size() / 2) {
        _bytes.erase(_bytes.begin(), _bytes.begin() + static_cast<std::ptrdiff_t>(_taken));
        _taken = 0;
    }
    _bytes.insert(_bytes.end(), bytes.begin(), bytes.end());
}

void SendBuffer::clear()
{
    _bytes = Bytes();
    _taken = 0;
    _hasBegun = false;
}

IoStatus SendBuffer::sendOnce(int socket)
{
    if (empty())
        return IoStatus::Done;
    const IoResult result = sendBytes(socket, ByteView(_bytes).subspan(_taken));
    _taken += result.count;
    _hasBegun |= result.count > 0;
    return result.status;
}

void NotifierDeleter::operator()(QSocketNotifier* notifier) const
{
    notifier->setEnabled(false);
    notifier->disconnect();
    notifier->deleteLater();
}

SocketNotifier makeNotifier(int socket, QSocketNotifier::Type type, std::function<void()> handler)
{
    SocketNotifier notifier(new QSocketNotifier(socket, type));
    QObject::connect(notifier.get(), &QSocketNotifier::activated, notifier.get(),
                     [handler = std::move(handler)] { handler(); });
    return notifier;
}

} // namespace ventrik
