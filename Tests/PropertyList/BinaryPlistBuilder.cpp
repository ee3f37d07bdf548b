#include "Tests/PropertyList/BinaryPlistBuilder.h"

namespace ventrik
{

BinaryPlistBuilder& BinaryPlistBuilder::object(const Bytes& bytes)
{
    _offsets.push_back(8 + _objects.size());
    _objects.insert(_objects.end(), bytes.begin(), bytes.end());
    return *this;
}

BinaryPlistBuilder& BinaryPlistBuilder::offsetSize(std::uint8_t size)
{
    _offsetSize = size;
    return *this;
}

BinaryPlistBuilder& BinaryPlistBuilder::referenceSize(std::uint8_t size)
{
    _referenceSize = size;
    return *this;
}

BinaryPlistBuilder& BinaryPlistBuilder::topObject(std::uint64_t number)
{
    _topObject = number;
    return *this;
}

BinaryPlistBuilder& BinaryPlistBuilder::objectCount(std::uint64_t count)
{
    _objectCount = count;
    return *this;
}

BinaryPlistBuilder& BinaryPlistBuilder::tableStart(std::uint64_t start)
{
    _tableStart = start;
    return *this;
}

BinaryPlistBuilder& BinaryPlistBuilder::offsetOf(std::size_t object, std::uint64_t offset)
{
    _wrongOffsets[object] = offset;
    return *this;
}

Bytes BinaryPlistBuilder::build() const
{
    Bytes data{'b', 'p', 'l', 'i', 's', 't', '0', '0'};
    const auto add = [&](const Bytes& bytes) {
        data.insert(data.end(), bytes.begin(), bytes.end());
    };
    add(_objects);
    const std::uint64_t table = data.size();
    for (std::size_t i = 0; i < _offsets.size(); ++i) {
        const auto wrong = _wrongOffsets.find(i);
        add(bigEndianBytes(wrong == _wrongOffsets.end() ? _offsets[i] : wrong->second,
                           _offsetSize));
    }
    add({0, 0, 0, 0, 0, 0, _offsetSize, _referenceSize});
    add(bigEndianBytes(_objectCount.value_or(_offsets.size()), 8));
    add(bigEndianBytes(_topObject, 8));
    add(bigEndianBytes(_tableStart.value_or(table), 8));
    return data;
}

Bytes bigEndianBytes(std::uint64_t value, std::size_t size)
{
    Bytes bytes(size);
    for (std::size_t i = size; i > 0; --i, value >>= 8)
        bytes[i - 1] = static_cast<std::uint8_t>(value & 0xff);
    return bytes;
}

Bytes joined(std::initializer_list<Bytes> parts)
{
    Bytes all;
    for (const Bytes& part : parts)
        all.insert(all.end(), part.begin(), part.end());
    return all;
}

} // namespace ventrik
