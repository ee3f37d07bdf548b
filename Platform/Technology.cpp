#include "Platform/Technology.h"

#include <algorithm>
#include <array>

namespace ventrik
{

namespace
{

constexpr std::array<Technology, 5> known{Technologies::cellMonitor, Technologies::gsm,
                                          Technologies::c2k, Technologies::lte,
                                          Technologies::utran};

template <typename Field, typename Value>
std::optional<Technology> technologyWith(Field field, const Value& value)
{
    const auto* found = std::ranges::find(known, value, field);
    return found == known.end() ? std::nullopt : std::optional(*found);
}

} // namespace

std::span<const Technology> technologies()
{
    return known;
}

std::optional<Technology> technologyOfIdentifier(const PlistValue& identifier)
{
    return identifier.string() ? technologyWith(&Technology::identifier, *identifier.string())
                               : std::nullopt;
}

std::optional<Technology> technologyOfLinkType(int linkType)
{
    return technologyWith(&Technology::linkType, linkType);
}

std::optional<Technology> technologyNamed(std::string_view name)
{
    return technologyWith(&Technology::name, name);
}

} // namespace ventrik
