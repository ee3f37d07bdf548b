#include "PropertyList/Base64.h"

#include "PropertyList/XmlText.h"

#include <algorithm>
#include <array>
#include <utility>

namespace ventrik
{

namespace
{

constexpr std::string_view alphabet =
    "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
constexpr std::uint8_t notInAlphabet = 0xff;

constexpr std::array<std::uint8_t, 256> makeValues()
{
    std::array<std::uint8_t, 256> values{};
    values.fill(notInAlphabet);
    for (std::size_t i = 0; i < alphabet.size(); ++i)
        values[static_cast<std::uint8_t>(alphabet[i])] = static_cast<std::uint8_t>(i);
    return values;
}

constexpr std::array<std::uint8_t, 256> alphabetValues = makeValues();

// Gathers six bits a character and gives off whole bytes.
class Decoder
{
  public:
    bool add(char character)
    {
        if (isXmlSpace(character))
            return true;
        ++_count;
        if (character == '=')
            return ++_padding <= 2;
        const std::uint8_t value = alphabetValues.at(static_cast<std::uint8_t>(character));
        if (value == notInAlphabet || _padding > 0)
            return false;
        addBits(value);
        return true;
    }

    bool isComplete() const { return _count % 4 == 0; }
    Bytes takeData() { return std::move(_data); }

  private:
    void addBits(std::uint8_t value)
    {
        _bits = (_bits << 6 | value) & 0xffff;
        _bitCount += 6;
        if (_bitCount < 8)
            return;
        _bitCount -= 8;
        _data.push_back(static_cast<std::uint8_t>(_bits >> _bitCount & 0xff));
    }

    Bytes _data;
    std::uint32_t _bits = 0;
    unsigned _bitCount = 0;
    std::size_t _count = 0;
    std::size_t _padding = 0;
};

} // namespace

std::string encodeBase64(ByteView data)
{
    std::string text;
    text.reserve((data.size() + 2) / 3 * 4);
    for (std::size_t i = 0; i < data.size(); i += 3) {
        const std::size_t count = std::min<std::size_t>(3, data.size() - i);
        std::uint32_t bits = 0;
        for (std::size_t j = 0; j < 3; ++j)
            bits = bits << 8 | (j < count ? data[i + j] : 0U);
        for (std::size_t j = 0; j < 4; ++j)
            text += j <= count ? alphabet[bits >> (18 - 6 * j) & 0x3f] : '=';
    }
    return text;
}

std::optional<Bytes> decodeBase64(std::string_view text)
{
    Decoder decoder;
    for (const char character : text)
        if (!decoder.add(character))
            return std::nullopt;
    return decoder.isComplete() ? std::optional(decoder.takeData()) : std::nullopt;
}

} // namespace ventrik
