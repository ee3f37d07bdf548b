#include "Model/ChangeStore.h"

#include "Model/DisplayMoment.h"

#include <algorithm>
#include <functional>
#include <utility>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

// A store of so many chunks drops that part of itself at a time.
constexpr std::size_t chunksOfStore = 32;
// Of the raw packets less is kept: they take the most, and a change can do without.
constexpr std::size_t packetShare = 4;
constexpr std::size_t largestPacketKept = 65536;
// From one key state to the next one there are as many changes as this, and for each of its places.
constexpr std::size_t fewestChanges = 512;
constexpr std::size_t changesForPlace = 8;
constexpr auto hearingInterval = 1s;
// What comes a little out of order is not worth a word.
constexpr auto longestDelay = 1s;
constexpr std::size_t mostEvents = 4096;
constexpr unsigned knownValueBits = 13;
constexpr unsigned knownValueShift = 64 - knownValueBits;
// A display of more places than that is none that a person looks at.
constexpr std::size_t maximumKnownPlaces = 65536;

bool isSame(const StoredValue& a, const StoredValue& b)
{
    return a.field == b.field && a.raw == b.raw && a.number == b.number && a.text == b.text;
}

std::size_t hashOf(const StoredValue& value)
{
    const std::uint64_t number = value.field ? static_cast<std::uint64_t>(value.raw)
                                             : std::hash<std::string_view>{}(value.text);
    const std::uint64_t hash = (std::hash<const Field*>{}(value.field) + number) *
                               0x9E3779B97F4A7C15U; // spreads neighbors
    return hash >> knownValueShift;
}

// Texts that no field shows came as they are: numbers with their units, too.
StoredValue valueOf(const std::optional<ShownCell>& cell, std::string_view text)
{
    if (cell)
        return {text, cell->number(), cell->field->shown.unit, cell->field, cell->raw};
    if (const auto measurement = measurementIn(text))
        return {text, measurement->number, measurement->unit};
    return {text, plainNumber(text)};
}

PlaceTable::HolderKind kindOf(const DisplayGroup& holder)
{
    if (holder.isList)
        return PlaceTable::HolderKind::List;
    return holder.isSorted ? PlaceTable::HolderKind::Sorted : PlaceTable::HolderKind::Dictionary;
}

} // namespace

std::size_t ChangeStore::Chunk::bytes() const
{
    return messages.capacity() * sizeof(Message) + changes.capacity() * sizeof(Change) +
           values.capacity() * sizeof(Value) + texts.capacity() + packets.capacity() +
           heard.capacity() * sizeof(Heard) + layouts.capacity() * sizeof(NotedLayout) + keyBytes;
}

void ChangeStore::Chunk::add(KeyState state)
{
    keyBytes += state.places.capacity() * sizeof(state.places.front());
    keyStates.push_back(std::move(state));
}

StoredValue ChangeStore::Chunk::valueAt(std::uint32_t value) const
{
    const Value& found = values[value];
    return {std::string_view(texts).substr(found.textStart, found.textSize),
            found.hasNumber ? std::optional(found.number) : std::nullopt, found.unit, found.field,
            found.raw};
}

ChangeStore::ChangeStore(RecordsMode records, Limits limits)
    : _records(records), _limits(limits), _knownValues(std::size_t{1} << knownValueBits)
{
}

ChangeStore::~ChangeStore() = default;

void ChangeStore::useGenerator(const LogGenerator* generator, std::string_view technology)
{
    _generator = generator;
    _changes = generator ? std::make_unique<DisplayChanges>(*generator) : nullptr;
    _knownPlaces.clear();
    _isFirstDisplay = true;
    if (!generator)
        return;
    _wanted = WantedCodes(generator->getStartCommand());
    const bool isOther = _technologies.empty() || _technologies.back().name != technology;
    if (isOther)
        _technologies.push_back({_present, std::string(technology)});
    if (_technologies.size() > mostEvents)
        _technologies.pop_front();
}

