#pragma once

#include "Platform/Linux/Socket.h"

#include <string>
#include <string_view>

#include <sys/types.h>

namespace ventrik
{

/// The directory that holds the ports' sockets. It must belong to this user and be his alone:
/// whoever could put files there could pose as a port. One of ours is made so; one that somebody
/// named is refused where others may use it, since closing it to them might be against his will.
class PortDirectory
{
  public:
    enum class Origin {
        Named, ///< by the user; never changed
        Ours,  ///< by our own rule; set to mode 0700
    };

    PortDirectory(std::string path, Origin origin = Origin::Named);

    /// $VENTRIK_RUNTIME_DIR, a named one, else ours: $XDG_RUNTIME_DIR/ventrik where that is an
    /// absolute path, else /tmp/ventrik-UID.
    static PortDirectory fromEnvironment();

    enum class IfMissing { Create, Leave };
    /// One line that says why the directory cannot be used, or nothing when it can. What is made
    /// has mode 0700, missing parents too.
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
    std::string faultOf(int directory) const;

    std::string _path;
    Origin _origin;
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
