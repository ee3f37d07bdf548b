#include "Model/CellPlaces.h"

#include "Platform/Technology.h"

#include <algorithm>
#include <array>

namespace ventrik
{

namespace
{

using enum CellSystem;
using enum CellKind;

constexpr CellPlaces serving(CellSystem system, std::string_view path, CellNames names)
{
    return {CellShape::Group, system, Serving, path, names};
}
constexpr CellPlaces list(CellSystem system, CellKind kind, std::string_view path, CellNames names,
                          std::span<const KindOfText> kinds = {})
{
    return {CellShape::List, system, kind, path, names, kinds};
}
constexpr CellPlaces pilots(CellSystem system, std::string_view path, CellNames names,
                            std::span<const KindOfText> kinds = {})
{
    return {CellShape::Strengths, system, Active, path, names, kinds};
}

constexpr std::array<KindOfText, 2> servingTexts{{{"True", Serving}, {"False", Measured}}};
constexpr std::array<KindOfText, 3> setTexts{
    {{"ASET", Active}, {"MSET", Monitored}, {"DSET", Detected}}};
constexpr std::array<KindOfText, 1> pilotTexts{{{"(ref pilot)", Serving}}};

// Of several serving cells of a system the one that was told last is the one.
constexpr std::string_view connectedEARFCN =
    "/Connected mode LTE Intra-frequency Measurement/E-ARFCN";
constexpr std::string_view candidates = "/Reselection/Reselection Candidates List";
constexpr std::array<CellPlaces, 13> ltePlaces{{
    serving(LTE, "/Serving Cell Measurements",
            {"E-ARFCN", "Physical Cell ID", "Measured RSRP", "Measured RSRQ"}),
    serving(
        LTE, "/Connected mode LTE Intra-frequency Measurement",
        {"E-ARFCN", "Serving Physical Cell ID", "Serving Filtered RSRP", "Serving Filtered RSRQ"}),
    serving(LTE, "/Serving Cell Info", {"Download Frequency", "Physical Cell ID"}),
    serving(LTE, "/More/Serving Cell Signal", {"E-ARFCN", "Physical Cell ID", "RSRP", "RSRQ"}),
    list(LTE, Measured, "/More/Signal by Cell",
         {"E-ARFCN", "Physical Cell ID", "RSRP", "RSRQ", "Serving"}, servingTexts),
    list(LTE, Measured, "/Neighbors/Measured Neighbor Cells",
         {connectedEARFCN, "Physical Cell ID", "Filtered RSRP", "Filtered RSRQ"}),
    list(LTE, Measured, "/More/Neighbors/Connected Neighbor Cells",
         {"/More/Neighbors/Connected Neighbors/E-ARFCN", "Physical Cell ID", "Measured RSRP",
          "Measured RSRQ"}),
    list(LTE, Detected, "/Neighbors/Detected Cells", {connectedEARFCN, "Physical Cell ID"}),
    list(LTE, Neighbor, "/Neighbors/Neighbor Cells List",
         {"/Neighbors/Neighbor Measurements/E-ARFCN", "Physical Cell ID", "Measured RSRP",
          "Measured RSRQ"}),
    list(LTE, Candidate, candidates, {"E ARFCN", "Cell ID"}),
    list(UMTS, Candidate, candidates, {"U ARFCN", "PSC"}),
    list(GSM, Candidate, candidates, {"ARFCN", "BSIC ID"}),
    list(OneX, Candidate, candidates, {.channel = "Channel", .identity = "Pilot", .band = "Band"}),
}};

constexpr std::string_view umtsServing = "/Serving Cell/UMTS RR Info";
constexpr std::array<CellPlaces, 8> gsmPlaces{{
    serving(GSM, "/Serving Cell/GSM Serving Cell", {"ARFCN", "BSIC", "RSSI"}),
    serving(UMTS, umtsServing, {"Downlink Frequency", "Scrambling Code"}),
    serving(UMTS, umtsServing, {"UARFCN", "Scrambling Code"}),
    list(UMTS, Active, "/Serving Cell/Active Set",
         {"/Serving Cell/UMTS RR Info/Downlink Frequency", "Scrambling Code", "RSCP",
          "Energy Per Chip"}),
    list(GSM, Neighbor, "/Neighbors/Neighboring Cells", {"ARFCN", "BSIC", "RSSI"}),
    list(UMTS, Ranked, "/Neighbors/UMTS Set",
         {"Downlink Frequency", "Scrambling Code", "RSCP", "Energy Per Chip"}),
    list(UMTS, Neighbor, "/Neighbors/UMTS Set",
         {"UARFCN", "Scrambling Code", "RSCP", "Energy Per Chip"}),
    list(GSM, Ranked, "/Neighbors/GSM Set", {"ARFCN", "BSIC", "RSSI"}),
}};

constexpr std::array<CellPlaces, 2> utranPlaces{{
    serving(TimeDividedUMTS, "/Serving Cell Info", {"Downlink UARFCN", "Cell Scrambling Code"}),
    list(TimeDividedUMTS, Neighbor, "/Neighbor Cell List",
         {.channel = "UARFCN", .identity = "Cell ID", .level = "Filter RSCP", .kind = "Status"},
         setTexts),
}};

constexpr std::array<CellPlaces, 2> c2kPlaces{{
    pilots(OneX, "/1x/Active Set",
           {.channel = "/1x/Radio/Rx 0 Channel", .band = "/1x/Radio/Rx 0 Band Class"}, pilotTexts),
    pilots(EVDO, "/EV-DO/Active Set Pilots",
           {.channel = "/EV-DO/Radio/Channel", .band = "/EV-DO/Radio/Band Class"}),
}};

constexpr std::array<CellPlaces, 4> ifxPlaces{{
    serving(GSM, "/Serving Cell", {"ARFCN", "BSIC", "RxLev"}),
    serving(UMTS, "/Serving Cell", {"UARFCN", "Scrambling Code", "RSCP"}),
    list(GSM, Neighbor, "/GSM Neighbor Cells", {"ARFCN", "BSIC", "RxLev"}),
    list(UMTS, Neighbor, "/UMTS Neighbor Cells", {"UARFCN", "Scrambling Code", "RSCP"}),
}};

struct PlacesOfTechnology {
    std::string_view technology;
    std::span<const CellPlaces> places;
    std::string_view country;
};
constexpr std::array<PlacesOfTechnology, 5> technologyPlaces{{
    {Technologies::lte.name, ltePlaces, "/More/EPS Registration/Mobile Country Code"},
    {Technologies::gsm.name, gsmPlaces, "/Registration/Serving PLMN/Mobile Country Code"},
    {Technologies::utran.name, utranPlaces, {}},
    {Technologies::c2k.name, c2kPlaces, {}},
    {Technologies::cellMonitor.name, ifxPlaces, "/Serving Cell/MCC"},
}};

const PlacesOfTechnology* placesOf(std::string_view technology)
{
    const auto known =
        std::ranges::find(technologyPlaces, technology, &PlacesOfTechnology::technology);
    return known == technologyPlaces.end() ? nullptr : &*known;
}

} // namespace

std::span<const CellPlaces> cellPlacesOf(std::string_view technology)
{
    const PlacesOfTechnology* known = placesOf(technology);
    return known ? known->places : std::span<const CellPlaces>();
}

std::string_view countryPlaceOf(std::string_view technology)
{
    const PlacesOfTechnology* known = placesOf(technology);
    return known ? known->country : std::string_view();
}

} // namespace ventrik
