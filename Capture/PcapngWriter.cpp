#include "Capture/PcapngWriter.h"

#include "Capture/CaptureFile.h"

#include <cstdint>
#include <limits>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

namespace BlockType
{
constexpr std::uint32_t interface = 1;
constexpr std::uint32_t packet = 6;
constexpr std::uint32_t section = 0x0A0D0D0A;
} // namespace BlockType

namespace Option
{
constexpr std::uint16_t end = 0;
constexpr std::uint16_t comment = 1;
constexpr std::uint16_t interfaceName = 2;
constexpr std::uint16_t interfaceDescription = 3;
constexpr std::uint16_t application = 4;
constexpr std::uint16_t timeResolution = 9;
} // namespace Option

constexpr std::uint32_t byteOrderMark = 0x1A2B3C4D;
constexpr std::uint8_t nanoseconds = 9;

/// A block of the file, little-endian: its type, its length, its body and its length again.
class Block
{
  public:
    explicit Block(std::uint32_t type)
    {
        add32(type);
        add32(0);
    }
    void add16(std::uint16_t number)
    {
        addByte(number);
        addByte(number >> 8U);
    }
    void add32(std::uint32_t number)
    {
        add16(static_cast<std::uint16_t>(number & 0xFFFFU));
        add16(static_cast<std::uint16_t>(number >> 16U));
    }
    void addPadded(std::string_view bytes)
    {
        _bytes += bytes;
        _bytes.resize((_bytes.size() + 3) / 4 * 4);
    }
    void addOption(std::uint16_t code, std::string_view value)
    {
        add16(code);
        add16(static_cast<std::uint16_t>(value.size()));
        addPadded(value);
    }
    void addEndOfOptions() { addOption(Option::end, {}); }

    std::string bytes()
    {
        const auto size = static_cast<std::uint32_t>(_bytes.size() + 4);
        for (std::size_t i = 0; i < 4; ++i)
            _bytes[4 + i] = static_cast<char>(size >> (8 * i) & 0xFFU);
        add32(size);
        return std::move(_bytes);
    }

  private:
    void addByte(unsigned byte) { _bytes += static_cast<char>(byte & 0xFFU); }

    std::string _bytes;
};

std::string sectionHeader(const Technology& technology, std::string_view version)
{
    Block block(BlockType::section);
    block.add32(byteOrderMark);
    block.add16(1);
    block.add16(0);
    block.add32(std::numeric_limits<std::uint32_t>::max()); // of unknown length, in 64 bits
    block.add32(std::numeric_limits<std::uint32_t>::max());
    block.addOption(Option::comment,
                    fmt::format("Messages of a baseband's log channel, technology {} ({})",
                                technology.name, technology.displayName));
    block.addOption(Option::application, fmt::format("Ventrik {}", version));
    block.addEndOfOptions();
    return block.bytes();
}

std::string interfaceDescription(const Technology& technology, std::string_view version)
{
    Block block(BlockType::interface);
    block.add16(static_cast<std::uint16_t>(technology.linkType));
    block.add16(0);
    block.add32(static_cast<std::uint32_t>(CaptureFile::maximumMessageSize));
    block.addOption(Option::interfaceName, technology.name);
    block.addOption(Option::interfaceDescription,
                    fmt::format("Ventrik {}: log channel, {}", version, technology.displayName));
    block.addOption(Option::timeResolution, std::string(1, static_cast<char>(nanoseconds)));
    block.addEndOfOptions();
    return block.bytes();
}

} // namespace

std::optional<PcapngWriter> PcapngWriter::create(const std::string& path,
                                                 const Technology& technology,
                                                 std::string_view version, std::string& error)
{
    auto file = PrivateFile::create(path, error);
    if (!file)
        return std::nullopt;
    file->write(sectionHeader(technology, version));
    file->write(interfaceDescription(technology, version));
    return PcapngWriter(std::move(*file));
}

bool PcapngWriter::write(Clock::TimePoint time, ByteView message)
{
    if (message.size() > CaptureFile::maximumMessageSize)
        return false;
    const auto count = static_cast<std::uint64_t>(time.time_since_epoch().count());
    const auto size = static_cast<std::uint32_t>(message.size());
    Block block(BlockType::packet);
    block.add32(0); // the interface
    block.add32(static_cast<std::uint32_t>(count >> 32U));
    block.add32(static_cast<std::uint32_t>(count & 0xFFFFFFFFU));
    block.add32(size);
    block.add32(size);
    block.addPadded({reinterpret_cast<const char*>(message.data()), message.size()});
    _file.write(block.bytes());
    return std::ferror(_file.stream()) == 0;
}

} // namespace ventrik
