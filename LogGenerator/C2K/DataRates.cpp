#include "LogGenerator/C2K/DataRates.h"

#include "LogGenerator/C2K/C2KOutput.h"
#include "LogGenerator/Core/StateKeys.h"
#include "Packets/C2KRecords.h"
#include "Packets/LogPacket.h"

#include <array>

#include <fmt/compile.h>
#include <fmt/format.h>

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

const PlistInteger* keptNumber(const PlistDictionary& state, std::string_view key)
{
    const PlistValue* value = state.find(key);
    return value ? value->integer() : nullptr;
}

void updateRate(const Direction& direction, std::uint32_t sequence, std::int64_t sent,
                const C2KOutput& output)
{
    PlistDictionary& state = output.state();
    PlistDictionary* extraInfo = output.extraInfo();
    const auto keepExtra = [&](std::string_view key, const PlistValue& value) {
        if (extraInfo)
            extraInfo->set(key, value);
    };
    const PlistInteger* previousSequence = keptNumber(state, direction.sequenceKey);
    const PlistInteger* previousSent = keptNumber(state, direction.sentKey);
    if (previousSequence && previousSent) {
        const auto steps = static_cast<std::int32_t>(
            sequence - static_cast<std::uint32_t>(previousSequence->bits()));
        const auto added = static_cast<double>(sent - previousSent->signedBits());
        if (steps >= 1)
            output.publish(direction.rate,
                           fmt::format(FMT_COMPILE("{:.2f} kbps"), added / (steps * 1024.0)));
        keepExtra(direction.sequence2Key, *previousSequence);
        keepExtra(direction.sent2Key, *previousSent);
    } else {
        output.publish(direction.rate, "");
    }
    keepExtra(direction.sequence1Key, sequence);
    keepExtra(direction.sent1Key, sent);
    // Last: the state may move what it holds.
    state.set(direction.sequenceKey, sequence);
    state.set(direction.sentKey, sent);
}

// The sum of the counters that stand there, two of them in eight bytes.
std::int64_t sumOfTwo(const LogPacket& packet, std::size_t offset)
{
    const std::uint64_t word = packet.littleEndianWord(offset);
    return static_cast<std::int64_t>((word & 0xFFFFFFFF) + (word >> 32));
}

std::uint32_t sequenceNumber(const LogPacket& packet, const Field& field)
{
    return static_cast<std::uint32_t>(numberOf(packet, field));
}

} // namespace

void decodeForwardDataRate(const LogPacket& packet, const C2KOutput& output)
{
    const RecordElements& kinds = C2KRecords::forwardCounters;
    std::int64_t sent = 0;
    for (std::size_t kind = 0; kind < kinds.count; ++kind)
        sent += packet.u32(kinds.offset + kinds.stride * kind) * forwardBits.at(kind);
    updateRate(forward, sequenceNumber(packet, C2KRecords::forwardPacketsUnshown.front()), sent,
               output);
}

void decodeReverseDataRate(const LogPacket& packet, const C2KOutput& output)
{
    const RecordElements& sizes = C2KRecords::reverseCounters;
    std::int64_t sent = 0;
    for (std::size_t i = 0; i < sizes.count; ++i) {
        const std::size_t start = sizes.offset + sizes.stride * i;
        constexpr auto& counters = C2KRecords::payloadCounterFields;
        static_assert(counters.size() == 4);
        const std::int64_t packets = sumOfTwo(packet, start + counters[0].place.offset) +
                                     sumOfTwo(packet, start + counters[2].place.offset);
        sent += packets * reverseBits[i % reverseBits.size()];
    }
    updateRate(reverse, sequenceNumber(packet, C2KRecords::reversePacketsUnshown.front()), sent,
               output);
}

} // namespace ventrik
