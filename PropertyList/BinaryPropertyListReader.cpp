#include "PropertyList/PropertyListReader.h"

#include "PropertyList/BinaryPlistObject.h"
#include "PropertyList/PropertyListError.h"

#include <algorithm>
#include <string_view>
#include <unordered_map>

namespace ventrik
{

namespace
{

// "bplist00" | objects | offset table, one entry an object | trailer. All numbers are big-endian.
constexpr std::string_view header = "bplist00";
constexpr std::size_t trailerSize = 32;

// Objects may be referred to many times over, so a short message can stand for an endless tree.
// Whoever walks the tree pays for all of it; these bound what a message may stand for.
constexpr std::uint64_t maximumValues = 1'000'000;
constexpr std::uint64_t maximumContentBytes = 2 * propertyListMaximumSize;

// Trailer, 32 bytes
//    6 u8 bytes of an offset | 7 u8 bytes of a reference | 8 u64 objects | 16 u64 top object |
//   24 u64 place of the offset table
struct Trailer {
    explicit Trailer(ByteView bytes)
        : offsetSize(bytes[6]),
          referenceSize(bytes[7]),
          objectCount(bigEndian(bytes.subspan(8, 8))),
          topObject(bigEndian(bytes.subspan(16, 8))),
          tableStart(bigEndian(bytes.subspan(24, 8)))
    {
    }

    std::size_t offsetSize;
    std::size_t referenceSize;
    std::uint64_t objectCount;
    std::uint64_t topObject;
    std::uint64_t tableStart;
};

// How much a value is when every reference in it is followed.
struct Extent {
    std::uint64_t values = 0;
    std::uint64_t contentBytes = 0; // of strings, keys and data

    // Never overflows: what is added is itself within the limits.
    void add(const Extent& other, std::size_t offset)
    {
        values += other.values;
        contentBytes += other.contentBytes;
        if (values > maximumValues)
            failPropertyList("more than {} values in what starts at byte {}", maximumValues,
                             offset);
        if (contentBytes > maximumContentBytes)
            failPropertyList("more than {} bytes of text and data in what starts at byte {}",
                             maximumContentBytes, offset);
    }
};

struct Object {
    PlistValue value;
    Extent extent;
    std::size_t height = 0; // containers from here down to the deepest
};

std::uint64_t contentSize(const PlistValue& value)
{
    if (const std::string* text = value.string())
        return text->size();
    const Bytes* data = value.data();
    return data ? data->size() : 0;
}

// Reads one message, each of its objects at most once.
class BinaryReader
{
  public:
    explicit BinaryReader(ByteView data)
        : _data(data), _trailer(data.last(trailerSize)), _tableEnd(data.size() - trailerSize)
    {
        checkTrailer();
    }

    PlistValue readTop()
    {
        _built.add({1, 0}, 0);
        return object(_trailer.topObject, 0).value;
    }

  private:
    void checkTrailer() const
    {
        if (_trailer.offsetSize < 1 || _trailer.offsetSize > 8)
            failPropertyList("the trailer gives offsets {} bytes", _trailer.offsetSize);
        if (_trailer.referenceSize < 1 || _trailer.referenceSize > 8)
            failPropertyList("the trailer gives references {} bytes", _trailer.referenceSize);
        if (_trailer.tableStart < header.size() || _trailer.tableStart > _tableEnd)
            failPropertyList("the offset table starts at byte {}, outside the data",
                             _trailer.tableStart);
        const std::uint64_t tableSize = _tableEnd - _trailer.tableStart;
        if (_trailer.objectCount != tableSize / _trailer.offsetSize ||
            tableSize % _trailer.offsetSize != 0)
            failPropertyList("the offset table of {} objects does not fill the {} bytes for it",
                             _trailer.objectCount, tableSize);
    }

    BinaryPlistObject objectBytes(std::uint64_t number) const
    {
        if (number >= _trailer.objectCount)
            failPropertyList("a reference to object {} of {}", number, _trailer.objectCount);
        const auto tableStart = static_cast<std::size_t>(_trailer.tableStart);
        const std::size_t entry =
            tableStart + static_cast<std::size_t>(number) * _trailer.offsetSize;
        const std::uint64_t offset = bigEndian(_data.subspan(entry, _trailer.offsetSize));
        if (offset < header.size() || offset >= tableStart)
            failPropertyList("object {} starts at byte {}, outside the objects", number, offset);
        const auto start = static_cast<std::size_t>(offset);
        const std::uint8_t marker = _data[start];
        return {start, static_cast<std::uint8_t>(marker >> 4),
                static_cast<std::uint8_t>(marker & 0xf),
                _data.subspan(start + 1, tableStart - start - 1)};
    }

