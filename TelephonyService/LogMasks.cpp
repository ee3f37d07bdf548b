#include "TelephonyService/LogMasks.h"

#include "Capture/HdlcFrames.h"
#include "TelephonyService/DiagnosticFrames.h"

#include <algorithm>
#include <cstddef>

namespace ventrik
{

namespace
{

constexpr unsigned itemBits = 12;
constexpr std::uint16_t itemMask = (1U << itemBits) - 1;
constexpr std::size_t bitsOfByte = 8;

void appendWord(Bytes& bytes, std::uint32_t value)
{
    for (unsigned shift = 0; shift < 32; shift += bitsOfByte)
        bytes.push_back(static_cast<std::uint8_t>(value >> shift & 0xFFU));
}

// 0 u8 command | 1 three zero bytes | 4 u32 operation
Bytes commandOf(DiagnosticFrames::MaskOperation operation)
{
    Bytes command{DiagnosticFrames::logMaskCommand, 0, 0, 0};
    appendWord(command, static_cast<std::uint32_t>(operation));
    return command;
}

// and of a mask: 8 u32 equipment | 12 u32 number of items | 16 a bit for each, the lowest first
Bytes maskCommand(std::uint32_t equipment, std::uint32_t count,
                  const std::set<std::uint16_t>& items)
{
    Bytes command = commandOf(DiagnosticFrames::MaskOperation::SetMask);
    appendWord(command, equipment);
    appendWord(command, count);
    Bytes mask((count + bitsOfByte - 1) / bitsOfByte);
    for (const std::uint16_t item : items)
        mask.at(item / bitsOfByte) |= static_cast<std::uint8_t>(1U << item % bitsOfByte);
    command.insert(command.end(), mask.begin(), mask.end());
    return hdlcFrame(command);
}

std::uint32_t countFor(const std::set<std::uint16_t>& items)
{
    return items.empty() ? 0 : *items.rbegin() + 1U;
}

} // namespace

void LogMasks::add(std::uint16_t code)
{
    _items[static_cast<std::uint32_t>(code) >> itemBits].insert(code & itemMask);
}

std::vector<Bytes> LogMasks::commandsFrom(const LogMasks& before) const
{
    if (empty() && !before.empty())
        return {disablingCommand()};
    std::set<std::uint32_t> equipments;
    for (const LogMasks* masks : {this, &before})
        for (const auto& [equipment, items] : masks->_items)
            equipments.insert(equipment);
    std::vector<Bytes> commands;
    for (const std::uint32_t equipment : equipments) {
        const Items& items = itemsOf(equipment);
        const Items& itemsBefore = before.itemsOf(equipment);
        // What was set before and is not wanted any more is covered as well.
        if (items != itemsBefore)
            commands.push_back(
                maskCommand(equipment, std::max(countFor(items), countFor(itemsBefore)), items));
    }
    return commands;
}

Bytes LogMasks::disablingCommand()
{
    return hdlcFrame(commandOf(DiagnosticFrames::MaskOperation::DisableAll));
}

const LogMasks::Items& LogMasks::itemsOf(std::uint32_t equipment) const
{
    static const Items none;
    const auto found = _items.find(equipment);
    return found == _items.end() ? none : found->second;
}

} // namespace ventrik
