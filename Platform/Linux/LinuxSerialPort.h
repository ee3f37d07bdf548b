#pragma once

#include "Platform/SerialPort.h"

namespace ventrik
{

/// The machine's serial ports. Used on the main thread only, after the QCoreApplication is made.
/// Another process that uses the device by the usual lock files keeps us out, and we keep it out.
class LinuxSerialPorts : public SerialPorts
{
  public:
    /// A device without a slash is one in /dev.
    std::unique_ptr<SerialPort> open(const std::string& device, SerialPort::Events events,
                                     std::string& error) override;
};

} // namespace ventrik
