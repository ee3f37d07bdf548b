#include "LogGenerator/C2K/DataRates.h"

#include "LogGenerator/C2K/C2KOutput.h"
#include "Packets/LogPacket.h"

#include <array>

namespace ventrik
{

namespace
{

// Bits in a packet of each counted kind; 0 for kinds that do not count.
constexpr std::array<std::int64_t, 56> forwardBits{
    128,  256,  512, 1024, 0,    128,  256,  512,  1024, 0,    128,  256,  512,  1024,
    0,    128,  256, 512,  1024, 0,    128,  256,  512,  1024, 0,    512,  1024, 2048,
    0,    128,  256, 512,  1024, 0,    512,  1024, 2048, 0,    1024, 3072, 0,    512,
    1024, 2048, 0,   4096, 0,    1024, 3072, 0,    4096, 0,    5120, 0,    5120, 0};

// Bits in a packet of each payload size.
constexpr std::array<std::int64_t, 12> reverseBits{128,  256,  512,  768,  1024, 1536,
                                                   2048, 3072, 4096, 6144, 8192, 12288};

/// Where a direction keeps its last record, and where its rate is shown.
struct Direction {
    std::string_view lookupKey;
    std::string_view sequenceKey;
    std::string_view sentKey;
    // In the extra information: the last record and the one before it.
    std::string_view sequence1Key;
    std::string_view sent1Key;
    std::string_view sequence2Key;
    std::string_view sent2Key;
};

constexpr Direction forward{"kFLDataRate", "FLDataSeqNum",  "FLDataSent", "FLDataSeqNum1",
                            "FLDataSent1", "FLDataSeqNum2", "FLDataSent2"};
constexpr Direction reverse{"kRLDataRate", "RLDataSeqNum",  "RLDataSent", "RLDataSeqNum1",
                            "RLDataSent1", "RLDataSeqNum2", "RLDataSent2"};

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
            output.publish(direction.lookupKey,
                           fmt::format("{:.2f} kbps", added / (steps * 1024.0)));
        output.keepExtra(direction.sequence2Key, *previousSequence);
        output.keepExtra(direction.sent2Key, *previousSent);
    } else {
        output.publish(direction.lookupKey, "");
    }
    state.set(direction.sequenceKey, sequence);
    state.set(direction.sentKey, sent);
    output.keepExtra(direction.sequence1Key, sequence);
    output.keepExtra(direction.sent1Key, sent);
}

} // namespace

// EV-DO forward-link packets, 0x1192, at least 241 bytes
//   13 u32 sequence number | 17 56 counters, u32 each
void decodeForwardDataRate(const LogPacket& packet, const C2KOutput& output)
{
    constexpr std::size_t minimumSize = 241;
    if (packet.size() < minimumSize) {
        output.log().error("Log code 0x1192 is {} bytes long but must be at least {} bytes.",
                           packet.size(), minimumSize);
        return;
    }
    std::int64_t sent = 0;
    for (std::size_t kind = 0; kind < forwardBits.size(); ++kind)
        sent += packet.u32(17 + 4 * kind) * forwardBits.at(kind);
    updateRate(forward, packet.u32(13), sent, output);
}

// EV-DO reverse-link packets, 0x127E, at least 1750 bytes
//   14 u32 sequence number | 18 three blocks of 576 bytes, each of two halves of 288: for each of
//   12 payload sizes 24 bytes, of which the first 16 are four u32 counters
void decodeReverseDataRate(const LogPacket& packet, const C2KOutput& output)
{
    constexpr std::size_t minimumSize = 1750;
    if (packet.size() < minimumSize) {
        output.log().error("Log code 0x127e is {} bytes long but must be at least {} bytes.",
                           packet.size(), minimumSize);
        return;
    }
    std::int64_t sent = 0;
    for (std::size_t half = 0; half < 6; ++half)
        for (std::size_t rate = 0; rate < reverseBits.size(); ++rate)
            for (std::size_t counter = 0; counter < 4; ++counter)
                sent +=
                    packet.u32(18 + 288 * half + 24 * rate + 4 * counter) * reverseBits.at(rate);
    updateRate(reverse, packet.u32(14), sent, output);
}

} // namespace ventrik