void ChangeStore::channelChanged(Clock::TimePoint time, bool isOpen, std::string_view reason)
{
    const auto kind = isOpen ? ChannelEvent::Kind::Opened : ChannelEvent::Kind::Lost;
    if (!_channelEvents.empty() && _channelEvents.back().kind == kind)
        return;
    _channelEvents.push_back({std::max(time, _lastTime), _present, kind, std::string(reason)});
    if (_channelEvents.size() > mostEvents)
        _channelEvents.pop_front();
}

void ChangeStore::messageTaken(Clock::TimePoint time, ByteView message,
                               const PlistDictionary& state)
{
    ++_messagesTold;
    if (!_changes)
        return;
    _lateCount += time < _lastTime - longestDelay ? 1 : 0;
    _lastTime = std::max(_lastTime, time);
    const auto changes = _changes->take(state);
    const std::uint32_t logCode = codeOf(message);
    const bool isNoted = noteLayout(!changes.empty());
    if (!changes.empty())
        takeAll(changes, message, logCode, state);
    const bool isHeard = hear(logCode);
    if (!changes.empty() || isNoted || isHeard)
        keepSmall(state);
}

void ChangeStore::takeAll(std::span<const DisplayChange> changes, ByteView message,
                          std::uint32_t logCode, const PlistDictionary& state)
{
    if (_chunks.empty())
        beginChunk();
    if (std::exchange(_isFirstDisplay, false))
        return takeFirst(changes, message, logCode, state);
    beginMessage(message, logCode);
    for (const DisplayChange& change : changes)
        take(change, state);
    if (_changes->takeReordered() || isFarFromKeyState())
        writeKeyState(state);
}

// What is heard takes room, too. A display that was not taken yet begins no chunk.
void ChangeStore::keepSmall(const PlistDictionary& state)
{
    if (_chunks.empty() || _isFirstDisplay)
        return;
    endChunkIfFull(state);
    keepWithin();
}

// Only where it is another one than before. True where that took room, as `hear` says it.
bool ChangeStore::noteLayout(bool isOfChanges)
{
    const ReadLayout* read = _generator->lastRead();
    if (!read)
        return false;
    const auto [known, isFirst] = _layouts.emplace(read->logCode, *read);
    if (!isFirst && known->second.kind == read->kind && known->second.version == read->version)
        return false;
    known->second = *read;
    std::vector<std::string>& sections = _sections[read->logCode];
    if (sections.empty())
        for (const std::string_view section : _generator->sectionsOfCode(read->logCode))
            sections.emplace_back(section);
    if (_chunks.empty())
        return false;
    if (!isOfChanges)
        return noteOfLastChange(*read);
    Chunk& chunk = *_chunks.back();
    chunk.layouts.push_back({static_cast<std::uint32_t>(chunk.changes.size()), *read});
    return true;
}

// What changes nothing makes no moment of its own: it belongs to the one that is there.
bool ChangeStore::noteOfLastChange(const ReadLayout& layout)
{
    for (auto chunk = _chunks.rbegin(); chunk != _chunks.rend(); ++chunk) {
        const auto changes = static_cast<std::uint32_t>((*chunk)->changes.size());
        if (changes > 0) {
            (*chunk)->layouts.push_back({changes - 1, layout});
            return true;
        }
        (*chunk)->layoutsBefore[layout.logCode] = layout;
    }
    return false;
}

// A moment is made of the key state before it and the changes since then: of few enough that it
// costs about what the display itself does.
bool ChangeStore::isFarFromKeyState() const
{
    const Chunk& chunk = *_chunks.back();
    if (chunk.keyStates.empty())
        return false;
    const KeyState& last = chunk.keyStates.back();
    const std::size_t enough = std::max(fewestChanges, changesForPlace * last.places.size());
    return chunk.changes.size() - last.change >= enough;
}

