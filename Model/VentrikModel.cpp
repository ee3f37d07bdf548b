#include "Model/VentrikModel.h"

#include "Model/LayoutWarnings.h"
#include "Packets/Plausibility.h"
#include "Platform/Technology.h"
#include "Platform/TelephonyProtocol.h"
#include "PropertyList/PropertyListReader.h"
#include "PropertyList/PropertyListWriter.h"

#include <fmt/format.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

constexpr std::int32_t messageId = 0;
constexpr RemotePort::Seconds sendTimeout{1.0};
constexpr RemotePort::Seconds receiveTimeout{1.0};
constexpr RemotePort::Seconds noReceiveTimeout{0.0};
constexpr RemotePort::Seconds reportTimeout{0.1}; // nothing depends on it, and the screens wait
constexpr auto refreshInterval = 2s;
constexpr auto retryDelay = 5s;

ChannelFault faultOfSend(int error)
{
    return error == PortError::invalidPort ? ChannelFault::NoService : ChannelFault::NoAnswer;
}

// What kept the service from opening a channel, or us from understanding that it did.
ChannelFault faultOfRequest(const TelephonyError& error)
{
    using namespace TelephonyProtocol;
    if (error.domain != clientErrorDomain)
        return ChannelFault::Refused;
    return error.code == ClientError::answerNotUnderstood ? ChannelFault::BadAnswer
                                                          : ChannelFault::NoAnswer;
}

} // namespace

std::string_view channelFaultText(ChannelFault fault)
{
    switch (fault) {
    case ChannelFault::None:
        return "";
    case ChannelFault::NoPort:
        return "the viewer's port cannot be made";
    case ChannelFault::PortTaken:
        return "another viewer holds the port";
    case ChannelFault::NoService:
        return "no service";
    case ChannelFault::NoAnswer:
        return "the service does not answer";
    case ChannelFault::BadAnswer:
        return "the service's answer is not understood";
    case ChannelFault::Refused:
        return "the service refuses a channel";
    case ChannelFault::NoTechnology:
        return "the service speaks no known technology";
    }
    return "";
}

VentrikModel::VentrikModel(const Platform& platform, UpdateCallback updateScreens,
                           GeneratorFactory makeGenerator)
    : _platform(platform),
      _updateScreens(std::move(updateScreens)),
      _makeGenerator(std::move(makeGenerator))
{
}

VentrikModel::~VentrikModel()
{
    destroyPorts();
    tellObservers(nullptr, {});
}

bool VentrikModel::isConnected() const
{
    return _recvPort && _sendPort;
}

bool VentrikModel::createPorts()
{
    return createLocalPort() && createRemotePort();
}

bool VentrikModel::createLocalPort()
{
    auto creation =
        _platform.ports.createLocalPort(logChannelLocalPortName, PortSenders::SameUser,
                                        [this](const PortMessage& message) -> std::optional<Bytes> {
                                            if (message.id == messageId)
                                                updateWithData(message.data);
                                            return std::nullopt;
                                        });
    _recvPort = std::move(creation.port);
    if (!_recvPort) {
        setFault(creation.nameIsTaken ? ChannelFault::PortTaken : ChannelFault::NoPort);
        _platform.log.error("Could not create local message port");
        return false;
    }
    if (creation.alreadyExists) {
        setFault(ChannelFault::PortTaken);
        _platform.log.error("Local messsage port already exists");
        return false;
    }
    _recvPort->deliverOnMainQueue();
    _recvPort->setInvalidationCallback([this] { localPortInvalidated(); });
    return true;
}

bool VentrikModel::createRemotePort()
{
    auto connection = _platform.telephony.createServerConnection([this] { refresh(); });
    if (!connection) {
        setFault(ChannelFault::NoService);
        _platform.log.error("Could not create QXServerConnection");
        return false;
    }
    const LogChannelCreation channel =
        connection->networkMonitorCreateLogChannel(logChannelLocalPortName);
    connection.reset();
    if (channel.error.code != 0) {
        setFault(faultOfRequest(channel.error));
        _platform.log.error("_QXServerConnectionNetworkMonitorCreateLogChannel returns error: {}!",
                            channel.error.code);
        return false;
    }
    if (!channel.remotePortName || channel.remotePortName->empty()) {
        setFault(ChannelFault::BadAnswer);
        _platform.log.error("Could not create a log channel (QX returned null port)!");
        return false;
    }
    _sendPort = _platform.ports.createRemotePort(*channel.remotePortName);
    if (!_sendPort) {
        setFault(ChannelFault::NoAnswer);
        _platform.log.error("Could not create the remote port!");
        return false;
    }
    _recvPort->expectStreamOf(_sendPort->process());
    _answersReports = true;
    _platform.log.error(" ***** Created ports (send={}, recv={})", fmt::ptr(_sendPort.get()),
                        fmt::ptr(_recvPort.get()));
    return true;
}

