#pragma once

#include "LogGenerator/Orbel/FieldMemory.h"
#include "LogGenerator/Orbel/FieldTables.h"
#include "LogGenerator/Orbel/TextMemory.h"
#include "PropertyList/PlistValue.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// A pilot as a group of pilots shows it: by its place in the record and its PN offset.
struct ShownPilot {
    std::size_t index;
    std::uint16_t pnOffset;
    double level; ///< dB
    bool isReference = false;

    bool operator==(const ShownPilot& other) const;
};

/// A pilot of a list's element, with the fields that tell its offset and its level.
ShownPilot shownPilot(std::size_t index, const LogPacket& element, const Field& pnOffset,
                      const Field& level);

/// The labels that the template gives to each lookup key, and what they show: a value that has not
/// changed is neither formatted nor stored again. It keeps the lookup alive that it knows.
class C2KLabels
{
  public:
    /// The labels are those of this lookup, whatever was known of another one is forgotten. None:
    /// what is published goes nowhere.
    void useLookup(const PlistDictionary* lookup);

    void publish(const Field& field, const Record* record, std::int64_t raw);
    /// A table of fields, a constant, of a part of the record.
    void publish(std::span<const Field> fields, const Record* record, const LogPacket& part);
    /// A text in the place of the field's number.
    void publish(const Field& field, std::string_view text);
    /// A text, a constant, in the place of each number of a table of fields.
    void publish(std::span<const Field> fields, std::string_view text);
    /// A group of pilots, or the text while there is none; an empty one means the empty group.
    void publish(const Field& field, std::vector<ShownPilot> pilots, std::string_view textOfNone);
    /// Whether the group shows the pilots that were worked out from those bytes.
    bool showsPilotsOf(const Field& field, ByteView source);
    /// A group of pilots that were worked out from those bytes, and from nothing else.
    void publish(const Field& field, std::vector<ShownPilot> pilots, ByteView source);

    /// Where the value under a label of a group comes from; none where no field shows there.
    std::optional<ValueOrigin> originOf(const PlistDictionary& group, std::string_view label) const;
    /// Which slot shows under a label of a group; none so far where none does.
    std::optional<std::size_t> slotAt(const PlistDictionary& group, std::string_view label) const;
    /// None where no field shows.
    std::optional<ShownCell> cellOf(std::size_t slot) const;
    /// Which slot shows its pilots in a group; none so far where none does.
    std::optional<std::size_t> pilotSlotAt(const PlistDictionary& group) const;
    /// The level of the pilot under that key of the group. The place is where to look first.
    std::optional<ShownCell> cellOfPilot(std::size_t slot, std::string_view key,
                                         std::size_t& place) const;

  private:
    struct Target {
        PlistDictionary group;
        std::string label;
        std::optional<std::size_t> place = {}; // of the label in the group, as far as is known
        std::size_t removals = 0;              // of the group, as far as is known
    };
    struct Labels {
        std::vector<Target> targets;
        std::string text;               // that no field describes; else empty
        std::vector<ShownPilot> pilots; // likewise
        Bytes source;                   // of the pilots; empty while it is not known
        PlistDictionary group;          // of the pilots
        bool isGroup = false;
        bool hasTargets = false; // they were looked up
    };

    void publish(std::size_t slot, const Field& field, const Record* record, std::int64_t raw);
    Labels& showPilots(const Field& field, std::vector<ShownPilot> pilots);
    Labels& labelsOf(std::size_t slot, const Field& field)
    {
        const bool areKnown = slot < _labels.size() && _labels[slot].hasTargets;
        return areKnown ? _labels[slot] : lookUpLabels(slot, field);
    }
    Labels& lookUpLabels(std::size_t slot, const Field& field);
    std::vector<Target> targetsOf(std::string_view lookupKey) const;
    static PlistValue& valueOf(Target& target);
    static void store(Labels& labels, std::string_view text);
    static void store(Labels& labels, const PlistDictionary& group);

    std::optional<PlistDictionary> _lookup;
    FieldMemory _memory;
    FieldTables _tables;
    TextMemory _texts;
    std::vector<Labels> _labels; // of each slot
};

} // namespace ventrik
