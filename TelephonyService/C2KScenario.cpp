#include "TelephonyService/C2KScenario.h"

#include "Packets/C2KRecords.h"
#include "Packets/RecordWriter.h"

#include <algorithm>
#include <cmath>

namespace ventrik
{

namespace
{

constexpr std::uint64_t statusSteps = 5;   // every 0.25 s
constexpr std::uint64_t pilotSteps = 4;    // every 0.2 s
constexpr std::uint64_t dataSteps = 20;    // every 1 s
constexpr std::uint64_t systemSteps = 100; // every 5 s

// A strength in dB as a ratio in steps of 1/512.
std::uint16_t rawStrength(double strength)
{
    return rawOf(512.0 * std::pow(10.0, strength / 10.0), 16);
}

// The scales of the active set's energies, and the energy that shows as this strength in dB.
constexpr std::uint16_t scaleN = 32;
constexpr std::uint8_t scaleM = 8;
constexpr std::uint8_t scaleE = 2;

std::uint16_t rawEnergy(double strength)
{
    constexpr double factor = 9.0 * scaleN * scaleN * scaleM / 2; // 2^(2 * scaleE - 3)
    return rawOf((std::pow(10.0, strength / 10.0) + 1.0 / scaleN) * factor, 16);
}

} // namespace

void C2KScenario::reportStep()
{
    const C2KWalk::Changes changes = _walk.step();
    if (changes.cell || step() == 0)
        reportServingSystem();
    if (changes.cell || changes.state || step() == 0) {
        reportOneXStatus();
        reportFingers();
        reportEVDOStatus();
        reportActiveSetPilots();
    }
    reportRegularly();
}

void C2KScenario::reportRegularly()
{
    if (isInCall())
        reportTrafficFrame();
    if (step() % statusSteps == 0) {
        reportOneXStatus();
        reportEVDOStatus();
    }
    if (step() % pilotSteps == 0) {
        reportFingers();
        reportActiveSetPilots();
    }
    if (step() % dataSteps == 0) {
        reportForwardData();
        reportReverseData();
    }
    if (step() % systemSteps == systemSteps - 1)
        reportServingSystem();
}

std::uint32_t C2KScenario::second() const
{
    return static_cast<std::uint32_t>(step() / dataSteps);
}

void C2KScenario::reportServingSystem()
{
    constexpr int systemWithIdentity = 2;
    const C2KSystem& system = _walk.system();
    report(RecordWriter(C2KRecords::servingSystem)
               .set("version", 2)
               .set("k1xRoamingHome", system.roamingIndicator)
               .set("system type", systemWithIdentity)
               .set("kSystemId", system.systemId)
               .set("kNetworkId", system.networkId)
               .set("kPacketZoneId", system.packetZone)
               .set("kProtocolRevision", 6)
               .set("kBaseId", _walk.servingCell().baseStation));
}

void C2KScenario::reportOneXStatus()
{
    const C2KSystem& system = _walk.system();
    RecordWriter record(C2KRecords::oneXStatus);
    record.add(C2KRecords::statePart, 8)
        .set("k1xDeviceState", static_cast<std::int64_t>(_walk.oneXState()));
    record.add(C2KRecords::radioPart, 16)
        .set("k1xRx0BandClass", system.oneXBandClass)
        .set("k1xRx1BandClass", system.oneXBandClass)
        .set("k1xRx0ChanNum", system.oneXChannel)
        .set("k1xRx1ChanNum", system.oneXChannel)
        .level("k1xRxAGC0", _walk.receivedLevel(0))
        .level("k1xRxAGC1", _walk.receivedLevel(1))
        .set("k1xTxAGC", std::lround(10.0 * _walk.transmittedLevel()));

    // Each pilot with one further field.
    constexpr std::size_t fieldCount = 1;
    constexpr std::size_t size = C2KRecords::pilotSize(fieldCount);
    constexpr auto fields = C2KRecords::pilotFields(fieldCount);
    const auto pilots = _walk.joinedCells(isInCall());
    const FieldWriter activeSet =
        record.add(C2KRecords::activeSetPart, C2KRecords::firstPilot + size * pilots.size());
    activeSet.set("N", scaleN)
        .set("M", scaleM)
        .set("E", scaleE)
        .set("pilots", static_cast<std::int64_t>(pilots.size()))
        .set("F", fieldCount)
        .set("reference PN offset", pilots.front()->pnOffset);
    for (std::size_t i = 0; i < pilots.size(); ++i)
        activeSet.at(C2KRecords::firstPilot + size * i, fields)
            .set("PN offset", pilots[i]->pnOffset)
            .set("energy", rawEnergy(_walk.oneXStrength(*pilots[i])));

    record.add(C2KRecords::fingerPart, 4);
    report(record);
}

// Four fingers, of which those without a pilot are unassigned; none while the phone sleeps.
void C2KScenario::reportFingers()
{
    const std::size_t count = _walk.oneXState() == OneXState::slottedSleep ? 0 : 4;
    const auto pilots = _walk.heardCells();
    RecordWriter record(C2KRecords::fingerC2I);
    for (std::size_t i = 0; i < count; ++i) {
        const FieldWriter finger = record.add(C2KRecords::fingers);
        if (i < pilots.size())
            finger.set("PN offset", pilots[i]->pnOffset)
                .set("C/I", rawStrength(_walk.oneXStrength(*pilots[i])));
        else
            finger.set("PN offset", C2KRecords::unassignedFinger);
    }
    report(record);
}

void C2KScenario::reportTrafficFrame()
{
    RecordWriter record(C2KRecords::oneXTraffic);
    record.add(C2KRecords::demodulationPart, 28).set("frame erased", _walk.isFrameErased() ? 1 : 0);
    report(record);
}

void C2KScenario::reportEVDOStatus()
{
    const C2KSystem& system = _walk.system();
    const bool hasPilot = _walk.evdoState() >= EVDOState::sync;
    report(RecordWriter(C2KRecords::evdoStatus)
               .set("kChannel", system.evdoChannel)
               .set("kBandClass", system.evdoBandClass)
               .level("kRxAGC0", _walk.receivedLevel(0))
               .level("kRxAGC1", _walk.receivedLevel(1))
               .level("kTxAGC", _walk.transmittedLevel())
               .set("kServingPNOffset", hasPilot ? _walk.servingCell().pnOffset : 0xFFFF)
               .set("k1xEVDODeviceState", static_cast<std::int64_t>(_walk.evdoState()))
               .set("kSessionState", static_cast<std::int64_t>(_walk.session()))
               .set("kUATI24", _walk.session() == EVDOSession::closed ? 0 : _walk.address())
               .set("kColorCode", system.colorCode));
}

void C2KScenario::reportActiveSetPilots()
{
    std::vector<const C2KCell*> pilots;
    if (_walk.evdoState() >= EVDOState::sync)
        pilots = _walk.joinedCells(_walk.evdoState() == EVDOState::connected);
    RecordWriter record(C2KRecords::activeSetPilots);
    for (const C2KCell* pilot : pilots)
        record.add(C2KRecords::activeSetPilotList)
            .set("PN offset", pilot->pnOffset)
            .set("strength", rawStrength(_walk.evdoStrength(*pilot)));
    report(record);
}

void C2KScenario::reportForwardData()
{
    RecordWriter record(C2KRecords::forwardPackets);
    record.set("sequence number", second());
    const auto& counts = _walk.transfer().forward;
    for (std::size_t kind = 0; kind < counts.size(); ++kind)
        record.at(C2KRecords::forwardCounters, kind, C2KRecords::packetCounterFields)
            .set("packets", counts.at(kind));
    report(record);
}

// Every packet got through at its first try.
void C2KScenario::reportReverseData()
{
    RecordWriter record(C2KRecords::reversePackets);
    record.set("sequence number", second());
    const auto& counts = _walk.transfer().reverse;
    for (std::size_t i = 0; i < counts.size(); ++i)
        record.at(C2KRecords::reverseCounters, i, C2KRecords::packetCounterFields)
            .set("packets", counts.at(i));
    report(record);
}

} // namespace ventrik
