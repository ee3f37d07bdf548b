#include "LogGenerator/C2K/DataRates.h"

#include "LogGenerator/C2K/C2KOutput.h"
#include "LogGenerator/Core/StateKeys.h"
#include "Packets/C2KRecords.h"
#include "Packets/DecimalText.h"
#include "Packets/LogPacket.h"

#include <array>
#include <string>

namespace ventrik
{

namespace
{

// Bits in a packet of each counted kind; 0 for kinds that do not count.
constexpr std::array<std::int64_t, C2KRecords::forwardKindCount> forwardBits{
    128,  256,  512, 1024, 0,    128,  256,  512,  1024, 0,    128,  256,  512,  1024,
    0,    128,  256, 512,  1024, 0,    128,  256,  512,  1024, 0,    512,  1024, 2048,
    0,    128,  256, 512,  1024, 0,    512,  1024, 2048, 0,    1024, 3072, 0,    512,
    1024, 2048, 0,   4096, 0,    1024, 3072, 0,    4096, 0,    5120, 0,    5120, 0};

// Bits in a packet of each payload size.
constexpr std::array<std::int64_t, C2KRecords::payloadSizeCount> reverseBits{
    128, 256, 512, 768, 1024, 1536, 2048, 3072, 4096, 6144, 8192, 12288};

/// Where a direction keeps its last record, and where its rate is shown.
struct Direction {
    const Field& rate;
    std::string_view sequenceKey;
    std::string_view sentKey;
    // In the extra information: the last record and the one before it.
    std::string_view sequence1Key;
    std::string_view sent1Key;
    std::string_view sequence2Key;
    std::string_view sent2Key;
};

constexpr Field forwardRate{"kFLDataRate", {}};
constexpr Field reverseRate{"kRLDataRate", {}};

constexpr Direction forward{
    forwardRate,   StateKey::forwardSequence, StateKey::forwardSent, "FLDataSeqNum1",
    "FLDataSent1", "FLDataSeqNum2",           "FLDataSent2"};
constexpr Direction reverse{
    reverseRate,   StateKey::reverseSequence, StateKey::reverseSent, "RLDataSeqNum1",
    "RLDataSent1", "RLDataSeqNum2",           "RLDataSent2"};

const PlistInteger* numberIn(const PlistValue* value)
{
    return value ? value->integer() : nullptr;
}

void keep(PlistDictionary& dictionary, std::string_view key, std::size_t& place,
          PlistInteger number)
{
    if (PlistValue* kept = dictionary.find(key, place))
        *kept = number;
    else
        dictionary.set(key, number);
}

std::string textOfRate(double bits, std::int32_t steps)
{
    std::string text;
    appendTwoDecimals(text, bits / (steps * 1024.0));
    return text += " kbps";
}

void updateRate(const Direction& direction, TotalPlaces::Rate& places, std::uint32_t sequence,
                std::int64_t sent, const C2KOutput& output)
{
    PlistDictionary& state = output.state();
    PlistDictionary* extraInfo = output.extraInfo();
    const auto keepExtra = [&](std::string_view key, std::size_t& place, PlistInteger number) {
        if (extraInfo)
            keep(*extraInfo, key, place, number);
    };
    const auto* previousSequence = numberIn(state.find(direction.sequenceKey, places.sequence));
    const auto* previousSent = numberIn(state.find(direction.sentKey, places.sent));
    if (previousSequence && previousSent) {
        const auto steps = static_cast<std::int32_t>(
            sequence - static_cast<std::uint32_t>(previousSequence->bits()));
        const auto added = static_cast<double>(sent - previousSent->signedBits());
        if (steps >= 1)
            output.publish(direction.rate, textOfRate(added, steps));
        keepExtra(direction.sequence2Key, places.sequence2, *previousSequence);
        keepExtra(direction.sent2Key, places.sent2, *previousSent);
    } else {
        output.publish(direction.rate, "");
    }
    keepExtra(direction.sequence1Key, places.sequence1, sequence);
    keepExtra(direction.sent1Key, places.sent1, sent);
    // Last: the state may move what it holds.
    keep(state, direction.sequenceKey, places.sequence, sequence);
    keep(state, direction.sentKey, places.sent, sent);
}

std::uint32_t sequenceNumber(const LogPacket& packet, const Field& field)
{
    return static_cast<std::uint32_t>(numberOf(packet, field));
}

} // namespace

void decodeForwardDataRate(const LogPacket& packet, const C2KOutput& output)
{
    constexpr const RecordElements& kinds = C2KRecords::forwardCounters;
    static_assert(kinds.stride == sizeof(std::uint32_t));
    std::array<std::uint32_t, kinds.count> packets{};
    packet.u32s(kinds.offset, packets);
    std::int64_t sent = 0;
    for (std::size_t kind = 0; kind < packets.size(); ++kind)
        sent += packets[kind] * forwardBits[kind];
    updateRate(forward, output.totals().forward,
               sequenceNumber(packet, C2KRecords::forwardPacketsUnshown.front()), sent, output);
}

void decodeReverseDataRate(const LogPacket& packet, const C2KOutput& output)
{
    constexpr const RecordElements& sizes = C2KRecords::reverseCounters;
    constexpr std::size_t numbersEach = sizes.stride / sizeof(std::uint32_t);
    std::array<std::uint32_t, sizes.count * numbersEach> numbers{};
    packet.u32s(sizes.offset, numbers);
    std::int64_t sent = 0;
    for (std::size_t i = 0; i < sizes.count; ++i) {
        std::int64_t packets = 0;
        for (std::size_t counter = 0; counter < C2KRecords::countersForPayloadSize; ++counter)
            packets += numbers[numbersEach * i + counter];
        sent += packets * reverseBits[i % reverseBits.size()];
    }
    updateRate(reverse, output.totals().reverse,
               sequenceNumber(packet, C2KRecords::reversePacketsUnshown.front()), sent, output);
}

} // namespace ventrik
