#include "Capture/lz4_decode_fast.h"

#include <limits>

#include <lz4.h>

namespace
{

constexpr std::int64_t badArgument = -1;
constexpr auto largestSize = static_cast<std::size_t>(std::numeric_limits<int>::max());

} // namespace

std::int64_t lz4_decode_fast(const std::uint8_t* source, std::size_t sourceSize,
                             std::uint8_t* destination, std::size_t destinationCapacity)
{
    if (source == nullptr || destination == nullptr || sourceSize > largestSize)
        return badArgument;
    const std::size_t capacity =
        destinationCapacity < largestSize ? destinationCapacity : largestSize;
    return LZ4_decompress_safe(static_cast<const char*>(static_cast<const void*>(source)),
                               static_cast<char*>(static_cast<void*>(destination)),
                               static_cast<int>(sourceSize), static_cast<int>(capacity));
}
