#include "Platform/Linux/LinuxRemotePort.h"

#include <QTimer>

#include <utility>

#include <poll.h>

namespace ventrik
{

namespace
{

constexpr std::size_t chunkSize = 64 * 1024;

} // namespace

LinuxRemotePort::LinuxRemotePort(std::string name, FileDescriptor socket)
    : _name(std::move(name)),
      _socket(std::move(socket)),
      _reader(frameMaximumReply),
      _chunk(chunkSize)
{
    if (const auto peer = peerOf(_socket.get()))
        _process = peer->process;
    _readNotifier = makeNotifier(_socket.get(), QSocketNotifier::Read, [this] { readUnasked(); });
    _writeNotifier = makeNotifier(_socket.get(), QSocketNotifier::Write, [this] { writeRest(); });
    _writeNotifier->setEnabled(false);
}

LinuxRemotePort::~LinuxRemotePort()
{
    close();
}

RemotePort::SendResult LinuxRemotePort::send(std::int32_t id, ByteView data, Seconds sendTimeout,
                                             Seconds receiveTimeout, Reply reply)
{
    if (!_socket.isOpen())
        return {PortError::invalidPort, std::nullopt};
    if (data.size() > frameMaximumPayload)
        return {PortError::transportFault, std::nullopt};
    const auto self = shared_from_this();
    const FrameHeader header{static_cast<std::uint32_t>(data.size()), id,
                             reply == Reply::Wanted ? FrameFlag::wantsReply : 0, ++_lastSerial};
    const int error = sendFrame(header, data, Deadline(sendTimeout));
    if (error != PortError::success || reply == Reply::NotWanted)
        return {error, std::nullopt};
    return receiveReply(header.serial, Deadline(receiveTimeout));
}

int LinuxRemotePort::sendFrame(const FrameHeader& header, ByteView data, const Deadline& deadline)
{
    if (const int error = sendOutgoing(deadline); error != PortError::success)
        return error; // the rest of an earlier message goes first
    _outgoing.append(encodeFrameHeader(header));
    _outgoing.append(data);
    const int error = sendOutgoing(deadline);
    if (error != PortError::sendTimeout)
        return error;
    if (_outgoing.hasBegun())
        return PortError::success;
    _outgoing.clear();
    watchForRest();
    return error;
}

// Tries once at least, so that a time-out of 0 still sends where there is room.
int LinuxRemotePort::sendOutgoing(const Deadline& deadline)
{
    while (!_outgoing.empty()) {
        const IoStatus status = _outgoing.sendOnce(_socket.get());
        if (status == IoStatus::Closed) {
            const bool wasTaken = _outgoing.hasBegun();
            peerHasGone();
            return wasTaken ? PortError::transportFault : PortError::invalidPort;
        }
        if (_outgoing.empty())
            break;
        const bool timeIsUp = status == IoStatus::WouldBlock
                                  ? !waitForSocket(_socket.get(), POLLOUT, deadline)
                                  : deadline.hasPassed();
        if (timeIsUp) {
            watchForRest();
            return PortError::sendTimeout;
        }
    }
    _outgoing.clear();
    watchForRest();
    return PortError::success;
}

RemotePort::SendResult LinuxRemotePort::receiveReply(std::uint32_t serial, const Deadline& deadline)
{
    SendResult result;
    bool timeIsUp = false;
    while (true) {
        const ReplySearch search = findReply(serial, result);
        if (search == ReplySearch::Found)
            return result;
        if (search == ReplySearch::Malformed)
            break;
        const short events = _outgoing.empty() ? POLLIN : POLLIN | POLLOUT;
        if (timeIsUp || !waitForSocket(_socket.get(), events, deadline))
            return {PortError::receiveTimeout, std::nullopt};
        // A peer that keeps on sending other things must not hold us beyond the time.
        timeIsUp = deadline.hasPassed();
        if (receive() == IoStatus::Closed || _outgoing.sendOnce(_socket.get()) == IoStatus::Closed)
            break;
    }
    peerHasGone();
    return {PortError::transportFault, std::nullopt};
}

// Consumes what has come in, up to the reply to that message; replies that are too late for their
// senders are dropped on the way.
LinuxRemotePort::ReplySearch LinuxRemotePort::findReply(std::optional<std::uint32_t> serial,
                                                        SendResult& result)
{
    while (!_unread.empty()) {
        const auto status = _reader.consume(_unread);
        if (status == FrameReader::Status::NeedsMore)
            break;
        if (status == FrameReader::Status::Malformed)
            return ReplySearch::Malformed;
        const FrameHeader header = _reader.header();
        Bytes data = _reader.takePayload();
        if ((header.flags & FrameFlag::isReply) == 0)
            return ReplySearch::Malformed;
        if (header.serial != serial)
            continue;
        if ((header.flags & FrameFlag::replyHasNoData) == 0)
            result.reply = std::move(data);
        return ReplySearch::Found;
    }
    return ReplySearch::NotYet;
}

IoStatus LinuxRemotePort::receive()
{
    const IoResult result = receiveBytes(_socket.get(), _chunk);
    _unread = ByteView(_chunk).first(result.count);
    return result.status;
}

void LinuxRemotePort::watchForRest()
{
    _writeNotifier->setEnabled(!_outgoing.empty());
}

void LinuxRemotePort::writeRest()
{
    if (_outgoing.sendOnce(_socket.get()) == IoStatus::Closed)
        return peerHasGone();
    if (_outgoing.empty())
        _outgoing.clear();
    watchForRest();
}

// Outside of `send` only the peer's end and late replies come.
void LinuxRemotePort::readUnasked()
{
    SendResult ignored;
    if (findReply(std::nullopt, ignored) == ReplySearch::Malformed ||
        receive() == IoStatus::Closed || findReply(std::nullopt, ignored) == ReplySearch::Malformed)
        peerHasGone();
}

void LinuxRemotePort::peerHasGone()
{
    close();
    QTimer::singleShot(0, &_context, [this] {
        const auto self = shared_from_this();
        runInvalidationCallback();
    });
}

void LinuxRemotePort::setInvalidationCallback(InvalidationCallback callback)
{
    _invalidationCallback = std::move(callback);
}

void LinuxRemotePort::invalidate()
{
    if (!_socket.isOpen())
        return;
    const auto self = shared_from_this(); // the callback may drop the last other reference
    close();
    runInvalidationCallback();
}

bool LinuxRemotePort::isValid() const
{
    return _socket.isOpen() && !hasHungUp(_socket.get());
}

void LinuxRemotePort::close()
{
    _readNotifier.reset();
    _writeNotifier.reset();
    _socket.reset();
    _outgoing.clear();
}

void LinuxRemotePort::runInvalidationCallback()
{
    if (const auto callback = std::exchange(_invalidationCallback, nullptr))
        callback();
}

} // namespace ventrik
