#pragma once

#include "Capture/GrowingCapture.h"
#include "Platform/MainQueue.h"

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>

namespace ventrik
{

/// Where a log channel's messages are recorded, and when a new file begins.
struct RecordingOptions {
    std::string path;
    std::optional<std::uint64_t> rotationSize;            ///< in bytes
    std::optional<std::chrono::nanoseconds> rotationTime; ///< from a file's first message

    bool rotates() const { return rotationSize || rotationTime; }
};

/// Records messages, with the times at which they came, while the program runs: the file can be
/// read meanwhile, and a program that is killed loses what came in its last second.
///
/// No file is overwritten. The first one has the name that was given, which must be free. Each
/// further one, for a rotation or another technology, has a number before its extension, the next
/// above those that are there; with a rotation the first one has as well. What cannot be written
/// ends the recording, and is told once.
class CaptureRecorder
{
  public:
    static constexpr std::chrono::seconds flushInterval{1};
    using FailureCallback = std::function<void(const std::string& line)>;

    /// Why nothing can be recorded there, in one line; empty when it can.
    static std::string faultOf(const RecordingOptions& options);

    /// The queue and the clock outlive this.
    CaptureRecorder(MainQueue& queue, const Clock& clock, RecordingOptions options,
                    FailureCallback tellFailure);
    /// What waits goes into the file.
    ~CaptureRecorder() { closeFile(); }
    CaptureRecorder(const CaptureRecorder&) = delete;
    CaptureRecorder& operator=(const CaptureRecorder&) = delete;

    /// Of the messages that come from then on. Those of no technology are not recorded.
    void setTechnology(const std::optional<Technology>& technology);
    void record(ByteView message);

  private:
    void openFile();
    void closeFile();
    std::string nextPath();
    bool isFileFull(std::size_t messageSize) const;
    void flushLater();
    void flush();
    void fail(const std::string& reason);
    void tellTooLarge(std::size_t size);

    MainQueue& _queue;
    const Clock& _clock;
    RecordingOptions _options;
    FailureCallback _tellFailure;
    std::optional<Technology> _technology; // the last one that was known
    bool _isPaused = true;                 // while none is
    std::optional<GrowingCapture> _file;
    Clock::TimePoint _fileStart;
    std::uint64_t _number = 0; // of the last file; 0 before the first
    bool _hasFailed = false;
    bool _hasLeftOut = false;
    bool _willFlush = false;
    std::shared_ptr<bool> _alive = std::make_shared<bool>(true);
};

} // namespace ventrik