// The generator knows it as a rule. What nobody reads is nobody's.
std::uint32_t ChangeStore::codeOf(ByteView message) const
{
    if (const ReadLayout* read = _generator->lastRead())
        return read->logCode;
    if (_wanted.wantsAll() || !_wanted.wants(message))
        return 0;
    return effectiveLogCode(LogPacket(stripPrefix(message)));
}

// What no record tells is not told again by another message, nor by a record that could not be
// read; but that of the cell monitor, whose messages tell all there is.
bool ChangeStore::hear(std::uint32_t logCode)
{
    if (!_generator->lastRead() && !_wanted.wantsAll())
        return false;
    _lastHeard[logCode] = _lastTime;
    if (_chunks.empty())
        return false;
    const auto [noted, isFirst] = _lastNoted.emplace(logCode, _lastTime);
    if (!isFirst && _lastTime - noted->second < hearingInterval)
        return false;
    noted->second = _lastTime;
    Chunk& chunk = *_chunks.back();
    chunk.heard.push_back({_lastTime, logCode, static_cast<std::uint32_t>(chunk.changes.size())});
    return true;
}

void ChangeStore::beginMessage(ByteView message, std::uint32_t logCode)
{
    Chunk& chunk = *_chunks.back();
    const bool isKept = message.size() <= largestPacketKept;
    chunk.messages.push_back({_lastTime, logCode, static_cast<std::uint32_t>(chunk.changes.size()),
                              chunk.packets.size(), _messagesTold - 1,
                              isKept ? static_cast<std::uint32_t>(message.size()) : 0});
    _message = static_cast<std::uint32_t>(chunk.messages.size() - 1);
    if (isKept)
        chunk.packets.insert(chunk.packets.end(), message.begin(), message.end());
    chunk.lastTime = _lastTime;
}

// A display that is new also shows what no record told. The cell monitor's messages tell it all.
void ChangeStore::takeFirst(std::span<const DisplayChange> changes, ByteView message,
                            std::uint32_t logCode, const PlistDictionary& state)
{
    const auto isTold = [&](const DisplayChange& change) {
        return _wanted.wantsAll() || _changes->cellAt(*change.place, state).has_value();
    };
    beginMessage({}, 0);
    removeWhatIsNotShown(state);
    const std::uint32_t untold = _message;
    beginMessage(message, logCode);
    const std::uint32_t told = _message;
    for (const DisplayChange& change : changes) {
        _message = isTold(change) ? told : untold;
        take(change, state);
    }
    _message = told;
    _changes->takeReordered();
    writeKeyState(state);
}

// What the generator before showed stands no more where this one has nothing.
void ChangeStore::removeWhatIsNotShown(const PlistDictionary& state)
{
    std::vector<PlaceId> shown; // some of them are new
    for (const DisplayGroup::Entry* entry : _changes->entries())
        shown.push_back(idOf(*entry->place, state));
    std::vector<bool> isShown(_places->size());
    for (const PlaceId id : shown)
        isShown[id] = true;
    for (PlaceId id = 1; id < isShown.size(); ++id)
        if (!isShown[id])
            remove(id);
}

void ChangeStore::take(const DisplayChange& change, const PlistDictionary& state)
{
    const PlaceId id = idOf(*change.place, state);
    switch (change.kind) {
    case DisplayChange::Kind::Shown:
        show(*change.place, state);
        break;
    case DisplayChange::Kind::Empty:
        if (standing(id).value != group) {
            showHolders(id);
            addChange(id, group);
        }
        break;
    case DisplayChange::Kind::Gone:
        remove(id);
        break;
    }
}

void ChangeStore::show(const DisplayPlace& place, const PlistDictionary& state)
{
    const PlaceId id = idOf(place, state);
    const StoredValue value = valueOf(_changes->cellAt(place, state), place.text);
    const std::uint32_t before = standing(id).value;
    if (before < group && isSame(_chunks.back()->valueAt(before), value))
        return;
    if (before == group)
        remove(id);
    if (before >= group)
        showHolders(id);
    addChange(id, intern(value));
}

