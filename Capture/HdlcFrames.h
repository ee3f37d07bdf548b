#pragma once

#include "Capture/ByteSource.h"
#include "Capture/SkippedCount.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// The checksum at the end of a frame: CRC-16/X-25.
std::uint16_t frameChecksum(ByteView bytes);

/// What one frame holds, without marks, escapes and checksum.
struct HdlcFrame {
    ByteView content;     ///< not empty; lives until the next frame is read
    std::uint64_t offset; ///< of the frame's first byte, in the capture
};

/// The frames of a serial port's bytes. Each ends with 0x7E; 0x7D escapes the byte behind it, and
/// the last two bytes are the little-endian checksum of those before.
///
/// What is no whole frame is skipped and counted. At most `maximumSize` is ever kept.
class HdlcFrames
{
  public:
    static constexpr std::size_t maximumSize = std::size_t{1} << 20; ///< checksum included

    explicit HdlcFrames(ByteSource& source) : _source(source) {}

    /// The next frame with a right checksum; none at the end.
    std::optional<HdlcFrame> next();
    /// What was skipped so far, a line for each kind, behind the capture's name.
    void tell(std::vector<std::string>& notes, std::string_view name) const;

  private:
    bool readToEndMark();
    void append(ByteView escaped);
    bool isWhole();

    ByteSource& _source;
    Bytes _frame;
    std::uint64_t _offset = 0; // of the frame
    bool _isEscaped = false;   // the next byte is
    bool _isTooLarge = false;
    SkippedCount _badChecksums;
    SkippedCount _tooShort;
    SkippedCount _tooLarge;
    SkippedCount _unfinished;
};

} // namespace ventrik
