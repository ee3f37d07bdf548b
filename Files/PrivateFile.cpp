#include "Files/PrivateFile.h"

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <utility>

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

constexpr mode_t ownerOnly = S_IRUSR | S_IWUSR;
constexpr mode_t readByAll = ownerOnly | S_IRGRP | S_IROTH;
constexpr std::string_view temporaryPattern = ".ventrik-XXXXXX";

std::string lineOf(const std::string& path, int error)
{
    return fmt::format("{}: {}", path, std::strerror(error));
}

std::string directoryOf(const std::string& path)
{
    const auto slash = path.rfind('/');
    if (slash == std::string::npos)
        return ".";
    return slash == 0 ? "/" : path.substr(0, slash);
}

// What has the name and must not make way for a file: the errno for it, or 0.
int obstacleAt(const std::string& path)
{
    if (path.empty() || path.ends_with('/'))
        return path.empty() ? ENOENT : EISDIR;
    struct stat status {
    };
    if (::stat(path.c_str(), &status) != 0)
        return 0; // nothing, or a link that leads nowhere
    if (S_ISDIR(status.st_mode))
        return EISDIR;
    const bool isDevice = S_ISCHR(status.st_mode) || S_ISBLK(status.st_mode);
    if (isDevice)
        return EINVAL;
    // A link to a pipe is one of the system's own, as /dev/stdout is.
    const bool isOtherThanFile = !S_ISREG(status.st_mode);
    if (isOtherThanFile && ::lstat(path.c_str(), &status) == 0 && S_ISLNK(status.st_mode))
        return EINVAL;
    return 0;
}

// Some file systems have nothing to flush.
bool flushToDisk(int descriptor)
{
    return ::fsync(descriptor) == 0 || errno == EINVAL || errno == ENOTSUP;
}

} // namespace

std::optional<PrivateFile> PrivateFile::create(const std::string& path, std::string& error)
{
    return create(path, Kind::Private, error);
}

std::optional<PrivateFile> PrivateFile::createForAll(const std::string& path, std::string& error)
{
    return create(path, Kind::ForAll, error);
}

std::optional<PrivateFile> PrivateFile::create(const std::string& path, Kind kind,
                                               std::string& error)
{
    PrivateFile file(path, kind);
    if (const int obstacle = obstacleAt(path); obstacle == EINVAL)
        error = fmt::format("{}: is no ordinary file", path);
    else if (obstacle != 0)
        error = lineOf(path, obstacle);
    else if (!file.open())
        error = lineOf(path, errno);
    else
        return file;
    return std::nullopt;
}

bool PrivateFile::open()
{
    const std::string directory = directoryOf(_path);
    if (!openNameless(directory) && !openNamed(directory))
        return false;
    return _kind == Kind::Private || ::fchmod(::fileno(stream()), readByAll) == 0;
}

// A file without a name leaves nothing behind, however the process ends.
bool PrivateFile::openNameless(const std::string& directory)
{
    const int descriptor = ::open(directory.c_str(), O_TMPFILE | O_WRONLY | O_CLOEXEC, ownerOnly);
    _stream.reset(descriptor < 0 ? nullptr : ::fdopen(descriptor, "w"));
    return _stream != nullptr;
}

bool PrivateFile::openNamed(const std::string& directory)
{
    std::string name = fmt::format("{}/{}", directory, temporaryPattern);
    const int descriptor = ::mkostemp(name.data(), O_CLOEXEC);
    if (descriptor < 0)
        return false;
    _temporaryName = std::move(name);
    _stream.reset(::fdopen(descriptor, "w"));
    return _stream != nullptr;
}

PrivateFile::~PrivateFile()
{
    discard();
}

PrivateFile::PrivateFile(PrivateFile&& other) noexcept
    : _path(std::move(other._path)),
      _kind(other._kind),
      _temporaryName(std::exchange(other._temporaryName, {})),
      _writeError(other._writeError),
      _stream(std::move(other._stream))
{
}

PrivateFile& PrivateFile::operator=(PrivateFile&& other) noexcept
{
    discard();
    _path = std::move(other._path);
    _kind = other._kind;
    _temporaryName = std::exchange(other._temporaryName, {});
    _writeError = other._writeError;
    _stream = std::move(other._stream);
    return *this;
}

void PrivateFile::write(std::string_view text)
{
    if (std::fwrite(text.data(), 1, text.size(), stream()) != text.size() && _writeError == 0)
        _writeError = errno;
}

bool PrivateFile::commit(std::string& error)
{
    if (bringToDisk() && takeName())
        return true;
    error = lineOf(_path, errno);
    discard();
    return false;
}

bool PrivateFile::bringToDisk()
{
    const bool isFlushed = std::fflush(stream()) == 0;
    const int error = isFlushed ? EIO : errno;
    if (isFlushed && _writeError == 0 && std::ferror(stream()) == 0)
        return flush(::fileno(stream()));
    errno = _writeError != 0 ? _writeError : error;
    return false;
}

bool PrivateFile::flush(int descriptor) const
{
    return _kind == Kind::ForAll || flushToDisk(descriptor);
}

bool PrivateFile::takeName()
{
    const std::string directory = directoryOf(_path);
    // A link cannot take the place of what is there; a rename can.
    if (_temporaryName.empty()) {
        std::string name = fmt::format("{}/{}", directory, temporaryPattern);
        const std::string nameless = fmt::format("/proc/self/fd/{}", ::fileno(stream()));
        const int placeholder = ::mkostemp(name.data(), O_CLOEXEC);
        if (placeholder < 0)
            return false;
        ::close(placeholder);
        ::unlink(name.c_str());
        if (::linkat(AT_FDCWD, nameless.c_str(), AT_FDCWD, name.c_str(), AT_SYMLINK_FOLLOW) != 0)
            return false;
        _temporaryName = std::move(name);
    }
    if (::rename(_temporaryName.c_str(), _path.c_str()) != 0)
        return false;
    _temporaryName.clear();
    const int opened = ::open(directory.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (opened >= 0) {
        flush(opened); // the name as well; the file is there already either way
        ::close(opened);
    }
    return true;
}

void PrivateFile::discard()
{
    const int error = errno;
    _stream.reset();
    if (!_temporaryName.empty())
        ::unlink(std::exchange(_temporaryName, {}).c_str());
    errno = error;
}

bool makePrivateDirectories(const std::string& path)
{
    for (auto end = path.find('/', 1); end != std::string::npos; end = path.find('/', end + 1))
        ::mkdir(path.substr(0, end).c_str(), S_IRWXU);
    if (::mkdir(path.c_str(), S_IRWXU) == 0)
        return true;
    const int error = errno;
    struct stat status {
    };
    if (::stat(path.c_str(), &status) == 0 && S_ISDIR(status.st_mode))
        return true;
    errno = error;
    return false;
}

} // namespace ventrik
