#include "TelephonyService/Scenarios.h"

#include "Platform/TelephonyConstants.h"
#include "TelephonyService/C2KScenario.h"
#include "TelephonyService/CellMonitorScenario.h"
#include "TelephonyService/GSMScenario.h"
#include "TelephonyService/LTEScenario.h"
#include "TelephonyService/UTRANScenario.h"

namespace ventrik
{

std::unique_ptr<MessageSource> makeScenario(const CaptureTechnology& technology, std::uint32_t seed)
{
    if (technology.identifier == kQXLogChannelTechnology_Orbel_GSM)
        return std::make_unique<GSMScenario>(seed);
    if (technology.identifier == kQXLogChannelTechnology_IFX)
        return std::make_unique<CellMonitorScenario>(seed);
    if (technology.identifier == kQXLogChannelTechnology_Orbel_CDMA)
        return std::make_unique<C2KScenario>(seed);
    if (technology.identifier == kQXLogChannelTechnology_Orbel_LTE)
        return std::make_unique<LTEScenario>(seed);
    if (technology.identifier == kQXLogChannelTechnology_Orbel_UTRAN2)
        return std::make_unique<UTRANScenario>(seed);
    return nullptr;
}

} // namespace ventrik