// What holds something is there. Whoever goes through the changes knows that by itself.
void ChangeStore::showHolders(PlaceId id)
{
    for (PlaceId holder = (*_places)[id].holder; holder != PlaceTable::root;
         holder = (*_places)[holder].holder) {
        if (standing(holder).value == group)
            return;
        standing(holder).value = group;
    }
}

void ChangeStore::remove(PlaceId id)
{
    if (standing(id).value == nothing)
        return;
    forget(id);
    addChange(id, nothing);
}

void ChangeStore::forget(PlaceId id)
{
    std::vector<PlaceId> pending{id};
    while (!pending.empty()) {
        const PlaceId gone = pending.back();
        pending.pop_back();
        if (standing(gone).value == nothing)
            continue;
        standing(gone).value = nothing;
        const auto& below = (*_places)[gone].below;
        pending.insert(pending.end(), below.begin(), below.end());
    }
}

void ChangeStore::addChange(PlaceId id, std::uint32_t value)
{
    Chunk& chunk = *_chunks.back();
    chunk.changes.push_back({_message, id, value});
    standing(id) = {value, chunk.messages[_message].logCode, _lastTime, _present};
    ++_present;
}

ChangeStore::Standing& ChangeStore::standing(PlaceId id)
{
    if (id >= _standing.size())
        _standing.resize(_places->size());
    return _standing[id];
}

PlaceId ChangeStore::holderOf(const DisplayPlace& place, const PlistDictionary& state)
{
    return place.holder->place ? idOf(*place.holder->place, state) : PlaceTable::root;
}

PlaceId ChangeStore::idOf(const DisplayPlace& place, const PlistDictionary& state)
{
    const bool isKept = place.number < maximumKnownPlaces;
    if (isKept && place.number >= _knownPlaces.size())
        _knownPlaces.resize(place.number + 1);
    if (isKept && _knownPlaces[place.number].serial == place.serial)
        return _knownPlaces[place.number].id;
    const PlaceId holder = holderOf(place, state);
    const PlaceTable::HolderKind kind = kindOf(*place.holder);
    const auto known = _places->find(holder, kind, place.key);
    const PlaceId id =
        known ? *known
              : _places->add(holder, kind, place.key, _changes->describe(place, state).section);
    if (isKept)
        _knownPlaces[place.number] = {place.serial, id};
    return id;
}

// Values come again and again.
std::uint32_t ChangeStore::intern(const StoredValue& value)
{
    Chunk& chunk = *_chunks.back();
    KnownValue& known = _knownValues[hashOf(value)];
    if (known.chunk == chunk.first && known.value < chunk.values.size() &&
        isSame(chunk.valueAt(known.value), value))
        return known.value;
    known = {chunk.first, static_cast<std::uint32_t>(chunk.values.size())};
    chunk.values.push_back({chunk.texts.size(), static_cast<std::uint32_t>(value.text.size()),
                            value.number.has_value(), value.number.value_or(0), value.unit,
                            value.field, value.raw});
    chunk.texts += value.text;
    return known.value;
}

void ChangeStore::writeKeyState(const PlistDictionary& state)
{
    Chunk& chunk = *_chunks.back();
    KeyState written{static_cast<std::uint32_t>(chunk.changes.size()), {}};
    for (const DisplayGroup::Entry* entry : _changes->entries()) {
        const PlaceId id = idOf(*entry->place, state);
        written.places.emplace_back(id, standing(id));
    }
    chunk.add(std::move(written));
}

void ChangeStore::beginChunk()
{
    auto chunk = std::make_unique<Chunk>();
    chunk->first = _present;
    chunk->firstTime = _lastTime;
    chunk->heardBefore = _lastHeard;
    chunk->layoutsBefore = _layouts;
    chunk->lastTime = _lastTime;
    _chunks.push_back(std::move(chunk));
}

