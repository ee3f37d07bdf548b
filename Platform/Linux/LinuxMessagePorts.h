#pragma once

#include "Platform/Linux/LinuxLocalPort.h"
#include "Platform/Linux/PortDirectory.h"
#include "Platform/MessagePorts.h"
#include "Platform/SystemLog.h"

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include <sys/types.h>

namespace ventrik
{

/// Message ports on Unix-domain sockets: a file in the runtime directory for each port name. Used
/// on the main thread only, after the QCoreApplication is made. The log must outlive the ports.
class LinuxMessagePorts : public MessagePorts
{
  public:
    /// Peers of the trusted user, this process's own by default, are the trusted senders, and only
    /// what that user serves is connected to.
    LinuxMessagePorts(PortDirectory runtimeDirectory, SystemLog& log,
                      std::optional<uid_t> trustedUser = std::nullopt);

    /// $VENTRIK_RUNTIME_DIR, else $XDG_RUNTIME_DIR/ventrik, else /tmp/ventrik-UID.
    static PortDirectory defaultDirectory() { return PortDirectory::fromEnvironment(); }

    /// Makes the runtime directory where it is missing.
    LocalPortCreation createLocalPort(std::string_view name, PortSenders senders,
                                      LocalPort::DataCallback callback) override;
    std::shared_ptr<RemotePort> createRemotePort(std::string_view name) override;

  private:
    struct PathFault {
        std::string reason; // empty: there is none
        bool nameIsTaken = false;
    };

    LocalPortCreation refuse(std::string reason, bool nameIsTaken = false) const;
    PathFault claimPath(std::string_view name) const;

    PortDirectory _directory;
    SystemLog& _log;
    uid_t _trustedUser;
    std::map<std::string, std::weak_ptr<LinuxLocalPort>, std::less<>> _localPorts;
};

} // namespace ventrik
