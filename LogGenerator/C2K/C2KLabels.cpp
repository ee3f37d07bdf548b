#include "LogGenerator/C2K/C2KLabels.h"

#include "Packets/ShownNumbers.h"

#include <algorithm>
#include <bit>
#include <charconv>
#include <cmath>
#include <utility>

#include <fmt/compile.h>
#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr Shown pilotLevel{.digits = Digits::SignedTwoDecimals, .unit = "dB"};
// Levels are worked out from several fields.
constexpr Field pilotLevelField{"level", {}, pilotLevel};

// In the room that the text has.
void setTextOf(std::string& text, const ShownPilot& pilot)
{
    text = pilot.isReference ? "(ref pilot) " : "";
    pilotLevel.appendTextOfNumber(text, pilot.level);
}

std::string keyOf(const ShownPilot& pilot)
{
    return fmt::format(FMT_COMPILE("{};{}"), pilot.index, pilot.pnOffset);
}

bool isKeyOf(const ShownPilot& pilot, std::string_view key)
{
    std::size_t index = 0;
    std::uint16_t pnOffset = 0;
    const char* const end = key.data() + key.size();
    const auto separator = std::from_chars(key.data(), end, index);
    if (separator.ptr == end || index != pilot.index)
        return false;
    return std::from_chars(separator.ptr + 1, end, pnOffset).ec == std::errc() &&
           pnOffset == pilot.pnOffset;
}

// Brings the group from the pilots that it shows to others.
void update(PlistDictionary& group, const std::vector<ShownPilot>& pilotsBefore,
            const std::vector<ShownPilot>& pilots)
{
    constexpr std::string_view marker = "_sorted"; // the display sorts the group
    if (group.empty())
        group.set(marker, marker);
    std::string text;
    std::size_t i = 0;
    for (; i < pilots.size() && i < pilotsBefore.size(); ++i) {
        if (pilots[i].index != pilotsBefore[i].index ||
            pilots[i].pnOffset != pilotsBefore[i].pnOffset)
            break;
        if (pilots[i] == pilotsBefore[i])
            continue;
        setTextOf(text, pilots[i]);
        group.entryAt(i + 1)->value.setText(text);
    }
    group.truncate(i + 1);
    for (; i < pilots.size(); ++i) {
        setTextOf(text, pilots[i]);
        group.set(keyOf(pilots[i]), text);
    }
}

} // namespace

// Levels that are no number are the same when their bits are.
bool ShownPilot::operator==(const ShownPilot& other) const
{
    return index == other.index && pnOffset == other.pnOffset && isReference == other.isReference &&
           std::bit_cast<std::uint64_t>(level) == std::bit_cast<std::uint64_t>(other.level);
}

ShownPilot shownPilot(std::size_t index, const LogPacket& element, const Field& pnOffset,
                      const Field& level)
{
    return {index, static_cast<std::uint16_t>(numberOf(element, pnOffset)),
            level.shown.number(numberOf(element, level)).value_or(0)};
}

void C2KLabels::useLookup(const PlistDictionary* lookup)
{
    if (lookup ? _lookup && _lookup->isSameContainer(*lookup) : !_lookup)
        return;
    _lookup = lookup ? std::optional(*lookup) : std::nullopt;
    _memory.forgetAll();
    _tables.forgetAll();
    _labels.clear();
}

void C2KLabels::publish(const Field& field, const Record* record, std::int64_t raw)
{
    publish(_memory.slotOf(field), field, record, raw);
}

void C2KLabels::publish(std::span<const Field> fields, const Record* record, const LogPacket& part)
{
    _tables.visit(fields, part, _memory,
                  [&](std::size_t slot, const Field& field, std::int64_t raw) {
                      publish(slot, field, record, raw);
                  });
}

void C2KLabels::publish(std::size_t slot, const Field& field, const Record* record,
                        std::int64_t raw)
{
    _tables.noteWriter(slot);
    if (_memory.shows(slot, field, raw, false))
        return;
    _memory.keep(slot, field, record, raw, false);
    Labels& labels = labelsOf(slot, field);
    labels.text.clear();
    const auto& text = _texts.textOf(field, raw);
    store(labels, text ? std::string_view(*text) : std::string_view());
}

void C2KLabels::publish(const Field& field, std::string_view text)
{
    const std::size_t slot = _memory.slotOf(field);
    _tables.noteWriter(slot);
    Labels& labels = labelsOf(slot, field);
    if (labels.text == text && !text.empty() && !labels.isGroup)
        return;
    _memory.keepNone(slot);
    labels.text = text;
    labels.isGroup = false;
    store(labels, text);
}

void C2KLabels::publish(std::span<const Field> fields, std::string_view text)
{
    _tables.visit(fields, text, [&](const Field& field) { publish(field, text); });
}

void C2KLabels::publish(const Field& field, std::vector<ShownPilot> pilots,
                        std::string_view textOfNone)
{
    if (pilots.empty() && !textOfNone.empty())
        return publish(field, textOfNone);
    showPilots(field, std::move(pilots)).source.clear();
}

