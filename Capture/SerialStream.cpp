#include "Capture/SerialStream.h"

namespace ventrik
{

bool SerialStream::isIn(ByteView firstBytes)
{
    ByteSource source(Bytes(firstBytes.begin(), firstBytes.end()), firstBytes.size());
    return HdlcFrames(source).next().has_value();
}

SerialStream::SerialStream(std::unique_ptr<ByteSource> source, std::string name)
    : _source(std::move(source)), _name(std::move(name)), _frames(*_source)
{
}

std::optional<CapturedMessage> SerialStream::next()
{
    while (const auto frame = _frames.next()) {
        if (auto found = _records.record(*frame))
            return found;
    }
    return std::nullopt;
}

std::vector<std::string> SerialStream::notes() const
{
    std::vector<std::string> lines;
    _frames.tell(lines, _name);
    _records.tell(lines, _name);
    return lines;
}

} // namespace ventrik
