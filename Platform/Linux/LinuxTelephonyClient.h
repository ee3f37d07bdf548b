#pragma once

#include "Platform/MainQueue.h"
#include "Platform/MessagePorts.h"
#include "Platform/TelephonyClient.h"

namespace ventrik
{

/// Talks to the telephony service over its message port. What goes wrong on this side is an error
/// of `TelephonyProtocol::clientErrorDomain`. A connection's one notification says that the service
/// has gone. The ports and the queue must outlive the client and its connections.
class LinuxTelephonyClient : public TelephonyClient
{
  public:
    LinuxTelephonyClient(MessagePorts& ports, MainQueue& queue) : _ports(ports), _queue(queue) {}

    std::unique_ptr<ServerConnection>
    createServerConnection(NotificationCallback callback) override;

  private:
    MessagePorts& _ports;
    MainQueue& _queue;
};

} // namespace ventrik
