#include "TelephonyService/LogChannel.h"

#include "Packets/LogPacket.h"
#include "PropertyList/PropertyListReader.h"
#include "PropertyList/PropertyListWriter.h"

namespace ventrik
{

namespace
{

constexpr std::int32_t messageId = 0;
constexpr RemotePort::Seconds noWaiting{0};
constexpr int ticksBetweenReports = 20;
// How much an unpaced source may send in one go, before other channels have their turn, and when
// its next turn comes.
constexpr int unpacedBatch = 5000;
constexpr std::chrono::milliseconds unpacedInterval{2};

// The effective log code of a packet that is long enough to have one.
std::optional<std::uint64_t> codeOf(ByteView message)
{
    const ByteView packet = stripPrefix(message);
    return hasLogCode(packet) ? std::optional<std::uint64_t>(effectiveLogCode(LogPacket(packet)))
                              : std::nullopt;
}

void collectCodes(const PlistDictionary& command, std::string_view key, std::uint64_t base,
                  std::unordered_set<std::uint64_t>& codes)
{
    const PlistValue* list = command.find(key);
    if (!list || !list->array())
        return;
    for (const PlistValue& code : *list->array())
        if (code.integer())
            codes.insert(code.integer()->bits() + base);
}

} // namespace

LogChannel::LogChannel(MainQueue& queue, SystemLog& log, const LogChannelContent& content,
                       std::shared_ptr<RemotePort> clientPort)
    : _queue(queue), _log(log), _content(content), _clientPort(std::move(clientPort))
{
}

LogChannel::~LogChannel()
{
    _clientPort->setInvalidationCallback({});
    _clientPort->invalidate();
    if (_dropped > 0)
        _log.warning("Log channel for {} ends: {} messages dropped in all", clientPortName(),
                     _dropped);
}

std::optional<Bytes> LogChannel::handleCommand(ByteView command)
{
    const auto reading = readPropertyList(command);
    const PlistDictionary* dictionary = reading ? reading.value->dictionary() : nullptr;
    if (!dictionary) {
        _log.error("Log channel for {}: a command that is no dictionary: {}", clientPortName(),
                   reading ? "another kind of value" : reading.error);
        return std::nullopt;
    }
    if (dictionary->contains("GetTechnology"))
        return propertyListBytes(PlistDictionary{{"GetTechnology", _content.technology}});
    const PlistValue* state = dictionary->find("SetState");
    if (state && *state == "Streaming")
        startStreaming(*dictionary);
    else
        _log.error("Log channel for {}: an unknown command", clientPortName());
    return std::nullopt;
}

void LogChannel::startStreaming(const PlistDictionary& command)
{
    // The cell-monitor technology has no log codes: its start command lists none.
    _wantsAllCodes = !command.contains("SetOrbelLogCodes") && !command.contains("SetQxExtraCodes");
    _wantedCodes.clear();
    collectCodes(command, "SetOrbelLogCodes", 0, _wantedCodes);
    collectCodes(command, "SetQxExtraCodes", extraCodeBase, _wantedCodes);

    _timer.reset();
    _source = _content.makeSource();
    if (!_source)
        return;
    _elapsed = {};
    fetchNext();
    _timer =
        _queue.repeatEvery(_source->isPaced() ? tickInterval : unpacedInterval, [this] { tick(); });
    _log.warning("Log channel for {}: streaming {} codes", clientPortName(), _wantedCodes.size());
}

void LogChannel::tick()
{
    _elapsed += tickInterval;
    if (_source->isPaced()) {
        queueDueMessages();
        sendQueued();
    } else {
        streamUnpaced();
    }
    if (++_ticksSinceReport >= ticksBetweenReports)
        reportDrops();
}

void LogChannel::queueDueMessages()
{
    while (_next && _next->due <= _elapsed) {
        if (isWanted(_next->data))
            enqueue(std::move(_next->data));
        fetchNext();
    }
}

void LogChannel::streamUnpaced()
{
    for (int sent = 0; sent < unpacedBatch && sendQueued() && _next; ++sent) {
        if (isWanted(_next->data))
            enqueue(std::move(_next->data));
        fetchNext();
    }
}

void LogChannel::enqueue(Bytes message)
{
    _outgoingBytes += message.size();
    _outgoing.push_back(std::move(message));
    while (_outgoing.size() > maximumQueuedMessages ||
           (_outgoingBytes > maximumQueuedBytes && _outgoing.size() > 1)) {
        _outgoingBytes -= _outgoing.front().size();
        _outgoing.pop_front();
        ++_dropped;
    }
}

bool LogChannel::sendQueued()
{
    while (!_outgoing.empty()) {
        const auto result = _clientPort->send(messageId, _outgoing.front(), noWaiting, noWaiting,
                                              RemotePort::Reply::NotWanted);
        if (result.error != PortError::success)
            return false;
        _outgoingBytes -= _outgoing.front().size();
        _outgoing.pop_front();
    }
    return true;
}

bool LogChannel::isWanted(ByteView message) const
{
    if (_wantsAllCodes)
        return true;
    const auto code = codeOf(message);
    return code && _wantedCodes.contains(*code);
}

void LogChannel::fetchNext()
{
    _next = _source->next();
}

void LogChannel::reportDrops()
{
    _ticksSinceReport = 0;
    if (_dropped == _droppedReported)
        return;
    _log.warning("Log channel for {}: the client does not keep up, {} messages dropped so far",
                 clientPortName(), _dropped);
    _droppedReported = _dropped;
}

} // namespace ventrik
