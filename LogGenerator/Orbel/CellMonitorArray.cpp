#include "LogGenerator/Orbel/CellMonitorArray.h"

#include "PropertyList/PropertyListReader.h"

#include <cmath>

namespace ventrik
{

namespace
{

std::optional<std::int32_t> truncated(double number)
{
    if (!std::isfinite(number))
        return std::nullopt;
    constexpr double twoTo32 = 4294967296.0;
    const auto lowBits = static_cast<std::int64_t>(std::fmod(std::trunc(number), twoTo32));
    return static_cast<std::int32_t>(lowBits);
}

} // namespace

std::optional<PlistArray> parseCellMonitorArray(const LogPacket& packet, SystemLog& log)
{
    const PropertyListReading reading = readPropertyList(packet.payload());
    if (reading && reading.value->array())
        return *reading.value->array();
    log.error("Cell Info Array data could not be constructed");
    return std::nullopt;
}

std::optional<std::int32_t> cellNumber(const PlistDictionary& cell, std::string_view key)
{
    const PlistValue* value = cell.find(key);
    if (!value)
        return std::nullopt;
    if (const PlistInteger* integer = value->integer())
        return static_cast<std::int32_t>(integer->bits());
    if (const double* real = value->real())
        return truncated(*real);
    return std::nullopt;
}

bool cellEntryIs(const PlistDictionary& cell, std::string_view key, std::string_view value)
{
    const PlistValue* entry = cell.find(key);
    return entry && entry->string() && *entry->string() == value;
}

} // namespace ventrik
