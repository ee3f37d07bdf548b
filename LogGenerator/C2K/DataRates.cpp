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
    const PlistInteger* previousSequence = keptNumber(state, direction.sequenceKey);
    const PlistInteger* previousSent = keptNumber(state, direction.sentKey);
    if (previousSequence && previousSent) {
        const auto steps = static_cast<std::int32_t>(
            sequence - static_cast<std::uint32_t>(previousSequence->bits()));
        const auto added = static_cast<double>(sent - previousSent->signedBits());
        if (steps >= 1)
            output.publish(direction.rate,
                           fmt::format(FMT_COMPILE("{:.2f} kbps"), added / (steps * 1024.0)));
        output.keepExtra(direction.sequence2Key, *previousSequence);
        output.keepExtra(direction.sent2Key, *previousSent);
    } else {
        output.publish(direction.rate, "");
    }
    state.set(direction.sequenceKey, sequence);
    state.set(direction.sentKey, sent);
    output.keepExtra(direction.sequence1Key, sequence);
    output.keepExtra(direction.sent1Key, sent);
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
        std::int64_t packets = 0;
        for (std::size_t counter = 0; counter < C2KRecords::payloadCounterFields.size(); ++counter)
            packets += packet.u32(start + C2KRecords::payloadCounterFields[counter].place.offset);
        sent += packets * reverseBits.at(i % reverseBits.size());
    }
    updateRate(reverse, sequenceNumber(packet, C2KRecords::reversePacketsUnshown.front()), sent,
               output);
}

} // namespace ventrik
