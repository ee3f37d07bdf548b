#pragma once

#include "Packets/Record.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

namespace ventrik
{

/// Which bytes of a record the fields of a table stand in. Records repeat most of what they told
/// the last time; comparing them eight bytes at a time leaves few fields to look at. The fields
/// outlive it.
class FieldBytes
{
  public:
    /// The bytes of the fields as they were last, eight in each.
    using Words = std::vector<std::uint64_t>;

    /// Bits stand for so many fields at most.
    static constexpr std::size_t maximumFields = 64;

    explicit FieldBytes(std::span<const Field> fields);

    /// Whether it was made for those very fields.
    bool areOf(std::span<const Field> fields) const
    {
        return _fields.data() == fields.data() && _fields.size() == fields.size();
    }

    std::size_t fieldCount() const { return _fields.size(); }

    /// The fields that share a byte with one that changed, as the bits of their indices; the words
    /// are brought to what the part holds. Empty words, at first, say nothing of what changed.
    std::uint64_t changesIn(const LogPacket& part, Words& words) const;

  private:
    std::span<const Field> _fields;
    std::size_t _first = 0;              // byte
    std::vector<std::uint64_t> _readers; // of each byte from the first on: its fields' bits
};

} // namespace ventrik
