#include "Capture/DlfFile.h"

#include "Packets/SharedRecords.h"

namespace ventrik
{

bool DlfFile::isIn(ByteView firstBytes)
{
    return LogRecords::isPlausibleAtStart(firstBytes, LogRecords::Framing::Bare);
}

DlfFile::DlfFile(std::unique_ptr<ByteSource> source, std::string name)
    : _source(std::move(source)),
      _name(std::move(name)),
      _records(*_source, LogRecords::Framing::Bare, _damage)
{
}

std::optional<CapturedMessage> DlfFile::next()
{
    while (const auto packet = _records.next()) {
        if (packet->code == SharedRecords::versionReport.logCode)
            continue;
        _time = packet->time.value_or(_time);
        return CapturedMessage{_time, packet->data};
    }
    return std::nullopt;
}

std::string DlfFile::error() const
{
    if (!_source->error().empty())
        return _source->error();
    return _records.error().empty() ? std::string() : _name + ": " + _records.error();
}

std::vector<std::string> DlfFile::notes() const
{
    std::vector<std::string> lines;
    _damage.tell(lines, _name);
    return lines;
}

} // namespace ventrik
