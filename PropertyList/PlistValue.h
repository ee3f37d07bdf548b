#pragma once

#include "PropertyList/Bytes.h"
#include "PropertyList/ChangeLog.h"

#include <concepts>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <limits>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <variant>
#include <vector>

namespace ventrik
{

class PlistValue;

/// A moment, in seconds since 1970-01-01 00:00 UTC.
struct PlistDate {
    double secondsSince1970 = 0;
    bool operator==(const PlistDate&) const = default;
};

/// A whole number from -2^63 to 2^64 - 1, the range that property lists share.
class PlistInteger
{
  public:
    template <std::integral T>
    requires(!std::same_as<T, bool>) constexpr PlistInteger(
        T value) // NOLINT(google-explicit-constructor): a number is a number
        : _bits(static_cast<std::uint64_t>(value)), _negative(std::cmp_less(value, 0))
    {
    }

    /// The low 64 bits as a signed number: the value itself up to 2^63 - 1.
    constexpr std::int64_t signedBits() const { return static_cast<std::int64_t>(_bits); }
    constexpr std::uint64_t bits() const { return _bits; }
    constexpr bool isNegative() const { return _negative; }
    std::string decimal() const;
    bool operator==(const PlistInteger&) const = default;

  private:
    std::uint64_t _bits;
    bool _negative;
};

/// An ordered list of values. A handle: copies share one container; `copy` makes a new one.
class PlistArray
{
  public:
    PlistArray();
    PlistArray(std::initializer_list<PlistValue> values);

    std::size_t size() const;
    bool empty() const { return size() == 0; }
    const PlistValue& operator[](std::size_t index) const;
    const PlistValue* begin() const;
    const PlistValue* end() const;

    void append(PlistValue value);
    /// Puts the value in the place of the one at the index, which must be below the size.
    void replace(std::size_t index, PlistValue value);
    void removeFirst(std::size_t count);
    /// Removes what stands behind the first so many.
    void truncate(std::size_t count);
    void clear();
    void reserve(std::size_t count);

    /// A new array of the same elements; nested containers stay shared.
    PlistArray copy() const;
    /// How many handles share the container, this one included.
    std::size_t handleCount() const { return static_cast<std::size_t>(_storage.use_count()); }
    bool isSameContainer(const PlistArray& other) const { return _storage == other._storage; }
    bool operator==(const PlistArray& other) const;

    /// What tells whoever watches the container that it changes. Copies have their own.
    ContainerWatch& watch();

  private:
    friend class WeakContainer;
    struct Storage;
    explicit PlistArray(std::shared_ptr<Storage> storage) : _storage(std::move(storage)) {}

    std::shared_ptr<Storage> _storage;
};

/// Values under string keys, in the order in which the keys were first set. A handle: copies share
/// one container; `copy` makes a new one. Finding a key takes constant time.
class PlistDictionary
{
  public:
    struct Entry;

    PlistDictionary();
    PlistDictionary(std::initializer_list<std::pair<std::string_view, PlistValue>> entries);

    std::size_t size() const;
    bool empty() const { return size() == 0; }
    bool contains(std::string_view key) const { return find(key) != nullptr; }

    /// The value under the key, or null. Valid until the dictionary changes.
    const PlistValue* find(std::string_view key) const;
    PlistValue* find(std::string_view key);
    /// Likewise, without a search while the key is at the place where it was the last time: 0 at
    /// first, then what the last call left.
    PlistValue* find(std::string_view key, std::size_t& place);

    /// The key's place in the order. It stays that of the key until a key before it is removed, so
    /// a caller that keeps it gets at the entry without a search: `entryAt`, then look at its key.
    std::optional<std::size_t> placeOf(std::string_view key) const;
    /// How often entries were removed. While it stays, each key is where it was.
    std::size_t removalCount() const;
    /// The entry at the place, or null past the end. Valid until the dictionary changes; its key
    /// must stay as it is.
    Entry* entryAt(std::size_t place);
    const Entry* entryAt(std::size_t place) const;

    /// Replaces the key's value in its place, or adds the key at the end.
    void set(std::string_view key, PlistValue value);
    bool remove(std::string_view key);
    /// Removes the entries behind the first so many.
    void truncate(std::size_t count);
    void clear();
    /// Makes room for that many entries, so that adding them moves none.
    void reserve(std::size_t count);

    const Entry* begin() const;
    const Entry* end() const;

    /// A new dictionary of the same entries; nested containers stay shared.
    PlistDictionary copy() const;
    /// How many handles share the container, this one included.
    std::size_t handleCount() const;
    bool isSameContainer(const PlistDictionary& other) const { return _storage == other._storage; }
    /// Equal keys with equal values, in any order.
    bool operator==(const PlistDictionary& other) const;

