#include "TelephonyService/C2KScenario.h"

#include "TelephonyService/PacketBuilder.h"

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
    return rawLevel(512.0 * std::pow(10.0, strength / 10.0), 0, 1, 16);
}

// The scales of the active set's energies, and the energy that shows as this strength in dB.
constexpr std::uint16_t scaleN = 32;
constexpr std::uint8_t scaleM = 8;
constexpr std::uint8_t scaleE = 2;

std::uint16_t rawEnergy(double strength)
{
    constexpr double factor = 9.0 * scaleN * scaleN * scaleM / 2; // 2^(2 * scaleE - 3)
    return rawLevel((std::pow(10.0, strength / 10.0) + 1.0 / scaleN) * factor, 0, 1, 16);
}

// Sets a subpacket's head where it begins, and gives the place of the next one.
std::size_t addSubpacket(PacketBuilder& packet, std::size_t start, std::uint8_t identifier,
                         std::size_t size)
{
    packet.u8(start, identifier)
        .u16(start + 2, static_cast<std::uint16_t>(size))
        .size(start + size);
    return start + size;
}

std::uint8_t rawReceiveLevel(double level)
{
    return signedByteOf((level + 63.248) / 0.334);
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
    const C2KSystem& system = _walk.system();
    report(PacketBuilder(0x134F)
               .u8(13, 2)
               .u32(42, system.roamingIndicator)
               .u32(46, 2)
               .u16(50, system.systemId)
               .u16(52, system.networkId)
               .u8(131, system.packetZone)
               .u8(133, 6)
               .u16(184, _walk.servingCell().baseStation));
}

void C2KScenario::reportOneXStatus()
{
    const C2KSystem& system = _walk.system();
    PacketBuilder packet(0x119C);
    packet.u8(14, 4);

    std::size_t start = 17;
    std::size_t next = addSubpacket(packet, start, 1, 8);
    packet.u8(start + 4, static_cast<std::uint8_t>(_walk.oneXState()));

    start = next;
    next = addSubpacket(packet, start, 2, 16);
    const double transmitted = std::round(10.0 * _walk.transmittedLevel());
    packet.u8(start + 4, system.oneXBandClass)
        .u8(start + 5, system.oneXBandClass)
        .u16(start + 6, system.oneXChannel)
        .u16(start + 8, system.oneXChannel)
        .u8(start + 10, rawReceiveLevel(_walk.receivedLevel(0)))
        .u8(start + 11, rawReceiveLevel(_walk.receivedLevel(1)))
        .u16(start + 12, static_cast<std::uint16_t>(static_cast<int>(transmitted)));

    // Each pilot with one further field: 20 bytes, the energy at byte 16.
    constexpr std::size_t pilotSize = 20;
    const auto pilots = _walk.joinedCells(isInCall());
    start = next;
    next = addSubpacket(packet, start, 3, 12 + pilotSize * pilots.size());
    packet.u16(start + 4, scaleN)
        .u8(start + 6, scaleM)
        .u8(start + 7, scaleE)
        .u8(start + 8, static_cast<std::uint8_t>(pilots.size()))
        .u8(start + 9, 1)
        .u16(start + 10, pilots.front()->pnOffset);
    std::size_t offset = start + 12;
    for (const C2KCell* pilot : pilots) {
        packet.u16(offset, pilot->pnOffset).u16(offset + 16, rawEnergy(_walk.oneXStrength(*pilot)));
        offset += pilotSize;
    }

    addSubpacket(packet, next, 4, 4);
    report(std::move(packet));
}

// Four fingers, of which those without a pilot are unassigned; none while the phone sleeps.
void C2KScenario::reportFingers()
{
    const std::size_t count = _walk.oneXState() == OneXState::slottedSleep ? 0 : 4;
    const auto pilots = _walk.heardCells();
    PacketBuilder packet(0x108A);
    packet.u8(22, static_cast<std::uint8_t>(count));
    for (std::size_t i = 0; i < count; ++i) {
        const std::size_t offset = 23 + 14 * i;
        packet.u16(offset, 0xFFFF).size(offset + 14);
        if (i < pilots.size())
            packet.u16(offset, pilots[i]->pnOffset)
                .u16(offset + 6, rawStrength(_walk.oneXStrength(*pilots[i])));
    }
    report(std::move(packet));
}

void C2KScenario::reportTrafficFrame()
{
    PacketBuilder packet(0x119D);
    packet.u8(14, 1);
    addSubpacket(packet, 17, 11, 28);
    packet.u8(17 + 24, _walk.isFrameErased() ? 1 : 0);
    report(std::move(packet));
}

void C2KScenario::reportEVDOStatus()
{
    const C2KSystem& system = _walk.system();
    const bool hasPilot = _walk.evdoState() >= EVDOState::sync;
    report(PacketBuilder(0x1183)
               .bits(13, 0, 11, system.evdoChannel)
               .bits(14, 3, 5, system.evdoBandClass)
               .u8(15, signedByteOf(_walk.receivedLevel(0)))
               .u8(16, signedByteOf(_walk.receivedLevel(1)))
               .u8(17, signedByteOf(_walk.transmittedLevel()))
               .u16(18, hasPilot ? _walk.servingCell().pnOffset : std::uint16_t{0xFFFF})
               .u8(36, static_cast<std::uint8_t>(_walk.evdoState()))
               .u8(37, static_cast<std::uint8_t>(_walk.session()))
               .u32(38, _walk.session() == EVDOSession::closed ? 0 : _walk.address())
               .u8(41, system.colorCode)
               .size(50));
}

void C2KScenario::reportActiveSetPilots()
{
    std::vector<const C2KCell*> pilots;
    if (_walk.evdoState() >= EVDOState::sync)
        pilots = _walk.joinedCells(_walk.evdoState() == EVDOState::connected);
    PacketBuilder packet(0x12B6);
    packet.u8(15, static_cast<std::uint8_t>(pilots.size())).size(25);
    std::size_t offset = 25;
    for (const C2KCell* pilot : pilots) {
        packet.u16(offset, pilot->pnOffset)
            .u16(offset + 2, rawStrength(_walk.evdoStrength(*pilot)))
            .size(offset + 12);
        offset += 12;
    }
    report(std::move(packet));
}

void C2KScenario::reportForwardData()
{
    PacketBuilder packet(0x1192);
    packet.u32(13, second());
    std::size_t offset = 17;
    for (const std::uint32_t count : _walk.transfer().forward) {
        packet.u32(offset, count);
        offset += 4;
    }
    report(std::move(packet));
}

// Every packet got through at its first try.
void C2KScenario::reportReverseData()
{
    PacketBuilder packet(0x127E);
    packet.u32(14, second()).size(1750);
    std::size_t offset = 18;
    for (const std::uint32_t count : _walk.transfer().reverse) {
        packet.u32(offset, count);
        offset += 24;
    }
    report(std::move(packet));
}

} // namespace ventrik
