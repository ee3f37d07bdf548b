#pragma once

#include "Platform/Linux/PortConnection.h"
#include "Platform/Linux/PortDirectory.h"
#include "Platform/MessagePorts.h"
#include "Platform/SystemLog.h"

#include <QObject>

#include <memory>
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
    };

    /// The log must outlive the port.
    LinuxLocalPort(Parts parts, SystemLog& log);
    ~LinuxLocalPort() override;

    const std::string& name() const override { return _parts.name; }
    void deliverOnMainQueue() override;
    void setInvalidationCallback(InvalidationCallback callback) override;
    void invalidate() override;
    bool isValid() const override { return _parts.listener.isOpen(); }

  private:
    void acceptWaiting();
    void pauseAccepting();
    void addConnection(FileDescriptor socket);
    PortConnection::Handlers connectionHandlers();
    void removeConnection(PortConnection& connection, std::string_view reason);
    void close();

    Parts _parts;
    SystemLog& _log;
    InvalidationCallback _invalidationCallback;
    SocketNotifier _acceptNotifier;
    std::vector<std::shared_ptr<PortConnection>> _connections;
    bool _isDelivering = false;
    QObject _context; // queued turns die with it
};

} // namespace ventrik
