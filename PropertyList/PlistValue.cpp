#include "PropertyList/PlistValue.h"

#include <algorithm>
#include <array>
#include <cmath>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

// Up to this many keys a walk over the entries is faster than a hash.
constexpr std::size_t linearSearchLimit = 16;

// Few containers hold less; growing from one by doubling would move the first elements twice.
constexpr std::size_t firstCapacity = 4;

struct KeyHash {
    using is_transparent = void;
    std::size_t operator()(std::string_view key) const
    {
        return std::hash<std::string_view>{}(key);
    }
};

} // namespace

std::string PlistInteger::decimal() const
{
    return _negative ? fmt::format_int(signedBits()).str() : fmt::format_int(_bits).str();
}

struct PlistArray::Storage {
    std::vector<PlistValue> values;
    ContainerWatch watch;
};

PlistArray::PlistArray() : _storage(std::make_shared<Storage>()) {}

PlistArray::PlistArray(std::initializer_list<PlistValue> values) : PlistArray()
{
    _storage->values = values;
}

std::size_t PlistArray::size() const
{
    return _storage->values.size();
}

const PlistValue& PlistArray::operator[](std::size_t index) const
{
    return _storage->values.at(index);
}

const PlistValue* PlistArray::begin() const
{
    return _storage->values.data();
}

const PlistValue* PlistArray::end() const
{
    return begin() + size();
}

void PlistArray::append(PlistValue value)
{
    std::vector<PlistValue>& values = _storage->values;
    if (values.capacity() == 0)
        values.reserve(firstCapacity);
    values.push_back(std::move(value));
    _storage->watch.note();
}

void PlistArray::removeFirst(std::size_t count)
{
    const auto first = _storage->values.begin();
    _storage->values.erase(first, first + static_cast<std::ptrdiff_t>(std::min(count, size())));
    _storage->watch.note();
}

void PlistArray::replace(std::size_t index, PlistValue value)
{
    _storage->values.at(index) = std::move(value);
    _storage->watch.note(index);
}

void PlistArray::truncate(std::size_t count)
{
    if (count >= size())
        return;
    const auto first = _storage->values.begin();
    _storage->values.erase(first + static_cast<std::ptrdiff_t>(count), _storage->values.end());
    _storage->watch.note();
}

void PlistArray::clear()
{
    _storage->values.clear();
    _storage->watch.note();
}

void PlistArray::reserve(std::size_t count)
{
    _storage->values.reserve(count);
}

PlistArray PlistArray::copy() const
{
    return PlistArray(std::make_shared<Storage>(*_storage));
}

bool PlistArray::operator==(const PlistArray& other) const
{
    return isSameContainer(other) || _storage->values == other._storage->values;
}

ContainerWatch& PlistArray::watch()
{
    return _storage->watch;
}

struct PlistDictionary::Storage {
    std::vector<Entry> entries;
    // Key to place in `entries`; kept only once there are more than `linearSearchLimit` of them.
    std::unordered_map<std::string, std::size_t, KeyHash, std::equal_to<>> places;
    std::size_t removals = 0;
    ContainerWatch watch;

    std::optional<std::size_t> place(std::string_view key) const
    {
        if (!places.empty()) {
            const auto found = places.find(key);
            return found == places.end() ? std::nullopt : std::optional(found->second);
        }
        for (std::size_t i = 0; i < entries.size(); ++i)
            if (entries[i].isUnder(key))
                return i;
        return std::nullopt;
    }

    void noteRemoval()
    {
        ++removals;
        watch.note();
    }

    void rebuildPlaces()
    {
        places.clear();
        if (entries.size() > linearSearchLimit)
            for (std::size_t i = 0; i < entries.size(); ++i)
                places.emplace(entries[i].key, i);
    }
};

PlistDictionary::PlistDictionary() : _storage(std::make_shared<Storage>()) {}

PlistDictionary::PlistDictionary(
    std::initializer_list<std::pair<std::string_view, PlistValue>> entries)
    : PlistDictionary()
{
    reserve(entries.size());
    for (const auto& [key, value] : entries)
        set(key, value);
}

std::size_t PlistDictionary::size() const
{
    return _storage->entries.size();
}

const PlistValue* PlistDictionary::find(std::string_view key) const
{
    const auto place = _storage->place(key);
    return place ? &_storage->entries[*place].value : nullptr;
}

PlistValue* PlistDictionary::find(std::string_view key)
{
    const auto place = _storage->place(key);
    if (!place)
        return nullptr;
    _storage->watch.note(*place);
    return &_storage->entries[*place].value;
}

PlistValue* PlistDictionary::find(std::string_view key, std::size_t& place)
{
    const auto& entries = _storage->entries;
    if (place >= entries.size() || !entries[place].isUnder(key)) {
        const auto found = _storage->place(key);
        if (!found)
            return nullptr;
        place = *found;
    }
    return &entryAt(place)->value;
}

