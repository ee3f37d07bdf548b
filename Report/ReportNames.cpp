#include "Report/ReportNames.h"

namespace ventrik
{

namespace
{

constexpr std::string_view separator = " › ";

} // namespace

std::string placeTitle(const PlaceTable& places, PlaceId place)
{
    std::string title;
    for (; place != PlaceTable::root; place = places[place].holder) {
        const std::string name(places.nameOf(place));
        title = title.empty() ? name : name + std::string(separator) + title;
    }
    return title;
}

std::string pathTitle(std::string_view path)
{
    std::string title;
    for (const char character : path.substr(path.starts_with('/') ? 1 : 0))
        if (character == '/')
            title += separator;
        else
            title += character;
    return title;
}

} // namespace ventrik