    // The object of that number, read at the first call. `depth` containers are around it.
    const Object& object(std::uint64_t number, std::size_t depth)
    {
        const auto [found, isNew] = _objects.try_emplace(number);
        std::optional<Object>& known = found->second;
        if (isNew)
            known = readObject(objectBytes(number), depth);
        else if (!known)
            failPropertyList("object {} contains itself", number);
        checkDepth(depth + known->height, number);
        return *known;
    }

    static void checkDepth(std::size_t depth, std::uint64_t number)
    {
        if (depth > propertyListMaximumDepth)
            failPropertyList("nesting deeper than {} at object {}", propertyListMaximumDepth,
                             number);
    }

    Object readObject(BinaryPlistObject bytes, std::size_t depth)
    {
        const bool isDictionary = bytes.kind == 0xd;
        if (isDictionary || bytes.kind == 0xa) {
            if (depth == propertyListMaximumDepth)
                failPropertyList("nesting deeper than {} at byte {}", depth, bytes.offset);
            return isDictionary ? readDictionary(bytes, depth + 1) : readArray(bytes, depth + 1);
        }
        PlistValue value = readBinaryScalar(bytes);
        const std::uint64_t size = contentSize(value);
        return {std::move(value), {1, size}};
    }

    Object readArray(BinaryPlistObject& bytes, std::size_t depth)
    {
        const std::uint64_t count = bytes.takeCount("array");
        const ByteView references = bytes.take(count, _trailer.referenceSize, "array");
        PlistArray array;
        Object result{array, {1, 0}, 1};
        reserveValues(count, bytes.offset);
        array.reserve(static_cast<std::size_t>(count));
        for (std::size_t i = 0; i < count; ++i)
            array.append(member(reference(references, i), depth, result, bytes.offset));
        return result;
    }

    Object readDictionary(BinaryPlistObject& bytes, std::size_t depth)
    {
        const std::uint64_t count = bytes.takeCount("dictionary");
        const ByteView keys = bytes.take(count, _trailer.referenceSize, "dictionary");
        const ByteView values = bytes.take(count, _trailer.referenceSize, "dictionary");
        PlistDictionary dictionary;
        Object result{dictionary, {1, 0}, 1};
        reserveValues(count, bytes.offset);
        for (std::size_t i = 0; i < count; ++i) {
            const std::string& name = key(reference(keys, i), depth, result, bytes.offset);
            dictionary.set(name, member(reference(values, i), depth, result, bytes.offset));
        }
        return result;
    }

    std::uint64_t reference(ByteView references, std::size_t index) const
    {
        const std::size_t size = _trailer.referenceSize;
        return bigEndian(references.subspan(index * size, size));
    }

    // Counted before anything is read, so that containers which overlap in the data cannot take
    // more memory together than one tree of the allowed size.
    void reserveValues(std::uint64_t count, std::size_t offset)
    {
        _built.add({std::min(count, maximumValues + 1), 0}, offset);
    }

    const PlistValue& member(std::uint64_t number, std::size_t depth, Object& parent,
                             std::size_t parentOffset)
    {
        const Object& child = object(number, depth);
        parent.extent.add(child.extent, parentOffset);
        parent.height = std::max(parent.height, child.height + 1);
        _built.add({0, contentSize(child.value)}, parentOffset);
        return child.value;
    }

    const std::string& key(std::uint64_t number, std::size_t depth, Object& parent,
                           std::size_t parentOffset)
    {
        const Object& child = object(number, depth);
        const std::string* name = child.value.string();
        if (!name)
            failPropertyList("a key of the dictionary at byte {} is not a string but {}",
                             parentOffset, child.value.kindName());
        const Extent extent{0, name->size()};
        parent.extent.add(extent, parentOffset);
        _built.add(extent, parentOffset);
        return *name;
    }

    ByteView _data;
    Trailer _trailer;
    std::size_t _tableEnd;
    // Empty while an object is being read: whoever meets it then stands inside it. References into
    // a map of this kind stay valid as it grows.
    std::unordered_map<std::uint64_t, std::optional<Object>> _objects;
    Extent _built; // what all containers hold, each counted once
};

PlistValue readBinary(ByteView data)
{
    if (data.size() > propertyListMaximumSize)
        failPropertyList("{} bytes are more than the {} allowed", data.size(),
                         propertyListMaximumSize);
    if (data.size() < header.size() || !std::equal(header.begin(), header.end(), data.begin()))
        failPropertyList("the data does not start with \"{}\"", header);
    if (data.size() < header.size() + trailerSize)
        failPropertyList("{} bytes are too few for a trailer", data.size());
    return BinaryReader(data).readTop();
}

} // namespace

PropertyListReading readBinaryPropertyList(ByteView data)
{
    try {
        return {readBinary(data), {}};
    } catch (const PropertyListError& error) {
        return {std::nullopt, fmt::format("binary property list: {}", error.what())};
    }
}

} // namespace ventrik
