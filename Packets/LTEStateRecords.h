#pragma once

#include "Packets/GSMRecords.h"

namespace ventrik
{

// What LTE basebands of today log of their layers above the measurements.

namespace LTEStateRecords
{

// ---- Mobility management. The digits of networks are nibbles as in the serving PLMN. The
// subscriber's temporary identity, the word at 28, identifies a person and is not shown.

inline constexpr std::array<std::string_view, 7> emmStates{"EMM_NULL",
                                                           "EMM_DEREGISTERED",
                                                           "EMM_REGISTERED_INITIATED",
                                                           "EMM_REGISTERED",
                                                           "EMM_TRACKING_AREA_UPDATING_INITIATED",
                                                           "EMM_SERVICE_REQUEST_INITIATED",
                                                           "EMM_DEREGISTERED_INITIATED"};
inline constexpr std::array<std::string_view, 7> deregisteredStates{
    "NO_IMSI",           "PLMN_SEARCH",          "ATTACH_NEEDED",
    "NO_CELL_AVAILABLE", "ATTEMPTING_TO_ATTACH", "NORMAL_SERVICE",
    "LIMITED_SERVICE"};
inline constexpr std::array<std::string_view, 2> registeringStates{"WAITING_FOR_NW_RESPONSE",
                                                                   "WAITING_FOR_ESM_RESPONSE"};
inline constexpr std::array<std::string_view, 6> registeredStates{
    "NORMAL_SERVICE",    "UPDATE_NEEDED", "ATTEMPTING_TO_UPDATE",
    "NO_CELL_AVAILABLE", "PLMN_SEARCH",   "LIMITED_SERVICE"};
constexpr Field emmSubState(std::span<const std::string_view> states)
{
    return {"EMM Sub State", u16(15), labels(states, "Unknown")};
}
inline constexpr Field emmState{"EMM State", u8(14), labels(emmStates, "Unknown")};
/// By the state; the others have no sub-states.
inline constexpr std::array<Field, 6> emmSubStates{{{},
                                                    emmSubState(deregisteredStates),
                                                    emmSubState(registeringStates),
                                                    emmSubState(registeredStates),
                                                    emmSubState(registeredStates),
                                                    emmSubState(registeredStates)}};
inline constexpr std::array<Field, 2> emmNetworkFields{{
    {"Mobile Country Code", bits(17, 0, 12), {.text = GSMRecords::countryCode}},
    {"Mobile Network Code", bits(18, 4, 12), {.text = GSMRecords::networkCode}},
}};
inline constexpr std::array<Field, 4> emmIdentityFields{{
    {"GUTI Mobile Country Code", bits(22, 0, 12), {.text = GSMRecords::countryCode}},
    {"GUTI Mobile Network Code", bits(23, 4, 12), {.text = GSMRecords::networkCode}},
    {"MME Group ID", u16(25)},
    {"MME Code", u8(27)},
}};
inline constexpr std::array<Field, 5> emmUnshown{{
    {"version", u8(13)},
    {"sub-state", u16(15)},
    {"network", bits(17, 0, 24)},
    {"has identity", u8(20)},
    {"kind of identity", u8(21)},
}};
inline constexpr std::array<Field, 1> emmStateFields{emmState};
inline constexpr Record emm{
    .logCode = 0xB0EE,
    .name = "LTE mobility management state",
    .minimumSize = 32,
    .groups = {emmStateFields, emmNetworkFields, emmIdentityFields, emmUnshown},
    .version = u8(13),
    .isExtension = true};

// ---- Radio resource messages: what stands in front of the message. Versions differ in where it
// stands, and in the numbers of the channels.

inline constexpr std::array<std::string_view, 9> channelsFrom1{
    "", "BCCH-BCH", "BCCH-DL-SCH", "MCCH", "PCCH", "DL-CCCH", "DL-DCCH", "UL-CCCH", "UL-DCCH"};
inline constexpr std::array<std::string_view, 16> channelsFrom8{
    "",     "",     "",        "",        "",        "",       "", "", "BCCH-BCH", "BCCH-DL-SCH",
    "MCCH", "PCCH", "DL-CCCH", "DL-DCCH", "UL-CCCH", "UL-DCCH"};
inline constexpr std::array<std::string_view, 10> channelsWithGap{
    "", "BCCH-BCH", "BCCH-DL-SCH", "", "MCCH", "PCCH", "DL-CCCH", "DL-DCCH", "UL-CCCH", "UL-DCCH"};
inline constexpr std::array<std::string_view, 12> channelsWithGaps{
    "",     "BCCH-BCH", "",        "BCCH-DL-SCH", "",        "",
    "MCCH", "PCCH",     "DL-CCCH", "DL-DCCH",     "UL-CCCH", "UL-DCCH"};
inline constexpr std::array<std::string_view, 1> noChannels{""};

struct MessageHeader {
    std::uint16_t bearer; ///< the identity follows it, the frequency follows that
    Place earfcn;
    std::uint16_t time; ///< the channel follows it
    std::uint16_t length;
};
inline constexpr MessageHeader header2{16, u16(19), 21, 24};
inline constexpr MessageHeader header5{16, u16(19), 21, 28};
inline constexpr MessageHeader header8{16, u32(19), 23, 30};
inline constexpr MessageHeader header25{18, u32(21), 25, 32};
constexpr std::array<Field, 7> messageFields(const MessageHeader& header,
                                             std::span<const std::string_view> channels)
{
    const auto behind = [](std::uint16_t offset, unsigned bytes) {
        return static_cast<std::uint16_t>(offset + bytes);
    };
    return {{
        {"Channel", u8(behind(header.time, 2)), labels(channels, "Unknown")},
        {"Physical Cell ID", u16(behind(header.bearer, 1)), physicalCellIdentity},
        {"E-ARFCN", header.earfcn, downlinkEARFCN},
        {"System Frame Number", bits(header.time, 4, 10)},
        {"Subframe Number", bits(header.time, 0, 4)},
        {"Radio Bearer", u8(header.bearer)},
        {"Length", u16(header.length)},
    }};
}
inline constexpr std::array<Field, 1> messageUnshown{{{"version", u8(13)}}};
constexpr Record message(std::size_t size, std::span<const Field> fields)
{
    return {.logCode = 0xB0C0,
            .name = "LTE radio resource message",
            .minimumSize = size,
            .groups = {fields, messageUnshown},
            .version = u8(13),
            .isExtension = true};
}
inline constexpr auto messageFields2 = messageFields(header2, channelsFrom1);
inline constexpr auto messageFields5 = messageFields(header5, noChannels);
inline constexpr auto messageFields6 = messageFields(header5, channelsFrom1);
inline constexpr auto messageFields8 = messageFields(header8, channelsFrom1);
inline constexpr auto messageFields9 = messageFields(header8, channelsFrom8);
inline constexpr auto messageFields10 = messageFields(header8, noChannels);
inline constexpr auto messageFields14 = messageFields(header8, channelsWithGap);
inline constexpr auto messageFields19 = messageFields(header8, channelsWithGaps);
inline constexpr auto messageFields25 = messageFields(header25, channelsWithGap);
inline constexpr auto messageFields26 = messageFields(header25, channelsWithGaps);
// Up to where the message begins.
inline constexpr Record message2 = message(26, messageFields2);
inline constexpr Record message5 = message(30, messageFields5);
inline constexpr Record message6 = message(30, messageFields6);
inline constexpr Record message8 = message(32, messageFields8);
inline constexpr Record message9 = message(32, messageFields9);
inline constexpr Record message10 = message(32, messageFields10);
inline constexpr Record message14 = message(32, messageFields14);
inline constexpr Record message19 = message(32, messageFields19);
inline constexpr Record message25 = message(34, messageFields25);
inline constexpr Record message26 = message(34, messageFields26);
inline constexpr Record message30 = message(37, messageFields26);

} // namespace LTEStateRecords

} // namespace ventrik
