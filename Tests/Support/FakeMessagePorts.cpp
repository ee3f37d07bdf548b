#include "Tests/Support/FakeMessagePorts.h"

#include <utility>

namespace ventrik
{

FakeMessagePorts::FakeMessagePorts(MainQueue& queue, std::shared_ptr<OperationRecord> record)
    : _queue(queue), _record(std::move(record))
{
}

LocalPortCreation FakeMessagePorts::createLocalPort(std::string_view name, PortSenders senders,
                                                    LocalPort::DataCallback callback)
{
    if (auto error = std::exchange(_nextError, std::nullopt))
        return {nullptr, false, std::move(*error)};
    if (std::exchange(_nextIsTaken, false))
        return {nullptr, false, "taken", true};
    const bool mustExist = std::exchange(_nextExists, false);
    if (auto existing = localPort(name))
        return {std::move(existing), true, {}};
    auto port = makeLocalPort(name, senders, mustExist ? nullptr : std::move(callback));
    if (mustExist)
        _foreignPorts.push_back(port);
    return {std::move(port), mustExist, {}};
}

std::shared_ptr<FakeLocalPort> FakeMessagePorts::makeLocalPort(std::string_view name,
                                                               PortSenders senders,
                                                               LocalPort::DataCallback callback)
{
    auto port = std::make_shared<FakeLocalPort>(std::string(name), senders, std::move(callback),
                                                _queue, _record);
    _localPorts[std::string(name)] = port;
    return port;
}

std::shared_ptr<RemotePort> FakeMessagePorts::createRemotePort(std::string_view name)
{
    if (!_listeners.contains(name))
        return nullptr;
    auto port = std::make_shared<FakeRemotePort>(
        std::string(name),
        [script = _script](const RecordedSend& send) { return script->resultFor(send); }, _queue,
        _record);
    _remotePorts.push_back(port);
    return port;
}

void FakeMessagePorts::failNextLocalPort(std::string error)
{
    _nextError = std::move(error);
}

void FakeMessagePorts::reportNextLocalPortAsTaken()
{
    _nextIsTaken = true;
}

void FakeMessagePorts::reportNextLocalPortAsExisting()
{
    _nextExists = true;
}

std::shared_ptr<FakeLocalPort> FakeMessagePorts::localPort(std::string_view name) const
{
    const auto found = _localPorts.find(name);
    auto port = found == _localPorts.end() ? nullptr : found->second.lock();
    return port != nullptr && port->isValid() ? port : nullptr;
}

bool FakeMessagePorts::deliver(std::string_view name, std::int32_t id, Bytes data,
                               FakeLocalPort::ReplyHandler onReply, bool senderIsTrusted)
{
    const auto port = localPort(name);
    if (port == nullptr)
        return false;
    port->receive(id, std::move(data), std::move(onReply), senderIsTrusted);
    return true;
}

void FakeMessagePorts::listen(std::string_view name)
{
    _listeners.emplace(name);
}

void FakeMessagePorts::stopListening(std::string_view name)
{
    _listeners.erase(std::string(name));
}

void FakeMessagePorts::killRemote(std::string_view name)
{
    stopListening(name);
    for (const auto& port : remotePorts(name))
        port->peerHasGone();
}

std::vector<std::shared_ptr<FakeRemotePort>>
FakeMessagePorts::remotePorts(std::string_view name) const
{
    std::vector<std::shared_ptr<FakeRemotePort>> ports;
    for (const auto& weak : _remotePorts)
        if (auto port = weak.lock(); port != nullptr && port->isValid() && port->name() == name)
            ports.push_back(std::move(port));
    return ports;
}

void FakeMessagePorts::queueResult(SendResult result)
{
    _script->queued.push_back(std::move(result));
}

void FakeMessagePorts::setDefaultResult(SendResult result)
{
    _script->defaultResult = std::move(result);
}

void FakeMessagePorts::setSendHandler(SendHandler handler)
{
    _script->handler = std::move(handler);
}

const std::vector<RecordedSend>& FakeMessagePorts::sends() const
{
    return _script->sends;
}

void FakeMessagePorts::clearSends()
{
    _script->sends.clear();
}

FakeMessagePorts::SendResult FakeMessagePorts::Script::resultFor(const RecordedSend& send)
{
    sends.push_back(send);
    if (const SendHandler current = handler)
        if (auto result = current(send))
            return *result;
    return queued.empty() ? defaultResult : takeQueued();
}

FakeMessagePorts::SendResult FakeMessagePorts::Script::takeQueued()
{
    SendResult result = queued.front();
    queued.pop_front();
    return result;
}

} // namespace ventrik
