#include "LogGenerator/Orbel/GSM/GSMRRInfo.h"

#include "LogGenerator/Orbel/GSM/CellOptionsRecord.h"
#include "LogGenerator/Orbel/GSM/IdleMeasurementsRecord.h"
#include "LogGenerator/Orbel/Labels.h"
#include "LogGenerator/Orbel/ValueText.h"

#include <array>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr std::uint32_t stateLogCode = 0x512C;
constexpr std::uint32_t dtxLogCode = 0x5072;

// The blanks are the labels' own.
constexpr std::array<std::string_view, 22> stateLabels{
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

} // namespace

std::string_view GSMRRInfo::getSectionName() const
{
    return "GSM RR Info";
}

std::vector<std::uint32_t> GSMRRInfo::getLogCodeArray() const
{
    return {stateLogCode, IdleMeasurementsRecord::logCode, dtxLogCode, CellOptionsRecord::logCode};
}

void GSMRRInfo::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("GSMRRInfo");
    switch (logCode) {
    case stateLogCode:
        return updateFromState(packet);
    case IdleMeasurementsRecord::logCode:
        return updateFromIdleMeasurements(packet);
    case dtxLogCode:
        return updateFromDTX(packet);
    case CellOptionsRecord::logCode:
        return updateFromCellOptions(packet);
    default:
        return logUnknownMessage(logCode);
    }
}

// Radio resource state, 0x512C, at least 17 bytes
//   13 u8 state | 14 u8 sub-state | 15 u8 status | 16 u8 mode, data or voice
void GSMRRInfo::updateFromState(const LogPacket& packet)
{
    if (packet.size() < 17)
        return;
    show("RR State", labelOr(stateLabels, packet.u8(13), "Unknown"));
    show("RR Sub State", decimal(packet.u8(14)));
    show("RR Status", decimal(packet.u8(15)));
    show("RR Mode", packet.u8(16) ? "Data" : "Voice");
}

void GSMRRInfo::updateFromIdleMeasurements(const LogPacket& packet)
{
    if (packet.size() < IdleMeasurementsRecord::minimumSize)
        return;
    show("Serving Rx Level", decimal(packet.u8(15)));
    show("Rx Quality Full", decimal(packet.i32(16)));
    show("Rx Quality Sub", decimal(packet.i32(20)));
}

// Discontinuous transmission, 0x5072, at least 20 bytes
//   19 u8 in use
void GSMRRInfo::updateFromDTX(const LogPacket& packet)
{
    if (packet.size() < 20)
        return;
    show("DTX Used", packet.u8(19) ? "ON" : "OFF");
}

void GSMRRInfo::updateFromCellOptions(const LogPacket& packet)
{
    if (packet.size() < CellOptionsRecord::minimumSize)
        return;
    show("DRX Used", fmt::format("{} sec", packet.u8(16)));
}

} // namespace ventrik
