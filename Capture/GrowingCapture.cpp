#include "Capture/GrowingCapture.h"

#include <cerrno>
#include <cstdio>
#include <cstring>

#include <fcntl.h>
#include <fmt/format.h>
#include <stdio_ext.h>
#include <sys/stat.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

constexpr mode_t ownerOnly = S_IRUSR | S_IWUSR;

std::FILE* openStream(const std::string& path)
{
    const int flags = GrowingCapture::isDevice(path) ? O_NONBLOCK | O_NOCTTY : O_CREAT | O_EXCL;
    const int descriptor = ::open(path.c_str(), O_WRONLY | O_CLOEXEC | flags, ownerOnly);
    return descriptor < 0 ? nullptr : ::fdopen(descriptor, "w");
}

std::string lineOf(const std::string& path, std::string_view reason)
{
    return fmt::format("{}: {}", path, reason);
}

} // namespace

bool GrowingCapture::isDevice(const std::string& path)
{
    struct stat status {
    };
    return ::stat(path.c_str(), &status) == 0 && S_ISCHR(status.st_mode);
}

std::optional<GrowingCapture>
GrowingCapture::create(const std::string& path, const Technology& technology, std::string& error)
{
    std::FILE* stream = openStream(path);
    if (!stream) {
        error = lineOf(path, std::strerror(errno));
        return std::nullopt;
    }
    // A buffer in which whole records gather: what the stream wrote by itself could end anywhere.
    std::vector<char> buffer(bufferSize);
    std::setvbuf(stream, buffer.data(), _IOFBF, buffer.size());
    std::string reason;
    auto output = PcapOutput::create(stream, technology, reason);
    if (!output) {
        error = lineOf(path, reason);
        return std::nullopt;
    }
    GrowingCapture capture(path, std::move(buffer), std::move(*output));
    capture.addWaiting(PcapOutput::fileHeaderSize);
    if (capture.flush())
        return capture;
    error = capture.error();
    if (!isDevice(path))
        ::unlink(path.c_str()); // it holds nothing
    return std::nullopt;
}

bool GrowingCapture::write(Clock::TimePoint time, ByteView message)
{
    if (!_output.write(time, message))
        return false;
    addWaiting(PcapOutput::recordHeaderSize + message.size());
    return _waitingSize < mostWaiting || flush();
}

bool GrowingCapture::flush()
{
    if (!_output.flush()) {
        cutToWholeRecords();
        return false;
    }
    _flushedSize += std::exchange(_waitingSize, 0);
    _waitingRecords.clear();
    return true;
}

void GrowingCapture::addWaiting(std::size_t size)
{
    _waitingSize += size;
    _waitingRecords.push_back(static_cast<std::uint32_t>(size));
}

// The disk may have taken a part of what waited, and must not take the rest later; nobody promises
// that a stream forgets what it failed to write.
void GrowingCapture::cutToWholeRecords()
{
    __fpurge(_output.stream());
    const int descriptor = ::fileno(_output.stream());
    struct stat status {
    };
    if (::fstat(descriptor, &status) != 0 || !S_ISREG(status.st_mode))
        return;
    std::uint64_t whole = _flushedSize;
    for (const std::uint32_t size : _waitingRecords) {
        if (whole + size > static_cast<std::uint64_t>(status.st_size))
            break;
        whole += size;
    }
    if (::ftruncate(descriptor, static_cast<off_t>(whole)) != 0)
        errno = 0; // it is as it is; why it failed is known already
}

std::string GrowingCapture::error() const
{
    return lineOf(_path, std::strerror(_output.error()));
}

} // namespace ventrik