    /// What tells whoever watches the container that it changes, or is about to: whoever gets at a
    /// value that can be written is taken to write it. Copies have their own.
    ContainerWatch& watch();

  private:
    friend class WeakContainer;
    struct Storage;
    explicit PlistDictionary(std::shared_ptr<Storage> storage) : _storage(std::move(storage)) {}

    std::shared_ptr<Storage> _storage;
};

/// A property-list value. Copies of arrays and dictionaries share their container; strings and data
/// are values (data is never changed once inside, so copies share its bytes).
class PlistValue
{
  public:
    enum class Kind { String, Integer, Real, Boolean, Date, Data, Array, Dictionary };

    PlistValue(std::string value) : _value(std::move(value)) {}
    PlistValue(std::string_view value) : _value(std::string(value)) {}
    PlistValue(const char* value) : _value(std::string(value)) {}
    template <std::integral T>
    requires(!std::same_as<T, bool>) PlistValue(T value) : _value(PlistInteger(value)) {}
    PlistValue(PlistInteger value) : _value(value) {}
    PlistValue(double value) : _value(value) {}
    PlistValue(std::same_as<bool> auto value) : _value(value) {}
    PlistValue(PlistDate value) : _value(value) {}
    PlistValue(Bytes value) : _value(std::make_shared<const Bytes>(std::move(value))) {}
    PlistValue(PlistArray value) : _value(std::move(value)) {}
    PlistValue(PlistDictionary value) : _value(std::move(value)) {}

    Kind kind() const { return static_cast<Kind>(_value.index()); }
    /// "string", "integer", "real", "boolean", "date", "data", "array" or "dictionary".
    std::string_view kindName() const;

    // Each gives the content when the value is of that kind, else null.
    const std::string* string() const { return std::get_if<std::string>(&_value); }
    const PlistInteger* integer() const { return std::get_if<PlistInteger>(&_value); }
    const double* real() const { return std::get_if<double>(&_value); }
    const bool* boolean() const { return std::get_if<bool>(&_value); }
    const PlistDate* date() const { return std::get_if<PlistDate>(&_value); }
    const Bytes* data() const;
    const PlistArray* array() const { return std::get_if<PlistArray>(&_value); }
    PlistArray* array() { return std::get_if<PlistArray>(&_value); }
    const PlistDictionary* dictionary() const { return std::get_if<PlistDictionary>(&_value); }
    PlistDictionary* dictionary() { return std::get_if<PlistDictionary>(&_value); }

    /// Becomes a number, without the detour over a value of its own.
    template <std::integral T>
    requires(!std::same_as<T, bool>) PlistValue& operator=(T number)
    {
        return *this = PlistInteger(number);
    }
    PlistValue& operator=(PlistInteger number)
    {
        _value = number;
        return *this;
    }
    PlistValue& operator=(std::same_as<double> auto number)
    {
        _value = number;
        return *this;
    }

    /// Becomes a text, in the room of the one that it is.
    void setText(std::string_view text)
    {
        if (std::string* present = std::get_if<std::string>(&_value))
            present->assign(text);
        else
            _value = std::string(text);
    }

    /// The same value; an array's or dictionary's top level is new, nested containers stay shared.
    PlistValue copy() const;

    /// Deep equality; reals that are both not-a-number count as equal.
    bool operator==(const PlistValue& other) const;

  private:
    std::variant<std::string, PlistInteger, double, bool, PlistDate, std::shared_ptr<const Bytes>,
                 PlistArray, PlistDictionary>
        _value;
};

struct PlistDictionary::Entry {
    /// Keys of one length mostly differ in their last character already.
    bool isUnder(std::string_view name) const
    {
        return key.size() == name.size() &&
               (name.empty() || (key.back() == name.back() &&
                                 std::memcmp(key.data(), name.data(), name.size()) == 0));
    }

    std::string key;
    PlistValue value;
};

/// Refers to an array or a dictionary without keeping it alive.
class WeakContainer
{
  public:
    WeakContainer() = default;
    /// Refers to nothing when the value is neither an array nor a dictionary.
    explicit WeakContainer(const PlistValue& value);

    /// The container, while somebody still owns it.
    std::optional<PlistArray> array() const;
    std::optional<PlistDictionary> dictionary() const;
    bool refersTo(const PlistValue& container) const;

  private:
    std::weak_ptr<PlistArray::Storage> _array;
    std::weak_ptr<PlistDictionary::Storage> _dictionary;
};

} // namespace ventrik
