#include "Capture/HdlcFrames.h"

#include <algorithm>
#include <array>

namespace ventrik
{

namespace
{

constexpr std::uint8_t endMark = 0x7E;
constexpr std::uint8_t escapeMark = 0x7D;
constexpr std::uint8_t escapeBit = 0x20;
constexpr std::size_t checksumSize = 2;
constexpr std::size_t blockSize = 65536;

constexpr std::array<std::uint16_t, 256> checksumTable = [] {
    constexpr unsigned reversedPolynomial = 0x8408;
    std::array<std::uint16_t, 256> table{};
    for (unsigned byte = 0; byte < table.size(); ++byte) {
        unsigned rest = byte;
        for (int bit = 0; bit < 8; ++bit)
            rest = (rest & 1U) != 0 ? rest >> 1U ^ reversedPolynomial : rest >> 1U;
        table.at(byte) = static_cast<std::uint16_t>(rest);
    }
    return table;
}();

} // namespace

std::uint16_t frameChecksum(ByteView bytes)
{
    unsigned rest = 0xFFFF;
    for (const std::uint8_t byte : bytes)
        rest = rest >> 8U ^ checksumTable[(rest ^ byte) & 0xFFU];
    return static_cast<std::uint16_t>(~rest);
}

Bytes hdlcFrame(ByteView content)
{
    const std::uint16_t checksum = frameChecksum(content);
    Bytes whole(content.begin(), content.end());
    whole.push_back(static_cast<std::uint8_t>(checksum & 0xFFU));
    whole.push_back(static_cast<std::uint8_t>(checksum >> 8U));
    Bytes frame;
    frame.reserve(whole.size() + 1);
    for (const std::uint8_t byte : whole) {
        const bool isMark = byte == endMark || byte == escapeMark;
        if (isMark)
            frame.push_back(escapeMark);
        frame.push_back(isMark ? byte ^ escapeBit : byte);
    }
    frame.push_back(endMark);
    return frame;
}

std::optional<HdlcFrame> HdlcFrames::next()
{
    while (true) {
        const ByteView block = _source.peekSome(blockSize);
        if (block.empty()) {
            _assembler.end();
            return std::nullopt;
        }
        _source.skip(_assembler.take(block));
        if (auto frame = _assembler.frame())
            return frame;
    }
}

std::size_t FrameAssembler::take(ByteView bytes)
{
    if (_isEnded)
        beginFrame();
    const auto end = static_cast<std::size_t>(std::ranges::find(bytes, endMark) - bytes.begin());
    append(bytes.first(end));
    _isEnded = end < bytes.size();
    const std::size_t taken = _isEnded ? end + 1 : end;
    _offset += taken;
    _isWhole = _isEnded && checkFrame();
    return taken;
}

std::optional<HdlcFrame> FrameAssembler::frame() const
{
    if (!_isWhole)
        return std::nullopt;
    return HdlcFrame{ByteView(_frame).first(_frame.size() - checksumSize), _start};
}

void FrameAssembler::end()
{
    if (!_isEnded && _offset > _start)
        _unfinished.add(_start);
    beginFrame();
}

void FrameAssembler::beginFrame()
{
    _frame.clear();
    _start = _offset;
    _isEscaped = _isTooLarge = _isEnded = _isWhole = false;
}

void FrameAssembler::append(ByteView escaped)
{
    for (const std::uint8_t byte : escaped) {
        if (byte == escapeMark && !_isEscaped) {
            _isEscaped = true;
            continue;
        }
        _isTooLarge = _isTooLarge || _frame.size() == maximumSize;
        if (_isTooLarge)
            return;
        _frame.push_back(_isEscaped ? byte ^ escapeBit : byte);
        _isEscaped = false;
    }
}

// Two end marks in a row hold no frame between them. An escape without its byte is a frame that the
// sender gave up: its checksum is as good as wrong.
bool FrameAssembler::checkFrame()
{
    if (_isTooLarge) {
        _tooLarge.add(_start);
        return false;
    }
    if (_frame.size() <= checksumSize) {
        if (!_frame.empty() || _isEscaped)
            _tooShort.add(_start);
        return false;
    }
    const std::size_t size = _frame.size() - checksumSize;
    const int checksum = _frame[size] | _frame[size + 1] << 8;
    const bool isRight = !_isEscaped && checksum == frameChecksum(ByteView(_frame).first(size));
    if (!isRight)
        _badChecksums.add(_start);
    return isRight;
}

void FrameAssembler::tell(std::vector<std::string>& notes, std::string_view name) const
{
    _badChecksums.tell(notes, name, "frame", "with a bad checksum");
    _tooShort.tell(notes, name, "piece", "of junk between frames");
    _tooLarge.tell(notes, name, "frame", "above 1 MiB");
    _unfinished.tell(notes, name, "unfinished frame", "at the end");
}

void FrameAssembler::addTo(PlistDictionary& report) const
{
    report.set("Bad Checksums", _badChecksums.text());
    _tooShort.addTo(report, "Junk Between Frames");
    _tooLarge.addTo(report, "Frames Above 1 MiB");
}

} // namespace ventrik
