#include "LogGenerator/C2K/OneXTrafficFER.h"

#include "LogGenerator/C2K/C2KOutput.h"
#include "LogGenerator/C2K/SubpacketSearch.h"
#include "LogGenerator/Core/StateKeys.h"
#include "Packets/C2KRecords.h"
#include "Packets/DecimalText.h"

namespace ventrik
{

namespace
{

// Each frame counts 1/64; single precision, as the share has always been kept.
constexpr float newShare = 0.015625F;
constexpr float oldShare = 0.984375F;

constexpr Field frameErasureRate{"k1xTrafficFER", {}};

PlistValue* keptValue(const C2KOutput& output)
{
    return output.state().find(StateKey::trafficFER, output.totals().trafficFER);
}

std::optional<float> keptRate(const C2KOutput& output)
{
    const PlistValue* kept = keptValue(output);
    const double* rate = kept ? kept->real() : nullptr;
    return rate ? std::optional(static_cast<float>(*rate)) : std::nullopt;
}

std::string percent(float rate)
{
    std::string text;
    appendTwoDecimals(text, static_cast<double>(rate * 100.0F));
    return text += '%';
}

} // namespace

void decodeOneXTrafficFER(const LogPacket& packet, const C2KOutput& output)
{
    const auto demodulation = findSubpacket(packet, C2KRecords::demodulationPart, output.log());
    if (!demodulation) {
        output.log().warning("Log code 0x119d: missing traffic demod subpacket.");
        return;
    }
    float rate = numberOf(*demodulation, C2KRecords::frameErasure) != 0 ? newShare : 0.0F;
    PlistValue* kept = keptValue(output);
    if (kept && kept->real()) {
        rate += static_cast<float>(*kept->real()) * oldShare;
        *kept = static_cast<double>(rate);
    } else {
        output.state().set(StateKey::trafficFER, static_cast<double>(rate));
    }
    output.publish(frameErasureRate, percent(rate));
}

void endTrafficFER(const C2KOutput& output)
{
    const auto rate = keptRate(output);
    if (!rate)
        return;
    output.publish(frameErasureRate, percent(*rate) + " (old)");
    output.state().remove(StateKey::trafficFER);
}

} // namespace ventrik
