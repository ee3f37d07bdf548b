#include "Packets/Record.h"

#include "Packets/DecimalText.h"

#include <algorithm>

#include <fmt/compile.h>
#include <fmt/format.h>

namespace ventrik
{

namespace
{

std::string withRawNumber(std::string_view text, std::int64_t raw)
{
    const auto gap = text.find("{}");
    if (gap == std::string_view::npos)
        return std::string(text);
    return fmt::format(FMT_COMPILE("{}{}{}"), text.substr(0, gap), raw, text.substr(gap + 2));
}

void appendNumber(std::string& text, Digits digits, double number)
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
        appendTwoDecimals(text, number);
        break;
    case Digits::SignedTwoDecimals:
        appendTwoDecimals(text, number, true);
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

std::optional<double> Shown::number(std::int64_t raw) const
{
    if (text || raw == none || std::ranges::find(marks, raw, &Mark::raw) != marks.end() ||
        !labels.empty() || !otherwise.empty())
        return std::nullopt;
    return scale ? scale(raw) : static_cast<double>(raw) * factor + offset;
}

std::optional<std::string> Shown::textOf(std::int64_t raw) const
{
    if (text)
        return text(raw);
    if (raw == none)
        return std::nullopt;
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
    std::string shown;
    appendTextOfNumber(shown, number);
    return shown;
}

void Shown::appendTextOfNumber(std::string& shown, double number) const
{
    appendNumber(shown, digits, number);
    if (unit.empty())
        return;
    shown += ' ';
    shown += unit;
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
