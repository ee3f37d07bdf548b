#include "LogGenerator/C2K/C2KLogGenerator.h"

#include "LogGenerator/C2K/ActiveSetPilots.h"
#include "LogGenerator/C2K/C2KOutput.h"
#include "LogGenerator/C2K/DataRates.h"
#include "LogGenerator/C2K/EVDOStatus.h"
#include "LogGenerator/C2K/FingerC2I.h"
#include "LogGenerator/C2K/OneXServingSystem.h"
#include "LogGenerator/C2K/OneXStatus.h"
#include "LogGenerator/C2K/OneXTrafficFER.h"
#include "LogGenerator/Core/StateKeys.h"
#include "Packets/C2KRecords.h"

#include <algorithm>
#include <array>
#include <utility>

namespace ventrik
{

namespace
{

constexpr const char* templateName = "C2KTemplate";

struct Decoder {
    const Record* record;
    void (*decode)(const LogPacket& packet, const C2KOutput& output);
    bool hasOneSize = false; // a longer record is none
};

// In the order of the start command.
constexpr std::array<Decoder, 8> decoders{{
    {&C2KRecords::fingerC2I, decodeFingerC2I},
    {&C2KRecords::evdoStatus, decodeEVDOStatus, true},
    {&C2KRecords::forwardPackets, decodeForwardDataRate},
    {&C2KRecords::activeSetPilots, decodeActiveSetPilots},
    {&C2KRecords::oneXStatus, decodeOneXStatus},
    {&C2KRecords::oneXTraffic, decodeOneXTrafficFER},
    {&C2KRecords::reversePackets, decodeReverseDataRate},
    {&C2KRecords::servingSystem, decodeOneXServingSystem},
}};

// A record of a wrong size is reported.
bool hasItsSize(const LogPacket& packet, const Decoder& decoder, SystemLog& log)
{
    const std::size_t size = decoder.record->minimumSize;
    if (decoder.hasOneSize ? packet.size() == size : packet.size() >= size)
        return true;
    log.error("Log code 0x{:04x} is {} bytes long but {} {} bytes.", decoder.record->logCode,
              packet.size(), decoder.hasOneSize ? "should be" : "must be at least", size);
    return false;
}

// The group of the display that holds what stands at the path, or null.
const PlistDictionary* groupOf(const PlistDictionary& state, std::span<const std::string_view> path)
{
    const PlistValue* group = path.empty() ? nullptr : state.find(StateKey::display);
    for (std::size_t i = 0; group && i + 1 < path.size(); ++i)
        group = group->dictionary() ? group->dictionary()->find(path[i]) : nullptr;
    return group ? group->dictionary() : nullptr;
}

} // namespace

std::unique_ptr<C2KLogGenerator> C2KLogGenerator::generator(const GeneratorServices& services)
{
    auto result = std::unique_ptr<C2KLogGenerator>(new C2KLogGenerator(services));
    result->init();
    return result;
}

PlistDictionary C2KLogGenerator::getStartCommand() const
{
    PlistArray logCodes;
    for (const Decoder& decoder : decoders)
        logCodes.append(decoder.record->logCode);
    return {{"SetState", "Streaming"}, {"SetOrbelLogCodes", logCodes}};
}

void C2KLogGenerator::updateState(PlistDictionary& state, ByteView data)
{
    ensureDisplay(state);
    const PlistDictionary::Entry* entry = std::as_const(state).entryAt(_lookupPlace);
    const PlistValue* lookup =
        entry && entry->isUnder(StateKey::lookup) ? &entry->value : state.find(StateKey::lookup);
    updateFromLog(data, lookup ? lookup->dictionary() : nullptr, state);
}

void C2KLogGenerator::updateFromLog(ByteView data, const PlistDictionary* lookup,
                                    PlistDictionary& state)
{
    _labels.useLookup(lookup);
    _lastRead.reset();
    if (data.size() < logPacketHeaderSize)
        return;
    const LogPacket packet(stripPrefix(data));
    // Another type is reported, and decoded all the same.
    if (packet.u8(0) != ordinaryPacketType)
        log().error("Invalid log type: {:x}. Dropping.", packet.u8(0));
    const auto* decoder =
        std::ranges::find(decoders, effectiveLogCode(packet),
                          [](const Decoder& known) { return known.record->logCode; });
    if (decoder == decoders.end())
        return;
    if (hasItsSize(packet, *decoder, log())) {
        _lastRead = {decoder->record->logCode, versionOf(*decoder->record, packet), packet.size(),
                     LayoutKind::Base};
        decoder->decode(packet, C2KOutput(_labels, _totals, state, log(), decoder->record));
    }
    keepPacket(packet.bytes());
}

std::optional<PlistValue> C2KLogGenerator::generateLogUsingState(PlistDictionary& state)
{
    auto display = getDisplayFromState(state);
    storePacketsInState(state);
    recordDisplay(state);
    return display;
}

std::optional<ValueOrigin> C2KLogGenerator::originOf(const PlistDictionary& state,
                                                     std::span<const std::string_view> path) const
{
    const PlistDictionary* group = groupOf(state, path);
    return group ? _labels.originOf(*group, path.back()) : std::nullopt;
}

std::optional<CellPlace> C2KLogGenerator::cellPlaceAt(const PlistDictionary& state,
                                                      std::span<const std::string_view> path) const
{
    const PlistDictionary* group = groupOf(state, path);
    if (!group)
        return std::nullopt;
    if (const auto slot = _labels.slotAt(*group, path.back()))
        return CellPlace{.key = path.back(), .slot = *slot};
    if (const auto slot = _labels.pilotSlotAt(*group))
        return CellPlace{.row = 0, .key = path.back(), .slot = *slot};
    return std::nullopt;
}

std::optional<ShownCell> C2KLogGenerator::cellAt(CellPlace& place) const
{
    return place.row ? _labels.cellOfPilot(place.slot, place.key, *place.row)
                     : _labels.cellOf(place.slot);
}

std::optional<PlistValue> C2KLogGenerator::getDisplayFromState(PlistDictionary& state)
{
    const PlistValue* display = ensureDisplay(state);
    return display ? std::optional(*display) : std::nullopt;
}

const PlistValue* C2KLogGenerator::ensureDisplay(PlistDictionary& state)
{
    const PlistDictionary::Entry* entry = std::as_const(state).entryAt(_displayPlace);
    if (entry && _display.refersTo(entry->value) && entry->isUnder(StateKey::display))
        return &entry->value;
    claimDisplay(state, templateName);
    if (const PlistValue* display = state.find(StateKey::display)) {
        useDisplay(state);
        return display;
    }
    const auto displayTemplate =
        loadTemplate(state, templateName, "Cannot load C2K template for display");
    if (!displayTemplate)
        return nullptr;
    PlistDictionary display;
    PlistDictionary lookup;
    processTemplate(*displayTemplate->dictionary(), display, lookup, log());
    state.set(StateKey::display, display);
    state.set(StateKey::lookup, lookup);
    state.set(StateKey::extraInfo, PlistDictionary());
    useDisplay(state);
    return state.find(StateKey::display);
}

void C2KLogGenerator::useDisplay(const PlistDictionary& state)
{
    _display = WeakContainer(*state.find(StateKey::display));
    _displayPlace = state.placeOf(StateKey::display).value_or(0);
    _lookupPlace = state.placeOf(StateKey::lookup).value_or(0);
}

void C2KLogGenerator::processTemplate(const PlistDictionary& displayTemplate,
                                      PlistDictionary& display, PlistDictionary& lookup,
                                      SystemLog& log)
{
    for (const auto& [label, value] : displayTemplate) {
        if (const PlistDictionary* group = value.dictionary()) {
            PlistDictionary displayed;
            processTemplate(*group, displayed, lookup, log);
            display.set(label, displayed);
        } else if (value == "_sorted") {
            display.set(label, value);
        } else if (const std::string* lookupKey = value.string()) {
            display.set(label, "");
            if (!lookup.contains(*lookupKey))
                lookup.set(*lookupKey, PlistArray());
            lookup.find(*lookupKey)
                ->array()
                ->append(PlistDictionary{{"key", label}, {"dict", display}});
        }
    }
    log.warning("Processing the template");
}

} // namespace ventrik
