#include "Capture/ByteSource.h"

#include <algorithm>
#include <cerrno>
#include <cstring>

#include <archive.h>
#include <archive_entry.h>
#include <fcntl.h>
#include <fmt/format.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

constexpr std::size_t readSize = 65536;

struct CloseArchive {
    void operator()(archive* handle) const { archive_read_free(handle); }
};
struct FileDescriptor {
    explicit FileDescriptor(int number) : number(number) {}
    ~FileDescriptor()
    {
        if (number > STDIN_FILENO)
            close(number);
    }
    FileDescriptor(const FileDescriptor&) = delete;
    FileDescriptor& operator=(const FileDescriptor&) = delete;
    const int number;
};

// The library reads plain and compressed files alike: a file is a filter's data without an archive.
struct OpenFile {
    std::string name;
    std::shared_ptr<FileDescriptor> descriptor;
    std::shared_ptr<archive> handle;
    bool isEmpty = false;

    std::string reason() const
    {
        const char* text = archive_error_string(handle.get());
        return fmt::format("{}: {}", name,
                           text ? text : std::strerror(archive_errno(handle.get())));
    }
    std::size_t read(std::span<std::uint8_t> room, std::string& error) const
    {
        if (isEmpty)
            return 0;
        const la_ssize_t count = archive_read_data(handle.get(), room.data(), room.size());
        if (count < 0) {
            error = reason();
            return 0;
        }
        return static_cast<std::size_t>(count);
    }
};

std::shared_ptr<archive> newArchive()
{
    std::shared_ptr<archive> handle(archive_read_new(), CloseArchive());
    archive_read_support_format_raw(handle.get());
    archive_read_support_format_empty(handle.get());
    archive_read_support_filter_gzip(handle.get());
    archive_read_support_filter_bzip2(handle.get());
    archive_read_support_filter_xz(handle.get());
    archive_read_support_filter_zstd(handle.get());
    return handle;
}

} // namespace

std::unique_ptr<ByteSource> ByteSource::open(const std::string& path, std::string& error)
{
    OpenFile file{path == "-" ? "standard input" : path, nullptr, newArchive()};
    const int number = path == "-" ? STDIN_FILENO : ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
    if (number < 0) {
        error = fmt::format("{}: {}", file.name, std::strerror(errno));
        return nullptr;
    }
    file.descriptor = std::make_shared<FileDescriptor>(number);
    archive_entry* entry = nullptr;
    if (archive_read_open_fd(file.handle.get(), number, readSize) != ARCHIVE_OK) {
        error = file.reason();
        return nullptr;
    }
    const int header = archive_read_next_header(file.handle.get(), &entry);
    file.isEmpty = header == ARCHIVE_EOF;
    if (header != ARCHIVE_OK && header != ARCHIVE_EOF && header != ARCHIVE_WARN) {
        error = file.reason();
        return nullptr;
    }
    return std::make_unique<ByteSource>([file](std::span<std::uint8_t> room, std::string& reason) {
        return file.read(room, reason);
    });
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

void ByteSource::skip(std::size_t size)
{
    const std::size_t taken = std::min(size, _end - _start);
    _start += taken;
    _offset += taken;
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
