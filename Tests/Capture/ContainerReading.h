#pragma once

#include "Capture/ByteSource.h"
#include "Capture/CaptureContainer.h"
#include "PropertyList/Bytes.h"

#include <algorithm>
#include <initializer_list>
#include <memory>
#include <optional>
#include <random>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{

/// Little-endian bytes, put down one after the other.
class ByteRow
{
  public:
    ByteRow& number(std::size_t width, std::uint64_t value)
    {
        for (std::size_t i = 0; i < width; ++i)
            _bytes.push_back(static_cast<std::uint8_t>(value >> (8 * i)));
        return *this;
    }
    ByteRow& bytes(const Bytes& bytes)
    {
        _bytes.insert(_bytes.end(), bytes.begin(), bytes.end());
        return *this;
    }

    operator Bytes() const { return _bytes; }

  private:
    Bytes _bytes;
};

inline Bytes joined(std::initializer_list<Bytes> pieces)
{
    ByteRow row;
    for (const Bytes& piece : pieces)
        row.bytes(piece);
    return row;
}

/// A length, a code, a timestamp, a payload. The length, unless given, is right modulo 65536.
inline Bytes logRecord(std::uint16_t code, std::uint64_t timestamp, const Bytes& payload,
                       std::optional<std::uint16_t> length = {})
{
    constexpr std::size_t headerSize = 12;
    return ByteRow()
        .number(2, length.value_or(static_cast<std::uint16_t>(headerSize + payload.size())))
        .number(2, code)
        .number(8, timestamp)
        .bytes(payload);
}

/// The timestamp of so many seconds after 1980-01-06.
constexpr std::uint64_t timestampOf(std::uint64_t seconds)
{
    return (seconds * 800) << 16;
}
/// That of a moment in the year 2025, and so many seconds later.
constexpr std::uint64_t stampIn2025(std::uint64_t seconds = 0)
{
    return timestampOf(std::uint64_t{45} * 365 * 86400 + seconds);
}
inline Clock::TimePoint timeAt(std::uint64_t timestamp)
{
    return timeOfTimestamp(timestamp).value();
}

struct ReadMessage {
    Clock::TimePoint time;
    Bytes data;
    std::optional<std::uint32_t> subscription;

    bool operator==(const ReadMessage&) const = default;
};

struct ContainerReading {
    std::vector<ReadMessage> messages;
    std::string error;
    std::vector<std::string> notes;

    std::vector<Bytes> packets() const
    {
        std::vector<Bytes> packets;
        for (const ReadMessage& message : messages)
            packets.push_back(message.data);
        return packets;
    }
    bool operator==(const ContainerReading&) const = default;
};

/// Reads bytes that come in blocks of that size; the container is named "x".
template <typename Container>
ContainerReading readAll(const Bytes& bytes, std::size_t blockSize = 65536)
{
    Container container(std::make_unique<ByteSource>(bytes, blockSize), "x");
    ContainerReading reading;
    while (const auto message = container.next())
        reading.messages.push_back({message->time,
                                    Bytes(message->data.begin(), message->data.end()),
                                    message->subscription});
    reading.error = container.error();
    reading.notes = container.notes();
    return reading;
}

/// Whatever the blocks are that bytes come in, they read the same.
template <typename Container>
void expectTheSameInBlocks(const Bytes& bytes)
{
    const auto whole = readAll<Container>(bytes, bytes.size());
    for (const std::size_t blockSize : {1, 2, 3, 7})
        EXPECT_EQ(readAll<Container>(bytes, blockSize), whole) << "blocks of " << blockSize;
}

/// Cut anywhere, they read as the first messages of the whole.
template <typename Container>
void expectPrefixesOfMessages(const Bytes& bytes)
{
    const auto whole = readAll<Container>(bytes).messages;
    for (std::size_t size = 0; size < bytes.size(); ++size) {
        const auto cut = Bytes(bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(size));
        const auto part = readAll<Container>(cut).messages;
        ASSERT_LE(part.size(), whole.size()) << "cut at " << size;
        EXPECT_TRUE(std::ranges::equal(part, std::span(whole).first(part.size())))
            << "cut at " << size;
    }
}

inline Bytes randomBytes(unsigned seed, std::size_t size)
{
    std::minstd_rand generator(seed);
    Bytes bytes(size);
    std::ranges::generate(bytes, [&] { return static_cast<std::uint8_t>(generator() >> 8); });
    return bytes;
}

/// Random bytes, alone and in the place of some of the given ones, end in no more messages than
/// they have bytes for.
template <typename Container>
void expectRandomBytesHarmless(const Bytes& good)
{
    constexpr std::size_t least = 13; // bytes of a message
    for (unsigned seed = 1; seed <= 200; ++seed) {
        const Bytes noise = randomBytes(seed, 20 * seed);
        EXPECT_LE(readAll<Container>(noise).messages.size(), noise.size() / least);
        Bytes damaged = good;
        for (std::size_t i = 0; i < 3 && !damaged.empty(); ++i)
            damaged[(noise[2 * i] | noise[2 * i + 1] << 8) % damaged.size()] = noise[10 + i];
        EXPECT_LE(readAll<Container>(damaged).messages.size(), damaged.size() / (least - 1));
    }
}

} // namespace ventrik
