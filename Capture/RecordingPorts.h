#pragma once

#include "Capture/CaptureRecorder.h"
#include "Platform/MessagePorts.h"

#include <memory>
#include <string_view>

namespace ventrik
{

/// Message ports that record a log channel on its way to the viewer: each message before it is
/// delivered, as what the service last called its technology. Everything else is passed on.
class RecordingPorts : public MessagePorts
{
  public:
    /// Both outlive these ports and every port that they made.
    RecordingPorts(MessagePorts& ports, CaptureRecorder& recorder)
        : _ports(ports), _recorder(recorder)
    {
    }

    LocalPortCreation createLocalPort(std::string_view name, PortSenders senders,
                                      LocalPort::DataCallback callback) override;
    std::shared_ptr<RemotePort> createRemotePort(std::string_view name) override;

  private:
    MessagePorts& _ports;
    CaptureRecorder& _recorder;
};

} // namespace ventrik
