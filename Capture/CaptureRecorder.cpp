#include "Capture/CaptureRecorder.h"

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <cstring>
#include <filesystem>
#include <utility>

#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

namespace fs = std::filesystem;

std::string numberedPath(const fs::path& path, std::uint64_t number)
{
    fs::path result = path;
    result.replace_filename(
        fmt::format("{}-{:04}{}", path.stem().string(), number, path.extension().string()));
    return result;
}

// The number in the name of a file that was numbered by this path; 0 in any other.
std::uint64_t numberIn(const std::string& name, const fs::path& path)
{
    const std::string before = path.stem().string() + "-";
    const std::string after = path.extension().string();
    if (!name.starts_with(before) || !name.ends_with(after) ||
        name.size() <= before.size() + after.size())
        return 0;
    const char* end = name.data() + name.size() - after.size();
    std::uint64_t number = 0;
    const auto [stop, error] = std::from_chars(name.data() + before.size(), end, number);
    return stop == end && error == std::errc() ? number : 0;
}

fs::path directoryOf(const fs::path& path)
{
    return path.has_parent_path() ? path.parent_path() : fs::path(".");
}

std::uint64_t highestNumber(const fs::path& path)
{
    std::uint64_t highest = 0;
    std::error_code error;
    for (fs::directory_iterator entry(directoryOf(path), error), end; !error && entry != end;
         entry.increment(error))
        highest = std::max(highest, numberIn(entry->path().filename(), path));
    return highest;
}

bool isThere(const std::string& path)
{
    struct stat status {
    };
    return ::lstat(path.c_str(), &status) == 0;
}

} // namespace

std::string CaptureRecorder::faultOf(const RecordingOptions& options)
{
    const std::string& path = options.path;
    if (GrowingCapture::isDevice(path) && !options.rotates())
        return {};
    if (!fs::path(path).has_filename())
        return fmt::format("{}: {}", path, std::strerror(path.empty() ? ENOENT : EISDIR));
    if (!options.rotates() && isThere(path))
        return fmt::format("{}: is there already, and a recording overwrites nothing", path);
    if (::access(directoryOf(path).c_str(), W_OK | X_OK) != 0)
        return fmt::format("{}: {}", path, std::strerror(errno));
    return {};
}

CaptureRecorder::CaptureRecorder(MainQueue& queue, const Clock& clock, RecordingOptions options,
                                 FailureCallback tellFailure)
    : _queue(queue),
      _clock(clock),
      _options(std::move(options)),
      _tellFailure(std::move(tellFailure))
{
}

void CaptureRecorder::setTechnology(const std::optional<Technology>& technology)
{
    // A channel that is lost for a while comes back with the same one.
    if (technology && _technology && technology->identifier != _technology->identifier)
        closeFile();
    _isPaused = !technology;
    if (technology)
        _technology = technology;
}

void CaptureRecorder::record(ByteView message)
{
    if (_hasFailed || _isPaused)
        return;
    if (message.size() > PcapOutput::maximumMessageSize)
        return tellTooLarge(message.size());
    if (_file && isFileFull(message.size()))
        closeFile();
    if (!_file && !_hasFailed)
        openFile();
    if (_hasFailed)
        return;
    if (_file->write(_clock.now(), message))
        flushLater();
    else
        fail(_file->error());
}

bool CaptureRecorder::isFileFull(std::size_t messageSize) const
{
    const bool isLarge =
        _options.rotationSize &&
        _file->size() + PcapOutput::recordHeaderSize + messageSize > *_options.rotationSize;
    const bool isOld = _options.rotationTime && _clock.now() - _fileStart >= *_options.rotationTime;
    return (isLarge && _file->size() > PcapOutput::fileHeaderSize) || isOld;
}

void CaptureRecorder::openFile()
{
    std::string error;
    if (auto file = GrowingCapture::create(nextPath(), *_technology, error))
        _file.emplace(std::move(*file));
    else
        fail(error);
    _fileStart = _clock.now();
}

std::string CaptureRecorder::nextPath()
{
    const bool isFirst = _number == 0;
    _number = std::max(_number, highestNumber(_options.path)) + 1;
    const bool hasNumber = _options.rotates() || !isFirst;
    return hasNumber ? numberedPath(_options.path, _number) : _options.path;
}

void CaptureRecorder::closeFile()
{
    if (!_file)
        return;
    flush();
    _file.reset();
}

void CaptureRecorder::flushLater()
{
    if (std::exchange(_willFlush, true))
        return;
    _queue.after(flushInterval, [this, alive = std::weak_ptr(_alive)] {
        if (!alive.lock())
            return;
        _willFlush = false;
        flush();
    });
}

void CaptureRecorder::flush()
{
    if (_file && !_file->flush())
        fail(_file->error());
}

void CaptureRecorder::fail(const std::string& reason)
{
    _hasFailed = true;
    _tellFailure(fmt::format("the recording ends: {}", reason));
    _file.reset();
}

void CaptureRecorder::tellTooLarge(std::size_t size)
{
    if (!std::exchange(_hasLeftOut, true))
        _tellFailure(
            fmt::format("{}: a message of {} bytes, and any such, is too large for a capture and "
                        "is left out",
                        _options.path, size));
}

} // namespace ventrik
