#pragma once

#include <string_view>

namespace ventrik
{

// Port names.
inline constexpr std::string_view logChannelLocalPortName =
    "org.ventrik.BasebandStateReport.LogChannel";
inline constexpr std::string_view telephonyServicePortName = "org.ventrik.TelephonyService";

// Technology identifiers: the service's answer to "GetTechnology".
inline constexpr std::string_view kQXLogChannelTechnology_IFX = "kQXLogChannelTechnology_IFX";
inline constexpr std::string_view kQXLogChannelTechnology_Orbel_GSM =
    "kQXLogChannelTechnology_Orbel_GSM";
inline constexpr std::string_view kQXLogChannelTechnology_Orbel_CDMA =
    "kQXLogChannelTechnology_Orbel_CDMA";
inline constexpr std::string_view kQXLogChannelTechnology_Orbel_LTE =
    "kQXLogChannelTechnology_Orbel_LTE";
inline constexpr std::string_view kQXLogChannelTechnology_Orbel_UTRAN2 =
    "kQXLogChannelTechnology_Orbel_UTRAN2";

// Keys of a cell dictionary in the cell-monitor array.
inline constexpr std::string_view kQXCellMonitorCellRadioAccessTechnology =
    "kQXCellMonitorCellRadioAccessTechnology";
inline constexpr std::string_view kQXCellMonitorCellType = "kQXCellMonitorCellType";
inline constexpr std::string_view kQXCellMonitorMCC = "kQXCellMonitorMCC";
inline constexpr std::string_view kQXCellMonitorMNC = "kQXCellMonitorMNC";
inline constexpr std::string_view kQXCellMonitorLAC = "kQXCellMonitorLAC";
inline constexpr std::string_view kQXCellMonitorTAC = "kQXCellMonitorTAC";
inline constexpr std::string_view kQXCellMonitorCellId = "kQXCellMonitorCellId";
inline constexpr std::string_view kQXCellMonitorPID = "kQXCellMonitorPID";
inline constexpr std::string_view kQXCellMonitorARFCN = "kQXCellMonitorARFCN";
inline constexpr std::string_view kQXCellMonitorUARFCN = "kQXCellMonitorUARFCN";
inline constexpr std::string_view kQXCellMonitorBandInfo = "kQXCellMonitorBandInfo";
inline constexpr std::string_view kQXCellMonitorSCN = "kQXCellMonitorSCN";
inline constexpr std::string_view kQXCellMonitorRSSI = "kQXCellMonitorRSSI";
inline constexpr std::string_view kQXCellMonitorRSCP = "kQXCellMonitorRSCP";
inline constexpr std::string_view kQXCellMonitorECN0 = "kQXCellMonitorECN0";

// Values of the radio access technology and of the cell type.
inline constexpr std::string_view kQXCellMonitorRadioAccessTechnologyGSM =
    "kQXCellMonitorRadioAccessTechnologyGSM";
inline constexpr std::string_view kQXCellMonitorRadioAccessTechnologyUMTS =
    "kQXCellMonitorRadioAccessTechnologyUMTS";
inline constexpr std::string_view kQXCellMonitorRadioAccessTechnologyUTRAN2 =
    "kQXCellMonitorRadioAccessTechnologyUTRAN2";
inline constexpr std::string_view kQXCellMonitorRadioAccessTechnologyLTE =
    "kQXCellMonitorRadioAccessTechnologyLTE";
inline constexpr std::string_view kQXCellMonitorCellTypeServing = "kQXCellMonitorCellTypeServing";
inline constexpr std::string_view kQXCellMonitorCellTypeNeighbor = "kQXCellMonitorCellTypeNeighbor";

} // namespace ventrik
