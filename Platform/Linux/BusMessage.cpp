#include "Platform/Linux/BusMessage.h"

#include <string_view>

namespace ventrik
{

namespace
{

constexpr std::uint64_t roundedUp(std::uint64_t size, std::uint64_t step)
{
    return (size + step - 1) / step * step;
}

class Marshaller
{
  public:
    const Bytes& bytes() const { return _bytes; }

    void align(std::size_t step) { _bytes.resize(roundedUp(_bytes.size(), step)); }
    void byte(std::uint8_t value) { _bytes.push_back(value); }
    void number(std::uint32_t value)
    {
        align(4);
        for (int shift = 0; shift < 32; shift += 8)
            byte(static_cast<std::uint8_t>(value >> shift));
    }
    void text(std::string_view text)
    {
        number(static_cast<std::uint32_t>(text.size()));
        append(text);
    }
    void signature(std::string_view types)
    {
        byte(static_cast<std::uint8_t>(types.size()));
        append(types);
    }
    void append(const Bytes& bytes) { _bytes.insert(_bytes.end(), bytes.begin(), bytes.end()); }

  private:
    void append(std::string_view text)
    {
        _bytes.insert(_bytes.end(), text.begin(), text.end());
        byte(0);
    }

    Bytes _bytes;
};

// A header field is its code and a variant: the value behind its own signature.
void addField(Marshaller& fields, std::uint8_t code, std::string_view type, std::string_view value)
{
    if (value.empty())
        return;
    fields.align(8);
    fields.byte(code);
    fields.signature(type);
    type == "g" ? fields.signature(value) : fields.text(value);
}

std::uint32_t readNumber(ByteView bytes, std::size_t offset, bool isLittleEndian)
{
    std::uint32_t number = 0;
    for (std::size_t i = 0; i < 4; ++i)
        number = number << 8 | bytes[offset + (isLittleEndian ? 3 - i : i)];
    return number;
}

} // namespace

// u8 byte order | u8 type | u8 flags | u8 version | u32 size of the body | u32 serial
// | the header fields as an array, whose first element is at byte 16 | the body, at a multiple of 8
Bytes BusMessage::encode() const
{
    Marshaller body;
    for (const std::string& argument : arguments)
        body.text(argument);
    Marshaller fields;
    addField(fields, 1, "o", path);
    addField(fields, 2, "s", interface);
    addField(fields, 3, "s", member);
    addField(fields, 6, "s", destination);
    addField(fields, 8, "g", std::string(arguments.size(), 's'));

    Marshaller message;
    message.byte('l');
    message.byte(static_cast<std::uint8_t>(type));
    message.byte(0);
    message.byte(1);
    message.number(static_cast<std::uint32_t>(body.bytes().size()));
    message.number(serial);
    message.number(static_cast<std::uint32_t>(fields.bytes().size()));
    message.append(fields.bytes());
    message.align(8);
    message.append(body.bytes());
    return message.bytes();
}

BusMessageStart BusMessageStart::decode(ByteView bytes)
{
    const bool isLittleEndian = bytes[0] == 'l';
    const std::uint64_t bodySize = readNumber(bytes, 4, isLittleEndian);
    const std::uint64_t fieldsSize = readNumber(bytes, 12, isLittleEndian);
    return {static_cast<BusMessage::Type>(bytes[1]), size + roundedUp(fieldsSize, 8) + bodySize};
}

} // namespace ventrik
