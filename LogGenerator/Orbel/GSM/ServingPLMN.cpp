#include "LogGenerator/Orbel/GSM/ServingPLMN.h"

#include "LogGenerator/Orbel/CellMonitorArray.h"
#include "LogGenerator/Orbel/GSM/RegistrationRecord.h"
#include "LogGenerator/Orbel/Labels.h"
#include "LogGenerator/Orbel/ValueText.h"
#include "Platform/TelephonyConstants.h"

#include <algorithm>
#include <array>

namespace ventrik
{

namespace
{

constexpr std::uint32_t servingPLMNLogCode = 0x7135;

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

bool isServingCell(const PlistDictionary& cell)
{
    const auto hasTechnology = [&](std::string_view technology) {
        return cellEntryIs(cell, kQXCellMonitorCellRadioAccessTechnology, technology);
    };
    return (hasTechnology(kQXCellMonitorRadioAccessTechnologyUMTS) ||
            hasTechnology(kQXCellMonitorRadioAccessTechnologyGSM)) &&
           cellEntryIs(cell, kQXCellMonitorCellType, kQXCellMonitorCellTypeServing);
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
    return {servingPLMNLogCode, RegistrationRecord::logCode, cellMonitorLogCode};
}

void ServingPLMN::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("Serving PLMN");
    switch (logCode) {
    case servingPLMNLogCode:
        return updateFromServingPLMN(packet);
    case RegistrationRecord::logCode:
        return updateFromRegistration(packet);
    case cellMonitorLogCode:
        return updateFromCellMonitor(packet);
    default:
        return logUnknownMessage(logCode);
    }
}

// Serving PLMN, 0x7135, at least 32 bytes
//   14 u8 service type | 15 PLMN identity, 3 bytes of two decimal digits each, low nibble first:
//   country 1, 2 | country 3, network 3 | network 1, 2
//   18 u16 big-endian location area code | 20 u8 routing area code
void ServingPLMN::updateFromServingPLMN(const LogPacket& packet)
{
    if (packet.size() < 32)
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
    const auto cells = parseCellMonitorArray(packet, log());
    if (!cells) {
        log().error("Failed to get Cell Array\n");
        return;
    }
    const auto* serving = std::ranges::find_if(*cells, [](const PlistValue& cell) {
        return cell.dictionary() && isServingCell(*cell.dictionary());
    });
    if (serving != cells->end())
        showCellFields(*serving->dictionary(), cellFields, "ServingPLMN");
}

} // namespace ventrik
