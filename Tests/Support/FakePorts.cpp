#include "Tests/Support/FakePorts.h"

#include <utility>

namespace ventrik
{

FakeLocalPort::FakeLocalPort(std::string name, PortSenders senders, DataCallback callback,
                             MainQueue& queue, std::shared_ptr<OperationRecord> record)
    : _name(std::move(name)),
      _senders(senders),
      _callback(std::move(callback)),
      _queue(queue),
      _record(std::move(record))
{
    _record->add("local created " + _name);
}

FakeLocalPort::~FakeLocalPort()
{
    _record->add("local released " + _name);
}

void FakeLocalPort::deliverOnMainQueue()
{
    if (!_isValid || _isDelivering)
        return;
    _isDelivering = true;
    _record->add("local delivering " + _name);
    for (std::size_t waiting = _inbox.size(); waiting > 0; --waiting)
        queueNext();
}

void FakeLocalPort::setInvalidationCallback(InvalidationCallback callback)
{
    _record->add((callback ? "local callback set " : "local callback cleared ") + _name);
    _invalidationCallback = std::move(callback);
}

void FakeLocalPort::invalidate()
{
    if (!_isValid)
        return;
    const auto self = shared_from_this(); // the callback may drop the last other reference
    _isValid = false;
    _inbox.clear();
    _record->add("local invalidated " + _name);
    if (const auto callback = std::exchange(_invalidationCallback, nullptr))
        callback();
}

void FakeLocalPort::receive(std::int32_t id, Bytes data, ReplyHandler onReply, bool senderIsTrusted)
{
    if (!_isValid)
        return;
    _inbox.push_back({id, std::move(data), std::move(onReply), senderIsTrusted});
    if (_isDelivering)
        queueNext();
}

void FakeLocalPort::queueNext()
{
    _queue.async([weak = weak_from_this()] {
        if (const auto port = weak.lock())
            port->handleNext();
    });
}

void FakeLocalPort::handleNext()
{
    if (_inbox.empty())
        return;
    const Message message = std::move(_inbox.front());
    _inbox.pop_front();
    const DataCallback callback = _callback;
    const auto reply =
        callback ? callback({message.id, message.data, message.senderIsTrusted}) : std::nullopt;
    if (message.onReply)
        message.onReply(reply);
}

FakeRemotePort::FakeRemotePort(std::string name, Sender sender, MainQueue& queue,
                               std::shared_ptr<OperationRecord> record)
    : _name(std::move(name)), _sender(std::move(sender)), _queue(queue), _record(std::move(record))
{
    _record->add("remote created " + _name);
}

FakeRemotePort::~FakeRemotePort()
{
    _record->add("remote released " + _name);
}

RemotePort::SendResult FakeRemotePort::send(std::int32_t id, ByteView data, Seconds sendTimeout,
                                            Seconds receiveTimeout, Reply reply)
{
    if (!_isValid)
        return {PortError::invalidPort, std::nullopt};
    const bool replyWanted = reply == Reply::Wanted;
    auto result = _sender({_name, id, Bytes(data.begin(), data.end()), sendTimeout.count(),
                           receiveTimeout.count(), replyWanted});
    if (!replyWanted)
        result.reply.reset();
    return result;
}

void FakeRemotePort::setInvalidationCallback(InvalidationCallback callback)
{
    _record->add((callback ? "remote callback set " : "remote callback cleared ") + _name);
    _invalidationCallback = std::move(callback);
}

void FakeRemotePort::invalidate()
{
    if (!_isValid)
        return;
    const auto self = shared_from_this(); // the callback may drop the last other reference
    _isValid = false;
    _record->add("remote invalidated " + _name);
    runInvalidationCallback();
}

void FakeRemotePort::peerHasGone()
{
    if (!_isValid)
        return;
    _isValid = false;
    _record->add("remote peer gone " + _name);
    _queue.async([weak = weak_from_this()] {
        if (const auto port = weak.lock())
            port->runInvalidationCallback();
    });
}

void FakeRemotePort::runInvalidationCallback()
{
    if (const auto callback = std::exchange(_invalidationCallback, nullptr))
        callback();
}

} // namespace ventrik
