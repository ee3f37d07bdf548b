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

/// A frame as it goes over the line: the content with its checksum, escaped, and the end mark.
Bytes hdlcFrame(ByteView content);

/// Puts the frames of a serial port's bytes together, as the bytes come. Each ends with 0x7E; 0x7D
/// escapes the byte behind it, and the last two bytes are the little-endian checksum of those
/// before.
///
/// What is no whole frame is skipped and counted. At most `maximumSize` is ever kept.
class FrameAssembler
{
  public:
    static constexpr std::size_t maximumSize = std::size_t{1} << 20; ///< checksum included

    /// Takes bytes up to the first end mark, and gives how many.
    std::size_t take(ByteView bytes);
    /// The frame that the bytes taken last have ended, if its checksum is right.
    std::optional<HdlcFrame> frame() const;
    /// No more bytes come: what was begun is unfinished.
    void end();
    /// What was skipped so far, a line for each kind, behind the capture's name.
    void tell(std::vector<std::string>& notes, std::string_view name) const;
    /// The same as rows of a display; bad checksums also where there are none.
    void addTo(PlistDictionary& report) const;

  private:
    void beginFrame();
    void append(ByteView escaped);
    bool checkFrame();

    Bytes _frame;
    std::uint64_t _start = 0;  // of the frame
    std::uint64_t _offset = 0; // of the next byte
    bool _isEscaped = false;   // the next byte is
    bool _isTooLarge = false;
    bool _isEnded = false; // by an end mark
    bool _isWhole = false;
    SkippedCount _badChecksums;
    SkippedCount _tooShort;
    SkippedCount _tooLarge;
    SkippedCount _unfinished;
};

/// The frames of a capture of a serial port's bytes.
class HdlcFrames
{
  public:
    explicit HdlcFrames(ByteSource& source) : _source(source) {}

    /// The next frame with a right checksum; none at the end.
    std::optional<HdlcFrame> next();
    void tell(std::vector<std::string>& notes, std::string_view name) const
    {
        _assembler.tell(notes, name);
    }

  private:
    ByteSource& _source;
    FrameAssembler _assembler;
};

} // namespace ventrik
