#pragma once

#include "LogGenerator/Orbel/Base.h"
#include "Packets/GSMRecords.h"
#include "Packets/SharedRecords.h"
#include "Platform/TelephonyConstants.h"

namespace ventrik
{

// The GSM/UMTS sections that only show what the tables of their records say.

// ---- Mobility management and registration

/// The network that the phone is registered on, its areas and its service. The cell monitor tells
/// plain numbers: no leading zeros, no blanks. Whichever record came last is shown.
inline constexpr std::array<std::string_view, 2> servingPLMNTechnologies{
    kQXCellMonitorRadioAccessTechnologyUMTS, kQXCellMonitorRadioAccessTechnologyGSM};
inline constexpr std::array<CellField, 3> servingPLMNCellFields{{
    {kQXCellMonitorMCC, {"Mobile Country Code", cellNumberPlace}, "MCC"},
    {kQXCellMonitorMNC, {"Mobile Network Code", cellNumberPlace}, "MNC"},
    {kQXCellMonitorLAC, {"Location Area Code", cellNumberPlace}, "LAC"},
}};
inline constexpr MonitoredCells servingPLMNCells{
    MonitoredCells::Kind::Serving, servingPLMNTechnologies, servingPLMNCellFields, "ServingPLMN"};
inline constexpr SectionTable servingPLMN{
    .name = "Serving PLMN",
    .records = {{
        {&GSMRecords::servingPLMN, GSMRecords::servingPLMNFields},
        {&GSMRecords::registration, GSMRecords::selectionModeFields},
        {.record = &SharedRecords::cellMonitor, .cells = &servingPLMNCells},
    }},
};
using ServingPLMN = TableSection<servingPLMN>;

/// The networks that count as the serving one, one row each.
inline constexpr SectionTable equivalentPLMNList{
    .name = "Equivalent PLMN List",
    .records = {{{&GSMRecords::equivalentPLMNs, {}, {{{&GSMRecords::equivalentPLMNList}}}}}},
};
using EquivalentPLMNList = TableSection<equivalentPLMNList>;

/// The circuit-switched mobility states.
inline constexpr SectionTable processCS{
    .name = "Process CS",
    .trace = "ProcessCS",
    .records = {{
        {&GSMRecords::mmState, GSMRecords::mmStateFields},
        {&GSMRecords::registration, GSMRecords::registrationStateFields},
    }},
};
using ProcessCS = TableSection<processCS>;

/// The mobility state on its own, without its sub-state and its update status. The trace is the
/// circuit-switched section's: readers of the log know the two by that one name.
inline constexpr SectionTable processCO{
    .name = "Process CO",
    .trace = "ProcessCS",
    .records = {{
        {&GSMRecords::mmState, std::span(GSMRecords::mmStateFields).first(1)},
        {&GSMRecords::registration, GSMRecords::registrationStateFields},
    }},
};
using ProcessCO = TableSection<processCO>;

/// The packet-switched mobility states.
inline constexpr SectionTable processPS{
    .name = "Process PS",
    .trace = "ProcessPS",
    .records = {{
        {&GSMRecords::gmmState, GSMRecords::gmmStateFields},
        {&GSMRecords::registration, GSMRecords::registrationStateFields},
    }},
};
using ProcessPS = TableSection<processPS>;

// ---- The GSM cell

/// The GSM cell that the phone camps on: its identity, its level and its reselection criteria. The
/// monitor tells no BSIC; otherwise whichever record came last is shown.
inline constexpr std::array<std::string_view, 1> gsmTechnology{
    kQXCellMonitorRadioAccessTechnologyGSM};
inline constexpr std::array<CellField, 2> gsmServingCellFields{{
    {kQXCellMonitorCellId, {"Cell ID", cellNumberPlace}, "Cell ID"},
    {kQXCellMonitorARFCN, {"ARFCN", cellNumberPlace}, "ARFCN"},
}};
inline constexpr MonitoredCells gsmServingCells{MonitoredCells::Kind::Serving, gsmTechnology,
                                                gsmServingCellFields, "GSMServingCell"};
inline constexpr SectionTable gsmServingCell{
    .name = "GSM Serving Cell",
    .trace = "GSMServingCell",
    .records = {{
        {&GSMRecords::cellIdentity, GSMRecords::cellIdentityFields},
        {&GSMRecords::idleMeasurements, GSMRecords::idleCriteriaFields},
        {&GSMRecords::dedicatedChannel, GSMRecords::dedicatedChannelFields},
        {.record = &SharedRecords::cellMonitor, .cells = &gsmServingCells},
    }},
};
using GSMServingCell = TableSection<gsmServingCell>;

/// The state of the GSM radio resource layer and the quality of its link.
inline constexpr SectionTable gsmRRInfo{
    .name = "GSM RR Info",
    .trace = "GSMRRInfo",
    .records = {{
        {&GSMRecords::rrState, GSMRecords::rrStateFields},
        {&GSMRecords::idleMeasurements, GSMRecords::idleQualityFields},
        {&GSMRecords::dtx, GSMRecords::dtxFields},
        {&GSMRecords::cellOptions, GSMRecords::drxFields},
    }},
};
using GSMRRInfo = TableSection<gsmRRInfo>;

/// What the GSM cell's system information says about packet data.
inline constexpr SectionTable gprsInformation{
    .name = "GPRS Information",
    .trace = "GPRSInformation",
    .records = {{
        {&GSMRecords::packetOptions, GSMRecords::packetOptionsFields},
        {&GSMRecords::servingPLMN, GSMRecords::networkModeFields},
        {&GSMRecords::cellOptions, GSMRecords::cellOptionsFields},
        {&GSMRecords::broadcastChannel, GSMRecords::broadcastChannelFields},
        {&GSMRecords::measurementOrder, GSMRecords::measurementOrderFields},
        {&GSMRecords::si13, GSMRecords::si13Fields},
        {&GSMRecords::idleMeasurements, GSMRecords::idleHysteresisFields},
    }},
};
using GPRSInformation = TableSection<gprsInformation>;

/// The frequencies that the GSM channel hops over.
inline constexpr SectionTable mobileAllocation{
    .name = "Mobile Allocation",
    .trace = "MobileAllocation",
    .records = {{{&GSMRecords::mobileAllocation,
                  GSMRecords::mobileAllocationFields,
                  {{{&GSMRecords::frequencies}}}}}},
};
using MobileAllocation = TableSection<mobileAllocation>;

// ---- UMTS

/// The GSM cells that the baseband ranks for reselection, one row each.
inline constexpr SectionTable gsmSet{
    .name = "GSM Set",
    .trace = "GSMSet",
    .records = {{{&GSMRecords::rankedCells, {}, {{{&GSMRecords::rankedGSMCells}}}}}},
};
using GSMSet = TableSection<gsmSet>;

/// The UMTS cells that the baseband ranks for reselection, or the UMTS neighbours of the cell
/// monitor, whichever came last; one row each.
inline constexpr std::array<std::string_view, 1> umtsTechnology{
    kQXCellMonitorRadioAccessTechnologyUMTS};
inline constexpr std::array<CellField, 4> umtsNeighborFields{{
    {kQXCellMonitorUARFCN, {"UARFCN", cellNumberPlace}, "UARFCN"},
    {kQXCellMonitorSCN, {"Scrambling Code", cellNumberPlace}, "Scrambling Code"},
    {kQXCellMonitorRSCP, {"RSCP", cellLevelPlace, marked(wholeDbm(), notMeasured)}, "RSCP"},
    {kQXCellMonitorECN0,
     {"Energy Per Chip", cellLevelPlace, marked(wholeDb(), notMeasured)},
     "Energy Per Chip"},
}};
inline constexpr MonitoredCells umtsNeighbors{MonitoredCells::Kind::Neighbors, umtsTechnology,
                                              umtsNeighborFields, "UMTSSet"};
inline constexpr SectionTable umtsSet{
    .name = "UMTS Set",
    .trace = "UMTSSet",
    .records = {{
        {&GSMRecords::rankedCells, {}, {{{&GSMRecords::rankedUMTSCells}}}},
        {.record = &SharedRecords::cellMonitor, .cells = &umtsNeighbors},
    }},
};
using UMTSSet = TableSection<umtsSet>;

/// How many blocks of each UMTS transport channel came in error.
inline constexpr SectionTable bler{
    .name = "BLER",
    .records = {{{&GSMRecords::blockErrors,
                  GSMRecords::blockErrorsFields,
                  {{{&GSMRecords::transportChannels}}}}}},
};
using BLER = TableSection<bler>;

/// The HSDPA carriers and the counters of their HARQ processes.
inline constexpr SectionTable hsdpaInformation{
    .name = "HSDPA Info",
    .records = {{{&GSMRecords::hsdpa,
                  GSMRecords::hsdpaFields,
                  {{{&GSMRecords::primaryProcesses, true},
                    {&GSMRecords::secondaryProcesses, true}}}}}},
    .unknownCode = UnknownCode::Ignored,
};
using HSDPAInformation = TableSection<hsdpaInformation>;

// ---- Sets of UMTS cells that are not shown cell by cell: they follow the cell list's records, and
// each of them leaves them empty.

/// The cells that the network asked to be monitored.
inline constexpr SectionTable monitoredSet{
    .name = "Monitored Set",
    .trace = "MonitoredSet",
    .records = {{{.record = &GSMRecords::cellList, .emptiesRows = true}}},
};
using MonitoredSet = TableSection<monitoredSet>;

/// The cells that were detected without having been announced.
inline constexpr SectionTable detectedSet{
    .name = "Detected Set",
    .trace = "DetectedSet",
    .records = {{{.record = &GSMRecords::cellList, .emptiesRows = true}}},
};
using DetectedSet = TableSection<detectedSet>;

/// The cells of the active set kept for another frequency.
inline constexpr SectionTable virtualActiveSet{
    .name = "Virtual Active Set",
    .trace = "VirtualActiveSet",
    .records = {{{.record = &GSMRecords::cellList, .emptiesRows = true}}},
};
using VirtualActiveSet = TableSection<virtualActiveSet>;

// ---- Sections that want no log codes: they keep their place in the display, which stays as the
// template laid it out.

inline constexpr SectionTable cellChangeCounters{
    .name = "Cell Change Counters",
    .trace = "CellChangeCounters",
    .unknownCode = UnknownCode::Ignored,
};
using CellChangeCounters = TableSection<cellChangeCounters>;

/// The trace is the cell change counters': the two have always traced one name.
inline constexpr SectionTable codingScheme{
    .name = "Coding Scheme",
    .trace = "CellChangeCounters",
    .unknownCode = UnknownCode::Ignored,
};
using CodingScheme = TableSection<codingScheme>;

inline constexpr SectionTable nonRankedGSMSet{
    .name = "Non-Ranked GSM Set",
    .trace = "NonRankedGSMSet",
    .unknownCode = UnknownCode::Ignored,
};
using NonRankedGSMSet = TableSection<nonRankedGSMSet>;

inline constexpr SectionTable nonRankedUMTSSet{
    .name = "Non-Ranked UMTS Set",
    .trace = "NonRankedUMTSSet",
    .unknownCode = UnknownCode::Ignored,
};
using NonRankedUMTSSet = TableSection<nonRankedUMTSSet>;

inline constexpr SectionTable umtsRRMeasurement{
    .name = "UMTS RR Measurement",
    .trace = "UMTSRRMeasurement",
    .unknownCode = UnknownCode::Ignored,
};
using UMTSRRMeasurement = TableSection<umtsRRMeasurement>;

} // namespace ventrik
