#include "Capture/CaptureReader.h"

#include "Capture/ByteSource.h"
#include "Capture/DlfFile.h"
#include "Capture/PcapFile.h"
#include "Capture/SerialStream.h"
#include "Capture/SnapshotContainer.h"
#include "Packets/AllRecords.h"

#include <algorithm>
#include <array>
#include <map>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

// Log codes are numbered by the part of the baseband that writes them: their upper four bits.
const Technology* technologyOfRecord(ByteView message)
{
    const LogPacket packet(stripPrefix(message));
    const std::uint32_t code = effectiveLogCode(packet);
    if (packet.size() < logPacketHeaderSize || !recordOf(code))
        return nullptr;
    switch (code >> 12) {
    case 0x1:
        return &Technologies::c2k;
    case 0x4:
    case 0x5:
    case 0x7:
        return &Technologies::gsm;
    case 0xB:
        return &Technologies::lte;
    case 0xD:
        return &Technologies::utran;
    default:
        return nullptr; // of all technologies
    }
}

/// A kind of file that captures are kept in.
struct Container {
    bool (*isIn)(ByteView firstBytes);
    std::unique_ptr<CaptureContainer> (*open)(std::unique_ptr<ByteSource> source,
                                              const std::string& name, std::string& error);
};

std::unique_ptr<CaptureContainer> openPcapFile(std::unique_ptr<ByteSource> source,
                                               const std::string& name, std::string& error)
{
    return PcapFile::open(std::move(source), name, error);
}

template <typename Kind>
std::unique_ptr<CaptureContainer> make(std::unique_ptr<ByteSource> source, const std::string& name,
                                       std::string&)
{
    return std::make_unique<Kind>(std::move(source), name);
}

// In the order in which they are tried: those that are surest of themselves first.
constexpr std::array<Container, 4> containers{{
    {PcapFile::isIn, openPcapFile},
    {SnapshotContainer::isIn, make<SnapshotContainer>},
    {SerialStream::isIn, make<SerialStream>},
    {DlfFile::isIn, make<DlfFile>},
}};

} // namespace

std::optional<CaptureReader> CaptureReader::open(const std::string& path, std::string& error)
{
    constexpr std::size_t magicSize = 4;
    constexpr std::size_t enoughToTell = 65536;
    const std::string name = path == "-" ? "standard input" : path;
    auto source = ByteSource::open(path, error);
    if (!source)
        return std::nullopt;
    // A pcap file tells itself by its first bytes and does not wait for more of them.
    const Container* container = containers.data();
    if (!container->isIn(source->peek(magicSize))) {
        const ByteView firstBytes = source->peek(enoughToTell);
        container = std::ranges::find_if(
            containers, [&](const Container& kind) { return kind.isIn(firstBytes); });
    }
    // What is of no kind is for the first one to refuse.
    if (container == containers.end())
        container = containers.data();
    auto opened = container->open(std::move(source), name, error);
    return opened ? std::optional(CaptureReader(std::move(opened))) : std::nullopt;
}

std::optional<Technology> CaptureReader::technology() const
{
    const auto type = linkType();
    return type ? technologyOfLinkType(*type) : std::nullopt;
}

std::optional<Technology> CaptureReader::guessTechnology()
{
    constexpr std::size_t enough = 1000;
    while (_ahead.size() < enough) {
        const auto message = _container->next();
        if (!message)
            break;
        _ahead.push_back({*message, Bytes(message->data.begin(), message->data.end())});
    }
    std::map<std::string_view, std::size_t> counts;
    for (const ReadAhead& ahead : _ahead)
        if (const Technology* technology = technologyOfRecord(ahead.data))
            ++counts[technology->name];
    const auto most =
        std::ranges::max_element(counts, {}, [](const auto& count) { return count.second; });
    return most == counts.end() ? std::nullopt : technologyNamed(most->first);
}

std::optional<CapturedMessage> CaptureReader::next()
{
    if (_ahead.empty())
        return _container->next();
    CapturedMessage message = _ahead.front().message;
    _current = std::move(_ahead.front().data);
    message.data = _current;
    _ahead.pop_front();
    return message;
}

} // namespace ventrik