void ChangeStore::goOnInNewChunk(const PlistDictionary& state)
{
    const Chunk& before = *_chunks.back();
    beginChunk();
    for (Standing& standing : _standing)
        if (standing.value < group)
            standing.value = intern(before.valueAt(standing.value));
    writeKeyState(state);
    _chunks.back()->bytesAtStart = _chunks.back()->bytes();
}

// Where the display itself is large, a chunk holds at least as much of what changed.
bool ChangeStore::isFull(const Chunk& chunk) const
{
    return chunk.bytes() >= std::max(_limits.bytes / chunksOfStore, 2 * chunk.bytesAtStart);
}

// Where little changes, what is too old goes by pieces of time, unless the states that they begin
// with would take the room of the changes.
bool ChangeStore::isLong(const Chunk& chunk) const
{
    return _lastTime - chunk.firstTime > _limits.age / chunksOfStore &&
           chunk.bytesAtStart < _limits.bytes / chunksOfStore / 2;
}

void ChangeStore::endChunkIfFull(const PlistDictionary& state)
{
    Chunk& chunk = *_chunks.back();
    if (!isFull(chunk) && !isLong(chunk))
        return;
    chunk.messages.shrink_to_fit();
    chunk.changes.shrink_to_fit();
    chunk.values.shrink_to_fit();
    chunk.texts.shrink_to_fit();
    chunk.packets.shrink_to_fit();
    chunk.heard.shrink_to_fit();
    chunk.layouts.shrink_to_fit();
    goOnInNewChunk(state);
}

void ChangeStore::keepWithin()
{
    if (_places->bytes() > _limits.bytes / 2)
        return beginAnew();
    std::size_t packets = 0;
    for (auto chunk = _chunks.rbegin(); chunk != _chunks.rend(); ++chunk) {
        packets += (*chunk)->packets.capacity();
        if (packets > _limits.bytes / packetShare && chunk != _chunks.rbegin())
            (*chunk)->packets = Bytes();
    }
    while (_chunks.size() > 1 &&
           (bytes() > _limits.bytes || _lastTime - _chunks.front()->lastTime > _limits.age))
        _chunks.pop_front();
}

// A display of ever new names: their numbers begin anew, with what it shows now.
void ChangeStore::beginAnew()
{
    _places = std::make_shared<PlaceTable>();
    ++_generation;
    _chunks.clear();
    _standing.clear();
    _knownPlaces.clear();
    _changes = std::make_unique<DisplayChanges>(*_generator);
    _isFirstDisplay = true;
}

std::size_t ChangeStore::bytes() const
{
    std::size_t bytes = _places->bytes() + _standing.capacity() * sizeof(Standing);
    for (const auto& chunk : _chunks)
        bytes += chunk->bytes();
    return bytes;
}

std::size_t ChangeStore::changeCount() const
{
    return _chunks.empty() ? 0 : _present - _chunks.front()->first;
}

std::uint64_t ChangeStore::firstMoment() const
{
    return _chunks.empty() ? _present : _chunks.front()->first;
}

Clock::TimePoint ChangeStore::firstTime() const
{
    return _chunks.empty() ? Clock::TimePoint() : _chunks.front()->firstTime;
}

std::uint64_t ChangeStore::momentAt(Clock::TimePoint time) const
{
    for (auto chunk = _chunks.rbegin(); chunk != _chunks.rend(); ++chunk) {
        const auto& messages = (*chunk)->messages;
        const auto later = std::ranges::upper_bound(messages, time, {}, &Message::time);
        if (later == messages.begin())
            continue;
        const std::size_t changes =
            later == messages.end() ? (*chunk)->changes.size() : later->firstChange;
        return (*chunk)->first + changes;
    }
    return firstMoment();
}

