#pragma once

#include "Packets/ShownNumbers.h"

namespace ventrik
{

// The records of GSM/UMTS basebands: those of mobility management, of the GSM cell, and of UMTS.
// Bit fields are those of little-endian words.

namespace GSMRecords
{

// Serving PLMN. The network's digits are nibbles, the low one of a byte first: country 1, 2 |
// country 3, network 3 | network 1, 2.
std::string countryCode(std::int64_t nibbles);
std::string networkCode(std::int64_t nibbles);
inline constexpr std::array<std::string_view, 5> serviceTypes{"NO_SERVICE", "CS_ONLY", "PS_ONLY",
                                                              "CS_PS_SERVICE", "LIMITED_SERVICE"};
inline constexpr std::array<std::string_view, 3> operatingModes{"Class 1", "Class 2", "Class 3"};
inline constexpr std::array<Field, 5> servingPLMNFields{{
    {"Mobile Country Code", bits(15, 0, 12), {.text = countryCode}},
    {"Mobile Network Code", bits(16, 4, 12), {.text = networkCode}},
    {"Location Area Code", u16BigEndian(18)},
    {"Routing Area Code", u8(20)},
    {"Service Type", u8(14), labels(serviceTypes, "Unknown")},
}};
inline constexpr std::array<Field, 1> networkModeFields{{
    {"Network Operating Mode", u8(13), labels(operatingModes, "Unknown")},
}};
inline constexpr Record servingPLMN{
    0x7135, "Serving PLMN", 32, {servingPLMNFields, networkModeFields}};

// Equivalent PLMNs. They lie 3 bytes apart: the second half of one is the first half of the next.
// Each byte is a decimal digit, country and network code taking turns.
double digitsOfEverySecondByte(std::int64_t bytes);
inline constexpr Shown threeDigits{.scale = digitsOfEverySecondByte};
inline constexpr std::array<Field, 2> equivalentPLMNFields{{
    {"Mobile Country Code", bits(0, 0, 40), threeDigits},
    {"Mobile Network Code", bits(1, 0, 40), threeDigits},
}};
inline constexpr std::array<Field, 1> equivalentPLMNUnshown{{{"digits", bits(0, 0, 48)}}};
inline constexpr List equivalentPLMNList{
    .offset = 17,
    .stride = 3,
    .needed = 6,
    .count = {u8(16)},
    .fields = equivalentPLMNFields,
    .unshown = equivalentPLMNUnshown,
};
inline constexpr Record equivalentPLMNs{0x7150, "Equivalent PLMNs", 17, {}, {&equivalentPLMNList}};

// Registration
inline constexpr std::array<std::string_view, 7> registrationStates{
    "REG_STATE_INACTIVE",      "REG_STATE_IDLE",          "REG_STATE_REGISTERING",
    "REG_STATE_DEREGISTERING", "REG_STATE_MANUAL_SEARCH", "REG_STATE_AUTOMATIC_SEARCH",
    "REG_STATE_OFFLINE"};
inline constexpr std::array<std::string_view, 5> selectionModes{
    "Automatic", "Manual", "Limited", "LIMITED_ROUTINE_ACQ", "LIMITED_MANUAL_ACQ"};
inline constexpr std::array<Field, 1> registrationStateFields{{
    {"MM Service State", u8(13), labels(registrationStates, "Unknown")},
}};
inline constexpr std::array<Field, 1> selectionModeFields{{
    {"PLMN Sel Mod", u8(14), labels(selectionModes, "Unknown")},
}};
inline constexpr Record registration{
    0x7132, "Registration", 16, {registrationStateFields, selectionModeFields}};

// Circuit-switched mobility management. Two labels carry a blank behind an underscore, and are
// shown so.
inline constexpr std::array<std::string_view, 26> mmStates{
    "MM_NULL",
    "",
    "",
    "MM_LOCATION_UPDATE_INITIATED",
    "",
    "MM_WAIT_FOR_OUTGOING_MM_CONNECTION",
    "MM_CONNECTION_ACTIVE",
    "MM_IMSI_DETACH_INITIATED",
    "MM_PROCESS_CM_SERVICE_PROMPT",
    "MM_WAIT_FOR_NETWORK_COMMAND",
    "MM_LOCATION_UPDATE_REJECTED",
    "",
    "",
    "MM_WAIT_FOR_RR_CONNECTION_LU",
    "MM_WAIT_FOR_RR_CONNECTION_MM",
    "MM_WAIT_FOR_RR_CONNECTION_IMSI_DETACH",
    "",
    "MM_REESTABLISHMENT_INITIATED",
    "MM_WAIT_FOR_RR_ACTIVE",
    "MM_IDLE",
    "MM_WAIT_FOR_ADDITIONAL_OUTGOING_MM_ CONNECTION",
    "MM_WAIT_FOR_RR_CONNECTION_ REESTABLISHMENT",
    "MM_WAIT_FOR_REESTABLISH_DECISION",
    "MM_LOCATION_UPDATING_PENDING",
    "",
    "MM_RR_CONNECTION_RELEASE_NOT_ALLOWED",
};
inline constexpr std::array<std::string_view, 9> mmSubStates{
    "MM_NULL_SUBSTATE",        "MM_NO_IMSI",
    "MM_PLMN_SEARCH",          "MM_LIMITED_SERVICE",
    "MM_ATTEMPTING_TO_UPDATE", "MM_LOCATION_UPDATE_NEEDED",
    "MM_NO_CELL_AVAILABLE",    "MM_PLMN_SEARCH_NORMAL_SERVICE",
    "MM_NORMAL_SERVICE"};
inline constexpr std::array<std::string_view, 4> locationUpdateStatuses{
    "UPDATED", "NOT_UPDATED", "ROAMING_NOT_ALLOWED", "LOCATION_AREA_NOT_ALLOWED"};
inline constexpr std::array<Field, 3> mmStateFields{{
    {"MM State", u8(13), labels(mmStates, "Unknown")},
    {"MM Sub State", u8(14), labels(mmSubStates, "Unknown")},
    {"LU Reject Cause", u8(15), labels(locationUpdateStatuses, "Unknown")},
}};
inline constexpr Record mmState{0x7131, "CS mobility management state", 16, {mmStateFields}};

// Packet-switched mobility management. The keys are the circuit-switched ones: one name for one
// kind of state in either domain.
inline constexpr std::array<std::string_view, 7> gmmStates{
    "GMM_NULL",
    "GMM_DEREGISTERED",
    "GMM_REGISTERED_INITIATED",
    "GMM_REGISTERED",
    "GMM_DEREGISTERED_INITIATED",
    "GMM_ROUTING_AREA_UPDATE_INITIATED",
    "GMM_SERVICE_REQUEST_INITIATED",
};
inline constexpr std::array<std::string_view, 13> gmmSubStates{
    "GMM_NORMAL_SERVICE",
    "GMM_LIMITED_SERVICE",
    "GMM_ATTACH_NEEDED",
    "GMM_ATTEMPTING_TO_ATTACH",
    "GMM_NO_IMSI",
    "GMM_NO_CELL_AVAILABLE",
    "GMM_PLMN_SEARCH",
    "GMM_SUSPENDED",
    "GMM_UPDATE_NEEDED",
    "GMM_ATTEMPING_TO_UPDATE",
    "GMM_ATTEMPTING_TO_UPDATE_MM",
    "GMM_IMSI_DETACH_INITIATED",
    "GMM_NULL_SUBSTATE",
};
inline constexpr std::array<std::string_view, 4> gmmUpdateStatuses{
    "GMM_GU1_UPDATED",
    "GMM_GU2_NOT_UPDATED",
    "GMM_GU3_PLMN_NOT_ALLOWED",
    "GMM_GU3_ROUTING_AREA_NOT_ALLOWED",
};
inline constexpr std::array<Field, 3> gmmStateFields{{
    {"MM State", u8(13), labels(gmmStates, "Unknown")},
    {"MM Sub State", u8(14), labels(gmmSubStates, "Unknown")},
    {"Attach Reject Cause", u8(15), labels(gmmUpdateStatuses, "Unknown")},
}};
inline constexpr Record gmmState{0x7130, "PS mobility management state", 16, {gmmStateFields}};

// GSM radio resource state. The blanks are the labels' own.
inline constexpr std::array<std::string_view, 22> rrStates{
    "RR_INACTIVE",
    "RR_GOING_ACTIVE",
    "RR_GOING_INACTIVE",
    "RR_CELL_SELECTION",
    "RR_PLMN_LIST_CONSTRUCTION",
    "RR_IDLE",
    "RR_CELL_RESELECTION",
    "RR_CONNECTION_PENDING",
    "RR_CHOOSE_CELL",
    "RR_DATA_TRANSFER",
    "RR_NO_CHANNELS",
    "RR_CONNECTION_RELEASE",
    "RR_EARLY_CAMPED_WAIT_FOR_SI",
    "RR_W2G_INTERRAT_HANDOVER_ PROGRESS",
    "RR_W2G_INTERRAT_RESELECTION_PROGRESS",
    "RR_WAIT_FOR_EARLY_PSCAN",
    "GRR51",
    "GRR52",
    "RR_G2W_INTERRAT_RESELECTION_PROGRESS",
    "RR_G2W_INTERRAT_HANDOVER_ PROGRESS",
    "RR_CELL_REEST",
    "RR_W2G_INTERRAT_CC_ORDER_ PROGRESS",
};
inline constexpr std::array<std::string_view, 1> voiceLabel{"Voice"};
inline constexpr std::array<Field, 4> rrStateFields{{
    {"RR State", u8(13), labels(rrStates, "Unknown")},
    {"RR Sub State", u8(14)},
    {"RR Status", u8(15)},
    {"RR Mode", u8(16), labels(voiceLabel, "Data")},
}};
inline constexpr Record rrState{0x512C, "GSM RR state", 17, {rrStateFields}};

// Discontinuous transmission
inline constexpr std::array<std::string_view, 1> offLabel{"OFF"};
inline constexpr std::array<Field, 1> dtxFields{{{"DTX Used", u8(19), labels(offLabel, "ON")}}};
inline constexpr Record dtx{0x5072, "GSM discontinuous transmission", 20, {dtxFields}};

// Serving cell identity
inline constexpr std::array<Field, 3> cellIdentityFields{{
    {"Cell ID", u16(17)},
    {"ARFCN", u16(13)},
    {"BSIC", u16(15)},
}};
inline constexpr Record cellIdentity{0x5134, "GSM serving cell identity", 26, {cellIdentityFields}};

// Idle measurements. The words at 16 and 20 are two quantities in one place: criteria in 16 bits,
// qualities in 32. The level comes without its sign.
inline constexpr std::array<std::string_view, 1> notAppliedLabel{"Not Applied"};
inline constexpr std::array<Field, 3> idleCriteriaFields{{
    {"RSSI", u8(15), wholeDbm()},
    {"C1 Value", u16(16)},
    {"C2 Value", u16(20)},
}};
inline constexpr std::array<Field, 3> idleQualityFields{{
    {"Serving Rx Level", u8(15)},
    {"Rx Quality Full", i32(16)},
    {"Rx Quality Sub", i32(20)},
}};
inline constexpr std::array<Field, 1> idleHysteresisFields{{
    {"Cell Reselect Hysteresis", u8(26), labels(notAppliedLabel, "Applied")},
}};
inline constexpr std::array<Field, 3> idleNeighborFields{{
    {"ARFCN", u16(0)},
    {"RSSI", u8(2)},
    {"C1 Value", i32(3)},
}};
inline constexpr List idleNeighbors{
    .offset = 29,
    .stride = 14,
    .needed = 7,
    .count = {u8(28)},
    .fields = idleNeighborFields,
};
inline constexpr Record idleMeasurements{
    0x5137,
    "GSM idle measurements",
    29,
    {idleCriteriaFields, idleQualityFields, idleHysteresisFields},
    {&idleNeighbors}};

// Dedicated channel: of the mobile allocation's ARFCN the low byte shows.
inline constexpr std::array<Field, 1> dedicatedChannelFields{{{"MA Dedicated ARFCN", u8(13)}}};
inline constexpr std::array<Field, 1> dedicatedChannelUnshown{{{"ARFCN", u16(13)}}};
inline constexpr Record dedicatedChannel{
    0x5076, "GSM dedicated channel", 17, {dedicatedChannelFields, dedicatedChannelUnshown}};

// BSIC list
inline constexpr std::array<Field, 2> bsicFields{{
    {"ARFCN", u16(0)},
    {"BSIC", u8(2)},
}};
inline constexpr List bsics{
    .offset = 15,
    .stride = 4,
    .needed = 3,
    .count = {u8(14)},
    .fields = bsicFields,
};
inline constexpr Record bsicList{0x51FF, "GSM BSIC list", 15, {}, {&bsics}};

// Mobile allocation
inline constexpr std::array<Field, 1> mobileAllocationFields{{{"HSN", u8(13)}}};
inline constexpr std::array<Field, 1> frequencyFields{{{"", u16(0)}}};
inline constexpr List frequencies{
    .key = "ARFCNs",
    .offset = 15,
    .stride = 2,
    .needed = 2,
    .count = {u8(14)},
    .fields = frequencyFields,
};
inline constexpr Record mobileAllocation{
    0x51F8, "GSM mobile allocation", 15, {mobileAllocationFields}, {&frequencies}};

// Packet options. 255 is what the baseband writes for a value that the cell did not tell.
inline constexpr std::array<Mark, 1> untold{{{255, "Not Available"}}};
inline constexpr std::array<Mark, 1> untoldFlowContext{{{255, "Available"}}};
inline constexpr std::array<std::string_view, 3> networkControlOrders{"NC0", "NC1", "NC2"};
inline constexpr std::array<std::string_view, 2> supports{"Not Supported", "Supported"};
inline constexpr std::array<std::string_view, 8> priorityAccesses{
    "Barred (PKT access not allowed in the Cell)",
    "Barred",
    "Barred",
    "1 Only",
    "1 to 2",
    "1 to 3",
    "1 to 4",
    "Allowed",
};
inline constexpr std::array<Field, 3> packetOptionsFields{{
    {"Network Control Order", u8(15), marked(labels(networkControlOrders, "Unknown"), untold)},
    {"PFC Supported", u8(13), marked(labels(supports, "Unknown"), untoldFlowContext)},
    {"Priority Access Threshold", u8(14), marked(labels(priorityAccesses, "Unknown"), untold)},
}};
inline constexpr Record packetOptions{0x51F5, "GPRS packet options", 18, {packetOptionsFields}};

// Cell options
inline constexpr std::array<std::string_view, 8> t3192Values{
    "500 ms", "1000 ms", "1500 ms", "0 ms", "80 ms", "120 ms", "160 ms", "200 ms"};
inline constexpr std::array<std::string_view, 1> shortBurstLabel{"8-bit format"};
inline constexpr std::array<Field, 3> cellOptionsFields{{
    {"T3192", u8(15), labels(t3192Values, "?? ms")},
    {"Access Burst Type", u8(17), labels(shortBurstLabel, "11-bit format")},
    {"DRX Timer Max", u8(16)},
}};
inline constexpr std::array<Field, 1> drxFields{{{"DRX Used", u8(16), {.unit = "sec"}}}};
inline constexpr Record cellOptions{
    0x51F6, "GPRS cell options", 24, {cellOptionsFields, drxFields}};

// Packet broadcast channel
inline constexpr std::array<Field, 1> broadcastChannelFields{{{"PBCCH Present", u8(13)}}};
inline constexpr Record broadcastChannel{
    0x51FB, "GPRS packet broadcast channel", 34, {broadcastChannelFields}};

// Measurement order
inline constexpr std::array<std::string_view, 1> notSupportedLabel{"Not Supported"};
inline constexpr std::array<Field, 5> measurementOrderFields{{
    {"Ext Measurement Order", u8(16)},
    {"Packet PSI Status", u8(13)},
    {"Packet SI Status", u8(33), labels(notSupportedLabel, "Supported")},
    {"Count LR", u8(14)},
    {"Count HR", u8(15)},
}};
inline constexpr Record measurementOrder{
    0x51FD, "GPRS measurement order", 35, {measurementOrderFields}};

// SI13: where the cell sends it
inline constexpr std::array<std::string_view, 2> si13Positions{"Located on BCCH",
                                                               "Located on Extended BCCH"};
inline constexpr std::array<Field, 1> si13Fields{{
    {"SI13 Position", u8(14), marked(labels(si13Positions, "Unknown"), untold)},
}};
inline constexpr Record si13{0x51F4, "GPRS SI13", 15, {si13Fields}};

// UMTS RRC state
inline constexpr std::array<std::string_view, 6> rrcStates{
    "Disconnected", "Connecting", "CELL_FACH", "CELL_DCH", "CELL_PCH", "URA_PCH"};
inline constexpr std::array<Field, 1> rrcStateFields{{
    {"RRC State", u8(13), labels(rrcStates, "Unknown")},
}};
inline constexpr Record rrcState{0x4125, "UMTS RRC state", 14, {rrcStateFields}};

// Transmit power: samples in tenths of a dB above -18.8 dBm, 0: no sample. Their mean shows.
inline constexpr Field transmitPowerMean{"Transmit Power", {}, dbm()};
inline constexpr std::array<Field, 1> powerSampleFields{{{"power", i16(4)}}};
inline constexpr List powerSamples{
    .offset = 16,
    .stride = 14,
    .needed = 6,
    .count = {u8(14)},
    .fields = powerSampleFields,
};
inline constexpr Record transmitPower{0x4031, "UMTS transmit power", 16, {}, {&powerSamples}};

// UMTS serving cell
inline constexpr std::array<Field, 4> umtsCellFields{{
    {"Cell ID", i32(21)},
    {"Downlink Frequency", i32(17)},
    {"Uplink Frequency", i32(13)},
    {"URA ID", u16(25)},
}};
inline constexpr Record umtsCell{0x4127, "UMTS serving cell", 29, {umtsCellFields}};

// Security
inline constexpr std::array<std::string_view, 1> disabledLabel{"Disabled"};
inline constexpr std::array<Field, 1> securityFields{{
    {"Ciphering", u8(13), labels(disabledLabel, "Enabled")},
}};
inline constexpr Record security{0x4157, "UMTS security", 19, {securityFields}};

// UMTS cell list with energies. Of a cell the set type 0 is the active set; of its energies the
// first that is not 0 counts.
inline constexpr std::array<Field, 2> listedCellFields{{
    {"scrambling code", bits(7, 0, 13)},
    {"set type", bits(8, 5, 3)},
}};
inline constexpr std::array<Field, 3> energyFields{{
    {"first Ec/Io", u32(32)},
    {"second Ec/Io", u32(36)},
    {"third Ec/Io", u32(40)},
}};
// The level is a code power; its unit is shown as dB all the same.
inline constexpr std::array<Field, 3> activeSetFields{{
    {"Scrambling Code", bits(7, 0, 13)},
    {"RSCP", {}, wholeDb()},
    {"Energy Per Chip", {}, wholeDb()},
}};
inline constexpr std::array<Field, 1> cellListUnshown{{{"receive AGC", i16(13)}}};
inline constexpr Place listedCellCount = u8(15);
inline constexpr List listedCells{
    .offset = 16,
    .stride = 15,
    .needed = 9,
    .count = {listedCellCount},
    .fields = listedCellFields,
};
inline constexpr List energies{
    .offset = 16,
    .stride = 44,
    .needed = 44,
    .count = {listedCellCount},
    .fields = energyFields,
    .before = {listedCellCount, 15},
};
inline constexpr Record cellList{
    0x417A, "UMTS cell list", 16, {cellListUnshown}, {&listedCells, &energies}};

// Ranked reselection candidates. Both lists begin at 15: the GSM cells of a record that has both
// kinds lie over the UMTS cells.
inline constexpr std::array<Field, 6> rankedUMTSCellFields{{
    {"Scrambling Code", u16(2)},
    {"RSCP", i8(4), wholeDb(1, -21)},
    {"Energy Per Chip", i8(7), {.digits = Digits::SixDecimals, .factor = 0.5, .unit = "dB"}},
    {"Downlink Frequency", i16(0)},
    {"Ranking Value", i16(8)},
    {"Rank Cell RSCP", i16(5), wholeDb()},
}};
inline constexpr std::array<Field, 4> rankedGSMCellFields{{
    {"ARFCN", u16(0)},
    {"BSIC", u16(2)},
    {"RSSI", i8(4), wholeDbm()},
    {"Ranking Value", i16(5)},
}};
inline constexpr List rankedUMTSCells{
    .offset = 15,
    .stride = 10,
    .needed = 10,
    .count = {u8(13)},
    .fields = rankedUMTSCellFields,
};
inline constexpr List rankedGSMCells{
    .offset = 15,
    .stride = 7,
    .needed = 7,
    .count = {u8(14)},
    .fields = rankedGSMCellFields,
};
inline constexpr Record rankedCells{
    0x4005, "UMTS ranked cells", 15, {}, {&rankedUMTSCells, &rankedGSMCells}};

// Block errors; the counters show signed.
inline constexpr std::array<Field, 1> blockErrorsFields{{{"Window Size", u16(14)}}};
inline constexpr std::array<Field, 3> transportChannelFields{{
    {"Transport Channel ID", u8(0)},
    {"CRC Received", i32(1)},
    {"CRC Received in Error", i32(5)},
}};
inline constexpr List transportChannels{
    .key = "Transport Channels",
    .offset = 16,
    .stride = 9,
    .needed = 9,
    .count = {u8(13)},
    .fields = transportChannelFields,
};
inline constexpr Record blockErrors{
    0x4116, "UMTS block errors", 16, {blockErrorsFields}, {&transportChannels}};

// HSDPA. The record keeps room for 18 elements behind each primary process, whatever it fills.
inline constexpr std::array<std::string_view, 4> carrierConfigurations{"Single Carrier", "MIMO",
                                                                       "Dual Carrier", "Reserved"};
inline constexpr std::array<Field, 3> hsdpaFields{{
    {"Version", u8(13)},
    {"Sub Frames", bits(14, 0, 10)},
    {"Carrier Info", bits(15, 2, 2), labels(carrierConfigurations, "Reserved")},
}};
inline constexpr std::array<Field, 4> harqProcessFields{{
    {"Process ID", u8(0)},
    {"No Rx Bits", u32(1)},
    {"New Tx", u16(5)},
    {"Block Errors", u16(7)},
}};
inline constexpr List primaryProcesses{
    .key = "Primary HARQ Process",
    .offset = 18,
    .stride = 9,
    .needed = 9,
    .count = {u8(16)},
    .fields = harqProcessFields,
};
inline constexpr List secondaryProcesses{
    .key = "Secondary HARQ Process",
    .offset = 18,
    .stride = 9,
    .needed = 9,
    .count = {u8(17)},
    .fields = harqProcessFields,
    .before = {u8(16), 162},
};
inline constexpr Record hsdpa{
    0x4221, "HSDPA", 18, {hsdpaFields}, {&primaryProcesses, &secondaryProcesses}, u8(13)};

} // namespace GSMRecords

} // namespace ventrik
