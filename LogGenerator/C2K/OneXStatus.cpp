#include "LogGenerator/C2K/OneXStatus.h"

#include "LogGenerator/C2K/BandClass.h"
#include "LogGenerator/C2K/C2KOutput.h"
#include "LogGenerator/C2K/OneXTrafficFER.h"
#include "LogGenerator/C2K/PilotGroup.h"
#include "LogGenerator/C2K/Subpackets.h"
#include "LogGenerator/Orbel/Labels.h"
#include "LogGenerator/Orbel/ValueText.h"

#include <array>
#include <cmath>

namespace ventrik
{

namespace
{

constexpr std::uint8_t stateIdentifier = 1;
constexpr std::uint8_t radioIdentifier = 2;
constexpr std::uint8_t activeSetIdentifier = 3;
constexpr std::uint8_t fingerIdentifier = 4;

constexpr std::uint8_t trafficState = 8;

constexpr std::array<std::string_view, 12> deviceStateLabels{"Inactive [0]",
                                                             "Deep sleep in start state [1]",
                                                             "Initial state for CDMA operation [2]",
                                                             "Acquisition [3]",
                                                             "Sync [4]",
                                                             "Slew [5]",
                                                             "Paging [6]",
                                                             "Slotted mode sleep state [7]",
                                                             "Traffic [8]",
                                                             "UnSlew [9]",
                                                             "Operation in PCG state [10]",
                                                             "Powerup state [11]"};

std::string deviceStateLabel(std::uint8_t state)
{
    return std::string(labelOr(deviceStateLabels, state, fmt::format("[Bad Value {}]", state)));
}

std::string receiveAGC(std::int8_t rawLevel)
{
    return signedDbm(rawLevel * 334.0 / 1000.0 - 63.248);
}

// Radio
//   4 u8 band class of chain 0 | 5 u8 of chain 1 | 6 u16 channel of chain 0 | 8 u16 of chain 1
//   10 i8 receive AGC of chain 0 | 11 i8 of chain 1 | 12 i16 transmit AGC (0.1 dBm)
void publishRadio(const LogPacket& radio, bool isInTraffic, const C2KOutput& output)
{
    // Outside traffic only the first chain receives, and nothing is sent.
    const auto inTraffic = [&](std::string text) { return isInTraffic ? std::move(text) : "N/A"; };

    output.publish("k1xRx0BandClass", bandClassLabel(radio.u8(4)));
    output.publish("k1xRx0ChanNum", decimal(radio.u16(6)));
    output.publish("k1xRxAGC0", receiveAGC(radio.i8(10)));
    output.publish("k1xRx1BandClass", inTraffic(bandClassLabel(radio.u8(5))));
    output.publish("k1xRx1ChanNum", inTraffic(decimal(radio.u16(8))));
    output.publish("k1xRxAGC1", inTraffic(receiveAGC(radio.i8(11))));
    output.publish("k1xTxAGC", inTraffic(signedDbm(radio.i16(12) / 10.0)));
}

// Energy over total, in dB; whatever comes out too low, or as no number, shows as -50 dB.
double pilotLevel(const LogPacket& activeSet, std::uint16_t energy)
{
    constexpr double lowest = 0.00001;
    const double n = activeSet.u16(4);
    const double m = activeSet.u8(6);
    const int exponent = 2 * activeSet.u8(7) - 3;
    const double ratio = std::ldexp(1.0, exponent) * energy / (9.0 * n * n * m) - 1.0 / n;
    return 10.0 * std::log10(ratio >= lowest ? ratio : lowest);
}

// Active set
//   4 u16 N, 6 u8 M and 7 u8 E scale the energies | 8 u8 number of pilots | 9 u8 fields F
//   10 u16 PN offset of the reference pilot | 12 pilots of 12 to 1544 bytes, as F tells:
//   0 u16 PN offset, 4F + 12 u16 energy
PlistDictionary activeSetGroup(const LogPacket& activeSet)
{
    const std::size_t fields = activeSet.u8(9);
    const std::size_t energyOffset = 4 * fields + 12;
    const std::uint16_t referencePNOffset = activeSet.u16(10);
    const RecordElements pilots{12, (6 * fields + 15) & 0xFFC, activeSet.u8(8), energyOffset + 2};

    PilotGroup group;
    for (std::size_t i = 0; i < pilots.completeIn(activeSet); ++i) {
        const LogPacket pilot = pilots.element(activeSet, i);
        const std::uint16_t pnOffset = pilot.u16(0);
        const auto level = signedDb(pilotLevel(activeSet, pilot.u16(energyOffset)));
        group.add(i, pnOffset, pnOffset == referencePNOffset ? "(ref pilot) " + level : level);
    }
    return group.group();
}

} // namespace

// 1x status, 0x119C, a record of subpackets
//   1 state: 4 u8 device state | 2 radio | 3 active set | 4 fingers, of which nothing is shown
void decodeOneXStatus(const LogPacket& packet, const C2KOutput& output)
{
    if (packet.size() < Subpackets::minimumSize) {
        output.log().error("Log code 0x119c is {} bytes long but must be at least {} bytes.",
                           packet.size(), Subpackets::minimumSize);
        return;
    }
    const auto state = Subpackets::find(packet, stateIdentifier, output.log());
    const auto radio = Subpackets::find(packet, radioIdentifier, output.log());
    const auto activeSet = Subpackets::find(packet, activeSetIdentifier, output.log());
    const auto fingers = Subpackets::find(packet, fingerIdentifier, output.log());
    if (!state || !radio || !activeSet || !fingers) {
        output.log().warning(
            "Log code 0x119c: missing subpacket (ss={:d},rf={:d},ai={:d},fi={:d}).",
            state.has_value(), radio.has_value(), activeSet.has_value(), fingers.has_value());
        return;
    }
    const std::uint8_t deviceState = state->u8(4);
    const bool isInTraffic = deviceState == trafficState;
    output.publish("k1xDeviceState", deviceStateLabel(deviceState));
    publishRadio(*radio, isInTraffic, output);
    output.publish("k1xActiveSetInfo", activeSetGroup(*activeSet));
    if (!isInTraffic)
        endTrafficFER(output);
}

} // namespace ventrik
