#include "LogGenerator/LogGenerator.h"

#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "LogGenerator/DateText.h"
#include "LogGenerator/GSM/GSMLogGenerator.h"
#include "LogGenerator/Orbel/GSM/Orbel_GSMLogGenerator.h"
#include "LogGenerator/Orbel/LTE/LTELogGenerator.h"
#include "LogGenerator/Orbel/UTRAN/UTRANLogGenerator.h"
#include "Platform/TelephonyConstants.h"

#include <algorithm>
#include <array>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr std::int32_t historyLimit = 5;

template <typename Generator>
std::unique_ptr<LogGenerator> make(const GeneratorServices& services)
{
    return Generator::generator(services);
}

struct Technology {
    std::string_view identifier;
    std::string_view name;
    std::unique_ptr<LogGenerator> (*makeGenerator)(const GeneratorServices& services);
};

constexpr std::array<Technology, 5> technologies{{
    {kQXLogChannelTechnology_IFX, "Cell monitor", make<GSMLogGenerator>},
    {kQXLogChannelTechnology_Orbel_GSM, "GSM/UMTS", make<Orbel_GSMLogGenerator>},
    {kQXLogChannelTechnology_Orbel_CDMA, "CDMA2000", make<C2KLogGenerator>},
    {kQXLogChannelTechnology_Orbel_LTE, "LTE", make<LTELogGenerator>},
    {kQXLogChannelTechnology_Orbel_UTRAN2, "UTRAN", make<UTRANLogGenerator>},
}};

const Technology* findTechnology(const PlistValue& identifier)
{
    const auto* found = std::ranges::find_if(technologies, [&](const Technology& technology) {
        return identifier == technology.identifier;
    });
    return found == technologies.end() ? nullptr : found;
}

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
    const Technology* found = findTechnology(technology);
    return found ? found->makeGenerator(services) : nullptr;
}

std::string_view LogGenerator::technologyName(const PlistValue& technology)
{
    const Technology* found = findTechnology(technology);
    return found ? found->name : std::string_view();
}

void LogGenerator::recordDisplay(PlistDictionary& state) const
{
    if (state.contains("Display"))
        updateHistoryInState(state, clock());
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
