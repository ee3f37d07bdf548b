#include "LogGenerator/C2K/OneXStatus.h"

#include "LogGenerator/C2K/C2KOutput.h"
#include "LogGenerator/C2K/OneXTrafficFER.h"
#include "LogGenerator/C2K/SubpacketSearch.h"
#include "Packets/C2KRecords.h"

#include <algorithm>
#include <array>
#include <cmath>

namespace ventrik
{

namespace
{

void publishRadio(const LogPacket& radio, bool isInTraffic, const C2KOutput& output)
{
    const auto fields = std::span(C2KRecords::radioFields);
    if (isInTraffic)
        return output.publish(fields, radio);
    output.publish(fields.first(C2KRecords::alwaysShownRadioFields), radio);
    output.publish(fields.subspan(C2KRecords::alwaysShownRadioFields), "N/A");
}

// Energy over total, in dB; whatever comes out too low, or as no number, shows as -50 dB.
double pilotLevel(const LogPacket& activeSet, std::int64_t energy)
{
    constexpr double lowest = 0.00001;
    const auto n = static_cast<double>(numberOf(activeSet, C2KRecords::scaleN));
    const auto m = static_cast<double>(numberOf(activeSet, C2KRecords::scaleM));
    const int exponent = 2 * static_cast<int>(numberOf(activeSet, C2KRecords::scaleE)) - 3;
    const double ratio =
        std::ldexp(1.0, exponent) * static_cast<double>(energy) / (9.0 * n * n * m) - 1.0 / n;
    return 10.0 * std::log10(ratio >= lowest ? ratio : lowest);
}

struct PilotLayout {
    Field pnOffset;
    Field energy;
    RecordElements elements;
};

PilotLayout pilotLayoutOf(const LogPacket& activeSet)
{
    const auto furtherFields =
        static_cast<std::size_t>(numberOf(activeSet, C2KRecords::furtherFields));
    const auto [pnOffset, energy] = C2KRecords::pilotFields(furtherFields);
    return {pnOffset,
            energy,
            {C2KRecords::firstPilot, C2KRecords::pilotSize(furtherFields),
             static_cast<std::size_t>(numberOf(activeSet, C2KRecords::pilotCount)),
             energy.place.offset + energy.place.bytes()}};
}

// The bytes that tell the pilots, as far as the packet holds them.
ByteView pilotBytes(const LogPacket& activeSet, const RecordElements& elements)
{
    const std::size_t end =
        elements.count == 0
            ? elements.offset
            : elements.offset + elements.stride * (elements.count - 1) + elements.needed;
    return activeSet.bytes().first(std::min(end, activeSet.size()));
}

std::vector<ShownPilot> pilotsOf(const LogPacket& activeSet, const PilotLayout& layout)
{
    const auto& [pnOffset, energy, elements] = layout;
    const std::int64_t reference = numberOf(activeSet, C2KRecords::referencePNOffset);
    const std::size_t count = elements.completeIn(activeSet);
    std::vector<ShownPilot> pilots;
    pilots.reserve(count);
    for (std::size_t i = 0; i < count; ++i) {
        const LogPacket pilot = elements.element(activeSet, i);
        const std::int64_t number = numberOf(pilot, pnOffset);
        pilots.push_back({i, static_cast<std::uint16_t>(number),
                          pilotLevel(activeSet, numberOf(pilot, energy)), number == reference});
    }
    return pilots;
}

} // namespace

void decodeOneXStatus(const LogPacket& packet, const C2KOutput& output)
{
    constexpr std::int64_t trafficState = 8;
    std::array<SoughtSubpacket, 4> parts{{{C2KRecords::statePart},
                                          {C2KRecords::radioPart},
                                          {C2KRecords::activeSetPart},
                                          {C2KRecords::fingerPart}}};
    findSubpackets(packet, parts, output.log());
    const auto& state = parts[0].found;
    const auto& radio = parts[1].found;
    const auto& activeSet = parts[2].found;
    const auto& fingers = parts[3].found;
    if (!state || !radio || !activeSet || !fingers) {
        output.log().warning(
            "Log code 0x119c: missing subpacket (ss={:d},rf={:d},ai={:d},fi={:d}).",
            state.has_value(), radio.has_value(), activeSet.has_value(), fingers.has_value());
        return;
    }
    const bool isInTraffic = numberOf(*state, C2KRecords::deviceState) == trafficState;
    output.publish(C2KRecords::deviceState, *state);
    publishRadio(*radio, isInTraffic, output);
    const PilotLayout layout = pilotLayoutOf(*activeSet);
    output.publish(C2KRecords::activeSetInfo, pilotBytes(*activeSet, layout.elements),
                   [&] { return pilotsOf(*activeSet, layout); });
    if (!isInTraffic)
        endTrafficFER(output);
}

} // namespace ventrik
