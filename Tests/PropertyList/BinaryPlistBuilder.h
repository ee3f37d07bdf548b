#pragma once

#include "PropertyList/PlistValue.h"

#include <map>

namespace ventrik
{

/// Puts a binary property list together from the raw bytes of its objects; object 0 is the top.
/// Offsets take four bytes and references one unless set otherwise. What a test sets by hand
/// replaces the right number in the trailer or the offset table.
class BinaryPlistBuilder
{
  public:
    BinaryPlistBuilder& object(const Bytes& bytes);
    BinaryPlistBuilder& offsetSize(std::uint8_t size);
    BinaryPlistBuilder& referenceSize(std::uint8_t size);
    BinaryPlistBuilder& topObject(std::uint64_t number);
    BinaryPlistBuilder& objectCount(std::uint64_t count);
    BinaryPlistBuilder& tableStart(std::uint64_t start);
    BinaryPlistBuilder& offsetOf(std::size_t object, std::uint64_t offset);

    Bytes build() const;

  private:
    Bytes _objects;
    std::vector<std::uint64_t> _offsets;
    std::map<std::size_t, std::uint64_t> _wrongOffsets;
    std::uint8_t _offsetSize = 4;
    std::uint8_t _referenceSize = 1;
    std::uint64_t _topObject = 0;
    std::optional<std::uint64_t> _objectCount;
    std::optional<std::uint64_t> _tableStart;
};

/// The number in that many bytes, the highest first.
Bytes bigEndianBytes(std::uint64_t value, std::size_t size);

Bytes joined(std::initializer_list<Bytes> parts);

} // namespace ventrik
