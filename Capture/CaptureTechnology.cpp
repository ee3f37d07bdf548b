#include "Capture/CaptureTechnology.h"

#include "Platform/TelephonyConstants.h"

#include <algorithm>
#include <array>

namespace ventrik
{

namespace
{

constexpr std::array<CaptureTechnology, 5> technologies{{
    {147, kQXLogChannelTechnology_IFX, "ifx"},
    {148, kQXLogChannelTechnology_Orbel_GSM, "gsm"},
    {149, kQXLogChannelTechnology_Orbel_CDMA, "c2k"},
    {150, kQXLogChannelTechnology_Orbel_LTE, "lte"},
    {151, kQXLogChannelTechnology_Orbel_UTRAN2, "utran"},
}};

template <typename Field, typename Value>
std::optional<CaptureTechnology> technologyWith(Field field, const Value& value)
{
    const auto* found = std::ranges::find(technologies, value, field);
    return found == technologies.end() ? std::nullopt : std::optional(*found);
}

} // namespace

std::span<const CaptureTechnology> captureTechnologies()
{
    return technologies;
}

std::optional<CaptureTechnology> technologyOfLinkType(int linkType)
{
    return technologyWith(&CaptureTechnology::linkType, linkType);
}

std::optional<CaptureTechnology> technologyNamed(std::string_view name)
{
    return technologyWith(&CaptureTechnology::name, name);
}

} // namespace ventrik
