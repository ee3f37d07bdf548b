#include "LogGenerator/Orbel/GSM/GPRSInformation.h"

#include "LogGenerator/Orbel/GSM/CellOptionsRecord.h"
#include "LogGenerator/Orbel/GSM/IdleMeasurementsRecord.h"
#include "LogGenerator/Orbel/GSM/ServingPLMNRecord.h"
#include "LogGenerator/Orbel/Labels.h"
#include "LogGenerator/Orbel/ValueText.h"

#include <array>

namespace ventrik
{

namespace
{

constexpr std::uint32_t packetOptionsLogCode = 0x51F5;
constexpr std::uint32_t broadcastChannelLogCode = 0x51FB;
constexpr std::uint32_t measurementOrderLogCode = 0x51FD;
constexpr std::uint32_t si13PositionLogCode = 0x51F4;

constexpr std::array<std::string_view, 3> networkControlOrderLabels{"NC0", "NC1", "NC2"};

constexpr std::array<std::string_view, 2> pfcLabels{"Not Supported", "Supported"};

constexpr std::array<std::string_view, 8> priorityAccessLabels{
    "Barred (PKT access not allowed in the Cell)",
    "Barred",
    "Barred",
    "1 Only",
    "1 to 2",
    "1 to 3",
    "1 to 4",
    "Allowed",
};

constexpr std::array<std::string_view, 8> t3192Labels{"500 ms", "1000 ms", "1500 ms", "0 ms",
                                                      "80 ms",  "120 ms",  "160 ms",  "200 ms"};

constexpr std::array<std::string_view, 2> si13PositionLabels{"Located on BCCH",
                                                             "Located on Extended BCCH"};

constexpr std::array<std::string_view, 3> operatingModeLabels{"Class 1", "Class 2", "Class 3"};

// 255 is what the baseband writes for a value that the cell did not tell.
std::string_view labelOrUntold(std::span<const std::string_view> labels, std::uint8_t value,
                               std::string_view untold)
{
    return value == 255 ? untold : labelOr(labels, value, "Unknown");
}

} // namespace

std::string_view GPRSInformation::getSectionName() const
{
    return "GPRS Information";
}

std::vector<std::uint32_t> GPRSInformation::getLogCodeArray() const
{
    return {packetOptionsLogCode,           ServingPLMNRecord::logCode, CellOptionsRecord::logCode,
            broadcastChannelLogCode,        measurementOrderLogCode,    si13PositionLogCode,
            IdleMeasurementsRecord::logCode};
}

void GPRSInformation::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("GPRSInformation");
    switch (logCode) {
    case packetOptionsLogCode:
        return updateFromPacketOptions(packet);
    case ServingPLMNRecord::logCode:
        return updateFromNetworkMode(packet);
    case CellOptionsRecord::logCode:
        return updateFromCellOptions(packet);
    case broadcastChannelLogCode:
        return updateFromBroadcastChannel(packet);
    case measurementOrderLogCode:
        return updateFromMeasurementOrder(packet);
    case si13PositionLogCode:
        return updateFromSI13Position(packet);
    case IdleMeasurementsRecord::logCode:
        return updateFromIdleMeasurements(packet);
    default:
        return logUnknownMessage(logCode);
    }
}

// Packet options, 0x51F5, at least 18 bytes
//   13 u8 packet flow context | 14 u8 priority access threshold | 15 u8 network control order
void GPRSInformation::updateFromPacketOptions(const LogPacket& packet)
{
    if (packet.size() < 18)
        return;
    show("Network Control Order",
         labelOrUntold(networkControlOrderLabels, packet.u8(15), "Not Available"));
    show("PFC Supported", labelOrUntold(pfcLabels, packet.u8(13), "Available"));
    show("Priority Access Threshold",
         labelOrUntold(priorityAccessLabels, packet.u8(14), "Not Available"));
}

void GPRSInformation::updateFromNetworkMode(const LogPacket& packet)
{
    if (packet.size() < ServingPLMNRecord::minimumSize)
        return;
    show("Network Operating Mode", labelOr(operatingModeLabels, packet.u8(13), "Unknown"));
}

void GPRSInformation::updateFromCellOptions(const LogPacket& packet)
{
    if (packet.size() < CellOptionsRecord::minimumSize)
        return;
    show("T3192", labelOr(t3192Labels, packet.u8(15), "?? ms"));
    show("Access Burst Type", packet.u8(17) ? "11-bit format" : "8-bit format");
    show("DRX Timer Max", decimal(packet.u8(16)));
}

// Packet broadcast channel, 0x51FB, at least 34 bytes
//   13 u8 PBCCH present
void GPRSInformation::updateFromBroadcastChannel(const LogPacket& packet)
{
    if (packet.size() < 34)
        return;
    show("PBCCH Present", decimal(packet.u8(13)));
}

// Measurement order, 0x51FD, at least 35 bytes
//   13 u8 packet PSI status | 14 u8 count LR | 15 u8 count HR | 16 u8 extended measurement order
//   33 u8 packet SI status
void GPRSInformation::updateFromMeasurementOrder(const LogPacket& packet)
{
    if (packet.size() < 35)
        return;
    show("Ext Measurement Order", decimal(packet.u8(16)));
    show("Packet PSI Status", decimal(packet.u8(13)));
    show("Packet SI Status", packet.u8(33) ? "Supported" : "Not Supported");
    show("Count LR", decimal(packet.u8(14)));
    show("Count HR", decimal(packet.u8(15)));
}

// SI13, 0x51F4, at least 15 bytes
//   14 u8 where the cell sends it
void GPRSInformation::updateFromSI13Position(const LogPacket& packet)
{
    if (packet.size() < 15)
        return;
    show("SI13 Position", labelOrUntold(si13PositionLabels, packet.u8(14), "Not Available"));
}

void GPRSInformation::updateFromIdleMeasurements(const LogPacket& packet)
{
    if (packet.size() < IdleMeasurementsRecord::minimumSize)
        return;
    show("Cell Reselect Hysteresis", packet.u8(26) ? "Applied" : "Not Applied");
}

} // namespace ventrik
