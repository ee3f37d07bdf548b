#pragma once

#include "Platform/Linux/MessageFrame.h"
#include "Platform/Linux/Socket.h"
#include "Platform/MessagePorts.h"

#include <QTimer>

#include <chrono>
#include <functional>
#include <memory>
#include <optional>
#include <string_view>

namespace ventrik
{

/// One sender's connection to a local port. It reads a bounded share of what waits in each turn of
/// the event loop, so that a busy sender leaves room for everything else.
class PortConnection : public std::enable_shared_from_this<PortConnection>
{
  public:
    struct Handlers {
        /// Gives the reply. May close the connection.
        std::function<std::optional<Bytes>(const PortMessage&)> onMessage;
        /// The connection has ended by itself; the reason is empty when the peer just went.
        std::function<void(PortConnection&, std::string_view reason)> onEnd;
    };

    using Time = std::chrono::steady_clock::time_point;

    PortConnection(FileDescriptor socket, Peer peer, bool peerIsTrusted, Handlers handlers);
    ~PortConnection();

    void startReading();
    /// Ends the connection without a call of `onEnd`.
    void close();
    bool isOpen() const { return _socket.isOpen(); }

    pid_t peerProcess() const { return _peer.process; }
    /// Whether any byte came.
    bool hasSent() const { return _hasSent; }
    /// Whether a whole message came, and when the last one did; at first, when the connection was
    /// made.
    bool hasSentMessage() const { return _hasSentMessage; }
    Time lastMessageTime() const { return _lastMessageTime; }

  private:
    void readTurn();
    bool readAndHandle();
    bool receive();
    void handleFrame();
    void reply(std::uint32_t serial, std::optional<Bytes> data);
    void flush();
    void end(std::string_view reason);
    void watchForStall();
    void checkStall();

    FileDescriptor _socket;
    Peer _peer;
    bool _peerIsTrusted;
    bool _hasSent = false;
    bool _hasSentMessage = false;
    Time _lastMessageTime = std::chrono::steady_clock::now();
    Handlers _handlers;
    SocketNotifier _readNotifier;
    SocketNotifier _writeNotifier;
    FrameReader _reader;
    Bytes _chunk;     // the bytes of the last read
    ByteView _unread; // what of them is not consumed yet
    SendBuffer _outgoing;
    QTimer _nextTurn;
    QTimer _stall; // runs while the rest of a message is awaited
};

} // namespace ventrik
