#include "Capture/CaptureReader.h"

#include "Capture/ByteSource.h"
#include "Capture/PcapFile.h"
#include "Packets/AllRecords.h"

#include <algorithm>
#include <map>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

// Log codes are numbered by the part of the baseband that writes them: their upper four bits.
const Technology* technologyOfRecord(ByteView message)
{
    const LogPacket packet(message.size() < transportPrefixSize ? message : stripPrefix(message));
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

} // namespace

std::optional<CaptureReader> CaptureReader::open(const std::string& path, std::string& error)
{
    const std::string name = path == "-" ? "standard input" : path;
    auto source = ByteSource::open(path, error);
    if (!source)
        return std::nullopt;
    std::unique_ptr<CaptureContainer> container;
    // What is nothing else is for the library to name.
    container = PcapFile::open(std::move(source), name, error);
    return container ? std::optional(CaptureReader(std::move(container))) : std::nullopt;
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
