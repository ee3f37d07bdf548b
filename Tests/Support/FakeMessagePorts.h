#pragma once

#include "Platform/MessagePorts.h"
#include "Tests/Support/FakePorts.h"
#include "Tests/Support/OperationRecord.h"

#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// Message ports in memory, with faults on demand and a record of what was done. The queue must
/// outlive the ports.
///
/// Operations are recorded as "local created NAME", "local delivering NAME", "local callback set
/// NAME", "local callback cleared NAME", "local invalidated NAME", "local released NAME" and, for
/// remote ports, the same with "remote" (no "delivering") and "remote peer gone NAME".
class FakeMessagePorts : public MessagePorts
{
  public:
    using SendResult = RemotePort::SendResult;
    /// Gives the result of a send, or none to leave it to the queued results and the default.
    using SendHandler = std::function<std::optional<SendResult>(const RecordedSend&)>;

    explicit FakeMessagePorts(MainQueue& queue, std::shared_ptr<OperationRecord> record =
                                                    std::make_shared<OperationRecord>());

    /// The creation of a name that a live port has gives that port, with `alreadyExists`.
    LocalPortCreation createLocalPort(std::string_view name, PortSenders senders,
                                      LocalPort::DataCallback callback) override;
    /// Only for names that were `listen`ed on.
    std::shared_ptr<RemotePort> createRemotePort(std::string_view name) override;

    // Local ports.
    /// The next creation of a local port gives none and this error.
    void failNextLocalPort(std::string error = "no local port on demand");
    /// The next creation finds its name taken by another process.
    void reportNextLocalPortAsTaken();
    /// The next creation finds its name taken in this process: by the live port of that name, or
    /// by one that stands for somebody else's and that these ports then keep.
    void reportNextLocalPortAsExisting();
    /// The live local port of that name, or null.
    std::shared_ptr<FakeLocalPort> localPort(std::string_view name) const;
    /// Sends a message to the live local port of that name: it is handed over by the queue once
    /// delivery was asked for, and the handler then takes the answer. False when there is no port.
    bool deliver(std::string_view name, std::int32_t id, Bytes data,
                 FakeLocalPort::ReplyHandler onReply = {}, bool senderIsTrusted = true);

    // Remote ports.
    void listen(std::string_view name);
    void stopListening(std::string_view name);
    /// The peer dies: nobody listens any more, the live remote ports of that name turn invalid and
    /// their invalidation callbacks are queued.
    void killRemote(std::string_view name);
    /// The live and valid remote ports of that name, oldest first.
    std::vector<std::shared_ptr<FakeRemotePort>> remotePorts(std::string_view name) const;

    // What sends give: the handler's result, else the first of the queued ones, else the default.
    void queueResult(SendResult result);
    void queueError(int error) { queueResult({error, std::nullopt}); }
    void queueReply(Bytes reply) { queueResult({PortError::success, std::move(reply)}); }
    /// Success without a reply at first.
    void setDefaultResult(SendResult result);
    void setSendHandler(SendHandler handler);

    /// Every message that was sent through a valid remote port, whatever its result.
    const std::vector<RecordedSend>& sends() const;
    void clearSends();
    const std::vector<std::string>& operations() const { return _record->operations(); }
    void clearOperations() { _record->clear(); }

  private:
    // Shared with the remote ports, which may outlive these ports.
    struct Script {
        std::vector<RecordedSend> sends;
        std::deque<SendResult> queued;
        SendResult defaultResult;
        SendHandler handler;

        SendResult resultFor(const RecordedSend& send);
        SendResult takeQueued();
    };

    std::shared_ptr<FakeLocalPort> makeLocalPort(std::string_view name, PortSenders senders,
                                                 LocalPort::DataCallback callback);

    MainQueue& _queue;
    std::shared_ptr<OperationRecord> _record;
    std::shared_ptr<Script> _script = std::make_shared<Script>();
    std::map<std::string, std::weak_ptr<FakeLocalPort>, std::less<>> _localPorts;
    std::vector<std::shared_ptr<FakeLocalPort>> _foreignPorts;
    std::vector<std::weak_ptr<FakeRemotePort>> _remotePorts;
    std::set<std::string, std::less<>> _listeners;
    std::optional<std::string> _nextError;
    bool _nextIsTaken = false;
    bool _nextExists = false;
};

} // namespace ventrik
