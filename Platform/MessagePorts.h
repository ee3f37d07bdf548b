#pragma once

#include "PropertyList/PlistValue.h"

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace ventrik
{

/// Results of `RemotePort::send`.
namespace PortError
{
inline constexpr int success = 0;
inline constexpr int sendTimeout = -1;
inline constexpr int receiveTimeout = -2;
inline constexpr int invalidPort = -3;
inline constexpr int transportFault = -4;
} // namespace PortError

/// The number of a process of this machine; 0 when it is not known.
using ProcessNumber = std::int64_t;

/// One message as a local port hands it out; the data lives as long as the callback runs.
struct PortMessage {
    std::int32_t id = 0;
    ByteView data;
    /// The sender may open channels here: it runs as the same user as the receiver.
    bool senderIsTrusted = true;
};

/// The receiving end of a named port. Everything is delivered on the main queue.
class LocalPort
{
  public:
    /// Gives the reply, or none. A sender that waits for a reply is answered either way.
    using DataCallback = std::function<std::optional<Bytes>(const PortMessage&)>;
    using InvalidationCallback = std::function<void()>;

    virtual ~LocalPort() = default;

    virtual const std::string& name() const = 0;
    /// Nothing is delivered before this.
    virtual void deliverOnMainQueue() = 0;
    /// An empty function clears the callback.
    virtual void setInvalidationCallback(InvalidationCallback callback) = 0;
    /// Closes the port, frees its name and runs the invalidation callback at once, if one is set.
    /// The callback may drop the caller's reference. A second call does nothing.
    virtual void invalidate() = 0;
    virtual bool isValid() const = 0;

    /// Names the process whose connection carries a channel's stream to this port. Where that
    /// process never connects, every connection on which something came carries it.
    virtual void expectStreamOf(ProcessNumber process) = 0;
    /// The connection that carries the stream was there and is not any more: its peer has closed
    /// or half-closed it, has broken the framing, or has stalled for 5 s within a message.
    virtual bool hasLostStream() const = 0;
};

/// The sending end of a named port.
class RemotePort
{
  public:
    using Seconds = std::chrono::duration<double>;
    using InvalidationCallback = std::function<void()>;

    enum class Reply { NotWanted, Wanted };

    struct SendResult {
        int error = PortError::success;
        /// The answer, when one was wanted and the receiver gave one.
        std::optional<Bytes> reply;
    };

    virtual ~RemotePort() = default;

    virtual const std::string& name() const = 0;

    /// Sends one message; blocks for the two time-outs at most. A message of which any byte was
    /// taken counts as sent, and its rest goes out before the next one. With a send time-out of 0
    /// a receiver that does not keep up gives `PortError::sendTimeout` and nothing is sent.
    virtual SendResult send(std::int32_t id, ByteView data, Seconds sendTimeout,
                            Seconds receiveTimeout, Reply reply) = 0;

    /// Called on the main queue when the peer has gone, and by `invalidate`. Empty clears it.
    virtual void setInvalidationCallback(InvalidationCallback callback) = 0;
    virtual void invalidate() = 0;
    /// Turns false when the peer has gone, without anybody asking.
    virtual bool isValid() const = 0;
    /// The process behind the port.
    virtual ProcessNumber process() const = 0;
};

/// Whose messages a local port takes.
enum class PortSenders {
    SameUser, ///< connections of other users are closed unread
    AnyUser,  ///< all are delivered; `PortMessage::senderIsTrusted` tells them apart
};

struct LocalPortCreation {
    /// None when the port could not be made; the reason is then in `error`.
    std::shared_ptr<LocalPort> port;
    /// The name was taken in this process; `port` is the existing one.
    bool alreadyExists = false;
    std::string error;
    /// There is none because another process has a port of that name.
    bool nameIsTaken = false;
};

/// Makes and finds message ports by name.
class MessagePorts
{
  public:
    virtual ~MessagePorts() = default;

    virtual LocalPortCreation createLocalPort(std::string_view name, PortSenders senders,
                                              LocalPort::DataCallback callback) = 0;
    /// None where nobody listens under that name.
    virtual std::shared_ptr<RemotePort> createRemotePort(std::string_view name) = 0;
};

} // namespace ventrik
