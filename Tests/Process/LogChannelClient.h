#pragma once

#include "Platform/Linux/LinuxMainQueue.h"
#include "Platform/Linux/LinuxMessagePorts.h"
#include "Platform/Linux/LinuxTelephonyClient.h"
#include "PropertyList/PropertyListWriter.h"
#include "Tests/Support/CapturingSystemLog.h"

#include <memory>
#include <string>
#include <vector>

namespace ventrik
{

/// A client of the telephony service with a local port of its own name, which keeps every message.
class LogChannelClient
{
  public:
    LogChannelClient(const std::string& runtimeDirectory, std::string name)
        : _name(std::move(name)), _ports(runtimeDirectory, _log)
    {
    }

    /// Opens the log channel; false when any step of it fails.
    bool open()
    {
        _localPort = _ports
                         .createLocalPort(_name, PortSenders::SameUser,
                                          [this](const PortMessage& message) {
                                              _messages.emplace_back(message.data.begin(),
                                                                     message.data.end());
                                              return std::optional<Bytes>();
                                          })
                         .port;
        const auto connection = _telephony.createServerConnection({});
        if (!_localPort || !connection)
            return false;
        _localPort->deliverOnMainQueue();
        const auto creation = connection->networkMonitorCreateLogChannel(_name);
        _remotePortName = creation.remotePortName.value_or("");
        _remotePort = _ports.createRemotePort(_remotePortName);
        return _remotePort != nullptr;
    }

    /// Asks for every message, whatever its code.
    void startStreaming() { send(PlistDictionary{{"SetState", "Streaming"}}); }
    /// Asks for the messages of these codes.
    void startStreaming(const PlistArray& codes)
    {
        send(PlistDictionary{{"SetState", "Streaming"},
                             {"SetOrbelLogCodes", codes},
                             {"SetQxExtraCodes", PlistArray()}});
    }

    const std::string& remotePortName() const { return _remotePortName; }
    const std::vector<Bytes>& messages() const { return _messages; }

  private:
    void send(const PlistDictionary& command)
    {
        constexpr RemotePort::Seconds time{1.0};
        _remotePort->send(0, propertyListBytes(command).value(), time, time,
                          RemotePort::Reply::NotWanted);
    }

    std::string _name;
    CapturingSystemLog _log;
    LinuxMainQueue _mainQueue;
    LinuxMessagePorts _ports;
    LinuxTelephonyClient _telephony{_ports, _mainQueue};
    std::shared_ptr<LocalPort> _localPort;
    std::shared_ptr<RemotePort> _remotePort;
    std::string _remotePortName;
    std::vector<Bytes> _messages;
};

} // namespace ventrik
