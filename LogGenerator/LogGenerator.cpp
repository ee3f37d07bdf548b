#include "LogGenerator/LogGenerator.h"

#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "LogGenerator/DateText.h"
#include "LogGenerator/GSM/GSMLogGenerator.h"
#include "LogGenerator/Orbel/GSM/Orbel_GSMLogGenerator.h"
#include "LogGenerator/Orbel/LTE/LTELogGenerator.h"
#include "LogGenerator/Orbel/UTRAN/UTRANLogGenerator.h"
#include "Platform/TelephonyConstants.h"

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
    for (const std::string_view key : {"DisplayState", "Display", "ExtraInfo"}) {
        const PlistValue* value = state.find(key);
        if (!value)
            return entry;
        entry.set(key, value->copy());
    }
    entry.set("Date", date);
    entry.set("Description", fmt::format("Snapshot ({})", date));
    return entry;
}

} // namespace

void LogGenerator::init()
{
    log().warning("Creating Log object: {}", fmt::ptr(this));
}

std::unique_ptr<LogGenerator>
LogGenerator::generatorFromTechnology(const PlistValue& technology,
                                      const GeneratorServices& services)
{
    if (technology == kQXLogChannelTechnology_IFX)
        return GSMLogGenerator::generator(services);
    if (technology == kQXLogChannelTechnology_Orbel_GSM)
        return Orbel_GSMLogGenerator::generator(services);
    if (technology == kQXLogChannelTechnology_Orbel_CDMA)
        return C2KLogGenerator::generator(services);
    if (technology == kQXLogChannelTechnology_Orbel_LTE)
        return LTELogGenerator::generator(services);
    if (technology == kQXLogChannelTechnology_Orbel_UTRAN2)
        return UTRANLogGenerator::generator(services);
    return nullptr;
}

void LogGenerator::updateHistoryInState(PlistDictionary& state, const Clock& clock)
{
    PlistValue* existing = state.find("History");
    if (existing && existing->array()) {
        const auto count = static_cast<std::int32_t>(existing->array()->size());
        if (count >= historyLimit)
            existing->array()->removeFirst(static_cast<std::size_t>(count - (historyLimit - 1)));
    } else {
        state.set("History", PlistArray());
    }
    state.find("History")->array()->append(makeHistoryEntry(state, dateText(clock.now())));
}

void LogGenerator::claimDisplay(PlistDictionary& state, std::string_view owner)
{
    const PlistValue* current = state.find("DisplayOwner");
    if (current && *current == owner)
        return;
    if (current)
        for (const std::string_view key : {"Template", "Display", "Lookup"})
            state.remove(key);
    state.set("DisplayOwner", owner);
}

} // namespace ventrik
