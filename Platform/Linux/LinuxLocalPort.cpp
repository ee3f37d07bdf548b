#include "Platform/Linux/LinuxLocalPort.h"

#include <QTimer>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <utility>

#include <sys/socket.h>

namespace ventrik
{

namespace
{

constexpr int acceptsPerTurn = 16;
constexpr std::size_t maximumConnections = 256;

} // namespace

LinuxLocalPort::LinuxLocalPort(Parts parts, SystemLog& log) : _parts(std::move(parts)), _log(log)
{
    _acceptNotifier =
        makeNotifier(_parts.listener.get(), QSocketNotifier::Read, [this] { acceptWaiting(); });
}

LinuxLocalPort::~LinuxLocalPort()
{
    close();
}

void LinuxLocalPort::deliverOnMainQueue()
{
    _isDelivering = true;
    for (const auto& connection : _connections)
        connection->startReading();
}

void LinuxLocalPort::setInvalidationCallback(InvalidationCallback callback)
{
    _invalidationCallback = std::move(callback);
}

void LinuxLocalPort::invalidate()
{
    if (!isValid())
        return;
    const auto self = shared_from_this(); // the callback may drop the last other reference
    close();
    if (const auto callback = std::exchange(_invalidationCallback, nullptr))
        callback();
}

void LinuxLocalPort::close()
{
    if (!isValid())
        return;
    // While it still listens nobody takes the file for a stale one and puts his own there.
    _parts.file.removeIfOwn();
    _acceptNotifier.reset();
    _parts.listener.reset();
    for (const auto& connection : std::exchange(_connections, {}))
        connection->close();
}

void LinuxLocalPort::acceptWaiting()
{
    for (int i = 0; i < acceptsPerTurn; ++i) {
        FileDescriptor socket(
            ::accept4(_parts.listener.get(), nullptr, nullptr, SOCK_NONBLOCK | SOCK_CLOEXEC));
        if (socket.isOpen()) {
            _cannotAccept = false;
            addConnection(std::move(socket));
        } else if (errno == EAGAIN || errno == EWOULDBLOCK) {
            return;
        } else if (errno != EINTR && errno != ECONNABORTED) {
            return pauseAccepting();
        }
    }
}

// Out of descriptors or memory: the waiting connection would wake us all the time.
void LinuxLocalPort::pauseAccepting()
{
    if (!std::exchange(_cannotAccept, true))
        _log.error("port {} cannot take connections for now: {}", name(), std::strerror(errno));
    _acceptNotifier->setEnabled(false);
    QTimer::singleShot(100, &_context, [this] {
        if (_acceptNotifier != nullptr)
            _acceptNotifier->setEnabled(true);
    });
}

void LinuxLocalPort::addConnection(FileDescriptor socket)
{
    const auto peer = peerOf(socket.get());
    const bool isTrusted = peer && peer->user == _parts.trustedUser;
    if (!isTrusted && _parts.senders == PortSenders::SameUser)
        return _log.warning("port {} refused a connection of user {}", name(),
                            peer ? std::to_string(peer->user) : "unknown");
    if (_connections.size() >= maximumConnections && !makeRoom())
        return _log.warning("port {} refused a connection: it has {} already", name(),
                            maximumConnections);
    auto connection = std::make_shared<PortConnection>(std::move(socket), peer.value_or(Peer{}),
                                                       isTrusted, connectionHandlers());
    _connections.push_back(connection);
    noteStreamConnection(*connection);
    if (_isDelivering)
        connection->startReading();
}

// Ends the connection that has been idle longest: one that never sent a message before all that
// did, and never the one that carries the stream, which may be silent for good reasons.
bool LinuxLocalPort::makeRoom()
{
    const auto limit = std::chrono::steady_clock::now() - _parts.idleLimit;
    const auto rank = [](const auto& connection) {
        return std::pair(connection->hasSentMessage(), connection->lastMessageTime());
    };
    std::shared_ptr<PortConnection> idle;
    for (const auto& connection : _connections)
        if (connection->lastMessageTime() <= limit && !carriesStream(*connection) &&
            (!idle || rank(connection) < rank(idle)))
            idle = connection;
    if (!idle)
        return false;
    idle->close();
    removeConnection(*idle, "it was idle, and room was needed");
    return true;
}

void LinuxLocalPort::expectStreamOf(ProcessNumber process)
{
    _streamProcess = process;
    for (const auto& connection : _connections)
        noteStreamConnection(*connection);
}

void LinuxLocalPort::noteStreamConnection(const PortConnection& connection)
{
    if (_streamProcess && connection.peerProcess() == *_streamProcess)
        _streamProcessConnected = true;
}

bool LinuxLocalPort::carriesStream(const PortConnection& connection) const
{
    if (!_streamProcess)
        return false;
    return _streamProcessConnected ? connection.peerProcess() == *_streamProcess
                                   : connection.hasSent();
}

bool LinuxLocalPort::hasLostStream() const
{
    return _streamEnded && std::ranges::none_of(_connections, [this](const auto& connection) {
               return carriesStream(*connection);
           });
}

PortConnection::Handlers LinuxLocalPort::connectionHandlers()
{
    // Holding the port through each call lets a receiver drop it meanwhile.
    const std::weak_ptr<LinuxLocalPort> weak = weak_from_this();
    return {[weak](const PortMessage& message) -> std::optional<Bytes> {
                const auto port = weak.lock();
                if (port == nullptr || !port->_parts.callback)
                    return std::nullopt;
                return port->_parts.callback(message);
            },
            [weak](PortConnection& connection, std::string_view reason) {
                if (const auto port = weak.lock())
                    port->removeConnection(connection, reason);
            }};
}

void LinuxLocalPort::removeConnection(PortConnection& connection, std::string_view reason)
{
    if (!reason.empty())
        _log.warning("port {} dropped a connection: {}", name(), reason);
    _streamEnded |= carriesStream(connection);
    std::erase_if(_connections, [&](const auto& other) { return other.get() == &connection; });
}

} // namespace ventrik
