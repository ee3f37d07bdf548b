#pragma once

#include "Packets/ShownNumbers.h"
#include "Packets/Subpackets.h"

namespace ventrik
{

// The records of CDMA2000 basebands, 1x and EV-DO. The keys are those of the template's lookup. Bit
// fields are those of little-endian words.

namespace C2KRecords
{

// The blank that is missing in class 9 is missed by nobody who searches for the label.
inline constexpr std::array<std::string_view, 13> bandClassLabels{
    "800 MHz cellular band [0]",
    "1.8 to 2.0GHz PCS band [1]",
    "872 to 960MHz TACS band [2]",
    "832 to 925MHz JTACS band [3]",
    "1.75 to 1.87GHz Korean PCS band [4]",
    "450MHz band [5]",
    "2GHz band [6]",
    "700MHz band [7]",
    "1800 MHz band [8]",
    "900 MHzband [9]",
    "Secondary 800 MHz band [10]",
    "400 MHz European PAMR band [11]",
    "800 MHz European PAMR band [12]"};
inline constexpr Shown bandClass = labels(bandClassLabels, "[Bad Value {}]");

// A strength in dB, of steps of 1/512; of 0 it is minus infinity.
double strengthInDb(std::int64_t steps);
inline constexpr Shown pilotStrength{
    .digits = Digits::SignedTwoDecimals, .unit = "dB", .scale = strengthInDb};

// 1x finger C/I. The packet ends with its last finger.
inline constexpr std::int64_t unassignedFinger = 0xFFFF;
inline constexpr Field fingerPNOffset{"PN offset", u16(0)};
inline constexpr Field fingerRatio{"C/I", u16(6), pilotStrength};
inline constexpr std::array<Field, 2> fingerFields{fingerPNOffset, fingerRatio};
inline constexpr List fingers{
    .offset = 23,
    .stride = 14,
    .needed = 14,
    .count = {u8(22)},
    .fields = fingerFields,
};
inline constexpr Field fingerGroup{"kFingerC2I", {}};
inline constexpr Record fingerC2I{0x108A, "1x finger C/I", 23, {}, {&fingers}};

// EV-DO status, exactly 50 bytes
inline constexpr std::array<std::string_view, 6> evdoDeviceStates{
    "Inactive [0]", "Acquisition [1]", "Sync [2]", "Idle [3]", "Access [4]", "Connected [5]"};
inline constexpr std::array<std::string_view, 5> sessionStates{
    "Closed [0]", "AMP setup [1]", "AT-initiated neg [2]", "Initiated neg [3]", "Open [4]"};
inline constexpr std::array<Mark, 1> noPNOffset{{{0xFFFF, "Invalid Value"}}};
inline constexpr Field evdoDeviceState{"k1xEVDODeviceState", u8(36),
                                       labels(evdoDeviceStates, "[Reserved {}]")};
inline constexpr Field evdoReceive1{"kRxAGC1", i8(16), signedWholeDbm()};
inline constexpr Field evdoTransmit{"kTxAGC", i8(17), signedWholeDbm()};
inline constexpr std::array<Field, 8> evdoStatusFields{{
    {"kChannel", bits(13, 0, 11)},
    evdoDeviceState,
    {"kBandClass", bits(14, 3, 5), bandClass},
    {"kRxAGC0", i8(15), signedWholeDbm()},
    {"kServingPNOffset", u16(18), {.unit = "× 64chips", .marks = noPNOffset}},
    {"kSessionState", u8(37), labels(sessionStates, "[Reserved {}]")},
    {"kUATI24", bits(38, 0, 24), {.digits = Digits::SixHexDigits}},
    {"kColorCode", u8(41)},
}};
// Before the access state only the first chain receives, and nothing is sent.
inline constexpr std::array<Field, 2> evdoActiveFields{evdoReceive1, evdoTransmit};
inline constexpr Record evdoStatus{
    0x1183, "EV-DO status", 50, {evdoStatusFields, evdoActiveFields}};

// EV-DO forward-link packets: a counter for each kind
inline constexpr std::array<Field, 1> forwardPacketsUnshown{{{"sequence number", u32(13)}}};
inline constexpr std::array<Field, 1> packetCounterFields{{{"packets", u32(0)}}};
inline constexpr std::size_t forwardKindCount = 56;
inline constexpr RecordElements forwardCounters{17, 4, forwardKindCount, 4};
inline constexpr Record forwardPackets{
    0x1192, "EV-DO forward-link packets", 241, {forwardPacketsUnshown}};

// EV-DO reverse-link packets: three blocks of 576 bytes, each of two halves of 288: for each of 12
// payload sizes 24 bytes, of which the first 16 are four counters
inline constexpr std::array<Field, 1> reversePacketsUnshown{{{"sequence number", u32(14)}}};
inline constexpr std::size_t payloadSizeCount = 12;
inline constexpr std::size_t countersForPayloadSize = 4;
inline constexpr RecordElements reverseCounters{18, 24, 6 * payloadSizeCount, 16};
inline constexpr Record reversePackets{
    0x127E, "EV-DO reverse-link packets", 1750, {reversePacketsUnshown}};

// Active-set pilot strengths
inline constexpr Field pilotPNOffset{"PN offset", u16(0)};
inline constexpr Field pilotLevel{"strength", u16(2), pilotStrength};
inline constexpr std::array<Field, 2> activeSetPilotFields{pilotPNOffset, pilotLevel};
inline constexpr List activeSetPilotList{
    .offset = 25,
    .stride = 12,
    .needed = 12,
    .count = {u8(15)},
    .fields = activeSetPilotFields,
};
inline constexpr Field activeSetPilotGroup{"kActiveSetPilots", {}};
inline constexpr Record activeSetPilots{
    0x12B6, "EV-DO active-set pilot strengths", 25, {}, {&activeSetPilotList}};

// 1x status, a record of subpackets
inline constexpr std::array<std::string_view, 12> deviceStates{
    "Inactive [0]",
    "Deep sleep in start state [1]",
    "Initial state for CDMA operation [2]",
    "Acquisition [3]",
    "Sync [4]",
    "Slew [5]",
    "Paging [6]",
    "Slotted mode sleep state [7]",
    "Traffic [8]",
    "UnSlew [9]",
    "Operation in PCG state [10]",
    "Powerup state [11]"};
inline constexpr Field deviceState{"k1xDeviceState", u8(4), labels(deviceStates, "[Bad Value {}]")};
inline constexpr std::array<Field, 1> stateFields{deviceState};
inline constexpr Subpacket statePart{1, stateFields};

inline constexpr Shown receiveAGC = signedDbm(0.334, -63.248);
inline constexpr std::array<Field, 7> radioFields{{
    {"k1xRx0BandClass", u8(4), bandClass},
    {"k1xRx0ChanNum", u16(6)},
    {"k1xRxAGC0", i8(10), receiveAGC},
    // Outside traffic only the first chain receives, and nothing is sent.
    {"k1xRx1BandClass", u8(5), bandClass},
    {"k1xRx1ChanNum", u16(8)},
    {"k1xRxAGC1", i8(11), receiveAGC},
    {"k1xTxAGC", i16(12), signedDbm(0.1, 0)},
}};
inline constexpr std::size_t alwaysShownRadioFields = 3;
inline constexpr Subpacket radioPart{2, radioFields};

// N, M and E scale the energies. As F tells, a pilot has 12 to 1544 bytes.
inline constexpr Field scaleN{"N", u16(4)};
inline constexpr Field scaleM{"M", u8(6)};
inline constexpr Field scaleE{"E", u8(7)};
inline constexpr Field pilotCount{"pilots", u8(8)};
inline constexpr Field furtherFields{"F", u8(9)};
inline constexpr Field referencePNOffset{"reference PN offset", u16(10)};
inline constexpr std::array<Field, 6> activeSetFields{scaleN,     scaleM,        scaleE,
                                                      pilotCount, furtherFields, referencePNOffset};
inline constexpr Field activeSetInfo{"k1xActiveSetInfo", {}};
inline constexpr Subpacket activeSetPart{3, activeSetFields};
inline constexpr std::size_t firstPilot = 12;
inline constexpr std::size_t pilotSize(std::size_t fieldCount)
{
    return (6 * fieldCount + 15) & 0xFFC;
}
inline constexpr std::array<Field, 2> pilotFields(std::size_t fieldCount)
{
    return {
        {{"PN offset", u16(0)}, {"energy", u16(static_cast<std::uint16_t>(4 * fieldCount + 12))}}};
}

inline constexpr Subpacket fingerPart{4}; // of which nothing shows
inline constexpr Record oneXStatus{0x119C, "1x status", Subpackets::minimumSize};

// 1x traffic frame erasure, a record of subpackets
inline constexpr Field frameErasure{"frame erased", u8(24)};
inline constexpr std::array<Field, 1> demodulationFields{frameErasure};
inline constexpr Subpacket demodulationPart{11, demodulationFields};
inline constexpr Record oneXTraffic{0x119D, "1x traffic", Subpackets::minimumSize};

// 1x serving system, version 2 at least. Longer records name the base station.
inline constexpr std::array<std::string_view, 13> roamingLabels{
    "OFF [0]",
    "ON [1]",
    "Flashing [2]",
    "Out of Neighborhood [3]",
    "Out of Building [4]",
    "Preferred system [5]",
    "Available system [6]",
    "Alliance partner [7]",
    "Premium partner [8]",
    "Full service functionality [9]",
    "Partial service functionality [10]",
    "Banner ON [11]",
    "Banner OFF [12]"};
inline constexpr Field servingSystemVersion{"version", u8(13)};
inline constexpr Field systemType{"system type", i32(46)};
inline constexpr std::array<Field, 2> servingSystemUnshown{servingSystemVersion, systemType};
inline constexpr std::array<Field, 1> roamingFields{{
    {"k1xRoamingHome", i32(42), labels(roamingLabels, "ERI - {}")},
}};
inline constexpr std::array<Field, 2> systemNumberFields{{
    {"kSystemId", u16(50)},
    {"kNetworkId", u16(52)},
}};
inline constexpr Field packetZone{"kPacketZoneId", u8(131)};
inline constexpr Field protocolRevision{"kProtocolRevision", u8(133)};
inline constexpr Field baseStation{"kBaseId", u16(184)};
inline constexpr std::size_t sizeWithBaseStation = 186;
inline constexpr std::array<Field, 3> servingSystemFields{packetZone, baseStation,
                                                          protocolRevision};
inline constexpr Record servingSystem{
    0x134F, "1x serving system",
    171,    {servingSystemUnshown, roamingFields, systemNumberFields, servingSystemFields},
    {},     u8(13)};

} // namespace C2KRecords

} // namespace ventrik
