#include "LogGenerator/Orbel/LTE/ServingCellMeasurement.h"

#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

namespace
{

constexpr std::uint32_t measurementLogCode = 0xB17F;

constexpr int powerNotPresent = 64;
constexpr int searchThresholdNotPresent = 32;

std::string txPower(int value)
{
    return value == powerNotPresent ? "Not Present" : wholeDbm(value - 30);
}

} // namespace

std::string_view ServingCellMeasurement::getSectionName() const
{
    return "Serving Cell Measurements";
}

std::vector<std::uint32_t> ServingCellMeasurement::getLogCodeArray() const
{
    return {measurementLogCode};
}

// Serving cell measurement, 0xB17F, at least 33 bytes; bit fields of little-endian words
//   13 u8 version | 17 u16 E-ARFCN | 19 9 bits physical cell identity, 4 bits layer priority
//   21 9 bits measured RSRP | 22.1 9 bits average RSRP | 23.2 7 bits measured RSRQ
//   24.1 7 bits average RSRQ | 25 9 bits measured RSSI | 26.1 6 bits Qrxlevmin
//   26.7 7 bits P-Max | 27.6 6 bits maximum transmit power | 29 7 bits Srxlev
//   29.7 6 bits DRX cycles with S < 0 | 30.5 6 bits S-IntraSearch | 31.3 6 bits S-NonIntraSearch
//   32.1 1 bit rules updated | 32.2 4 bits rules
void ServingCellMeasurement::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("Serving Cell Measurements");
    if (logCode != measurementLogCode)
        return logUnknownMessage(logCode);
    if (packet.size() < 33)
        return;

    show("Version", decimal(packet.u8(13)));
    show("E-ARFCN", decimal(packet.u16(17)));
    show("Physical Cell ID", decimal(packet.u16(19) & 0x1FF));
    show("Serving Layer Priority", decimal(packet.u16(19) >> 9 & 0xF));
    show("Measured RSRP", dbm((packet.u16(21) & 0x1FF) * 0.25 - 140.0));
    show("Average RSRP", dbm((packet.u16(22) >> 1 & 0x1FF) * 0.25 - 140.0));
    show("Measured RSRQ", db((packet.u16(23) >> 2 & 0x7F) * 0.25 - 30.0));
    show("Average RSRQ", db((packet.u8(24) >> 1) * 0.25 - 30.0));
    show("Measured RSSI", dbm((packet.u16(25) & 0x1FF) * 0.5 - 140.0));
    show("Qrxlevmin", wholeDbm(2 * (packet.u8(26) >> 1 & 0x3F) - 140));
    show("P_Max", txPower(packet.u16(26) >> 7 & 0x7F));
    // Six bits never reach the mark for "not present"; the comparison is the one of P-Max.
    show("Max UE Tx Power", txPower(packet.u16(27) >> 6 & 0x3F));
    show("Srxlev", wholeDbm((packet.u8(29) & 0x7F) - 30));
    show("Num of Consecutive DRX Cycles of S < 0", decimal(packet.u16(29) >> 7 & 0x3F));

    const int intraSearch = packet.u16(30) >> 5 & 0x3F;
    const int nonIntraSearch = packet.u16(31) >> 3 & 0x3F;
    show("S Intra Search",
         intraSearch == searchThresholdNotPresent ? "Not Present" : wholeDb(2 * intraSearch));
    show("S Non Intra Search", nonIntraSearch == searchThresholdNotPresent
                                   ? "Not Present"
                                   : wholeDbm(2 * nonIntraSearch));
    show("Measurement Rules Updated", packet.u8(32) >> 1 & 1 ? "True" : "False");
    show("Measurement Rules", decimal(packet.u8(32) >> 2 & 0xF));
}

} // namespace ventrik