void VentrikModel::localPortInvalidated()
{
    _platform.log.error(" ***** INVALIDATED {} *****", fmt::ptr(_recvPort.get()));
    _lastTrouble = {_platform.clock.now(), "the channel was lost"};
    restartMonitor();
}

void VentrikModel::destroyPorts()
{
    _connectedSince.reset();
    _displayUpdateTimer.reset();
    // The callbacks go first, so that tearing down never looks like a lost channel.
    if (_recvPort) {
        _recvPort->setInvalidationCallback({});
        _recvPort->invalidate();
        _recvPort.reset();
    }
    if (_sendPort) {
        _sendPort->setInvalidationCallback({});
        _sendPort->invalidate();
        _sendPort.reset();
    }
}

void VentrikModel::configureGenerator()
{
    setFault(ChannelFault::NoAnswer);
    const auto command = propertyListBytes(PlistDictionary{{"GetTechnology", "GetTechnology"}});
    if (!command) {
        _platform.log.error(" Could not generate GetTechnology command; cannot configure");
        return;
    }
    const auto result = sendCommand(*command, receiveTimeout, RemotePort::Reply::Wanted);
    if (result.error != PortError::success) {
        setFault(faultOfSend(result.error));
        _platform.log.error(" ***** Could not send the GetTechnology command (got error={})",
                            result.error);
        return;
    }
    if (!result.reply) {
        _platform.log.error(" ***** No response to GetTechnology; cannot configure");
        return;
    }
    setFault(ChannelFault::BadAnswer);
    const auto answer = readPropertyList(*result.reply);
    if (!answer) {
        _platform.log.error(" ***** Could not parse reply to GetTechnology; cannot configure");
        return;
    }
    const PlistDictionary* dictionary = answer.value->dictionary();
    const PlistValue* technology = dictionary ? dictionary->find("GetTechnology") : nullptr;
    if (!technology) {
        _platform.log.error(" ***** Reply to GetTechnology had no answer; cannot configure");
        return;
    }
    setFault(ChannelFault::NoTechnology);
    tellObservers(nullptr, {});
    _logGenerator =
        _makeGenerator(*technology, {_platform.log, _platform.resources, _platform.clock});
    if (const auto known = technologyOfIdentifier(*technology); known && _logGenerator) {
        _technologyName = known->displayName;
        tellObservers(_logGenerator.get(), known->name);
    }
    _platform.log.error("Got log generated: {}", fmt::ptr(_logGenerator.get()));
}

void VentrikModel::tellObservers(const LogGenerator* generator, std::string_view technology)
{
    for (MessageObserver* observer : _observers)
        observer->useGenerator(generator, technology);
}

void VentrikModel::startMonitor()
{
    if (_displayUpdateTimer)
        return;
    if (!createPorts()) {
        _platform.log.error("Could not create the ports necessary");
        return retryLater();
    }
    // A failed configuration leaves an earlier generator in place, which then goes on.
    configureGenerator();
    if (!_logGenerator) {
        _platform.log.error("No log generator technology works");
        return retryLater();
    }
    if (!sendStartCommand())
        return retryLater();
    _platform.log.error("Starting the display update timer");
    _displayUpdateTimer = _platform.mainQueue.repeatEvery(refreshInterval, [this] { refresh(); });
    setFault(ChannelFault::None);
    ++_timesOpened;
    publishChannelState();
}

RemotePort::SendResult VentrikModel::sendCommand(const Bytes& command,
                                                 RemotePort::Seconds replyTimeout,
                                                 RemotePort::Reply reply)
{
    if (!_sendPort)
        return {PortError::invalidPort, std::nullopt};
    return _sendPort->send(messageId, command, sendTimeout, replyTimeout, reply);
}

bool VentrikModel::sendStartCommand()
{
    const auto command = propertyListBytes(_logGenerator->getStartCommand());
    if (!command) {
        _platform.log.error(" Could not generate PLIST");
        return false;
    }
    const auto result = sendCommand(*command, noReceiveTimeout, RemotePort::Reply::NotWanted);
    setFault(faultOfSend(result.error));
    if (result.error != PortError::success)
        _platform.log.error(" ***** Could not send the START command (got error={})", result.error);
    return result.error == PortError::success;
}

