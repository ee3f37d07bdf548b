#pragma once

#include "Packets/LogPacket.h"
#include "Packets/Place.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>

namespace ventrik
{

// The layouts of records as tables of constants. Decoders read through them, the telephony service
// writes through them, and whoever asks where a shown value comes from is answered from them.

/// How the digits of a number are written.
enum class Digits : std::uint8_t {
    Whole,             ///< -5
    SignedWhole,       ///< +5
    TwoDecimals,       ///< 5.25
    SignedTwoDecimals, ///< +5.25
    SixDecimals,       ///< 5.250000
    SixHexDigits,      ///< 0x00001f
};

/// What a single raw number means, whatever the others mean.
struct Mark {
    std::int64_t raw;
    std::string_view text;
};

/// What a number measures, as far as its limits are known.
enum class Quantity : std::uint8_t {
    Any,
    RSRP,                 ///< dBm
    RSRQ,                 ///< dB
    PhysicalCellIdentity, ///< of LTE
    DownlinkEARFCN,
    UplinkEARFCN,
};

/// How a raw number shows: as the text that its mark or its label gives, else as a number, which is
/// the raw one times a factor plus an offset.
struct Shown {
    Digits digits = Digits::Whole;
    double factor = 1;
    double offset = 0;
    std::string_view unit = {}; ///< behind the number and a blank
    std::span<const Mark> marks = {};
    /// By raw number. Gaps are empty.
    std::span<const std::string_view> labels = {};
    /// For raw numbers that have no label; "{}" in it is the raw number. Where there are labels and
    /// this is empty, such a number does not show at all.
    std::string_view otherwise = {};
    /// In the place of factor and offset, for scales that are not straight.
    double (*scale)(std::int64_t raw) = nullptr;
    /// For texts that no number stands for, such as digits in nibbles.
    std::string (*text)(std::int64_t raw) = nullptr;
    Quantity quantity = Quantity::Any;
    /// The raw number that stands for none: nothing shows.
    std::optional<std::int64_t> none = {};

    /// The number that the raw one stands for; none where a text shows in its place.
    std::optional<double> number(std::int64_t raw) const;
    /// What shows; none where nothing does.
    std::optional<std::string> textOf(std::int64_t raw) const;
    /// The text of a number that was already scaled.
    std::string textOfNumber(double number) const;
    void appendTextOfNumber(std::string& shown, double number) const;
};

/// A field of a record: the key of the display under which it shows, or, in lower case, the name of
/// one that does not show; where it stands; and how it shows.
struct Field {
    std::string_view key;
    Place place;
    Shown shown = {};
};

/// The place of a number that counts the elements of a list.
struct ElementCount {
    Place place;
    std::size_t more = 0; ///< so many more than the number says
};

/// A repeated part of a record, one element every `stride` bytes. Where a list follows on another,
/// it begins `before.bytesEach` bytes later for each that `before.count` counts.
struct List {
    /// In the section's dictionary; where there is none, the list is the section.
    std::string_view key = {};
    std::size_t offset;
    std::size_t stride;
    std::size_t needed; ///< the bytes that a complete element has
    ElementCount count;
    /// A single field without a key makes the list one of texts.
    std::span<const Field> fields = {};
    std::span<const Field> unshown = {};
    struct Before {
        Place count = {};
        std::size_t bytesEach = 0;
    } before = {};

    RecordElements elementsOf(const LogPacket& packet) const;
};

/// A record, or one of its subpackets.
struct Record {
    std::uint32_t logCode; ///< effective
    std::string_view name;
    std::size_t minimumSize; ///< of the packet, its header included; 0: whatever its size
    /// Its fields, in one group for each section that shows some, and those that do not show.
    std::array<std::span<const Field>, 4> groups = {};
    std::array<const List*, 2> lists = {};
    /// Where it carries its version.
    std::optional<Place> version = {};
    /// The number of the carrier that it tells of, where several share a record. The fields are the
    /// first carrier's, 0: the others leave them as they are.
    std::optional<Place> carrier = {};
    /// Only read by those who ask for more than the base records.
    bool isExtension = false;
    /// Of a record of subpackets: the identifier of the kind whose version tells the layout.
    std::optional<std::uint8_t> subpacket = {};

    /// Null when the record has no field of that name.
    const Field* find(std::string_view key) const;
};

/// The first field of that name in the groups, or null.
const Field* findField(std::span<const std::span<const Field>> groups, std::string_view key);

/// The number at a place that counts from `start` on; bytes past the packet's end read as 0. In its
/// caller a place that is a constant leaves a load and a mask of it.
[[gnu::always_inline]] inline std::int64_t numberAt(const LogPacket& packet, const Place& place,
                                                    std::size_t start = 0)
{
    const std::size_t offset = start + place.offset;
    const std::uint64_t word = place.isBigEndian ? packet.bigEndianWord(offset, place.bytes())
                                                 : packet.littleEndianWord(offset) >> place.bit;
    const std::uint64_t sign = std::uint64_t{1} << (place.width - 1);
    const std::uint64_t number = word & (2 * sign - 1);
    // Subtracting the sign bit twice spreads it over all bits above.
    return static_cast<std::int64_t>(place.isSigned && (number & sign) ? number - 2 * sign
                                                                       : number);
}

[[gnu::always_inline]] inline std::int64_t numberOf(const LogPacket& packet, const Field& field)
{
    return numberAt(packet, field.place);
}

} // namespace ventrik
