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

std::optional<HdlcFrame> HdlcFrames::next()
{
    do {
        _frame.clear();
        _isEscaped = false;
        _isTooLarge = false;
        _offset = _source.offset();
        if (!readToEndMark()) {
            if (_source.offset() > _offset)
                _unfinished.add(_offset);
            return std::nullopt;
        }
    } while (!isWhole());
    return HdlcFrame{ByteView(_frame).first(_frame.size() - checksumSize), _offset};
}

bool HdlcFrames::readToEndMark()
{
    while (true) {
        const ByteView block = _source.peekSome(blockSize);
        const auto end =
            static_cast<std::size_t>(std::ranges::find(block, endMark) - block.begin());
        append(block.first(end));
        const bool hasEnd = end < block.size();
        _source.skip(hasEnd ? end + 1 : end);
        if (hasEnd || block.empty())
            return hasEnd;
    }
}

void HdlcFrames::append(ByteView escaped)
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
bool HdlcFrames::isWhole()
{
    if (_isTooLarge) {
        _tooLarge.add(_offset);
        return false;
    }
    if (_frame.size() <= checksumSize) {
        if (!_frame.empty() || _isEscaped)
            _tooShort.add(_offset);
        return false;
    }
    const std::size_t size = _frame.size() - checksumSize;
    const int checksum = _frame[size] | _frame[size + 1] << 8;
    const bool isRight = !_isEscaped && checksum == frameChecksum(ByteView(_frame).first(size));
    if (!isRight)
        _badChecksums.add(_offset);
    return isRight;
}

void HdlcFrames::tell(std::vector<std::string>& notes, std::string_view name) const
{
    _badChecksums.tell(notes, name, "frame", "with a bad checksum");
    _tooShort.tell(notes, name, "piece", "of junk between frames");
    _tooLarge.tell(notes, name, "frame", "above 1 MiB");
    _unfinished.tell(notes, name, "unfinished frame", "at the end");
}

} // namespace ventrik
