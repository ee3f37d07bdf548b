#include "LogGenerator/C2K/EVDOStatus.h"

#include "LogGenerator/C2K/BandClass.h"
#include "LogGenerator/C2K/C2KOutput.h"
#include "LogGenerator/Orbel/Labels.h"
#include "Packets/LogPacket.h"
#include "LogGenerator/Orbel/ValueText.h"

#include <array>

namespace ventrik
{

namespace
{

constexpr std::size_t recordSize = 50;
constexpr std::uint8_t accessState = 4;
constexpr std::uint16_t invalidPNOffset = 0xFFFF;

constexpr std::array<std::string_view, 6> deviceStateLabels{
    "Inactive [0]", "Acquisition [1]", "Sync [2]", "Idle [3]", "Access [4]", "Connected [5]"};

constexpr std::array<std::string_view, 5> sessionStateLabels{
    "Closed [0]", "AMP setup [1]", "AT-initiated neg [2]", "Initiated neg [3]", "Open [4]"};

std::string labelOrReserved(std::span<const std::string_view> labels, std::uint8_t value)
{
    return std::string(labelOr(labels, value, fmt::format("[Reserved {}]", value)));
}

} // namespace

// EV-DO status, 0x1183, exactly 50 bytes
//   13 11 bits channel | 14.3 5 bits band class | 15, 16 i8 receive AGC of both chains, dBm
//   17 i8 transmit AGC, dBm | 18 u16 serving PN offset | 36 u8 device state | 37 u8 session state
//   38 24 bits UATI | 41 u8 color code
void decodeEVDOStatus(const LogPacket& packet, const C2KOutput& output)
{
    if (packet.size() != recordSize) {
        output.log().error("Log code 0x1183 is {} bytes long but should be {} bytes.",
                           packet.size(), recordSize);
        return;
    }
    const std::uint8_t deviceState = packet.u8(36);
    const std::uint16_t pnOffset = packet.u16(18);
    // Before the access state only the first chain receives, and nothing is sent.
    const bool isActive = deviceState >= accessState;

    output.publish("kChannel", decimal(packet.u16(13) & 0x7FF));
    output.publish("k1xEVDODeviceState", labelOrReserved(deviceStateLabels, deviceState));
    output.publish("kBandClass", bandClassLabel(packet.u8(14) >> 3));
    output.publish("kRxAGC0", signedWholeDbm(packet.i8(15)));
    output.publish("kRxAGC1", isActive ? signedWholeDbm(packet.i8(16)) : "N/A");
    output.publish("kTxAGC", isActive ? signedWholeDbm(packet.i8(17)) : "N/A");
    output.publish("kServingPNOffset", pnOffset == invalidPNOffset
                                           ? "Invalid Value"
                                           : fmt::format("{} × 64chips", pnOffset));
    output.publish("kSessionState", labelOrReserved(sessionStateLabels, packet.u8(37)));
    output.publish("kUATI24", fmt::format("0x{:06x}", packet.u32(38) & 0xFFFFFF));
    output.publish("kColorCode", decimal(packet.u8(41)));
}

} // namespace ventrik
