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
std::unique_ptr<MessageSource> make(std::uint32_t seed)
{
    return std::make_unique<Scenario>(seed);
}

struct ScenarioOfTechnology {
    const Technology& technology;
    std::unique_ptr<MessageSource> (*makeScenario)(std::uint32_t seed);
};

constexpr std::array<ScenarioOfTechnology, 5> scenarios{{
    {Technologies::cellMonitor, make<CellMonitorScenario>},
    {Technologies::gsm, make<GSMScenario>},
    {Technologies::c2k, make<C2KScenario>},
    {Technologies::lte, make<LTEScenario>},
    {Technologies::utran, make<UTRANScenario>},
}};

} // namespace

std::unique_ptr<MessageSource> makeScenario(const Technology& technology, std::uint32_t seed)
{
    for (const ScenarioOfTechnology& known : scenarios)
        if (technology.identifier == known.technology.identifier)
            return known.makeScenario(seed);
    return nullptr;
}

} // namespace ventrik
