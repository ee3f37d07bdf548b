#pragma once

#include "Capture/PcapOutput.h"
#include "Files/PrivateFile.h"
#include "Platform/Clock.h"
#include "Platform/Technology.h"
#include "PropertyList/PlistValue.h"

#include <optional>
#include <string>
#include <utility>

namespace ventrik
{

/// Writes a capture: each message of the log channel as one record of a pcap file, with microsecond
/// times. The file is there when it is whole; one that is there while it grows is a
/// `GrowingCapture`.
class CaptureWriter
{
  public:
    /// The most that readers of the format take in one record.
    static constexpr std::size_t maximumMessageSize = PcapOutput::maximumMessageSize;

    /// Begins a file that takes its name, and the place of what has it, at `commit`. On failure
    /// `error` says why in one line.
    static std::optional<CaptureWriter> create(const std::string& path,
                                               const Technology& technology, std::string& error);

    /// False, with nothing written, for a message above `maximumMessageSize`; false also when the
    /// file cannot be written, which `commit` explains.
    bool write(Clock::TimePoint time, ByteView message);
    /// After the last message. False, and the error, when something did not reach the file; there
    /// is none then.
    bool commit(std::string& error);

  private:
    CaptureWriter(PrivateFile file, PcapOutput output)
        : _file(std::move(file)), _output(std::move(output))
    {
    }

    PrivateFile _file;
    PcapOutput _output;
};

} // namespace ventrik
