#pragma once

#include "Platform/Linux/MessageFrame.h"
#include "Platform/Linux/Socket.h"
#include "Platform/MessagePorts.h"

#include <QObject>

#include <memory>
#include <optional>
#include <string>

namespace ventrik
{

/// A remote port on a connected socket; made by `LinuxMessagePorts`. Dropping the last reference
/// closes it without running the invalidation callback.
class LinuxRemotePort : public RemotePort, public std::enable_shared_from_this<LinuxRemotePort>
{
  public:
    LinuxRemotePort(std::string name, FileDescriptor socket);
    ~LinuxRemotePort() override;

    const std::string& name() const override { return _name; }
    /// Data above 64 MiB is not sent: `PortError::transportFault`, and the port stays. A reply that
    /// is malformed or above 64 KiB, or a peer that goes before it replies, gives the same and ends
    /// the port.
    SendResult send(std::int32_t id, ByteView data, Seconds sendTimeout, Seconds receiveTimeout,
                    Reply reply) override;
    void setInvalidationCallback(InvalidationCallback callback) override;
    void invalidate() override;
    bool isValid() const override;
    ProcessNumber process() const override { return _process; }

  private:
    enum class ReplySearch { Found, NotYet, Malformed };

    int sendFrame(const FrameHeader& header, ByteView data, const Deadline& deadline);
    int sendOutgoing(const Deadline& deadline);
    SendResult receiveReply(std::uint32_t serial, const Deadline& deadline);
    ReplySearch findReply(std::optional<std::uint32_t> serial, SendResult& result);
    IoStatus receive();
    void watchForRest();
    void writeRest();
    void readUnasked();
    void peerHasGone();
    void close();
    void runInvalidationCallback();

    std::string _name;
    FileDescriptor _socket;
    ProcessNumber _process = 0;
    InvalidationCallback _invalidationCallback;
    SocketNotifier _readNotifier;
    SocketNotifier _writeNotifier;
    SendBuffer _outgoing;
    FrameReader _reader;
    Bytes _chunk;     // the bytes of the last read
    ByteView _unread; // what of them is not consumed yet
    std::uint32_t _lastSerial = 0;
    QObject _context; // queued callbacks die with it
};

} // namespace ventrik
