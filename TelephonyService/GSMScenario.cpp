#include "TelephonyService/GSMScenario.h"

#include "Packets/GSMLayouts.h"
#include "Packets/RecordWriter.h"
#include "Packets/SharedRecords.h"
#include "Platform/TelephonyConstants.h"

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

// Levels of the receiver and the transmitter stand in tenths of a dB above this one less 51.2 dB.
std::int64_t rawPower(double level, double zero)
{
    return std::lround(10.0 * (level - zero) - 512.0);
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
    report(RecordWriter(GSMRecords::servingPLMN)
               .set("Network Operating Mode", isOnUMTS ? 0 : 1)
               .set("Service Type", _ride.phase() == Phase::cellSelection ? 0 : bothServices)
               // 262, 07: the low nibble comes first, and a filler stands for the third digit.
               .set("Mobile Country Code", 0x262)
               .set("Mobile Network Code", 0x70F)
               .set("Location Area Code",
                    isOnUMTS ? _ride.umtsCell().locationAreaCode : _ride.gsmCell().locationAreaCode)
               .set("Routing Area Code",
                    isOnUMTS ? _ride.umtsCell().routingAreaCode : _ride.gsmCell().routingAreaCode));
}

// Entries lie over each other by half, so the networks are two whose digits allow it: 262, 26 and
// 262, 203. Behind the last one stand its other three bytes.
void GSMScenario::reportEquivalentPLMNs()
{
    if (_isNewer)
        return reportEquivalentPLMNsInNibbles();
    RecordWriter record(GSMRecords::equivalentPLMNs);
    for (const std::int64_t digits : {0x060202060002, 0x030200060202})
        record.add(GSMRecords::equivalentPLMNList).set("digits", digits);
    report(record);
}

// 262, 01 and 262, 03; the low nibble of a byte comes first. Slots that are empty are all ones.
void GSMScenario::reportEquivalentPLMNsInNibbles()
{
    constexpr std::size_t slots = 5;
    constexpr std::int64_t empty = 0xFFFFFF;
    const List& list = GSMLayouts::equivalentPLMNList;
    RecordWriter record(GSMLayouts::equivalentPLMNs);
    record.set("registered network", 0x70F262);
    for (const std::int64_t digits : {0x10F262, 0x30F262})
        record.add(list).set("digits", digits);
    const RecordElements all{list.offset, list.stride, slots, list.needed};
    for (std::size_t i = 2; i < slots; ++i)
        record.at(all, i, list.unshown).set("digits", empty);
    report(record);
}

void GSMScenario::reportRegistration()
{
    constexpr std::uint8_t idle = 1;
    constexpr std::uint8_t registering = 2;
    report(RecordWriter(GSMRecords::registration)
               .set("MM Service State", _ride.phase() == Phase::cellSelection ? registering : idle)
               .set("PLMN Sel Mod", 0));
}

void GSMScenario::reportMobilityManagement()
{
    const bool isRegistered = _ride.phase() != Phase::cellSelection;
    constexpr std::uint8_t mmNormalService = 8;
    constexpr std::uint8_t mmUpdateNeeded = 5;
    report(RecordWriter(GSMRecords::mmState)
               .set("MM State", mmStateIn(_ride.phase()))
               .set("MM Sub State", isRegistered ? mmNormalService : mmUpdateNeeded)
               .set("LU Reject Cause", isRegistered ? 0 : 1));
    constexpr std::uint8_t gmmNormalService = 0;
    constexpr std::uint8_t gmmAttachNeeded = 2;
    report(RecordWriter(GSMRecords::gmmState)
               .set("MM State", gmmStateIn(_ride.phase()))
               .set("MM Sub State", isRegistered ? gmmNormalService : gmmAttachNeeded)
               .set("Attach Reject Cause", isRegistered ? 0 : 1));
}

void GSMScenario::reportGSMState()
{
    const bool isInCall = _ride.phase() == Phase::call;
    const bool isVoice = isInCall || _ride.phase() == Phase::callSetup;
    report(RecordWriter(GSMRecords::rrState)
               .set("RR State", rrStateIn(_ride.phase()))
               .set("RR Sub State", isVoice ? 2 : 1)
               .set("RR Status", 0)
               .set("RR Mode", isVoice ? 0 : 1));
    report(RecordWriter(GSMRecords::dtx).set("DTX Used", isInCall ? 1 : 0));
}

