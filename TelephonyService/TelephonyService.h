#pragma once

#include "Platform/MainQueue.h"
#include "Platform/MessagePorts.h"
#include "Platform/SystemLog.h"
#include "TelephonyService/LogChannel.h"

#include <cstdint>
#include <map>
#include <memory>
#include <string>

namespace ventrik
{

/// A telephony service for machines without a baseband. It opens a log channel for each client's
/// local port and streams its technology's messages there. Callers that run as another user are
/// refused.
class TelephonyService
{
  public:
    /// The platform's parts outlive the service.
    TelephonyService(MainQueue& queue, MessagePorts& ports, SystemLog& log,
                     LogChannelContent content);
    /// Closes every port.
    ~TelephonyService();
    TelephonyService(const TelephonyService&) = delete;
    TelephonyService& operator=(const TelephonyService&) = delete;

    /// Opens the service's port. On failure `error` says why in one line.
    bool start(std::string& error);

    std::size_t channelCount() const { return _channels.size(); }

  private:
    struct Channel {
        std::shared_ptr<LocalPort> commandPort;
        std::unique_ptr<LogChannel> stream;
    };

    std::optional<Bytes> handleRequest(const PortMessage& message);
    PlistDictionary openChannel(const PortMessage& message);
    PlistDictionary openChannelFor(const std::string& clientPortName);
    void closeChannel(std::uint64_t number);
    void closeChannelsOf(const std::string& clientPortName);

    MainQueue& _queue;
    MessagePorts& _ports;
    SystemLog& _log;
    LogChannelContent _content;
    std::shared_ptr<LocalPort> _servicePort;
    std::map<std::uint64_t, Channel> _channels;
    std::uint64_t _nextNumber = 1;
    std::shared_ptr<bool> _alive = std::make_shared<bool>(true);
};

} // namespace ventrik
