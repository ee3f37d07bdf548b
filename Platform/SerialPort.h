#pragma once

#include "PropertyList/Bytes.h"

#include <chrono>
#include <functional>
#include <memory>
#include <string>

namespace ventrik
{

/// An open serial port. It closes with the object.
class SerialPort
{
  public:
    /// Both come on the main queue, and never within a call to the port. The port must not be
    /// destroyed within them.
    struct Events {
        /// Takes what came; it lives as long as the call.
        std::function<void(ByteView bytes)> received;
        /// The device has gone or fails, and why. Comes once; nothing comes after it.
        std::function<void(const std::string& reason)> lost;
    };

    virtual ~SerialPort() = default;

    /// Never waits: bytes go out in order, as the device takes them. One that takes none while a
    /// bounded number waits is lost.
    virtual void write(ByteView bytes) = 0;
    /// Waits until all of it has gone out, for so long at most.
    virtual void flush(std::chrono::milliseconds longest) = 0;
};

/// Opens serial ports.
class SerialPorts
{
  public:
    virtual ~SerialPorts() = default;

    /// A device by its path, with 8 data bits, no parity, 1 stop bit. None where it cannot be
    /// opened; `error` then says why, in a few words.
    virtual std::unique_ptr<SerialPort> open(const std::string& device, SerialPort::Events events,
                                             std::string& error) = 0;
};

} // namespace ventrik