void GSMScenario::reportGSMCell()
{
    const GSMRideCell& cell = _ride.gsmCell();
    if (_isNewer) {
        constexpr int gsm900 = 8;
        report(RecordWriter(GSMLayouts::cellIdentityWithBand)
                   .set("ARFCN", cell.arfcn)
                   .set("band", gsm900)
                   .set("Cell ID", cell.cellIdentity));
        return;
    }
    report(RecordWriter(GSMRecords::cellIdentity)
               .set("ARFCN", cell.arfcn)
               .set("BSIC", cell.bsic)
               .set("Cell ID", cell.cellIdentity));
}

// What the cell broadcasts about packet data.
void GSMScenario::reportPacketInformation()
{
    constexpr std::uint8_t untold = 255;
    constexpr std::uint8_t everyPriority = 7;
    report(RecordWriter(GSMRecords::si13).set("SI13 Position", 0));
    report(RecordWriter(GSMRecords::packetOptions)
               .set("PFC Supported", _ride.gsmCell().locationAreaCode == 4711 ? untold : 1)
               .set("Priority Access Threshold", everyPriority)
               .set("Network Control Order", 0));
    report(RecordWriter(GSMRecords::cellOptions)
               .set("T3192", 0)
               .set("DRX Timer Max", 4)
               .set("Access Burst Type", 0));
    report(RecordWriter(GSMRecords::broadcastChannel).set("PBCCH Present", 0));
    report(RecordWriter(GSMRecords::measurementOrder)
               .set("Packet PSI Status", 0)
               .set("Count LR", 4)
               .set("Count HR", 2)
               .set("Ext Measurement Order", 0)
               .set("Packet SI Status", 1));
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
    RecordWriter record(GSMRecords::idleMeasurements);
    record.set("RSSI", withoutSign(level))
        .set("Rx Quality Full", isOnDedicatedChannel ? quality : byteOf(criterion))
        .set("Rx Quality Sub",
             isOnDedicatedChannel ? quality : byteOf(criterion + reselectionOffset))
        .set("Cell Reselect Hysteresis", 1);
    for (const GSMRideCell* cell : _ride.gsmNeighbors()) {
        const double neighborLevel = _ride.rssi(*cell);
        record.add(GSMRecords::idleNeighbors)
            .set("ARFCN", cell->arfcn)
            .set("RSSI", withoutSign(neighborLevel))
            .set("C1 Value", byteOf(std::max(0.0, neighborLevel - lowestLevel)));
    }
    report(record);
}

void GSMScenario::reportBSICs()
{
    RecordWriter record(GSMRecords::bsicList);
    for (const GSMRideCell* cell : _ride.gsmNeighbors())
        record.add(GSMRecords::bsics).set("ARFCN", cell->arfcn).set("BSIC", cell->bsic);
    report(record);
}

// The call hops over four frequencies beside the cell's own.
void GSMScenario::reportDedicatedChannel()
{
    RecordWriter allocation(GSMRecords::mobileAllocation);
    allocation.set("HSN", 23);
    for (const int frequency : {80, 83, 86, 89})
        allocation.add(GSMRecords::frequencies).set("", frequency);
    report(allocation);
    report(RecordWriter(GSMRecords::dedicatedChannel).set("ARFCN", 80));
}

void GSMScenario::reportUMTSState()
{
    report(RecordWriter(GSMRecords::rrcState).set("RRC State", rrcStateIn(_ride.phase())));
}

void GSMScenario::reportUMTSCell()
{
    constexpr std::uint16_t duplexSpacing = 950; // channels of 200 kHz: 190 MHz
    const UMTSRideCell& cell = _ride.umtsCell();
    RecordWriter record(_isNewer ? GSMLayouts::umtsCell45 : GSMRecords::umtsCell);
    record.set("Uplink Frequency", cell.uarfcn - duplexSpacing)
        .set("Downlink Frequency", cell.uarfcn)
        .set("Cell ID", cell.cellIdentity)
        .set("URA ID", cell.uraId);
    if (_isNewer)
        record.set("Scrambling Code", cell.scramblingCode);
    report(record);
    report(RecordWriter(GSMRecords::security).set("Ciphering", 1));
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

    RecordWriter record(GSMRecords::cellList);
    record.set("receive AGC", rawPower(_ride.carrierPower(), -106.0));
    for (const UMTSRideCell* cell : cells) {
        const bool isActive = _ride.rscp(*cell) > _ride.rscp(serving) - activeMargin;
        record.add(GSMRecords::listedCells)
            .set("scrambling code", cell->scramblingCode)
            .set("set type", isActive ? active : monitored);
    }
    for (const UMTSRideCell* cell : cells)
        record.add(GSMRecords::energies).set("first Ec/Io", rawEnergy(_ride.ecno(*cell)));
    report(record);
}

