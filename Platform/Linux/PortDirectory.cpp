#include "Platform/Linux/PortDirectory.h"

#include "Files/PrivateFile.h"

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

PortDirectory::PortDirectory(std::string path, Origin origin)
    : _path(std::move(path)), _origin(origin)
{
    // With a slash at its end a link would be followed.
    while (_path.size() > 1 && _path.ends_with('/'))
        _path.pop_back();
}

PortDirectory PortDirectory::fromEnvironment()
{
    if (auto chosen = environment("VENTRIK_RUNTIME_DIR"); !chosen.empty())
        return {std::move(chosen), Origin::Named};
    if (const auto runtime = environment("XDG_RUNTIME_DIR"); runtime.starts_with('/'))
        return {runtime + "/ventrik", Origin::Ours};
    return {fmt::format("/tmp/ventrik-{}", geteuid()), Origin::Ours};
}

std::string PortDirectory::prepare(IfMissing ifMissing) const
{
    if (ifMissing == IfMissing::Create)
        makePrivateDirectories(_path); // opening it tells
    // The checks are made on what was opened: nobody can swap it in between.
    const FileDescriptor directory(
        ::open(_path.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
    if (directory.isOpen())
        return faultOf(directory.get());
    const int error = errno;
    std::error_code ignored;
    if (std::filesystem::is_symlink(_path, ignored))
        return fmt::format("runtime directory {} is a symbolic link, which is not followed", _path);
    return fmt::format("runtime directory {} cannot be used: {}", _path, std::strerror(error));
}

std::string PortDirectory::faultOf(int directory) const
{
    struct stat status {
    };
    if (::fstat(directory, &status) != 0)
        return fmt::format("runtime directory {} cannot be used: {}", _path, std::strerror(errno));
    if (status.st_uid != geteuid())
        return fmt::format("runtime directory {} belongs to user {}, not to user {}", _path,
                           status.st_uid, geteuid());
    const mode_t mode = status.st_mode & 07777;
    if (_origin == Origin::Named && (mode & (S_IRWXG | S_IRWXO)) != 0)
        return fmt::format("runtime directory {} may be used by others (mode {:04o}, not 0700)",
                           _path, mode);
    if (_origin == Origin::Ours && mode != S_IRWXU && ::fchmod(directory, S_IRWXU) != 0)
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
