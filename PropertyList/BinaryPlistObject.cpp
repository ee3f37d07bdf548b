#include "PropertyList/BinaryPlistObject.h"

#include "PropertyList/PropertyListError.h"
#include "PropertyList/Utf8.h"

#include <algorithm>
#include <bit>
#include <cmath>

namespace ventrik
{

namespace
{

// From 1970-01-01 to 2001-01-01, where the dates of this form start.
constexpr double epochDistance = 978'307'200;

PlistInteger readWideInteger(ByteView bytes, std::size_t offset)
{
    const std::uint64_t high = bigEndian(bytes.first(8));
    const std::uint64_t low = bigEndian(bytes.subspan(8));
    if (high == 0)
        return low;
    if (high != ~std::uint64_t{0} || low >> 63 == 0)
        failPropertyList("the integer at byte {} is out of range", offset);
    return static_cast<std::int64_t>(low);
}

PlistValue readInteger(BinaryPlistObject& object)
{
    if (object.low > 4)
        failPropertyList("an integer of unknown size at byte {}", object.offset);
    const ByteView number = object.take(std::uint64_t{1} << object.low, 1, "integer");
    if (number.size() == 16)
        return readWideInteger(number, object.offset);
    const std::uint64_t value = bigEndian(number);
    // Only the widest of the plain sizes has a sign.
    return number.size() == 8 ? PlistInteger(static_cast<std::int64_t>(value))
                              : PlistInteger(value);
}

PlistValue readReal(BinaryPlistObject& object)
{
    if (object.low != 2 && object.low != 3)
        failPropertyList("a real of unknown size at byte {}", object.offset);
    const std::uint64_t bits = bigEndian(object.take(std::uint64_t{1} << object.low, 1, "real"));
    return object.low == 3 ? std::bit_cast<double>(bits)
                           : double{std::bit_cast<float>(static_cast<std::uint32_t>(bits))};
}

PlistValue readDate(BinaryPlistObject& object)
{
    if (object.low != 3)
        failPropertyList("a date of unknown size at byte {}", object.offset);
    const auto seconds = std::bit_cast<double>(bigEndian(object.take(8, 1, "date")));
    if (!std::isfinite(seconds))
        failPropertyList("the date at byte {} is not finite", object.offset);
    return PlistDate{seconds + epochDistance};
}

PlistValue readData(BinaryPlistObject& object)
{
    const ByteView data = object.take(object.takeCount("data"), 1, "data");
    return Bytes(data.begin(), data.end());
}

PlistValue readAscii(BinaryPlistObject& object)
{
    const ByteView text = object.take(object.takeCount("string"), 1, "string");
    if (std::any_of(text.begin(), text.end(), [](std::uint8_t byte) { return byte > 0x7f; }))
        failPropertyList("the string at byte {} is not ASCII", object.offset);
    return std::string(text.begin(), text.end());
}

PlistValue readUtf16(BinaryPlistObject& object)
{
    const ByteView units = object.take(object.takeCount("string"), 2, "string");
    std::string text;
    char32_t high = 0; // a surrogate that waits for its other half
    for (std::size_t i = 0; i < units.size(); i += 2) {
        const auto unit = static_cast<char32_t>(bigEndian(units.subspan(i, 2)));
        const bool isLow = unit >= 0xdc00 && unit <= 0xdfff;
        if (isLow != (high != 0))
            failPropertyList("an unpaired surrogate in the string at byte {}", object.offset);
        if (unit >= 0xd800 && unit <= 0xdbff) {
            high = unit;
            continue;
        }
        appendUtf8(text, isLow ? 0x10000 + ((high - 0xd800) << 10) + (unit - 0xdc00) : unit);
        high = 0;
    }
    if (high != 0)
        failPropertyList("an unpaired surrogate in the string at byte {}", object.offset);
    return text;
}

std::string_view refusedKindName(const BinaryPlistObject& object)
{
    const auto marker = static_cast<std::uint8_t>(object.kind << 4 | object.low);
    switch (marker) {
    case 0x00:
        return "null";
    case 0x0c:
    case 0x0d:
        return "URL";
    case 0x0e:
        return "UUID";
    case 0x0f:
        return "fill";
    default:
        break;
    }
    switch (object.kind) {
    case 0x8:
        return "keyed-archiver UID";
    case 0xb:
        return "ordered set";
    case 0xc:
        return "set";
    default:
        return "object of unknown kind";
    }
}

} // namespace

std::uint64_t bigEndian(ByteView bytes)
{
    std::uint64_t value = 0;
    for (const std::uint8_t byte : bytes)
        value = value << 8 | byte;
    return value;
}

ByteView BinaryPlistObject::take(std::uint64_t count, std::size_t elementSize,
                                 std::string_view what)
{
    if (count > rest.size() / elementSize)
        failPropertyList("the {} at byte {} runs past the objects ({} elements)", what, offset,
                         count);
    const auto size = static_cast<std::size_t>(count) * elementSize;
    const ByteView taken = rest.first(size);
    rest = rest.subspan(size);
    return taken;
}

std::uint64_t BinaryPlistObject::takeCount(std::string_view what)
{
    if (low != 0xf)
        return low;
    const std::uint8_t marker = take(1, 1, what).front();
    if (marker < 0x10 || marker > 0x13)
        failPropertyList("the count of the {} at byte {} is no integer", what, offset);
    return bigEndian(take(std::uint64_t{1} << (marker & 0xf), 1, what));
}

PlistValue readBinaryScalar(BinaryPlistObject& object)
{
    switch (object.kind) {
    case 0x0:
        if (object.low == 8 || object.low == 9)
            return object.low == 9;
        break;
    case 0x1:
        return readInteger(object);
    case 0x2:
        return readReal(object);
    case 0x3:
        return readDate(object);
    case 0x4:
        return readData(object);
    case 0x5:
        return readAscii(object);
    case 0x6:
        return readUtf16(object);
    default:
        break;
    }
    failPropertyList("a value that is not supported, {}, at byte {}", refusedKindName(object),
                     object.offset);
}

} // namespace ventrik
