#include "Model/VentrikModel.h"

#include "Platform/TelephonyConstants.h"
#include "PropertyList/PropertyListReader.h"
#include "PropertyList/PropertyListWriter.h"

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

constexpr std::int32_t messageId = 0;
constexpr RemotePort::Seconds sendTimeout{1.0};
constexpr RemotePort::Seconds receiveTimeout{1.0};
constexpr RemotePort::Seconds noReceiveTimeout{0.0};
constexpr auto refreshInterval = 2s;
constexpr auto retryDelay = 5s;

std::optional<Bytes> serialized(const PlistValue& command)
{
    const auto writing = writeXmlPropertyList(command);
    if (!writing)
        return std::nullopt;
    return Bytes(writing.text->begin(), writing.text->end());
}

} // namespace

VentrikModel::VentrikModel(const Platform& platform, UpdateCallback updateScreens)
    : _platform(platform), _updateScreens(std::move(updateScreens))
{
}

VentrikModel::~VentrikModel()
{
    destroyPorts();
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
        _platform.log.error("Could not create local message port");
        return false;
    }
    if (creation.alreadyExists) {
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
        _platform.log.error("Could not create QXServerConnection");
        return false;
    }
    const LogChannelCreation channel =
        connection->networkMonitorCreateLogChannel(logChannelLocalPortName);
    connection.reset();
    if (channel.error.code != 0) {
        _platform.log.error("_QXServerConnectionNetworkMonitorCreateLogChannel returns error: {}!",
                            channel.error.code);
        return false;
    }
    if (!channel.remotePortName || channel.remotePortName->empty()) {
        _platform.log.error("Could not create a log channel (QX returned null port)!");
        return false;
    }
    _sendPort = _platform.ports.createRemotePort(*channel.remotePortName);
    if (!_sendPort) {
        _platform.log.error("Could not create the remote port!");
        return false;
    }
    _platform.log.error(" ***** Created ports (send={}, recv={})", fmt::ptr(_sendPort.get()),
                        fmt::ptr(_recvPort.get()));
    return true;
}

void VentrikModel::localPortInvalidated()
{
    _platform.log.error(" ***** INVALIDATED {} *****", fmt::ptr(_recvPort.get()));
    restartMonitor();
}

void VentrikModel::destroyPorts()
{
    if (_displayUpdateTimer) {
        _displayUpdateTimer->stop();
        _displayUpdateTimer.reset();
    }
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
    const auto command = serialized(PlistDictionary{{"GetTechnology", "GetTechnology"}});
    if (!command) {
        _platform.log.error(" Could not generate GetTechnology command; cannot configure");
        return;
    }
    const auto result = _sendPort->send(messageId, *command, sendTimeout, receiveTimeout,
                                        RemotePort::Reply::Wanted);
    if (result.error != PortError::success) {
        _platform.log.error(" ***** Could not send the GetTechnology command (got error={})",
                            result.error);
        return;
    }
    if (!result.reply) {
        _platform.log.error(" ***** No response to GetTechnology; cannot configure");
        return;
    }
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
    _logGenerator = LogGenerator::generatorFromTechnology(
        *technology, {_platform.log, _platform.resources, _platform.clock});
    _platform.log.error("Got log generated: {}", fmt::ptr(_logGenerator.get()));
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
}

bool VentrikModel::sendStartCommand()
{
    const auto command = serialized(_logGenerator->getStartCommand());
    if (!command) {
        _platform.log.error(" Could not generate PLIST");
        return false;
    }
    const auto result = _sendPort->send(messageId, *command, sendTimeout, noReceiveTimeout,
                                        RemotePort::Reply::NotWanted);
    if (result.error != PortError::success)
        _platform.log.error(" ***** Could not send the START command (got error={})", result.error);
    return result.error == PortError::success;
}

void VentrikModel::retryLater()
{
    destroyPorts();
    _platform.mainQueue.after(retryDelay, guarded(&VentrikModel::startMonitor));
}

void VentrikModel::restartMonitor()
{
    destroyPorts();
    startMonitor();
}

void VentrikModel::refresh()
{
    if (_recvPort && _sendPort && !_sendPort->isValid()) {
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
    if (!_nodesByPath)
        return nullptr;
    const auto node = _nodesByPath->find(path);
    return node == _nodesByPath->end() ? nullptr : node->second;
}

void VentrikModel::updateWithData(ByteView data)
{
    if (_logGenerator)
        _logGenerator->updateState(_state, data);
    _updated = true;
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
