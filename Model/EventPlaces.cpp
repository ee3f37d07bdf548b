#include "Model/EventPlaces.h"

#include "Platform/Technology.h"

#include <algorithm>
#include <array>

namespace ventrik
{

namespace
{

using enum EventKind;
using enum EventShape;

constexpr EventPlace simCard{SIM, "/SIM Info/EF-ICCID", "ICCID"};
constexpr EventPlace sessions(std::string_view path)
{
    return {DataSession, path, "Contexts", Listed};
}

constexpr std::array<ServingPlace, 4> lteServing{{
    {"/Serving Cell Info", "Physical Cell ID", "Download Frequency", "PCI", "E-ARFCN", 0},
    {"/Serving Cell Measurements", "Physical Cell ID", "E-ARFCN", "PCI", "E-ARFCN", 0},
    {"/Connected mode LTE Intra-frequency Measurement", "Serving Physical Cell ID", "E-ARFCN",
     "PCI", "E-ARFCN", 0},
    {"/More/Serving Cell Signal", "Physical Cell ID", "E-ARFCN", "PCI", "E-ARFCN", 0},
}};
constexpr std::array<EventPlace, 4> lteValues{{
    {Registration, "/More/EPS Registration/EMM State", "EMM State"},
    {Registration, "/More/EPS Registration/EMM Sub State", "EMM Sub State"},
    sessions("/PDP Context Info/*/APN"),
    simCard,
}};

constexpr std::array<ServingPlace, 2> gsmServing{{
    {"/Serving Cell/GSM Serving Cell", "BSIC", "ARFCN", "BSIC", "ARFCN", 0},
    {"/Serving Cell/UMTS RR Info", "Scrambling Code", "Downlink Frequency", "PSC", "UARFCN", 1},
}};
constexpr std::array<EventPlace, 13> gsmValues{{
    {RRC, "/Serving Cell/GSM RR Info/RR State", "RR State"},
    {RRC, "/Serving Cell/UMTS RR Info/RRC State", "RRC State"},
    {Registration, "/Registration/Process CS/MM State", "MM State"},
    {Registration, "/Registration/Process CS/MM Sub State", "MM Sub State"},
    {Registration, "/Registration/Process CS/LU Reject Cause", "LU Reject Cause"},
    {Registration, "/Registration/Process CS/MM Service State", "MM Service State"},
    {Registration, "/Registration/Process PS/MM State", "GMM State"},
    {Registration, "/Registration/Process PS/MM Sub State", "GMM Sub State"},
    {Registration, "/Registration/Process PS/Attach Reject Cause", "Attach Reject Cause"},
    {Registration, "/Registration/Serving PLMN/Service Type", "Service Type"},
    {Call, "/Serving Cell/GSM RR Info/RR Mode", "RR Mode"},
    sessions("/Data/PDP Context Info/*/APN"),
    simCard,
}};

constexpr std::array<ServingPlace, 1> utranServing{{
    {"/Serving Cell Info", "Cell Scrambling Code", "Downlink UARFCN", "CPI", "UARFCN", 0},
}};
constexpr std::array<EventPlace, 3> utranValues{{
    {RRC, "/RRC Info/State", "State"},
    sessions("/PDP Context Info/*/APN"),
    simCard,
}};

constexpr std::array<ServingPlace, 1> c2kServing{{
    {"/EV-DO/Radio", "Serving PN Offset", "Channel", "EV-DO PN", "EV-DO Channel", 0},
}};
constexpr std::array<EventPlace, 6> c2kValues{{
    {Cell, "/1x/Active Set", "1x PN", Marked, "(ref pilot)"},
    {Cell, "/1x/Radio/Rx 0 Channel", "1x Channel"},
    {RRC, "/1x/State", "1x State"},
    {RRC, "/EV-DO/State", "EV-DO State"},
    {Registration, "/1x/System/Roaming", "Roaming"},
    {DataSession, "/EV-DO/Session/Session State", "Session State"},
}};

constexpr std::array<ServingPlace, 2> ifxServing{{
    {"/Serving Cell", "BSIC", "ARFCN", "BSIC", "ARFCN", 0},
    {"/Serving Cell", "Scrambling Code", "UARFCN", "PSC", "UARFCN", 1},
}};
constexpr std::array<EventPlace, 2> ifxValues{{
    {Registration, "/Registration", "Registration"},
    {Call, "/Call", "Call", Group},
}};

struct PlacesOfTechnology {
    std::string_view technology;
    EventPlaces places;
};
constexpr std::array<PlacesOfTechnology, 5> technologyPlaces{{
    {Technologies::lte.name, {lteServing, lteValues}},
    {Technologies::gsm.name, {gsmServing, gsmValues}},
    {Technologies::utran.name, {utranServing, utranValues}},
    {Technologies::c2k.name, {c2kServing, c2kValues}},
    {Technologies::cellMonitor.name, {ifxServing, ifxValues}},
}};

} // namespace

EventPlaces eventPlacesOf(std::string_view technology)
{
    const auto known =
        std::ranges::find(technologyPlaces, technology, &PlacesOfTechnology::technology);
    return known == technologyPlaces.end() ? EventPlaces() : known->places;
}

} // namespace ventrik