C2KLabels::Labels& C2KLabels::showPilots(const Field& field, std::vector<ShownPilot> pilots)
{
    const std::size_t slot = _memory.slotOf(field);
    _tables.noteWriter(slot);
    Labels& labels = labelsOf(slot, field);
    if (labels.isGroup && labels.pilots == pilots)
        return labels;
    _memory.keepNone(slot);
    // Whoever else holds the group keeps it as it was.
    const bool wasShown = std::exchange(labels.isGroup, true);
    const std::size_t ours = 1 + (wasShown ? labels.targets.size() : 0);
    const bool isShared = labels.group.handleCount() > ours;
    if (isShared)
        labels.group = labels.group.copy();
    update(labels.group, labels.pilots, pilots);
    labels.pilots = std::move(pilots);
    if (isShared || !wasShown)
        store(labels, labels.group);
    return labels;
}

bool C2KLabels::showsPilotsOf(const Field& field, ByteView source)
{
    const Labels& labels = labelsOf(_memory.slotOf(field), field);
    return labels.isGroup && !source.empty() && std::ranges::equal(labels.source, source);
}

void C2KLabels::publish(const Field& field, std::vector<ShownPilot> pilots, ByteView source)
{
    showPilots(field, std::move(pilots)).source.assign(source.begin(), source.end());
}

std::optional<ValueOrigin> C2KLabels::originOf(const PlistDictionary& group,
                                               std::string_view label) const
{
    const auto slot = slotAt(group, label);
    return slot ? _memory.originOf(*slot) : std::nullopt;
}

std::optional<ShownCell> C2KLabels::cellOf(std::size_t slot) const
{
    return slot < _labels.size() ? _memory.cellOf(slot) : std::nullopt;
}

std::optional<std::size_t> C2KLabels::slotAt(const PlistDictionary& group,
                                             std::string_view label) const
{
    for (std::size_t slot = 0; slot < _labels.size(); ++slot)
        for (const Target& target : _labels[slot].targets)
            if (target.group.isSameContainer(group) && target.label == label)
                return slot;
    return std::nullopt;
}

std::optional<std::size_t> C2KLabels::pilotSlotAt(const PlistDictionary& group) const
{
    for (std::size_t slot = 0; slot < _labels.size(); ++slot)
        if (_labels[slot].isGroup && _labels[slot].group.isSameContainer(group))
            return slot;
    return std::nullopt;
}

std::optional<ShownCell> C2KLabels::cellOfPilot(std::size_t slot, std::string_view key,
                                                std::size_t& place) const
{
    if (slot >= _labels.size() || !_labels[slot].isGroup)
        return std::nullopt;
    const std::vector<ShownPilot>& pilots = _labels[slot].pilots;
    if (place >= pilots.size() || !isKeyOf(pilots[place], key))
        place = static_cast<std::size_t>(
            std::ranges::find_if(pilots, [key](const auto& pilot) { return isKeyOf(pilot, key); }) -
            pilots.begin());
    if (place >= pilots.size())
        return std::nullopt;
    // No finer than it shows: it is a sum of logarithms.
    const double level = std::round(pilots[place].level * 100) / 100;
    return ShownCell{&pilotLevelField, std::bit_cast<std::int64_t>(level), level};
}

C2KLabels::Labels& C2KLabels::lookUpLabels(std::size_t slot, const Field& field)
{
    if (slot >= _labels.size())
        _labels.resize(slot + 1);
    Labels& labels = _labels[slot];
    labels.targets = targetsOf(field.key);
    labels.hasTargets = true;
    return labels;
}

// An entry of the lookup that is none ends the labels there.
std::vector<C2KLabels::Target> C2KLabels::targetsOf(std::string_view lookupKey) const
{
    std::vector<Target> targets;
    const PlistValue* found = _lookup ? _lookup->find(lookupKey) : nullptr;
    const PlistArray* entries = found ? found->array() : nullptr;
    if (!entries)
        return targets;
    for (const PlistValue& element : *entries) {
        const PlistDictionary* entry = element.dictionary();
        const PlistValue* label = entry ? entry->find("key") : nullptr;
        const PlistValue* group = entry ? entry->find("dict") : nullptr;
        if (!label || !label->string() || !group || !group->dictionary())
            break;
        targets.push_back({*group->dictionary(), *label->string()});
    }
    return targets;
}

// A label's place stays until one is removed.
PlistValue& C2KLabels::valueOf(Target& target)
{
    if (!target.place || target.removals != target.group.removalCount()) {
        if (!target.group.contains(target.label))
            target.group.set(target.label, "");
        target.place = target.group.placeOf(target.label);
        target.removals = target.group.removalCount();
    }
    return target.group.entryAt(*target.place)->value;
}

void C2KLabels::store(Labels& labels, std::string_view text)
{
    for (Target& target : labels.targets)
        valueOf(target).setText(text);
}

void C2KLabels::store(Labels& labels, const PlistDictionary& group)
{
    for (Target& target : labels.targets)
        valueOf(target) = group;
}

} // namespace ventrik