std::optional<PlistDictionary> VentrikModel::askServiceReport()
{
    using TelephonyProtocol::reportCommand;
    if (!_sendPort || !_answersReports)
        return std::nullopt;
    const auto command = propertyListBytes(PlistDictionary{{reportCommand, reportCommand}});
    const auto result = _sendPort->send(messageId, *command, reportTimeout, reportTimeout,
                                        RemotePort::Reply::Wanted);
    const auto answer = result.reply ? readPropertyList(*result.reply) : PropertyListReading();
    const PlistDictionary* dictionary = answer ? answer.value->dictionary() : nullptr;
    const PlistValue* report = dictionary ? dictionary->find(reportCommand) : nullptr;
    _answersReports = report && report->dictionary();
    return _answersReports ? std::optional(*report->dictionary()) : std::nullopt;
}

void VentrikModel::retryLater()
{
    destroyPorts();
    _lastTrouble = {_platform.clock.now(), std::string(channelFaultText(_attemptFault))};
    publishChannelState();
    _platform.mainQueue.after(retryDelay, guarded(&VentrikModel::startMonitor));
}

void VentrikModel::publishChannelState()
{
    const bool isOpen = isConnected();
    if (isOpen && !_connectedSince)
        _connectedSince = _platform.clock.now();
    if (isOpen == _wasConnected && _attemptFault == _channelFault)
        return;
    _wasConnected = isOpen;
    _channelFault = _attemptFault;
    _platform.mainQueue.async([alive = std::weak_ptr(_alive), this] {
        if (alive.lock() && _channelCallback)
            _channelCallback();
    });
}

void VentrikModel::setChannelCallback(std::function<void()> callback)
{
    _channelCallback = std::move(callback);
}

std::string VentrikModel::displayFault() const
{
    return _logGenerator ? _logGenerator->displayFault() : std::string();
}

void VentrikModel::restartMonitor()
{
    destroyPorts();
    startMonitor();
}

void VentrikModel::refresh()
{
    // The stream is as much a part of the channel as the port that takes its commands.
    if (_recvPort && _sendPort && (!_sendPort->isValid() || _recvPort->hasLostStream())) {
        // Restarts the monitor there and then, which lets go of the port while it still runs.
        const auto port = _recvPort;
        port->invalidate();
    }
    if (!_updated)
        return;
    _updated = false;
    _nodes.reset();
    _nodesByPath.reset();
    if (_updateScreens)
        _platform.mainQueue.async([alive = std::weak_ptr(_alive), this] {
            if (alive.lock())
                _updateScreens();
        });
}

ModelNodePointer VentrikModel::topLevelNodes()
{
    if (_nodes || !_logGenerator)
        return _nodes;
    const auto display = _logGenerator->generateLogUsingState(_state);
    _nodesByPath.emplace();
    _nodes = VentrikModelNode::makeTreeFromObject(display ? &*display : nullptr, *_nodesByPath);
    return _nodes;
}

ModelNodePointer VentrikModel::nodeAtPath(const std::string& path)
{
    if (!_nodesByPath)
        topLevelNodes();
    return _nodesByPath ? _nodesByPath->find(path) : nullptr;
}

std::string_view VentrikModel::doubtAt(const std::string& path) const
{
    const ModelNodePointer node = _nodesByPath ? _nodesByPath->find(path) : nullptr;
    if (!node || !node->value() || !_logGenerator)
        return {};
    if (node->date())
        return doubtOf(*node->date());
    const auto origin = _logGenerator->originOf(_state, _nodesByPath->keysOf(path));
    return origin ? doubtOfShown(*origin->field, origin->raw, *node->value()) : std::string_view();
}

std::vector<std::string> VentrikModel::layoutWarningsAt(const std::string& path) const
{
    if (!_nodesByPath || !_logGenerator)
        return {};
    return layoutWarnings(_logGenerator->layoutsAt(_state, _nodesByPath->keysOf(path)));
}

void VentrikModel::updateWithData(ByteView data)
{
    if (_logGenerator)
        _logGenerator->updateState(_state, data);
    _updated = true;
    _lastMessageTime = _platform.clock.now();
    if (_logGenerator)
        for (MessageObserver* observer : _observers)
            observer->messageTaken(*_lastMessageTime, data, _state);
}

std::optional<PlistValue> VentrikModel::getSaveContents() const
{
    if (!_logGenerator)
        return std::nullopt;
    return _logGenerator->getSaveContentsFromState(_state);
}

MainQueue::Task VentrikModel::guarded(void (VentrikModel::*operation)())
{
    return [alive = std::weak_ptr(_alive), this, operation] {
        if (alive.lock())
            (this->*operation)();
    };
}

} // namespace ventrik
