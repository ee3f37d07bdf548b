#include "Platform/Linux/PortConnection.h"

#include <utility>

#include <poll.h>

namespace ventrik
{

namespace
{

constexpr std::size_t chunkSize = 64 * 1024;
constexpr int readsPerTurn = 16;
constexpr int messagesPerTurn = 64;
// A peer that lets more replies than this pile up does not read them.
constexpr std::size_t maximumOutgoing = 16 * frameMaximumReply;
constexpr std::chrono::seconds longestStall{5};

} // namespace

PortConnection::PortConnection(FileDescriptor socket, Peer peer, bool peerIsTrusted,
                               Handlers handlers)
    : _socket(std::move(socket)),
      _peer(peer),
      _peerIsTrusted(peerIsTrusted),
      _handlers(std::move(handlers)),
      _chunk(chunkSize)
{
    // A timer, not a posted event: posted events that post the next one keep everything else out.
    _nextTurn.setSingleShot(true);
    QObject::connect(&_nextTurn, &QTimer::timeout, [this] { readTurn(); });
    _stall.setSingleShot(true);
    _stall.setTimerType(Qt::PreciseTimer);
    QObject::connect(&_stall, &QTimer::timeout, [this] { checkStall(); });
}

PortConnection::~PortConnection()
{
    close();
}

void PortConnection::startReading()
{
    if (!isOpen() || _readNotifier != nullptr)
        return;
    _readNotifier = makeNotifier(_socket.get(), QSocketNotifier::Read, [this] { readTurn(); });
    _writeNotifier = makeNotifier(_socket.get(), QSocketNotifier::Write, [this] { flush(); });
    _writeNotifier->setEnabled(false);
}

void PortConnection::close()
{
    _nextTurn.stop();
    _stall.stop();
    _readNotifier.reset();
    _writeNotifier.reset();
    _socket.reset();
}

void PortConnection::readTurn()
{
    const auto self = shared_from_this();
    if (!isOpen())
        return;
    // A message's receiver may run a nested event loop: no second turn may begin there.
    _readNotifier->setEnabled(false);
    const bool hasMore = readAndHandle();
    if (!isOpen())
        return;
    if (hasMore)
        _nextTurn.start(0);
    else
        _readNotifier->setEnabled(true);
    watchForStall();
}

// Called when something was read.
void PortConnection::watchForStall()
{
    if (_reader.isWithinFrame())
        _stall.start(longestStall);
    else
        _stall.stop();
}

// Where we were held up ourselves, the rest may be waiting to be read.
void PortConnection::checkStall()
{
    if (waitForSocket(_socket.get(), POLLIN, Deadline(std::chrono::seconds(0))))
        _stall.start(longestStall);
    else
        end("it stalled within a message");
}

// True when the turn's share of messages is used up while more of them wait.
bool PortConnection::readAndHandle()
{
    int messages = 0;
    int reads = 0;
    while (isOpen()) {
        if (_unread.empty() && (reads++ == readsPerTurn || !receive()))
            return false;
        switch (_reader.consume(_unread)) {
        case FrameReader::Status::NeedsMore:
            break;
        case FrameReader::Status::Malformed:
            end("it sent a malformed message header");
            return false;
        case FrameReader::Status::HasFrame:
            handleFrame();
            if (++messages == messagesPerTurn && !_unread.empty())
                return true;
        }
    }
    return false;
}

bool PortConnection::receive()
{
    const IoResult result = receiveBytes(_socket.get(), _chunk);
    if (result.status == IoStatus::Closed)
        end({});
    _unread = ByteView(_chunk).first(result.count);
    _hasSent |= result.count > 0;
    return result.status == IoStatus::Done;
}

void PortConnection::handleFrame()
{
    const FrameHeader header = _reader.header();
    const Bytes data = _reader.takePayload();
    _hasSentMessage = true;
    _lastMessageTime = std::chrono::steady_clock::now();
    if ((header.flags & FrameFlag::isReply) != 0)
        return end("it sent a reply that nobody asked for");
    auto answer = _handlers.onMessage({header.id, data, _peerIsTrusted});
    if (isOpen() && (header.flags & FrameFlag::wantsReply) != 0)
        reply(header.serial, std::move(answer));
}

void PortConnection::reply(std::uint32_t serial, std::optional<Bytes> data)
{
    if (data && data->size() > frameMaximumReply)
        data.reset(); // the sender would take it for a fault of the line
    FrameHeader header{0, 0, FrameFlag::isReply, serial};
    if (data)
        header.length = static_cast<std::uint32_t>(data->size());
    else
        header.flags |= FrameFlag::replyHasNoData;
    if (_outgoing.size() + frameHeaderSize + header.length > maximumOutgoing)
        return end("it does not read its replies");
    _outgoing.append(encodeFrameHeader(header));
    if (data)
        _outgoing.append(*data);
    flush();
}

void PortConnection::flush()
{
    const IoStatus status = _outgoing.sendOnce(_socket.get());
    if (status == IoStatus::Closed)
        return end({});
    if (_outgoing.empty())
        _outgoing.clear();
    _writeNotifier->setEnabled(!_outgoing.empty());
}

void PortConnection::end(std::string_view reason)
{
    const auto self = shared_from_this();
    close();
    _handlers.onEnd(*this, reason);
}

} // namespace ventrik
