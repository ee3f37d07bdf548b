#pragma once

#include "Model/CellTable.h"

#include <span>
#include <string_view>

namespace ventrik
{

// Where the cells stand in the displays.

/// The names under which a cell's values stand; empty where there are none. Those that begin with
/// "/" stand elsewhere, the same for all cells of a list.
struct CellNames {
    std::string_view channel = {};
    std::string_view identity = {};
    std::string_view level = {};
    std::string_view quality = {};
    std::string_view kind = {}; ///< decides the kind
    std::string_view band = {};
};

enum class CellShape : std::uint8_t {
    Group,     ///< a group is a cell
    List,      ///< each element is a cell
    Strengths, ///< each value is a cell: its name the identity, its number the second level
};

struct KindOfText {
    std::string_view text; ///< or its beginning
    CellKind kind;
};

struct CellPlaces {
    CellShape shape;
    CellSystem system;
    CellKind kind; ///< where the cell's own text decides none
    std::string_view path;
    CellNames names;
    std::span<const KindOfText> kinds = {};
};

/// Of a technology as on the command line.
std::span<const CellPlaces> cellPlacesOf(std::string_view technology);
/// Where the code of the country stands; empty where that is not told.
std::string_view countryPlaceOf(std::string_view technology);

} // namespace ventrik
