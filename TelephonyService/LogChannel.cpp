#include "TelephonyService/LogChannel.h"

#include "Platform/TelephonyProtocol.h"
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

} // namespace

LogChannel::LogChannel(MainQueue& queue, SystemLog& log, const LogChannelContent& content,
                       std::shared_ptr<RemotePort> clientPort)
    : _queue(queue), _log(log), _content(content), _clientPort(std::move(clientPort))
{
}

LogChannel::~LogChannel()
{
    if (_content.observer)
        _content.observer->streamEnds(*this);
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
    if (dictionary->contains(TelephonyProtocol::reportCommand))
        return propertyListBytes(PlistDictionary{{TelephonyProtocol::reportCommand, report()}});
    const PlistValue* state = dictionary->find("SetState");
    if (state && *state == "Streaming")
        startStreaming(*dictionary);
    else
        _log.error("Log channel for {}: an unknown command", clientPortName());
    return std::nullopt;
}

PlistDictionary LogChannel::report() const
{
    PlistDictionary report = _source ? _source->report() : PlistDictionary();
    report.set("Messages Sent", fmt::format("{}", _sent));
    report.set("Messages Not Asked For", fmt::format("{}", _unwanted));
    report.set("Messages Dropped by the Service", fmt::format("{}", _dropped));
    return report;
}

void LogChannel::startStreaming(const PlistDictionary& command)
{
    _wanted = WantedCodes(command);
    _timer.reset();
    _source = _content.makeSource(); // and the last one's streaming has stopped
    if (!_source)
        return;
    _source->start(_wanted, [this](ByteView message) { takePushed(message); });
    _elapsed = {};
    fetchNext();
    _timer =
        _queue.repeatEvery(_source->isPaced() ? tickInterval : unpacedInterval, [this] { tick(); });
    _log.warning("Log channel for {}: streaming {} codes", clientPortName(),
                 _wanted.codes().size());
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

// While something waits, the client has just refused it, and has its next chance at the next tick.
void LogChannel::takePushed(ByteView message)
{
    if (!isWanted(message))
        return;
    const bool isFirst = _outgoing.empty();
    enqueue(Bytes(message.begin(), message.end()));
    if (isFirst)
        sendQueued();
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

bool LogChannel::isWanted(ByteView message)
{
    const bool isWanted = _wanted.wants(message);
    _unwanted += isWanted ? 0 : 1;
    return isWanted;
}

void LogChannel::enqueue(Bytes message)
{
    if (_content.observer)
        _content.observer->messageStreams(*this, message);
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
        ++_sent;
        _outgoingBytes -= _outgoing.front().size();
        _outgoing.pop_front();
    }
    return true;
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
