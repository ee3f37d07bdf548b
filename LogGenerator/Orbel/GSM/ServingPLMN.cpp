#include "LogGenerator/Orbel/GSM/ServingPLMN.h"

#include "LogGenerator/Orbel/CellMonitorArray.h"
#include "LogGenerator/Orbel/GSM/RegistrationRecord.h"
#include "LogGenerator/Orbel/GSM/ServingPLMNRecord.h"
#include "LogGenerator/Orbel/Labels.h"
#include "LogGenerator/Orbel/ValueText.h"
#include "Platform/TelephonyConstants.h"

#include <array>

namespace ventrik
{

namespace
{

constexpr std::array<std::string_view, 5> selectionModeLabels{
    "Automatic", "Manual", "Limited", "LIMITED_ROUTINE_ACQ", "LIMITED_MANUAL_ACQ"};

constexpr std::array<std::string_view, 5> serviceTypeLabels{"NO_SERVICE", "CS_ONLY", "PS_ONLY",
                                                            "CS_PS_SERVICE", "LIMITED_SERVICE"};

// A filler, as in a network code of two digits, is a blank.
char digit(int nibble)
{
    return nibble <= 9 ? static_cast<char>('0' + nibble) : ' ';
}

char lowDigit(std::uint8_t byte)
{
    return digit(byte & 0xF);
}

char highDigit(std::uint8_t byte)
{
    return digit(byte >> 4);
}

constexpr std::array<CellField, 3> cellFields{{
    {kQXCellMonitorMCC, "Mobile Country Code", "MCC"},
    {kQXCellMonitorMNC, "Mobile Network Code", "MNC"},
    {kQXCellMonitorLAC, "Location Area Code", "LAC"},
}};

} // namespace

std::string_view ServingPLMN::getSectionName() const
{
    return "Serving PLMN";
}

std::vector<std::uint32_t> ServingPLMN::getLogCodeArray() const
{
    return {ServingPLMNRecord::logCode, RegistrationRecord::logCode, cellMonitorLogCode};
}

void ServingPLMN::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("Serving PLMN");
    switch (logCode) {
    case ServingPLMNRecord::logCode:
        return updateFromServingPLMN(packet);
    case RegistrationRecord::logCode:
        return updateFromRegistration(packet);
    case cellMonitorLogCode:
        return updateFromCellMonitor(packet);
    default:
        return logUnknownMessage(logCode);
    }
}

void ServingPLMN::updateFromServingPLMN(const LogPacket& packet)
{
    if (packet.size() < ServingPLMNRecord::minimumSize)
        return;
    const std::uint8_t first = packet.u8(15);
    const std::uint8_t second = packet.u8(16);
    const std::uint8_t third = packet.u8(17);
    show("Mobile Country Code", std::string{lowDigit(first), highDigit(first), lowDigit(second)});
    show("Mobile Network Code", std::string{lowDigit(third), highDigit(third), highDigit(second)});
    show("Location Area Code", decimal(packet.u16BigEndian(18)));
    show("Routing Area Code", decimal(packet.u8(20)));
    show("Service Type", labelOr(serviceTypeLabels, packet.u8(14), "Unknown"));
}

// The registration record's selection mode
//   14 u8 PLMN selection mode
void ServingPLMN::updateFromRegistration(const LogPacket& packet)
{
    if (packet.size() < RegistrationRecord::minimumSize)
        return;
    show("PLMN Sel Mod", labelOr(selectionModeLabels, packet.u8(14), "Unknown"));
}

// Plain numbers here: no leading zeros, no blanks. Whichever record came last is shown.
void ServingPLMN::updateFromCellMonitor(const LogPacket& packet)
{
    const auto cells = getCellArray(packet);
    if (!cells)
        return;
    if (const auto* serving = servingCell(*cells, {kQXCellMonitorRadioAccessTechnologyUMTS,
                                                   kQXCellMonitorRadioAccessTechnologyGSM}))
        showCellFields(*serving, cellFields, "ServingPLMN");
}

} // namespace ventrik
