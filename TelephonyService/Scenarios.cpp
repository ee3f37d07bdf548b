#include "TelephonyService/Scenarios.h"

#include "TelephonyService/C2KScenario.h"
#include "TelephonyService/CellMonitorScenario.h"
#include "TelephonyService/GSMScenario.h"
#include "TelephonyService/LTEScenario.h"
#include "TelephonyService/UTRANScenario.h"

#include <array>

namespace ventrik
{

namespace
{

template <typename Scenario>
std::unique_ptr<MessageSource> make(std::uint32_t seed, RecordsMode)
{
    return std::make_unique<Scenario>(seed);
}

template <typename Scenario>
std::unique_ptr<MessageSource> makeWith(std::uint32_t seed, RecordsMode records)
{
    return std::make_unique<Scenario>(seed, records);
}

struct ScenarioOfTechnology {
    const Technology& technology;
    std::unique_ptr<MessageSource> (*makeScenario)(std::uint32_t seed, RecordsMode records);
};

constexpr std::array<ScenarioOfTechnology, 5> scenarios{{
    {Technologies::cellMonitor, make<CellMonitorScenario>},
    {Technologies::gsm, makeWith<GSMScenario>},
    {Technologies::c2k, make<C2KScenario>},
    {Technologies::lte, makeWith<LTEScenario>},
    {Technologies::utran, make<UTRANScenario>},
}};

} // namespace

std::unique_ptr<MessageSource> makeScenario(const Technology& technology, std::uint32_t seed,
                                            RecordsMode records)
{
    for (const ScenarioOfTechnology& known : scenarios)
        if (technology.identifier == known.technology.identifier)
            return known.makeScenario(seed, records);
    return nullptr;
}

} // namespace ventrik
