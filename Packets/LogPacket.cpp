#include "Packets/LogPacket.h"

#include "Packets/ArrayOutOfBoundsException.h"

#include <algorithm>

namespace ventrik
{

ByteView LogPacket::payload() const
{
    return _bytes.subspan(std::min(logPacketHeaderSize, _bytes.size()));
}

const PropertyListReading& LogPacket::propertyList() const
{
    if (!_propertyList)
        _propertyList =
            _memory ? _memory->read(effectiveLogCode(*this), payload())
                    : std::make_shared<const PropertyListReading>(readPropertyList(payload()));
    return *_propertyList;
}

std::shared_ptr<const PropertyListReading> PropertyListMemory::read(std::uint32_t logCode,
                                                                    ByteView payload)
{
    auto known = std::ranges::find(_known, logCode, &Known::logCode);
    if (known != _known.end() && std::ranges::equal(known->payload, payload))
        return known->reading;
    auto reading = std::make_shared<const PropertyListReading>(readPropertyList(payload));
    if (known == _known.end())
        known = _known.insert(known, {logCode, {}, {}});
    if (payload.size() <= maximumSize)
        *known = {logCode, Bytes(payload.begin(), payload.end()), reading};
    else
        _known.erase(known);
    return reading;
}

void LogPacket::u32s(std::size_t offset, std::span<std::uint32_t> numbers) const
{
    const std::size_t end = offset + numbers.size_bytes();
    if (std::endian::native == std::endian::little && end <= size()) {
        std::memcpy(numbers.data(), _bytes.data() + offset, numbers.size_bytes());
        return;
    }
    for (std::size_t i = 0; i < numbers.size(); ++i)
        numbers[i] = u32(offset + sizeof(std::uint32_t) * i);
}

std::size_t RecordElements::completeIn(const LogPacket& packet) const
{
    if (packet.size() < offset + needed)
        return 0;
    return std::min(count, (packet.size() - offset - needed) / stride + 1);
}

LogPacket RecordElements::element(const LogPacket& packet, std::size_t index) const
{
    if (index >= count)
        throw ArrayOutOfBoundsException();
    return packet.from(offset + stride * index);
}

ByteView stripPrefix(ByteView data)
{
    return data.size() >= transportPrefixSize && data[0] == transportPrefixMark
               ? data.subspan(transportPrefixSize)
               : data;
}

std::uint32_t effectiveLogCode(const LogPacket& packet)
{
    const std::uint32_t code = packet.u16(3);
    return packet.u8(0) == extraCodePacketType ? code | extraCodeBase : code;
}

} // namespace ventrik
