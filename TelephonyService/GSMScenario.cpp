#include "TelephonyService/GSMScenario.h"

#include "Platform/TelephonyConstants.h"
#include "TelephonyService/PacketBuilder.h"

#include <algorithm>
#include <cmath>

namespace ventrik
{

namespace
{

using Phase = GSMRidePhase;

constexpr std::uint64_t cellMonitorSteps = 60; // every 3 s
constexpr std::uint64_t bsicSteps = 40;        // every 2 s
constexpr std::uint64_t rankingSteps = 10;     // every 0.5 s
constexpr std::uint64_t energySteps = 2;       // every 0.1 s
constexpr std::uint64_t powerSteps = 4;        // every 0.2 s
constexpr std::uint64_t hsdpaSteps = 4;        // every 0.2 s
constexpr std::uint64_t blockErrorSteps = 20;  // every 1 s

// As the baseband numbers them.
enum RRState : std::uint8_t {
    rrInactive = 0,
    rrCellSelection = 3,
    rrIdle = 5,
    rrConnectionPending = 7,
    rrDataTransfer = 9,
    rrConnectionRelease = 11,
    rrReselectionFromUMTS = 14,
    rrHandoverToUMTS = 19,
};

RRState rrStateIn(Phase phase)
{
    switch (phase) {
    case Phase::cellSelection:
        return rrCellSelection;
    case Phase::camping:
        return rrIdle;
    case Phase::dataSession:
    case Phase::call:
        return rrDataTransfer;
    case Phase::callSetup:
        return rrConnectionPending;
    case Phase::callRelease:
        return rrConnectionRelease;
    case Phase::handoverToUMTS:
        return rrHandoverToUMTS;
    case Phase::reselectionToGSM:
        return rrReselectionFromUMTS;
    default:
        return rrInactive;
    }
}

enum RRCState : std::uint8_t { disconnected, connecting, cellFach, cellDch, cellPch };

RRCState rrcStateIn(Phase phase)
{
    switch (phase) {
    case Phase::handoverToUMTS:
        return connecting;
    case Phase::hsdpa:
    case Phase::dualCarrierHSDPA:
        return cellDch;
    case Phase::forwardAccess:
        return cellFach;
    case Phase::paging:
        return cellPch;
    default:
        return disconnected;
    }
}

enum MMState : std::uint8_t {
    mmLocationUpdateInitiated = 3,
    mmConnectionActive = 6,
    mmWaitForConnection = 14,
    mmIdle = 19,
};

MMState mmStateIn(Phase phase)
{
    switch (phase) {
    case Phase::cellSelection:
        return mmLocationUpdateInitiated;
    case Phase::callSetup:
        return mmWaitForConnection;
    case Phase::call:
        return mmConnectionActive;
    default:
        return mmIdle;
    }
}

enum GMMState : std::uint8_t { gmmRegistrationInitiated = 2, gmmRegistered = 3, gmmAreaUpdate = 5 };

GMMState gmmStateIn(Phase phase)
{
    switch (phase) {
    case Phase::cellSelection:
        return gmmRegistrationInitiated;
    case Phase::handoverToUMTS:
    case Phase::reselectionToGSM:
        return gmmAreaUpdate;
    default:
        return gmmRegistered;
    }
}

// The records carry levels in dBm without their sign.
std::uint8_t withoutSign(double dBm)
{
    return byteOf(-dBm);
}

std::uint16_t signedWord(double value)
{
    return static_cast<std::uint16_t>(std::lround(value));
}

// Energies stand in steps of a 524288th of the carrier's.
std::uint32_t rawEnergy(double ecno)
{
    return static_cast<std::uint32_t>(524288.0 * std::pow(10.0, ecno / 10.0));
}

} // namespace

void GSMScenario::reportStep()
{
    const GSMRide::Changes changes = _ride.step();
    if (step() == 0)
        reportSimFiles("UTRAN GSM");
    const bool hasNewCell = _ride.isOnUMTS() ? changes.umtsCell : changes.gsmCell;
    if (step() == 0 || hasNewCell || changes.phase)
        reportNewCell();
    if (step() == 0 || changes.phase)
        reportNewPhase();
    if (_ride.isOnUMTS())
        reportRegularlyOnUMTS();
    else
        reportRegularlyOnGSM();
    if (step() % cellMonitorSteps == cellMonitorSteps - 1)
        reportCellMonitor();
}

void GSMScenario::reportNewCell()
{
    if (_ride.isOnUMTS()) {
        reportUMTSCell();
    } else {
        reportGSMCell();
        reportPacketInformation();
        reportBSICs();
    }
    reportServingPLMN();
    reportEquivalentPLMNs();
    reportCellMonitor();
}

void GSMScenario::reportNewPhase()
{
    reportGSMState();
    reportUMTSState();
    reportRegistration();
    reportMobilityManagement();
    reportPdpContexts(_ride.hasDataConnection());
    if (_ride.phase() == Phase::call)
        reportDedicatedChannel();
}

void GSMScenario::reportRegularlyOnGSM()
{
    reportIdleMeasurements();
    if (step() % bsicSteps == 0)
        reportBSICs();
}

void GSMScenario::reportRegularlyOnUMTS()
{
    const bool isConnected = rrcStateIn(_ride.phase()) == cellDch;
    if (isConnected && step() % energySteps == 0)
        reportCellEnergies();
    if (isConnected && step() % powerSteps == 0)
        reportTransmitPower();
    if (isConnected && step() % hsdpaSteps == 0)
        reportHSDPA();
    if (isConnected && step() % blockErrorSteps == 0)
        reportBlockErrors();
    if (!isConnected && step() % rankingSteps == 0)
        reportRankedCells();
}

void GSMScenario::reportServingPLMN()
{
    const bool isOnUMTS = _ride.isOnUMTS();
    constexpr std::uint8_t bothServices = 3;
    report(
        PacketBuilder(0x7135)
            .u8(13, isOnUMTS ? 0 : 1)
            .u8(14, _ride.phase() == Phase::cellSelection ? 0 : bothServices)
            .u8(15, 0x62) // 262, 07
            .u8(16, 0xF2)
            .u8(17, 0x70)
            .u16BigEndian(18, isOnUMTS ? _ride.umtsCell().locationAreaCode
                                       : _ride.gsmCell().locationAreaCode)
            .u8(20, isOnUMTS ? _ride.umtsCell().routingAreaCode : _ride.gsmCell().routingAreaCode)
            .size(32));
}

// Entries lie over each other by half, so the networks are two whose digits allow it: 262, 26 and
// 262, 203. Behind the last one stand its other three bytes.
void GSMScenario::reportEquivalentPLMNs()
{
    report(PacketBuilder(0x7150).u8(16, 2).bytes(17, Bytes{2, 0, 6, 2, 2, 6, 0, 2, 3}));
}

void GSMScenario::reportRegistration()
{
    constexpr std::uint8_t idle = 1;
    constexpr std::uint8_t registering = 2;
    report(PacketBuilder(0x7132)
               .u8(13, _ride.phase() == Phase::cellSelection ? registering : idle)
               .u8(14, 0)
               .size(16));
}

void GSMScenario::reportMobilityManagement()
{
    const bool isRegistered = _ride.phase() != Phase::cellSelection;
    constexpr std::uint8_t mmNormalService = 8;
    constexpr std::uint8_t mmUpdateNeeded = 5;
    report(PacketBuilder(0x7131)
               .u8(13, mmStateIn(_ride.phase()))
               .u8(14, isRegistered ? mmNormalService : mmUpdateNeeded)
               .u8(15, isRegistered ? 0 : 1));
    constexpr std::uint8_t gmmNormalService = 0;
    constexpr std::uint8_t gmmAttachNeeded = 2;
    report(PacketBuilder(0x7130)
               .u8(13, gmmStateIn(_ride.phase()))
               .u8(14, isRegistered ? gmmNormalService : gmmAttachNeeded)
               .u8(15, isRegistered ? 0 : 1));
}

void GSMScenario::reportGSMState()
{
    const bool isInCall = _ride.phase() == Phase::call;
    const bool isVoice = isInCall || _ride.phase() == Phase::callSetup;
    report(PacketBuilder(0x512C)
               .u8(13, rrStateIn(_ride.phase()))
               .u8(14, isVoice ? 2 : 1)
               .u8(15, 0)
               .u8(16, isVoice ? 0 : 1));
    report(PacketBuilder(0x5072).u8(19, isInCall ? 1 : 0));
}

void GSMScenario::reportGSMCell()
{
    const GSMRideCell& cell = _ride.gsmCell();
    report(PacketBuilder(0x5134)
               .u16(13, cell.arfcn)
               .u16(15, cell.bsic)
               .u16(17, cell.cellIdentity)
               .size(26));
}

// What the cell broadcasts about packet data.
void GSMScenario::reportPacketInformation()
{
    constexpr std::uint8_t untold = 255;
    constexpr std::uint8_t everyPriority = 7;
    report(PacketBuilder(0x51F4).u8(14, 0));
    report(PacketBuilder(0x51F5)
               .u8(13, _ride.gsmCell().locationAreaCode == 4711 ? untold : 1)
               .u8(14, everyPriority)
               .u8(15, 0)
               .size(18));
    report(PacketBuilder(0x51F6).u8(15, 0).u8(16, 4).u8(17, 0).size(24));
    report(PacketBuilder(0x51FB).u8(13, 0).size(34));
    report(PacketBuilder(0x51FD).u8(13, 0).u8(14, 4).u8(15, 2).u8(16, 0).u8(33, 1).size(35));
}

// On a dedicated channel the two words are the qualities of the link, else the cell's criteria.
void GSMScenario::reportIdleMeasurements()
{
    const double level = _ride.rssi(_ride.gsmCell());
    constexpr double lowestLevel = -105;     // dBm, to be accepted in this cell
    constexpr double reselectionOffset = 10; // dB
    const bool isOnDedicatedChannel = _ride.phase() == Phase::call;
    const double criterion = std::max(0.0, level - lowestLevel);
    const unsigned quality = _ride.receiveQuality();
    const auto neighbors = _ride.gsmNeighbors();
    PacketBuilder packet(0x5137);
    packet.u8(15, withoutSign(level))
        .u32(16, isOnDedicatedChannel ? quality : byteOf(criterion))
        .u32(20, isOnDedicatedChannel ? quality : byteOf(criterion + reselectionOffset))
        .u8(26, 1)
        .u8(28, static_cast<std::uint8_t>(neighbors.size()));
    std::size_t offset = 29;
    for (const GSMRideCell* cell : neighbors) {
        const double neighborLevel = _ride.rssi(*cell);
        packet.u16(offset, cell->arfcn)
            .u8(offset + 2, withoutSign(neighborLevel))
            .u32(offset + 3, byteOf(std::max(0.0, neighborLevel - lowestLevel)));
        offset += 14;
        packet.size(offset);
    }
    report(std::move(packet));
}

void GSMScenario::reportBSICs()
{
    const auto neighbors = _ride.gsmNeighbors();
    PacketBuilder packet(0x51FF);
    packet.u8(14, static_cast<std::uint8_t>(neighbors.size()));
    std::size_t offset = 15;
    for (const GSMRideCell* cell : neighbors) {
        packet.u16(offset, cell->arfcn).u8(offset + 2, cell->bsic).u8(offset + 3, 0);
        offset += 4;
    }
    report(std::move(packet));
}

// The call hops over four frequencies beside the cell's own.
void GSMScenario::reportDedicatedChannel()
{
    constexpr std::uint8_t frequencyCount = 4;
    PacketBuilder allocation(0x51F8);
    allocation.u8(13, 23).u8(14, frequencyCount);
    for (std::uint8_t i = 0; i < frequencyCount; ++i)
        allocation.u16(15 + std::size_t{2} * i, static_cast<std::uint16_t>(80 + 3 * i));
    report(std::move(allocation));
    report(PacketBuilder(0x5076).u16(13, 80).size(17));
}

void GSMScenario::reportUMTSState()
{
    report(PacketBuilder(0x4125).u8(13, rrcStateIn(_ride.phase())));
}

void GSMScenario::reportUMTSCell()
{
    constexpr std::uint16_t duplexSpacing = 950; // channels of 200 kHz: 190 MHz
    const UMTSRideCell& cell = _ride.umtsCell();
    report(PacketBuilder(0x4127)
               .u32(13, cell.uarfcn - std::uint32_t{duplexSpacing})
               .u32(17, cell.uarfcn)
               .u32(21, cell.cellIdentity)
               .u16(25, cell.uraId)
               .size(29));
    report(PacketBuilder(0x4157).u8(13, 1).size(19));
}

// The phone combines the cells that come in nearly as well as the best one.
void GSMScenario::reportCellEnergies()
{
    enum SetType : std::uint8_t { active, monitored };
    constexpr double activeMargin = 4; // dB
    const UMTSRideCell& serving = _ride.umtsCell();
    auto cells = _ride.umtsNeighbors();
    std::erase_if(cells, [&](const UMTSRideCell* cell) { return cell->uarfcn != serving.uarfcn; });
    cells.insert(cells.begin(), &serving);

    PacketBuilder packet(0x417A);
    packet.u16(13, signedWord(10.0 * (_ride.carrierPower() + 106.0) - 512.0))
        .u8(15, static_cast<std::uint8_t>(cells.size()));
    const std::size_t energies = 16 + 15 * cells.size();
    for (std::size_t i = 0; i < cells.size(); ++i) {
        const UMTSRideCell& cell = *cells[i];
        const bool isActive = _ride.rscp(cell) > _ride.rscp(serving) - activeMargin;
        packet.bits(16 + 15 * i + 7, 0, 13, cell.scramblingCode)
            .bits(16 + 15 * i + 8, 5, 3, isActive ? active : monitored)
            .u32(energies + 44 * i + 32, rawEnergy(_ride.ecno(cell)));
    }
    report(packet.size(energies + 44 * cells.size()));
}

void GSMScenario::reportTransmitPower()
{
    constexpr std::uint8_t sampleCount = 5;
    PacketBuilder packet(0x4031);
    packet.u8(14, sampleCount).size(16 + 14 * std::size_t{sampleCount});
    for (std::uint8_t i = 0; i < sampleCount; ++i) {
        const double power = _ride.transmitPower() + i % 3 - 1; // the loop steps up and down
        packet.u16(16 + std::size_t{14} * i + 4, signedWord(10.0 * (power + 70.0) - 512.0));
    }
    report(std::move(packet));
}

// Either list begins at the same place, so a record holds one: cells of the own technology while
// they are good enough, GSM cells towards the end of the rest.
void GSMScenario::reportRankedCells()
{
    constexpr int stepsOnOwnTechnology = 100;
    PacketBuilder packet(0x4005);
    std::size_t offset = 15;
    if (_ride.phase() == Phase::umtsCamping && _ride.stepsInPhase() > stepsOnOwnTechnology) {
        const auto cells = _ride.gsmNeighbors();
        packet.u8(14, static_cast<std::uint8_t>(cells.size()));
        for (const GSMRideCell* cell : cells) {
            const double level = _ride.rssi(*cell);
            packet.u16(offset, cell->arfcn)
                .u16(offset + 2, cell->bsic)
                .u8(offset + 4, signedByteOf(level))
                .u16(offset + 5, signedWord(level));
            offset += 7;
        }
    } else {
        auto cells = _ride.umtsNeighbors();
        cells.insert(cells.begin(), &_ride.umtsCell());
        packet.u8(13, static_cast<std::uint8_t>(cells.size()));
        for (const UMTSRideCell* cell : cells) {
            const double level = _ride.rscp(*cell);
            packet.u16(offset, cell->uarfcn)
                .u16(offset + 2, cell->scramblingCode)
                .u8(offset + 4, signedByteOf(level + 21))
                .u16(offset + 5, signedWord(level))
                .u8(offset + 7, signedByteOf(2.0 * _ride.ecno(*cell)))
                .u16(offset + 8, signedWord(level));
            offset += 10;
        }
    }
    report(packet.size(offset));
}

void GSMScenario::reportBlockErrors()
{
    constexpr std::uint32_t blocksInWindow = 100;
    const double errors = blocksInWindow * _ride.blockErrorRate();
    PacketBuilder packet(0x4116);
    packet.u8(13, transportChannelCount).u16(14, blocksInWindow);
    for (std::size_t i = 0; i < transportChannelCount; ++i) {
        BlockCounter& blocks = _blocks.at(i);
        blocks.received += blocksInWindow;
        blocks.inError += byteOf(errors / static_cast<double>(i + 1));
        packet.u8(16 + 9 * i, static_cast<std::uint8_t>(i + 1))
            .u32(17 + 9 * i, blocks.received)
            .u32(21 + 9 * i, blocks.inError);
    }
    report(std::move(packet));
}

// Each report counts anew: 100 sub-frames of 2 ms, dealt to the processes in turn.
void GSMScenario::reportHSDPA()
{
    constexpr std::uint16_t subFrames = 100;
    constexpr std::uint32_t bitsInBlock = 7168;
    constexpr unsigned dualCarrier = 2;
    const bool isDual = _ride.phase() == Phase::dualCarrierHSDPA;
    PacketBuilder packet(0x4221);
    packet.u8(13, 1)
        .bits(14, 0, 10, subFrames)
        .bits(15, 2, 2, isDual ? dualCarrier : 0)
        .u8(16, harqProcessCount)
        .u8(17, isDual ? harqProcessCount : 0);
    const auto putProcesses = [&](std::size_t offset, unsigned share) {
        for (std::size_t i = 0; i < harqProcessCount; ++i, offset += 9) {
            const auto blocks =
                static_cast<std::uint16_t>(subFrames / harqProcessCount + i % share);
            const auto errors = std::min<std::uint16_t>(
                blocks, byteOf(blocks * _ride.blockErrorRate() + static_cast<double>(i % 2)));
            packet.u8(offset, static_cast<std::uint8_t>(i))
                .u32(offset + 1, bitsInBlock * (blocks - std::uint32_t{errors}))
                .u16(offset + 5, blocks)
                .u16(offset + 7, errors);
        }
    };
    putProcesses(18, 2);
    if (isDual)
        putProcesses(18 + 162 * harqProcessCount, 3);
    report(std::move(packet));
}

void GSMScenario::reportCellMonitor()
{
    PlistArray cells;
    const auto addGSM = [&](const GSMRideCell& cell, bool isServing) {
        PlistDictionary entry = cellEntry(kQXCellMonitorRadioAccessTechnologyGSM, isServing);
        entry.set(kQXCellMonitorLAC, cell.locationAreaCode);
        entry.set(kQXCellMonitorCellId, cell.cellIdentity);
        entry.set(kQXCellMonitorARFCN, cell.arfcn);
        entry.set(kQXCellMonitorRSSI, std::lround(_ride.rssi(cell) / 2)); // in steps of 2 dB
        cells.append(entry);
    };
    const auto addUMTS = [&](const UMTSRideCell& cell, bool isServing) {
        PlistDictionary entry = cellEntry(kQXCellMonitorRadioAccessTechnologyUMTS, isServing);
        entry.set(kQXCellMonitorLAC, cell.locationAreaCode);
        entry.set(kQXCellMonitorCellId, cell.cellIdentity);
        entry.set(kQXCellMonitorUARFCN, cell.uarfcn);
        entry.set(kQXCellMonitorSCN, cell.scramblingCode);
        entry.set(kQXCellMonitorRSCP, std::lround(_ride.rscp(cell)));
        entry.set(kQXCellMonitorECN0, std::lround(_ride.ecno(cell)));
        cells.append(entry);
    };
    if (_ride.isOnUMTS())
        addUMTS(_ride.umtsCell(), true);
    else
        addGSM(_ride.gsmCell(), true);
    for (const UMTSRideCell* cell : _ride.umtsNeighbors())
        addUMTS(*cell, false);
    for (const GSMRideCell* cell : _ride.gsmNeighbors())
        addGSM(*cell, false);
    reportPropertyList(0xFF0001, cells);
}

} // namespace ventrik
