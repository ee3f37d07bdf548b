#include "LogGenerator/C2K/OneXTrafficFER.h"

#include "LogGenerator/C2K/C2KOutput.h"
#include "LogGenerator/C2K/Subpackets.h"

namespace ventrik
{

namespace
{

constexpr std::uint8_t demodulationIdentifier = 11;

// Each frame counts 1/64; single precision, as the share has always been kept.
constexpr float newShare = 0.015625F;
constexpr float oldShare = 0.984375F;

constexpr std::string_view stateKey = "TrafficFER";
constexpr std::string_view lookupKey = "k1xTrafficFER";

std::optional<float> keptRate(const PlistDictionary& state)
{
    const PlistValue* kept = state.find(stateKey);
    const double* rate = kept ? kept->real() : nullptr;
    return rate ? std::optional(static_cast<float>(*rate)) : std::nullopt;
}

std::string percent(float rate)
{
    return fmt::format("{:.2f}%", static_cast<double>(rate * 100.0F));
}

} // namespace

// 1x traffic frame erasure, 0x119D, a record of subpackets
//   11 traffic demodulation: 24 u8 not 0 when the frame was erased
void decodeOneXTrafficFER(const LogPacket& packet, const C2KOutput& output)
{
    if (packet.size() < Subpackets::minimumSize) {
        output.log().error("Log code 0x119d is {} bytes long but must be at least {} bytes.",
                           packet.size(), Subpackets::minimumSize);
        return;
    }
    const auto demodulation = Subpackets::find(packet, demodulationIdentifier, output.log());
    if (!demodulation) {
        output.log().warning("Log code 0x119d: missing traffic demod subpacket.");
        return;
    }
    float rate = demodulation->u8(24) != 0 ? newShare : 0.0F;
    if (const auto previous = keptRate(output.state()))
        rate += *previous * oldShare;
    output.state().set(stateKey, static_cast<double>(rate));
    output.publish(lookupKey, percent(rate));
}

void endTrafficFER(const C2KOutput& output)
{
    const auto rate = keptRate(output.state());
    if (!rate)
        return;
    output.publish(lookupKey, percent(*rate) + " (old)");
    output.state().remove(stateKey);
}

} // namespace ventrik
