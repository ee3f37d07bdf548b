#include "LogGenerator/Orbel/CellMonitor.h"

#include "Platform/TelephonyConstants.h"

#include <algorithm>
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

bool entryIs(const PlistDictionary& cell, std::string_view key, std::string_view value)
{
    const PlistValue* entry = cell.find(key);
    return entry && entry->string() && *entry->string() == value;
}

} // namespace

std::optional<PlistArray> parseCellMonitorArray(const LogPacket& packet, SystemLog& log)
{
    const PropertyListReading& reading = packet.propertyList();
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

std::optional<std::int64_t> cellFieldNumber(const PlistDictionary& cell, const CellField& field,
                                            std::string_view sectionNameInLog, SystemLog& log)
{
    const auto number = cellNumber(cell, field.cellKey);
    if (!number) {
        log.error("{}: Failed to retrieve {}\n", sectionNameInLog, field.nameInLog);
        return std::nullopt;
    }
    return field.field.place.width == cellLevelPlace.width ? static_cast<std::int16_t>(*number)
                                                           : *number;
}

bool isCell(const PlistDictionary& cell, std::span<const std::string_view> technologies,
            std::string_view type)
{
    return entryIs(cell, kQXCellMonitorCellType, type) &&
           std::ranges::any_of(technologies, [&](std::string_view technology) {
               return entryIs(cell, kQXCellMonitorCellRadioAccessTechnology, technology);
           });
}

const PlistDictionary* servingCell(const PlistArray& cells,
                                   std::span<const std::string_view> technologies)
{
    for (const PlistValue& element : cells) {
        const PlistDictionary* cell = element.dictionary();
        if (cell && isCell(*cell, technologies, kQXCellMonitorCellTypeServing))
            return cell;
    }
    return nullptr;
}

} // namespace ventrik