Clock::TimePoint ChangeStore::timeOf(std::uint64_t moment) const
{
    const Chunk* chunk = chunkAt(moment);
    if (!chunk)
        return lastTime();
    if (chunk->changes.empty())
        return chunk->firstTime;
    const std::size_t change = std::max<std::uint64_t>(moment, chunk->first + 1) - chunk->first - 1;
    return chunk->messages[chunk->changes[change].message].time;
}

// The chunk that the changes before the moment end in.
const ChangeStore::Chunk* ChangeStore::chunkAt(std::uint64_t moment) const
{
    const Chunk* found = _chunks.empty() ? nullptr : _chunks.front().get();
    for (const auto& chunk : _chunks)
        if (chunk->first < moment)
            found = chunk.get();
    return found;
}

DisplayMoment ChangeStore::at(std::uint64_t moment) const
{
    return {*this, moment};
}

void ChangeStore::visit(std::uint64_t from, StoreVisitor& visitor) const
{
    for (const auto& chunk : _chunks) {
        if (chunk->first + chunk->changes.size() < from)
            continue;
        const auto first =
            static_cast<std::uint32_t>(from > chunk->first ? from - chunk->first : 0);
        auto heard = std::ranges::lower_bound(chunk->heard, first, {}, &Heard::change);
        for (std::uint32_t i = first; i <= chunk->changes.size(); ++i) {
            for (; heard != chunk->heard.end() && heard->change <= i; ++heard)
                visitor.heard(heard->time, heard->logCode);
            if (i == chunk->changes.size())
                break;
            const Change& change = chunk->changes[i];
            const Message& message = chunk->messages[change.message];
            const auto kind = change.value == nothing ? DisplayChange::Kind::Gone
                              : change.value == group ? DisplayChange::Kind::Empty
                                                      : DisplayChange::Kind::Shown;
            visitor.changed({chunk->first + i, message.time, message.logCode, message.record,
                             change.place, kind,
                             kind == DisplayChange::Kind::Shown ? chunk->valueAt(change.value)
                                                                : StoredValue{}});
        }
    }
}

std::vector<StoredChange> ChangeStore::standing() const
{
    std::vector<StoredChange> changes;
    const Chunk* chunk = _chunks.empty() ? nullptr : _chunks.front().get();
    if (!chunk || chunk->keyStates.empty() || chunk->keyStates.front().change > 0)
        return changes;
    for (const auto& [id, standing] : chunk->keyStates.front().places) {
        if (standing.value >= group)
            continue;
        const auto heard = chunk->heardBefore.find(standing.logCode);
        const bool isHeard = heard != chunk->heardBefore.end() && heard->second > standing.time;
        changes.push_back({standing.change, isHeard ? heard->second : standing.time,
                           standing.logCode, 0, id, DisplayChange::Kind::Shown,
                           chunk->valueAt(standing.value)});
    }
    return changes;
}

std::optional<Clock::TimePoint> ChangeStore::lastHeard(std::uint32_t logCode) const
{
    const auto heard = _lastHeard.find(logCode);
    return heard == _lastHeard.end() ? std::nullopt : std::optional(heard->second);
}

std::string_view ChangeStore::technologyAt(std::uint64_t moment) const
{
    std::string_view name;
    for (const Technology& technology : _technologies)
        if (name.empty() || technology.number < moment)
            name = technology.name;
    return name;
}

ByteView ChangeStore::messageOf(std::uint64_t change) const
{
    const Chunk* chunk = chunkAt(change + 1);
    if (!chunk || change < chunk->first || change - chunk->first >= chunk->changes.size())
        return {};
    const Message& message = chunk->messages[chunk->changes[change - chunk->first].message];
    if (message.bytesStart + message.bytesSize > chunk->packets.size())
        return {};
    return ByteView(chunk->packets).subspan(message.bytesStart, message.bytesSize);
}

} // namespace ventrik
