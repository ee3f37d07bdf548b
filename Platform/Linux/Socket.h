#pragma once

#include "PropertyList/PlistValue.h"

#include <QSocketNotifier>

#include <chrono>
#include <cstddef>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <utility>

#include <sys/types.h>

namespace ventrik
{

/// Owns a file descriptor.
class FileDescriptor
{
  public:
    explicit FileDescriptor(int descriptor = -1) : _descriptor(descriptor) {}
    ~FileDescriptor() { reset(); }
    FileDescriptor(FileDescriptor&& other) noexcept
        : _descriptor(std::exchange(other._descriptor, -1))
    {
    }
    FileDescriptor& operator=(FileDescriptor&& other) noexcept
    {
        std::swap(_descriptor, other._descriptor);
        return *this;
    }

    int get() const { return _descriptor; }
    bool isOpen() const { return _descriptor >= 0; }
    void reset();

  private:
    int _descriptor;
};

// Unix-domain stream sockets: all non-blocking, closed on exec, and never raising SIGPIPE.

/// The longest path that a socket's address holds.
std::size_t socketPathMaximumLength();

enum class ConnectStatus { Connected, NobodyListens, Busy, Failed };
struct Connecting {
    ConnectStatus status = ConnectStatus::Failed;
    FileDescriptor socket; ///< open only when connected
    int error = 0;         ///< errno, when not connected
};
Connecting connectSocket(const std::string& path);

/// A socket that listens at the path, which must be free; not open and errno set on failure.
FileDescriptor listenSocket(const std::string& path);

/// Who is behind the peer, as the kernel saw it when the connection was made or, for a connection
/// of ours, when the peer began to listen.
struct Peer {
    uid_t user = 0;
    pid_t process = 0;
};
std::optional<Peer> peerOf(int socket);

enum class IoStatus { Done, WouldBlock, Closed };
struct IoResult {
    IoStatus status = IoStatus::Done;
    std::size_t count = 0;
};
IoResult receiveBytes(int socket, std::span<std::uint8_t> buffer);
IoResult sendBytes(int socket, ByteView data);

/// A point on the monotonic clock until which something may block.
class Deadline
{
  public:
    /// Negative times and not-a-number count as 0; the longest is a day.
    explicit Deadline(std::chrono::duration<double> timeFromNow);
    std::chrono::nanoseconds remaining() const;
    bool hasPassed() const { return remaining() == std::chrono::nanoseconds(0); }

  private:
    std::chrono::steady_clock::time_point _end;
};

/// Waits for one of the poll(2) events, an error or a hang-up. False when the time is up.
bool waitForSocket(int socket, short events, const Deadline& deadline);
/// Has the peer closed its end?
bool hasHungUp(int socket);

/// Bytes on their way out.
class SendBuffer
{
  public:
    bool empty() const { return _taken == _bytes.size(); }
    std::size_t size() const { return _bytes.size() - _taken; }
    /// Whether the socket took any byte of what was last appended to an empty buffer.
    bool hasBegun() const { return _hasBegun; }

    /// Room that was taken by what has been sent is used again, also while the buffer never
    /// empties.
    void append(ByteView bytes);
    void clear();
    /// Offers the rest to the socket once.
    IoStatus sendOnce(int socket);

  private:
    Bytes _bytes;
    std::size_t _taken = 0; // of the bytes that are held
    bool _hasBegun = false;
};

struct NotifierDeleter {
    void operator()(QSocketNotifier* notifier) const;
};
/// A notifier that may be dropped from within its own handler. It must be dropped before its
/// descriptor is closed.
using SocketNotifier = std::unique_ptr<QSocketNotifier, NotifierDeleter>;
SocketNotifier makeNotifier(int socket, QSocketNotifier::Type type, std::function<void()> handler);

} // namespace ventrik
