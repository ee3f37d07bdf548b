#pragma once

#include <cstddef>
#include <cstdint>

/// Decodes one LZ4 block. Reads only the source and writes only the destination, whatever the
/// source holds. Returns the number of bytes written, or a negative number for a block that is
/// malformed or does not fit.
extern "C" [[gnu::visibility("default"), gnu::used]] std::int64_t
lz4_decode_fast(const std::uint8_t* source, std::size_t sourceSize, std::uint8_t* destination,
                std::size_t destinationCapacity);