void GSMScenario::reportTransmitPower()
{
    constexpr int sampleCount = 5;
    RecordWriter record(GSMRecords::transmitPower);
    for (int i = 0; i < sampleCount; ++i) {
        const double power = _ride.transmitPower() + i % 3 - 1; // the loop steps up and down
        record.add(GSMRecords::powerSamples).set("power", rawPower(power, -70.0));
    }
    report(record);
}

// Either list begins at the same place, so a record holds one: cells of the own technology while
// they are good enough, GSM cells towards the end of the rest. In newer layouts they follow each
// other.
void GSMScenario::reportRankedCells()
{
    constexpr int stepsOnOwnTechnology = 100;
    const bool isWithGSM =
        _ride.phase() == Phase::umtsCamping && _ride.stepsInPhase() > stepsOnOwnTechnology;
    RecordWriter record(_isNewer ? GSMLayouts::rankedCells2 : GSMRecords::rankedCells);
    if (_isNewer)
        record.set("version", 2);
    if (_isNewer || !isWithGSM)
        addRankedUMTSCells(record,
                           _isNewer ? GSMLayouts::rankedUMTSCells2 : GSMRecords::rankedUMTSCells);
    if (isWithGSM)
        addRankedGSMCells(record,
                          _isNewer ? GSMLayouts::rankedGSMCells2 : GSMRecords::rankedGSMCells);
    report(record);
}

void GSMScenario::addRankedUMTSCells(RecordWriter& record, const List& list)
{
    auto cells = _ride.umtsNeighbors();
    cells.insert(cells.begin(), &_ride.umtsCell());
    for (const UMTSRideCell* cell : cells) {
        const double level = _ride.rscp(*cell);
        record.add(list)
            .set("Downlink Frequency", cell->uarfcn)
            .set("Scrambling Code", cell->scramblingCode)
            .level("RSCP", level)
            .level("Rank Cell RSCP", level)
            .level("Energy Per Chip", _ride.ecno(*cell))
            .level("Ranking Value", level);
    }
}

void GSMScenario::addRankedGSMCells(RecordWriter& record, const List& list)
{
    for (const GSMRideCell* cell : _ride.gsmNeighbors()) {
        const double level = _ride.rssi(*cell);
        record.add(list)
            .set("ARFCN", cell->arfcn)
            .set("BSIC", cell->bsic)
            .level("RSSI", level)
            .level("Ranking Value", level);
    }
}

void GSMScenario::reportBlockErrors()
{
    constexpr std::uint32_t blocksInWindow = 100;
    const double errors = blocksInWindow * _ride.blockErrorRate();
    RecordWriter record(GSMRecords::blockErrors);
    record.set("Window Size", blocksInWindow);
    for (std::size_t i = 0; i < transportChannelCount; ++i) {
        BlockCounter& blocks = _blocks.at(i);
        blocks.received += blocksInWindow;
        blocks.inError += byteOf(errors / static_cast<double>(i + 1));
        record.add(GSMRecords::transportChannels)
            .set("Transport Channel ID", static_cast<std::int64_t>(i + 1))
            .set("CRC Received", blocks.received)
            .set("CRC Received in Error", blocks.inError);
    }
    report(record);
}

// Each report counts anew: 100 sub-frames of 2 ms, dealt to the processes in turn.
void GSMScenario::reportHSDPA()
{
    constexpr std::uint16_t subFrames = 100;
    constexpr std::uint32_t bitsInBlock = 7168;
    constexpr unsigned dualCarrier = 2;
    const bool isDual = _ride.phase() == Phase::dualCarrierHSDPA;
    RecordWriter record(GSMRecords::hsdpa);
    record.set("Version", 1)
        .set("Sub Frames", subFrames)
        .set("Carrier Info", isDual ? dualCarrier : 0);
    const auto addProcesses = [&](const List& processes, unsigned share) {
        for (std::size_t i = 0; i < harqProcessCount; ++i) {
            const auto blocks =
                static_cast<std::uint16_t>(subFrames / harqProcessCount + i % share);
            const auto errors = std::min<std::uint16_t>(
                blocks, byteOf(blocks * _ride.blockErrorRate() + static_cast<double>(i % 2)));
            record.add(processes)
                .set("Process ID", static_cast<std::int64_t>(i))
                .set("No Rx Bits", bitsInBlock * (blocks - std::uint32_t{errors}))
                .set("New Tx", blocks)
                .set("Block Errors", errors);
        }
    };
    addProcesses(GSMRecords::primaryProcesses, 2);
    if (isDual)
        addProcesses(GSMRecords::secondaryProcesses, 3);
    report(record);
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
    reportPropertyList(SharedRecords::cellMonitor.logCode, cells);
}

} // namespace ventrik
