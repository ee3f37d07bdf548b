#pragma once

#include "PropertyList/PlistValue.h"

namespace ventrik
{

/// The bytes as one unsigned number, the highest first; at most eight.
std::uint64_t bigEndian(ByteView bytes);

/// One object of a binary property list: its place, its marker taken apart, and the bytes after
/// that up to the offset table. Throws PropertyListError rather than reach beyond them.
struct BinaryPlistObject {
    std::size_t offset;
    std::uint8_t kind; ///< the marker's high half
    std::uint8_t low;  ///< the marker's low half: a size or a count
    ByteView rest;

    /// Takes that many elements off the rest; `what` names the object in the error.
    ByteView take(std::uint64_t count, std::size_t elementSize, std::string_view what);

    /// The marker's own count, or that of the integer object which follows it.
    std::uint64_t takeCount(std::string_view what);
};

/// The value of an object that is no container. Throws PropertyListError for one that is malformed
/// or of a kind that property lists do not share.
PlistValue readBinaryScalar(BinaryPlistObject& object);

} // namespace ventrik
