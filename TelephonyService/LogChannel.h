#pragma once

#include "Platform/MainQueue.h"
#include "Platform/MessagePorts.h"
#include "Platform/SystemLog.h"
#include "TelephonyService/MessageSource.h"

#include <deque>
#include <functional>
#include <memory>
#include <string>

namespace ventrik
{

class LogChannel;

/// Sees what log channels stream.
class StreamObserver
{
  public:
    virtual ~StreamObserver() = default;
    /// The channel has a message for its client, which may be slow and lose it.
    virtual void messageStreams(const LogChannel& channel, ByteView message) = 0;
    virtual void streamEnds(const LogChannel& channel) = 0;
};

/// What a log channel serves: the technology's identifier and how to make its messages.
struct LogChannelContent {
    std::string technology;
    std::function<std::unique_ptr<MessageSource>()> makeSource;
    StreamObserver* observer = nullptr; ///< outlives the channels; null: nobody looks
};

/// The service's end of one log channel: answers "GetTechnology", takes the start command and then
/// streams the messages whose codes were asked for to the client's local port. "GetReport" asks it
/// for what became of the messages.
///
/// It never waits for a client: what a slow one does not take in time is kept up to a bound; above
/// that the oldest messages are dropped, counted, and the count is logged.
class LogChannel
{
  public:
    static constexpr std::size_t maximumQueuedMessages = 1000;
    static constexpr std::size_t maximumQueuedBytes = std::size_t{4} << 20;
    static constexpr std::chrono::milliseconds tickInterval{50};

    /// `clientPort` is the client's local port.
    LogChannel(MainQueue& queue, SystemLog& log, const LogChannelContent& content,
               std::shared_ptr<RemotePort> clientPort);
    ~LogChannel();
    LogChannel(const LogChannel&) = delete;
    LogChannel& operator=(const LogChannel&) = delete;

    const std::string& clientPortName() const { return _clientPort->name(); }
    bool isClientAlive() const { return _clientPort->isValid(); }

    /// Takes one command; the reply, where the command has one.
    std::optional<Bytes> handleCommand(ByteView command);

    std::size_t droppedCount() const { return _dropped; }

  private:
    PlistDictionary report() const;
    void startStreaming(const PlistDictionary& command);
    void tick();
    void takePushed(ByteView message);
    void queueDueMessages();
    void streamUnpaced();
    bool isWanted(ByteView message);
    void enqueue(Bytes message);
    /// False when the client takes no more for now.
    bool sendQueued();
    void fetchNext();
    void reportDrops();

    MainQueue& _queue;
    SystemLog& _log;
    const LogChannelContent& _content;
    std::shared_ptr<RemotePort> _clientPort;

    WantedCodes _wanted;
    std::unique_ptr<MessageSource> _source;
    std::optional<TimedMessage> _next;
    std::unique_ptr<RepeatingTimer> _timer;
    std::chrono::nanoseconds _elapsed{};

    std::deque<Bytes> _outgoing;
    std::size_t _outgoingBytes = 0;
    std::size_t _sent = 0;
    std::size_t _unwanted = 0;
    std::size_t _dropped = 0;
    std::size_t _droppedReported = 0;
    int _ticksSinceReport = 0;
};

} // namespace ventrik
