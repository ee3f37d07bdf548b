#include "Capture/ByteSource.h"

#include <algorithm>
#include <cerrno>
#include <cstring>

#include <archive.h>
#include <archive_entry.h>
#include <fcntl.h>
#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

constexpr std::size_t readSize = 65536;

/// A file, or standard input, behind the library that tells compressed ones by content: a file is a
/// filter's data without an archive. A read that a signal interrupts is an error.
class OpenFile
{
  public:
    explicit OpenFile(std::string name) : _name(std::move(name)), _handle(archive_read_new()) {}
    ~OpenFile()
    {
        archive_read_free(_handle);
        if (_descriptor > STDIN_FILENO)
            close(_descriptor);
    }
    OpenFile(const OpenFile&) = delete;
    OpenFile& operator=(const OpenFile&) = delete;

    bool open(const std::string& path, std::string& error);
    std::size_t read(std::span<std::uint8_t> room, std::string& error);
    /// Of a file that is not compressed and that can be read from anywhere; -1 of others.
    int plainFile() const;

  private:
    static la_ssize_t readBlock(archive* handle, void* self, const void** block);
    std::string reason() const;

    std::string _name;
    archive* _handle;
    int _descriptor = -1;
    Bytes _raw = Bytes(readSize);
    ByteView _block; // what the library has given and is not taken yet
    bool _isEmpty = false;
};

bool OpenFile::open(const std::string& path, std::string& error)
{
    _descriptor = path == "-" ? STDIN_FILENO : ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
    if (_descriptor < 0) {
        error = fmt::format("{}: {}", _name, std::strerror(errno));
        return false;
    }
    archive_read_support_format_raw(_handle);
    archive_read_support_format_empty(_handle);
    archive_read_support_filter_gzip(_handle);
    archive_read_support_filter_bzip2(_handle);
    archive_read_support_filter_xz(_handle);
    archive_read_support_filter_zstd(_handle);
    archive_entry* entry = nullptr;
    int result = archive_read_open(_handle, this, nullptr, readBlock, nullptr);
    if (result == ARCHIVE_OK)
        result = archive_read_next_header(_handle, &entry);
    _isEmpty = result == ARCHIVE_EOF;
    if (result < ARCHIVE_WARN) {
        error = reason();
        return false;
    }
    return true;
}

la_ssize_t OpenFile::readBlock(archive* handle, void* self, const void** block)
{
    auto& file = *static_cast<OpenFile*>(self);
    const ssize_t count = ::read(file._descriptor, file._raw.data(), file._raw.size());
    *block = file._raw.data();
    if (count < 0)
        archive_set_error(handle, errno, "%s", std::strerror(errno));
    return count;
}

std::size_t OpenFile::read(std::span<std::uint8_t> room, std::string& error)
{
    while (_block.empty() && !_isEmpty) {
        const void* data = nullptr;
        std::size_t size = 0;
        la_int64_t offset = 0;
        const int result = archive_read_data_block(_handle, &data, &size, &offset);
        _isEmpty = result != ARCHIVE_OK;
        if (result < ARCHIVE_WARN)
            error = reason();
        if (!_isEmpty)
            _block = {static_cast<const std::uint8_t*>(data), size};
    }
    const std::size_t count = std::min(room.size(), _block.size());
    std::copy_n(_block.begin(), count, room.begin());
    _block = _block.subspan(count);
    return count;
}

int OpenFile::plainFile() const
{
    struct stat status {
    };
    const bool isFile = ::fstat(_descriptor, &status) == 0 && S_ISREG(status.st_mode);
    // The last filter is the one that passes on what it gets.
    const bool isPlain = archive_filter_count(_handle) == 1;
    return isFile && isPlain && _descriptor != STDIN_FILENO ? _descriptor : -1;
}

std::string OpenFile::reason() const
{
    const char* text = archive_error_string(_handle);
    return fmt::format("{}: {}", _name, text ? text : "it cannot be read");
}

} // namespace

