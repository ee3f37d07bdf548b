#include "Platform/Linux/PortDirectory.h"

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <thread>
#include <utility>

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

std::string environment(const char* name)
{
    const char* value = std::getenv(name);
    return value == nullptr ? std::string() : value;
}

} // namespace

PortDirectory::PortDirectory(std::string path) : _path(std::move(path)) {}

std::string PortDirectory::defaultPath()
{
    if (auto chosen = environment("VENTRIK_RUNTIME_DIR"); !chosen.empty())
        return chosen;
    if (const auto runtime = environment("XDG_RUNTIME_DIR"); !runtime.empty())
        return runtime + "/ventrik";
    return fmt::format("/tmp/ventrik-{}", geteuid());
}

std::string PortDirectory::prepare(IfMissing ifMissing) const
{
    if (ifMissing == IfMissing::Create) {
        std::error_code ignored; // opening it tells
        std::filesystem::create_directories(std::filesystem::path(_path).parent_path(), ignored);
        ::mkdir(_path.c_str(), S_IRWXU);
    }
    // The checks are made on what was opened: nobody can swap it in between.
    const FileDescriptor directory(
        ::open(_path.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
    struct stat status {
    };
    if (!directory.isOpen() || ::fstat(directory.get(), &status) != 0)
        return fmt::format("runtime directory {} cannot be used: {}", _path, std::strerror(errno));
    if (status.st_uid != geteuid())
        return fmt::format("runtime directory {} belongs to user {}, not to user {}", _path,
                           status.st_uid, geteuid());
    if ((status.st_mode & 07777) != S_IRWXU && ::fchmod(directory.get(), S_IRWXU) != 0)
        return fmt::format("runtime directory {} cannot be made private: {}", _path,
                           std::strerror(errno));
    return {};
}

std::string PortDirectory::nameFault(std::string_view name) const
{
    if (name.empty() || name.front() == '.' || name.find('/') != name.npos ||
        name.find('\0') != name.npos)
        return fmt::format("port name \"{}\" cannot be a file name", name);
    if (socketPath(name).size() > socketPathMaximumLength())
        return fmt::format("port path {} is longer than {} bytes", socketPath(name),
                           socketPathMaximumLength());
    return {};
}

bool PortDirectory::exists() const
{
    struct stat status {
    };
    return ::lstat(_path.c_str(), &status) == 0;
}

std::string PortDirectory::socketPath(std::string_view name) const
{
    return fmt::format("{}/{}", _path, name);
}

FileDescriptor PortDirectory::lock() const
{
    FileDescriptor file(::open(socketPath(".lock").c_str(),
                               O_RDWR | O_CREAT | O_NOFOLLOW | O_CLOEXEC, S_IRUSR | S_IWUSR));
    const Deadline deadline(std::chrono::seconds(1));
    while (file.isOpen() && ::flock(file.get(), LOCK_EX | LOCK_NB) != 0) {
        if ((errno != EWOULDBLOCK && errno != EINTR) || deadline.hasPassed())
            return FileDescriptor();
        std::this_thread::sleep_for(std::chrono::milliseconds(2));
    }
    return file;
}

SocketFile::SocketFile(std::string path) : _path(std::move(path))
{
    struct stat status {
    };
    if (::lstat(_path.c_str(), &status) == 0) {
        _device = status.st_dev;
        _inode = status.st_ino;
    }
}

void SocketFile::removeIfOwn() const
{
    struct stat status {
    };
    if (_inode != 0 && ::lstat(_path.c_str(), &status) == 0 && status.st_dev == _device &&
        status.st_ino == _inode)
        ::unlink(_path.c_str());
}

} // namespace ventrik
