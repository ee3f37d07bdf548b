#pragma once

#include "Capture/CaptureContainer.h"
#include "Capture/HdlcFrames.h"
#include "Capture/SkippedCount.h"

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// Takes the log records out of a serial port's frames, whether these are read from a capture or
/// come in live. Frames of other kinds are counted.
class LogFrames
{
  public:
    /// The record as a packet, which lives until the next one; none where the frame holds none.
    std::optional<CapturedMessage> record(const HdlcFrame& frame);
    /// What was skipped so far, a line for each kind, behind the capture's name.
    void tell(std::vector<std::string>& notes, std::string_view name) const;
    /// The frames by kind, as rows of a display.
    void addTo(PlistDictionary& report) const;

  private:
    bool takeRecord(ByteView content);

    Bytes _packet;
    Clock::TimePoint _time; // of the last record
    std::uint64_t _recordCount = 0;
    SkippedCount _badRecords;
    SkippedCount _badWrappings;
    std::array<std::uint64_t, 256> _otherKinds{};
};

} // namespace ventrik
