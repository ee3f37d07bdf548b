#pragma once

#include "PropertyList/PlistValue.h"

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace ventrik
{

/// A message of the session bus as it is sent; texts that are empty are left out.
struct BusMessage {
    enum class Type : std::uint8_t { MethodCall = 1, MethodReturn = 2, Error = 3, Signal = 4 };

    Type type = Type::MethodCall;
    std::uint32_t serial = 1;
    std::string path;
    std::string interface;
    std::string member;
    std::string destination;
    std::vector<std::string> arguments;

    Bytes encode() const;
};

/// What of a received message tells where the next one begins.
struct BusMessageStart {
    static constexpr std::size_t size = 16;

    BusMessage::Type type = BusMessage::Type::MethodCall;
    std::uint64_t messageSize = 0; ///< with this start

    /// The text must hold `size` bytes.
    static BusMessageStart decode(ByteView bytes);
};

} // namespace ventrik