std::unique_ptr<ByteSource> ByteSource::open(const std::string& path, std::string& error)
{
    const auto file = std::make_shared<OpenFile>(path == "-" ? "standard input" : path);
    if (!file->open(path, error))
        return nullptr;
    auto source =
        std::make_unique<ByteSource>([file](std::span<std::uint8_t> room, std::string& reason) {
            return file->read(room, reason);
        });
    source->_plainFile = file->plainFile();
    return source;
}

ByteSource::ByteSource(Bytes bytes, std::size_t blockSize)
    : ByteSource([bytes = std::move(bytes), blockSize,
                  position = std::size_t{0}](std::span<std::uint8_t> room, std::string&) mutable {
          const std::size_t count = std::min({room.size(), blockSize, bytes.size() - position});
          std::copy_n(bytes.begin() + static_cast<std::ptrdiff_t>(position), count, room.begin());
          position += count;
          return count;
      })
{
}

ByteView ByteSource::peek(std::size_t size)
{
    const std::size_t wanted = std::min(size, maximumPeek);
    if (_end - _start < wanted)
        fill(wanted);
    return ByteView(_buffer).subspan(_start, std::min(wanted, _end - _start));
}

ByteView ByteSource::peekSome(std::size_t size)
{
    if (_start == _end)
        fill(1);
    return ByteView(_buffer).subspan(_start, std::min(size, _end - _start));
}

std::size_t ByteSource::read(std::span<std::uint8_t> room)
{
    if (_start < _end) {
        const ByteView bytes = peekSome(room.size());
        std::copy(bytes.begin(), bytes.end(), room.begin());
        skip(bytes.size());
        return bytes.size();
    }
    if (_isAtEnd || room.empty())
        return 0;
    const std::size_t count = _read(room, _error);
    _isAtEnd = count == 0;
    _offset += count;
    return count;
}

void ByteSource::skip(std::size_t size)
{
    const std::size_t taken = std::min(size, _end - _start);
    _start += taken;
    _offset += taken;
}

std::FILE* ByteSource::stream()
{
    if (std::FILE* file = fileItself()) {
        // By itself a stream asks for a page at a time.
        _streamBuffer.resize(readSize);
        std::setvbuf(file, _streamBuffer.data(), _IOFBF, _streamBuffer.size());
        return file;
    }
    const auto read = [](void* self, char* room, std::size_t size) {
        auto& source = *static_cast<ByteSource*>(self);
        const std::size_t count = source.read({reinterpret_cast<std::uint8_t*>(room), size});
        return count == 0 && !source.error().empty() ? -1 : static_cast<ssize_t>(count);
    };
    return fopencookie(this, "rb", {read, nullptr, nullptr, nullptr});
}

std::FILE* ByteSource::fileItself() const
{
    if (_plainFile < 0)
        return nullptr;
    const int descriptor = fcntl(_plainFile, F_DUPFD_CLOEXEC, 0);
    if (descriptor < 0)
        return nullptr;
    const auto start = static_cast<off_t>(_offset);
    std::FILE* file =
        lseek(descriptor, start, SEEK_SET) == start ? fdopen(descriptor, "rb") : nullptr;
    if (!file)
        close(descriptor);
    return file;
}

// What is left moves to the front, and the buffer stays as large as the largest that was asked for.
void ByteSource::fill(std::size_t size)
{
    std::copy(_buffer.begin() + static_cast<std::ptrdiff_t>(_start),
              _buffer.begin() + static_cast<std::ptrdiff_t>(_end), _buffer.begin());
    _end -= _start;
    _start = 0;
    if (_buffer.size() < size + readSize)
        _buffer.resize(size + readSize);
    while (_end < size && !_isAtEnd) {
        const std::size_t count = _read(std::span(_buffer).subspan(_end), _error);
        _end += count;
        _isAtEnd = count == 0;
    }
}

} // namespace ventrik
