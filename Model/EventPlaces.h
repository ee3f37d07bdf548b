#pragma once

#include "Model/EventLog.h"

#include <span>
#include <string_view>

namespace ventrik
{

// Which values of the displays make events.

/// What tells the serving cell. Where several places do, whichever tells another cell first makes
/// the event.
struct ServingPlace {
    std::string_view path;     ///< of the values' group
    std::string_view identity; ///< a value's name
    std::string_view channel;
    std::string_view identityName; ///< as events say it
    std::string_view channelName;
    int cell; ///< places of one cell have one number
};

/// How the values at a place make an event.
enum class EventShape : std::uint8_t {
    Value,  ///< when it becomes another one
    Group,  ///< when the group comes or goes
    Listed, ///< when the values of that name in a list's elements become other ones, together
    Marked, ///< when another value has the mark in front: its name tells
};

struct EventPlace {
    EventKind kind;
    std::string_view
        path; ///< of the value; of a list with "*" in the place of the element's number
    std::string_view name; ///< as events say it
    EventShape shape = EventShape::Value;
    std::string_view mark = {};
};

struct EventPlaces {
    std::span<const ServingPlace> serving;
    std::span<const EventPlace> values;
};

/// Of a technology as on the command line.
EventPlaces eventPlacesOf(std::string_view technology);

} // namespace ventrik
