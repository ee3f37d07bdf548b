#include "LogGenerator/Core/LogGenerator.h"

#include "LogGenerator/Core/DateText.h"
#include "LogGenerator/Core/StateKeys.h"

#include <array>

#include <fmt/compile.h>
#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr std::int32_t historyLimit = 5;

// The first value that is missing ends the entry.
PlistDictionary makeHistoryEntry(const PlistDictionary& state, const std::string& date)
{
    PlistDictionary entry;
    entry.reserve(5);
    for (const std::string_view key :
         {StateKey::displayState, StateKey::display, StateKey::extraInfo}) {
        const PlistValue* value = state.find(key);
        if (!value)
            return entry;
        entry.set(key, value->copy());
    }
    entry.set(HistoryKey::date, date);
    entry.set(HistoryKey::description, fmt::format(FMT_COMPILE("Snapshot ({})"), date));
    return entry;
}

} // namespace

void LogGenerator::init()
{
    log().warning("Creating Log object: {}", fmt::ptr(this));
}

std::optional<ValueOrigin> LogGenerator::originOf(const PlistDictionary&,
                                                  std::span<const std::string_view>) const
{
    return std::nullopt;
}

std::optional<CellPlace> LogGenerator::cellPlaceAt(const PlistDictionary&,
                                                   std::span<const std::string_view>) const
{
    return CellPlace{};
}

std::optional<ShownCell> LogGenerator::cellAt(CellPlace&) const
{
    return std::nullopt;
}

std::string_view LogGenerator::sectionAt(const PlistDictionary&,
                                         std::span<const std::string_view>) const
{
    return {};
}

std::vector<ReadLayout> LogGenerator::layoutsAt(const PlistDictionary&,
                                                std::span<const std::string_view>) const
{
    return {};
}

void LogGenerator::recordDisplay(PlistDictionary& state) const
{
    if (state.contains(StateKey::display))
        updateHistoryInState(state, clock());
}

void LogGenerator::updateHistoryInState(PlistDictionary& state, const Clock& clock)
{
    PlistValue* existing = state.find(StateKey::history);
    if (existing && existing->array()) {
        const auto count = static_cast<std::int32_t>(existing->array()->size());
        if (count >= historyLimit)
            existing->array()->removeFirst(static_cast<std::size_t>(count - (historyLimit - 1)));
    } else {
        state.set(StateKey::history, PlistArray());
    }
    state.find(StateKey::history)->array()->append(makeHistoryEntry(state, dateText(clock.now())));
}

void LogGenerator::claimDisplay(PlistDictionary& state, std::string_view owner)
{
    const PlistValue* current = state.find(StateKey::displayOwner);
    if (current && *current == owner)
        return;
    if (current)
        for (const std::string_view key :
             {StateKey::displayTemplate, StateKey::display, StateKey::lookup})
            state.remove(key);
    state.set(StateKey::displayOwner, owner);
}

} // namespace ventrik
