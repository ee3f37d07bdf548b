#include "Packets/Record.h"

#include <algorithm>
#include <bit>
#include <cstring>

#include <fmt/compile.h>
#include <fmt/format.h>

namespace ventrik
{

namespace
{

std::uint64_t littleEndianWord(const LogPacket& packet, const Place& place)
{
    constexpr std::size_t wordSize = sizeof(std::uint64_t);
    const ByteView bytes = packet.bytes();
    if constexpr (std::endian::native == std::endian::little)
        if (place.offset + wordSize <= bytes.size()) {
            std::uint64_t word = 0;
            std::memcpy(&word, bytes.data() + place.offset, wordSize);
            return word;
        }
    std::uint64_t word = 0;
    for (std::size_t i = 0; i < place.bytes(); ++i)
        word |= std::uint64_t{packet.u8(place.offset + i)} << (8 * i);
    return word;
}

std::uint64_t bigEndianWord(const LogPacket& packet, const Place& place)
{
    std::uint64_t word = 0;
    for (std::size_t i = 0; i < place.bytes(); ++i)
        word = word << 8 | packet.u8(place.offset + i);
    return word;
}

std::string withRawNumber(std::string_view text, std::int64_t raw)
{
    const auto gap = text.find("{}");
    if (gap == std::string_view::npos)
        return std::string(text);
    return fmt::format(FMT_COMPILE("{}{}{}"), text.substr(0, gap), raw, text.substr(gap + 2));
}

void appendNumber(fmt::memory_buffer& text, Digits digits, double number)
{
    const auto out = std::back_inserter(text);
    const auto whole = [&] { return static_cast<std::int64_t>(number); };
    switch (digits) {
    case Digits::Whole:
        fmt::format_to(out, FMT_COMPILE("{}"), whole());
        break;
    case Digits::SignedWhole:
        fmt::format_to(out, FMT_COMPILE("{:+}"), whole());
        break;
    case Digits::TwoDecimals:
        fmt::format_to(out, FMT_COMPILE("{:>4.2f}"), number);
        break;
    case Digits::SignedTwoDecimals:
        fmt::format_to(out, FMT_COMPILE("{:+.2f}"), number);
        break;
    case Digits::SixDecimals:
        fmt::format_to(out, FMT_COMPILE("{:f}"), number);
        break;
    case Digits::SixHexDigits:
        fmt::format_to(out, FMT_COMPILE("0x{:06x}"), static_cast<std::uint64_t>(whole()));
        break;
    }
}

} // namespace

std::int64_t numberAt(const LogPacket& packet, const Place& place)
{
    const std::uint64_t word =
        place.isBigEndian ? bigEndianWord(packet, place) : littleEndianWord(packet, place);
    const std::uint64_t sign = std::uint64_t{1} << (place.width - 1);
    const std::uint64_t number = word >> place.bit & (2 * sign - 1);
    // Subtracting the sign bit twice spreads it over all bits above.
    return static_cast<std::int64_t>(place.isSigned && (number & sign) ? number - 2 * sign
                                                                       : number);
}

std::optional<double> Shown::number(std::int64_t raw) const
{
    if (text || std::ranges::find(marks, raw, &Mark::raw) != marks.end() || !labels.empty() ||
        !otherwise.empty())
        return std::nullopt;
    return scale ? scale(raw) : static_cast<double>(raw) * factor + offset;
}

std::optional<std::string> Shown::textOf(std::int64_t raw) const
{
    if (text)
        return text(raw);
    for (const Mark& mark : marks)
        if (mark.raw == raw)
            return std::string(mark.text);
    if (labels.empty() && otherwise.empty())
        return textOfNumber(scale ? scale(raw) : static_cast<double>(raw) * factor + offset);
    const auto index = static_cast<std::size_t>(raw);
    if (index < labels.size() && !labels[index].empty())
        return std::string(labels[index]);
    return otherwise.empty() ? std::nullopt : std::optional(withRawNumber(otherwise, raw));
}

std::string Shown::textOfNumber(double number) const
{
    fmt::memory_buffer shown;
    appendNumber(shown, digits, number);
    if (!unit.empty()) {
        shown.push_back(' ');
        shown.append(unit);
    }
    return {shown.data(), shown.size()};
}

RecordElements List::elementsOf(const LogPacket& packet) const
{
    const auto number = [&](const Place& place) {
        return static_cast<std::size_t>(numberAt(packet, place));
    };
    const std::size_t start =
        before.bytesEach == 0 ? offset : offset + before.bytesEach * number(before.count);
    return {start, stride, number(count.place) + count.more, needed};
}

const Field* findField(std::span<const std::span<const Field>> groups, std::string_view key)
{
    for (const std::span<const Field> group : groups)
        if (const auto field = std::ranges::find(group, key, &Field::key); field != group.end())
            return &*field;
    return nullptr;
}

const Field* Record::find(std::string_view key) const
{
    return findField(groups, key);
}

} // namespace ventrik
