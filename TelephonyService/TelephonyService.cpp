#include "TelephonyService/TelephonyService.h"

#include "Platform/TelephonyConstants.h"
#include "Platform/TelephonyProtocol.h"
#include "PropertyList/PropertyListReader.h"
#include "PropertyList/PropertyListWriter.h"

#include <cerrno>

namespace ventrik
{

namespace
{

constexpr std::int32_t serviceErrorDomain = 2; // the codes are the system's error numbers
constexpr std::size_t maximumChannels = 64;

PlistDictionary refusal(int code)
{
    return {{TelephonyProtocol::errorDomainKey, serviceErrorDomain},
            {TelephonyProtocol::errorCodeKey, code}};
}

std::string channelPortPrefix()
{
    return fmt::format("{}.LogChannel.", telephonyServicePortName);
}

bool isOwnPort(const std::string& name)
{
    return name == telephonyServicePortName || name.starts_with(channelPortPrefix());
}

} // namespace

TelephonyService::TelephonyService(MainQueue& queue, MessagePorts& ports, SystemLog& log,
                                   LogChannelContent content)
    : _queue(queue), _ports(ports), _log(log), _content(std::move(content))
{
}

TelephonyService::~TelephonyService()
{
    if (_servicePort)
        _servicePort->invalidate();
    while (!_channels.empty())
        closeChannel(_channels.begin()->first);
}

bool TelephonyService::start(std::string& error)
{
    auto creation = _ports.createLocalPort(
        telephonyServicePortName, PortSenders::AnyUser,
        [this](const PortMessage& message) { return handleRequest(message); });
    if (!creation.port || creation.alreadyExists) {
        error = creation.error.empty() ? "the service's port exists already" : creation.error;
        return false;
    }
    _servicePort = std::move(creation.port);
    _servicePort->deliverOnMainQueue();
    return true;
}

std::optional<Bytes> TelephonyService::handleRequest(const PortMessage& message)
{
    return propertyListBytes(openChannel(message));
}

PlistDictionary TelephonyService::openChannel(const PortMessage& message)
{
    if (!message.senderIsTrusted) {
        _log.error("Refused a log channel to a caller of another user");
        return refusal(EPERM);
    }
    const auto request = readPropertyList(message.data);
    const PlistDictionary* dictionary = request ? request.value->dictionary() : nullptr;
    const PlistValue* command =
        dictionary ? dictionary->find(TelephonyProtocol::commandKey) : nullptr;
    const PlistValue* localPort =
        dictionary ? dictionary->find(TelephonyProtocol::localPortKey) : nullptr;
    if (!command || !(*command == TelephonyProtocol::createLogChannelCommand) || !localPort ||
        !localPort->string()) {
        _log.error("Refused a request that is not understood");
        return refusal(EINVAL);
    }
    return openChannelFor(*localPort->string());
}

PlistDictionary TelephonyService::openChannelFor(const std::string& clientPortName)
{
    // What we streamed to a port of ours would come back to us as commands.
    if (isOwnPort(clientPortName)) {
        _log.error("Refused a log channel for {}: that is a port of the service", clientPortName);
        return refusal(EINVAL);
    }
    // A client that comes again has lost its earlier channel.
    closeChannelsOf(clientPortName);
    if (_channels.size() >= maximumChannels) {
        _log.error("Refused a log channel for {}: {} are open", clientPortName, _channels.size());
        return refusal(EMFILE);
    }
    auto clientPort = _ports.createRemotePort(clientPortName);
    if (!clientPort) {
        _log.error("Refused a log channel for {}: nobody listens there", clientPortName);
        return refusal(ENOENT);
    }

    const std::uint64_t number = _nextNumber++;
    clientPort->setInvalidationCallback([this, number, alive = std::weak_ptr(_alive)] {
        // Not at once: the port must not be let go of while it tells of its end.
        _queue.async([this, number, alive] {
            if (alive.lock())
                closeChannel(number);
        });
    });
    auto stream = std::make_unique<LogChannel>(_queue, _log, _content, std::move(clientPort));
    auto creation = _ports.createLocalPort(fmt::format("{}{}", channelPortPrefix(), number),
                                           PortSenders::SameUser,
                                           [channel = stream.get()](const PortMessage& message) {
                                               return channel->handleCommand(message.data);
                                           });
    if (!creation.port || creation.alreadyExists) {
        _log.error("Refused a log channel for {}: {}", clientPortName, creation.error);
        return refusal(EADDRINUSE);
    }
    creation.port->deliverOnMainQueue();
    const std::string name = creation.port->name();
    _channels.emplace(number, Channel{std::move(creation.port), std::move(stream)});
    _log.warning("Opened the log channel {} for {}", name, clientPortName);
    return {{TelephonyProtocol::errorDomainKey, 0},
            {TelephonyProtocol::errorCodeKey, 0},
            {TelephonyProtocol::remotePortKey, name}};
}

void TelephonyService::closeChannel(std::uint64_t number)
{
    const auto entry = _channels.find(number);
    if (entry == _channels.end())
        return;
    const Channel channel = std::move(entry->second);
    _channels.erase(entry);
    _log.warning("Closed the log channel {} for {}", channel.commandPort->name(),
                 channel.stream->clientPortName());
    channel.commandPort->invalidate();
}

void TelephonyService::closeChannelsOf(const std::string& clientPortName)
{
    std::vector<std::uint64_t> numbers;
    for (const auto& [number, channel] : _channels)
        if (channel.stream->clientPortName() == clientPortName)
            numbers.push_back(number);
    for (const std::uint64_t number : numbers)
        closeChannel(number);
}

} // namespace ventrik