std::optional<std::size_t> PlistDictionary::placeOf(std::string_view key) const
{
    return _storage->place(key);
}

std::size_t PlistDictionary::removalCount() const
{
    return _storage->removals;
}

PlistDictionary::Entry* PlistDictionary::entryAt(std::size_t place)
{
    if (place >= size())
        return nullptr;
    _storage->watch.note(place);
    return &_storage->entries[place];
}

const PlistDictionary::Entry* PlistDictionary::entryAt(std::size_t place) const
{
    return place < size() ? &_storage->entries[place] : nullptr;
}

void PlistDictionary::set(std::string_view key, PlistValue value)
{
    if (PlistValue* existing = find(key)) {
        *existing = std::move(value);
        return;
    }
    auto& entries = _storage->entries;
    auto& places = _storage->places;
    if (entries.capacity() == 0)
        entries.reserve(firstCapacity);
    _storage->watch.note();
    entries.push_back({std::string(key), std::move(value)});
    if (!places.empty())
        places.emplace(key, entries.size() - 1);
    else if (entries.size() > linearSearchLimit)
        _storage->rebuildPlaces();
}

bool PlistDictionary::remove(std::string_view key)
{
    const auto place = _storage->place(key);
    if (!place)
        return false;
    _storage->entries.erase(_storage->entries.begin() + static_cast<std::ptrdiff_t>(*place));
    _storage->noteRemoval();
    _storage->rebuildPlaces();
    return true;
}

void PlistDictionary::truncate(std::size_t count)
{
    if (count >= size())
        return;
    auto& entries = _storage->entries;
    entries.erase(entries.begin() + static_cast<std::ptrdiff_t>(count), entries.end());
    _storage->noteRemoval();
    _storage->rebuildPlaces();
}

void PlistDictionary::clear()
{
    _storage->entries.clear();
    _storage->places.clear();
    _storage->noteRemoval();
}

void PlistDictionary::reserve(std::size_t count)
{
    _storage->entries.reserve(count);
    if (count > linearSearchLimit)
        _storage->places.reserve(count);
}

const PlistDictionary::Entry* PlistDictionary::begin() const
{
    return _storage->entries.data();
}

const PlistDictionary::Entry* PlistDictionary::end() const
{
    return _storage->entries.data() + _storage->entries.size();
}

PlistDictionary PlistDictionary::copy() const
{
    return PlistDictionary(std::make_shared<Storage>(*_storage));
}

std::size_t PlistDictionary::handleCount() const
{
    return static_cast<std::size_t>(_storage.use_count());
}

ContainerWatch& PlistDictionary::watch()
{
    return _storage->watch;
}

bool PlistDictionary::operator==(const PlistDictionary& other) const
{
    if (isSameContainer(other))
        return true;
    return size() == other.size() && std::all_of(begin(), end(), [&](const Entry& entry) {
               const PlistValue* value = other.find(entry.key);
               return value != nullptr && *value == entry.value;
           });
}

std::string_view PlistValue::kindName() const
{
    static constexpr std::array<std::string_view, 8> names{
        "string", "integer", "real", "boolean", "date", "data", "array", "dictionary"};
    return names.at(_value.index());
}

const Bytes* PlistValue::data() const
{
    const auto* data = std::get_if<std::shared_ptr<const Bytes>>(&_value);
    return data ? data->get() : nullptr;
}

PlistValue PlistValue::copy() const
{
    if (const PlistArray* values = array())
        return values->copy();
    if (const PlistDictionary* entries = dictionary())
        return entries->copy();
    return *this;
}

bool PlistValue::operator==(const PlistValue& other) const
{
    if (kind() != other.kind())
        return false;
    if (const Bytes* bytes = data())
        return *bytes == *other.data();
    if (const double* number = real(); number && std::isnan(*number))
        return std::isnan(*other.real());
    return _value == other._value;
}

WeakContainer::WeakContainer(const PlistValue& value)
{
    if (const PlistArray* values = value.array())
        _array = values->_storage;
    else if (const PlistDictionary* entries = value.dictionary())
        _dictionary = entries->_storage;
}

std::optional<PlistArray> WeakContainer::array() const
{
    auto values = _array.lock();
    return values ? std::optional(PlistArray(std::move(values))) : std::nullopt;
}

std::optional<PlistDictionary> WeakContainer::dictionary() const
{
    auto storage = _dictionary.lock();
    return storage ? std::optional(PlistDictionary(std::move(storage))) : std::nullopt;
}

bool WeakContainer::refersTo(const PlistValue& container) const
{
    // Whoever owns the same thing is neither before nor behind it.
    const auto isSame = [](const auto& weak, const auto& owner) {
        return !weak.owner_before(owner) && !owner.owner_before(weak);
    };
    if (const PlistArray* values = container.array())
        return isSame(_array, values->_storage);
    const PlistDictionary* entries = container.dictionary();
    return entries && isSame(_dictionary, entries->_storage);
}

} // namespace ventrik
