#pragma once

#include "Capture/PcapOutput.h"

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace ventrik
{

/// A capture that is written in place, so that it can be read while it grows and is still there
/// when the program is killed: always whole records, all but what waits for the next `flush`. Its
/// mode is 0600.
class GrowingCapture
{
  public:
    /// One that is written as it is, and neither made nor cut.
    static bool isDevice(const std::string& path);
    /// Makes the file; one that is there is refused, but for a character device. On failure `error`
    /// says why in one line.
    static std::optional<GrowingCapture> create(const std::string& path,
                                                const Technology& technology, std::string& error);
    GrowingCapture(GrowingCapture&&) = default;
    GrowingCapture& operator=(GrowingCapture&&) = delete; // the stream needs its buffer to its end

    /// Both are false once something could not be written, which `error` explains. The file then
    /// ends with the last record that is whole, and nothing more is written.
    bool write(Clock::TimePoint time, ByteView message);
    bool flush();
    std::string error() const;

    const std::string& path() const { return _path; }
    /// In bytes, with what is not flushed yet.
    std::uint64_t size() const { return _flushedSize + _waitingSize; }

  private:
    // It holds what waits, a message more, and the file's header.
    static constexpr std::size_t mostWaiting = 65536;
    static constexpr std::size_t bufferSize = mostWaiting + PcapOutput::maximumMessageSize + 4096;

    GrowingCapture(std::string path, std::vector<char> buffer, PcapOutput output)
        : _path(std::move(path)), _buffer(std::move(buffer)), _output(std::move(output))
    {
    }
    void addWaiting(std::size_t size);
    void cutToWholeRecords();

    std::string _path;
    std::vector<char> _buffer; // the stream's
    PcapOutput _output;
    std::uint64_t _flushedSize = 0;
    std::uint64_t _waitingSize = 0;
    std::vector<std::uint32_t> _waitingRecords; // their sizes; the file's header is the first
};

} // namespace ventrik
