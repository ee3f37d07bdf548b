#pragma once

#include "Platform/MainQueue.h"
#include "Platform/MessagePorts.h"
#include "Tests/Support/OperationRecord.h"

#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace ventrik
{

/// A local port in memory; made by `FakeMessagePorts`. Dropping the last reference closes it
/// without running the invalidation callback.
class FakeLocalPort : public LocalPort, public std::enable_shared_from_this<FakeLocalPort>
{
  public:
    /// Takes what the receiver answered; nothing when it gave no reply.
    using ReplyHandler = std::function<void(const std::optional<Bytes>&)>;

    FakeLocalPort(std::string name, PortSenders senders, DataCallback callback, MainQueue& queue,
                  std::shared_ptr<OperationRecord> record);
    ~FakeLocalPort() override;

    const std::string& name() const override { return _name; }
    void deliverOnMainQueue() override;
    void setInvalidationCallback(InvalidationCallback callback) override;
    void invalidate() override;
    bool isValid() const override { return _isValid; }
    void expectStreamOf(ProcessNumber process) override { _streamProcess = process; }
    bool hasLostStream() const override { return _hasLostStream; }

    /// The process whose stream was expected; none before.
    std::optional<ProcessNumber> streamProcess() const { return _streamProcess; }
    void loseStream() { _hasLostStream = true; }
    PortSenders senders() const { return _senders; }
    bool isDelivering() const { return _isDelivering; }
    bool hasInvalidationCallback() const { return static_cast<bool>(_invalidationCallback); }

    /// Hands the message over in a task of the main queue, once delivery was asked for. A port that
    /// is invalid by then drops it.
    void receive(std::int32_t id, Bytes data, ReplyHandler onReply, bool senderIsTrusted);

  private:
    struct Message {
        std::int32_t id;
        Bytes data;
        ReplyHandler onReply;
        bool senderIsTrusted;
    };

    void queueNext();
    void handleNext();

    std::string _name;
    PortSenders _senders;
    DataCallback _callback;
    InvalidationCallback _invalidationCallback;
    MainQueue& _queue;
    std::shared_ptr<OperationRecord> _record;
    std::deque<Message> _inbox;
    bool _isDelivering = false;
    std::optional<ProcessNumber> _streamProcess;
    bool _hasLostStream = false;
    bool _isValid = true;
};

/// One message as it was sent to a fake remote port.
struct RecordedSend {
    std::string portName;
    std::int32_t id = 0;
    Bytes data;
    double sendTimeout = 0;    ///< seconds
    double receiveTimeout = 0; ///< seconds
    bool replyWanted = false;
};

/// A remote port in memory; made by `FakeMessagePorts`, which scripts its results.
class FakeRemotePort : public RemotePort, public std::enable_shared_from_this<FakeRemotePort>
{
  public:
    using Sender = std::function<SendResult(const RecordedSend&)>;

    FakeRemotePort(std::string name, Sender sender, MainQueue& queue,
                   std::shared_ptr<OperationRecord> record);
    ~FakeRemotePort() override;

    const std::string& name() const override { return _name; }
    /// A port that is not valid records nothing and gives `PortError::invalidPort`.
    SendResult send(std::int32_t id, ByteView data, Seconds sendTimeout, Seconds receiveTimeout,
                    Reply reply) override;
    void setInvalidationCallback(InvalidationCallback callback) override;
    void invalidate() override;
    bool isValid() const override { return _isValid; }
    static constexpr ProcessNumber processNumber = 4711;
    ProcessNumber process() const override { return processNumber; }

    bool hasInvalidationCallback() const { return static_cast<bool>(_invalidationCallback); }
    /// The peer has gone: the port is invalid at once, the callback follows on the main queue.
    void peerHasGone();

  private:
    void runInvalidationCallback();

    std::string _name;
    Sender _sender;
    InvalidationCallback _invalidationCallback;
    MainQueue& _queue;
    std::shared_ptr<OperationRecord> _record;
    bool _isValid = true;
};

} // namespace ventrik
