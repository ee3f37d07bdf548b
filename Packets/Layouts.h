#pragma once

#include "Packets/Record.h"

#include <cstddef>
#include <cstdint>
#include <limits>
#include <optional>
#include <span>
#include <string>
#include <string_view>

namespace ventrik
{

/// Which layouts records are read by.
enum class RecordsMode : std::uint8_t {
    Base,     ///< each record by its base layout, whatever its version
    Newer,    ///< by the newer layout that its version and its size fit, where there is one
    Extended, ///< likewise, and records that have no base layout as well
};

/// "base", "newer" or "extended".
std::string_view nameOf(RecordsMode mode);
std::optional<RecordsMode> recordsModeNamed(std::string_view name);

/// What is known of the layout that a record was read by.
enum class LayoutKind : std::uint8_t {
    Base,
    Newer,
    NotKnown, ///< read by the base layout for want of a better one
};

/// What tells that a packet has a layout: version, size and, where they do not suffice, its bytes.
struct Layout {
    const Record* record; ///< the base record itself where that is right
    std::uint8_t firstVersion = 0;
    std::uint8_t lastVersion = 255;
    std::size_t minimumSize = 0;
    std::size_t maximumSize = std::numeric_limits<std::size_t>::max();
    bool (*fits)(const Record& record, const LogPacket& packet) = nullptr;
    std::string_view condition = {}; ///< what that asks, for people

    constexpr bool isOfAnyVersion() const { return firstVersion == 0 && lastVersion == 255; }
    /// The packet carries that version.
    bool isOf(const LogPacket& packet, std::optional<std::uint8_t> version) const;
};

/// The version that a record, or the subpacket that tells it, carries; none where it has none.
std::optional<std::uint8_t> versionOf(const Record& record, const LogPacket& packet);

/// All that is known of the layouts of a log code; empty where a code has no other layout than its
/// base one.
std::span<const Layout> layoutsOf(std::uint32_t logCode);

/// By what record a packet is to be read, and what that is worth.
struct ChosenLayout {
    const Record* record;
    LayoutKind kind;
    std::optional<std::uint8_t> version; ///< none where that record tells none
};
/// Of a code's layouts. All records of a code that tell a version tell it in one place. The packet
/// is as long as the base record asks for.
ChosenLayout chooseLayout(const Record& base, std::span<const Layout> ofCode,
                          const LogPacket& packet);

/// "base", "newer" or "not known".
std::string_view nameOf(LayoutKind kind);

/// How a record was read.
struct ReadLayout {
    std::uint32_t logCode; ///< effective
    std::optional<std::uint8_t> version;
    std::size_t size; ///< of the packet, its header included
    LayoutKind kind;

    bool operator==(const ReadLayout&) const = default;
};

/// What a screen says of a record whose layout is not known, in one line.
std::string warningOf(const ReadLayout& layout);

} // namespace ventrik
