#include "LogGenerator/C2K/PilotGroup.h"

#include "LogGenerator/Orbel/ValueText.h"

#include <cmath>

#include <fmt/format.h>

namespace ventrik
{

std::string pilotStrength(std::uint16_t rawStrength)
{
    return signedDb(10.0 * std::log10(rawStrength * 0.001953125));
}

void PilotGroup::add(std::size_t index, std::uint16_t pnOffset, std::string_view text)
{
    _group.set(fmt::format("{};{}", index, pnOffset), text);
}

PlistValue PilotGroup::groupOrNone() const
{
    if (_group.size() == 1) // the marker alone
        return "(none)";
    return _group;
}

} // namespace ventrik
