#pragma once

#include "Platform/Linux/Socket.h"

#include <string>
#include <string_view>

#include <sys/types.h>

namespace ventrik
{

/// The directory that holds the ports' sockets. It must belong to this user and is kept at mode
/// 0700: whoever could put files there could pose as a port.
class PortDirectory
{
  public:
    explicit PortDirectory(std::string path);

    /// The directory that the environment names, or the user's own one; never empty.
    static std::string defaultPath();

    enum class IfMissing { Create, Leave };
    /// One line that says why the directory cannot be used, or nothing when it can.
    std::string prepare(IfMissing ifMissing) const;
    /// One line that says why no port can have that name, or nothing when one can.
    std::string nameFault(std::string_view name) const;

    bool exists() const;
    const std::string& path() const { return _path; }
    std::string socketPath(std::string_view name) const;

    /// Keeps other processes from creating ports while the descriptor is open; not open when it
    /// stayed locked for a second.
    FileDescriptor lock() const;

  private:
    std::string _path;
};

/// A socket file and its identity, so that nobody else's is removed in its place.
class SocketFile
{
  public:
    SocketFile() = default;
    explicit SocketFile(std::string path);
    void removeIfOwn() const;

  private:
    std::string _path;
    dev_t _device = 0;
    ino_t _inode = 0;
};

} // namespace ventrik
