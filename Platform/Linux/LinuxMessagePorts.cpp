#include "Platform/Linux/LinuxMessagePorts.h"

#include "Platform/Linux/LinuxRemotePort.h"

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <utility>

#include <fmt/format.h>
#include <unistd.h>

namespace ventrik
{

LinuxMessagePorts::LinuxMessagePorts(PortDirectory runtimeDirectory, SystemLog& log,
                                     std::optional<uid_t> trustedUser)
    : _directory(std::move(runtimeDirectory)),
      _log(log),
      _trustedUser(trustedUser.value_or(geteuid()))
{
}

LocalPortCreation LinuxMessagePorts::createLocalPort(std::string_view name, PortSenders senders,
                                                     LocalPort::DataCallback callback)
{
    if (const auto found = _localPorts.find(name); found != _localPorts.end())
        if (auto existing = found->second.lock(); existing != nullptr && existing->isValid())
            return {std::move(existing), true, {}};
    if (auto fault = _directory.nameFault(name); !fault.empty())
        return refuse(std::move(fault));
    if (auto fault = _directory.prepare(PortDirectory::IfMissing::Create); !fault.empty())
        return refuse(std::move(fault));
    // Between finding a stale file and replacing it nobody else may do the same.
    const FileDescriptor lock = _directory.lock();
    if (!lock.isOpen())
        return refuse(fmt::format("runtime directory {} cannot be locked", _directory.path()));
    if (auto fault = claimPath(name); !fault.reason.empty())
        return refuse(std::move(fault.reason), fault.nameIsTaken);
    const std::string path = _directory.socketPath(name);
    FileDescriptor listener = listenSocket(path);
    if (!listener.isOpen())
        return refuse(fmt::format("port {} cannot listen: {}", path, std::strerror(errno)));
    auto port = std::make_shared<LinuxLocalPort>(
        LinuxLocalPort::Parts{std::string(name), std::move(listener), SocketFile(path), senders,
                              _trustedUser, std::move(callback)},
        _log);
    _localPorts[std::string(name)] = port;
    return {std::move(port), false, {}};
}

// The viewer's own line says only that there is no port; this one says why.
LocalPortCreation LinuxMessagePorts::refuse(std::string reason, bool nameIsTaken) const
{
    _log.error("{}", reason);
    return {nullptr, false, std::move(reason), nameIsTaken};
}

// Frees the path of a file that a crash left; one line that says why, when that cannot be done.
LinuxMessagePorts::PathFault LinuxMessagePorts::claimPath(std::string_view name) const
{
    namespace fs = std::filesystem;
    const std::string path = _directory.socketPath(name);
    std::error_code error;
    const auto status = fs::symlink_status(path, error);
    if (!fs::exists(status))
        return {};
    if (!fs::is_socket(status))
        return {fmt::format("port {} cannot be made: something else than a socket is there", path)};
    const Connecting probe = connectSocket(path);
    if (probe.status == ConnectStatus::Connected || probe.status == ConnectStatus::Busy)
        return {fmt::format("port {} is in use by another process", name), true};
    if (probe.status == ConnectStatus::Failed)
        return {fmt::format("port {} cannot be checked: {}", path, std::strerror(probe.error))};
    if (!fs::remove(path, error))
        return {fmt::format("stale port {} cannot be removed: {}", path, error.message())};
    return {};
}

std::shared_ptr<RemotePort> LinuxMessagePorts::createRemotePort(std::string_view name)
{
    if (!_directory.exists() || !_directory.nameFault(name).empty())
        return nullptr;
    if (const auto fault = _directory.prepare(PortDirectory::IfMissing::Leave); !fault.empty()) {
        _log.error("port {} is not used: {}", name, fault);
        return nullptr;
    }
    Connecting connecting = connectSocket(_directory.socketPath(name));
    if (connecting.status != ConnectStatus::Connected)
        return nullptr;
    const auto peer = peerOf(connecting.socket.get());
    if (!peer || peer->user != _trustedUser) {
        _log.error("port {} is not used: it belongs to user {}, not to user {}", name,
                   peer ? std::to_string(peer->user) : "unknown", _trustedUser);
        return nullptr;
    }
    return std::make_shared<LinuxRemotePort>(std::string(name), std::move(connecting.socket));
}

} // namespace ventrik
