#pragma once

#include "Platform/Linux/PortConnection.h"
#include "Platform/Linux/PortDirectory.h"
#include "Platform/MessagePorts.h"
#include "Platform/SystemLog.h"

#include <QObject>

#include <chrono>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace ventrik
{

/// A local port on a listening socket; made by `LinuxMessagePorts`. Dropping the last reference
/// closes it without running the invalidation callback.
class LinuxLocalPort : public LocalPort, public std::enable_shared_from_this<LinuxLocalPort>
{
  public:
    struct Parts {
        std::string name;
        FileDescriptor listener;
        SocketFile file;
        PortSenders senders = PortSenders::SameUser;
        uid_t trustedUser = 0;
        DataCallback callback;
        /// A connection that has been without a whole message for so long makes room for another.
        std::chrono::steady_clock::duration idleLimit = std::chrono::seconds(30);
    };

    /// The log must outlive the port.
    LinuxLocalPort(Parts parts, SystemLog& log);
    ~LinuxLocalPort() override;

    const std::string& name() const override { return _parts.name; }
    void deliverOnMainQueue() override;
    void setInvalidationCallback(InvalidationCallback callback) override;
    void invalidate() override;
    bool isValid() const override { return _parts.listener.isOpen(); }
    void expectStreamOf(ProcessNumber process) override;
    bool hasLostStream() const override;

  private:
    void acceptWaiting();
    void pauseAccepting();
    void addConnection(FileDescriptor socket);
    bool makeRoom();
    bool carriesStream(const PortConnection& connection) const;
    void noteStreamConnection(const PortConnection& connection);
    PortConnection::Handlers connectionHandlers();
    void removeConnection(PortConnection& connection, std::string_view reason);
    void close();

    Parts _parts;
    SystemLog& _log;
    InvalidationCallback _invalidationCallback;
    SocketNotifier _acceptNotifier;
    std::vector<std::shared_ptr<PortConnection>> _connections;
    bool _isDelivering = false;
    bool _cannotAccept = false;
    std::optional<ProcessNumber> _streamProcess;
    bool _streamProcessConnected = false; // it did at least once
    bool _streamEnded = false;            // a connection that carried it has ended
    QObject _context;                     // queued turns die with it
};

} // namespace ventrik
