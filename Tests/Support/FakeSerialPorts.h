#pragma once

#include "Platform/SerialPort.h"

#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace ventrik
{

/// Serial ports in memory: one device, which the test plugs in and out and speaks for. What is
/// written and waited for is kept also when the port has closed.
class FakeSerialPorts : public SerialPorts
{
  public:
    std::unique_ptr<SerialPort> open(const std::string& device, SerialPort::Events events,
                                     std::string& error) override
    {
        attempts.push_back(device);
        if (!fault.empty()) {
            error = fault;
            return nullptr;
        }
        _events = std::move(events);
        return std::make_unique<Port>(*this);
    }

    /// The port is open, and was not lost.
    bool isOpen() const { return _events.has_value(); }
    void send(ByteView bytes) { _events->received(bytes); }
    void lose(const std::string& reason)
    {
        const auto events = std::exchange(_events, std::nullopt);
        events->lost(reason);
    }

    std::string fault; ///< why the device cannot be opened; empty when it can
    std::vector<std::string> attempts;
    std::vector<Bytes> written;
    int flushes = 0;

  private:
    struct Port : SerialPort {
        explicit Port(FakeSerialPorts& itsOwner) : owner(itsOwner) {}
        ~Port() override { owner._events.reset(); }
        void write(ByteView bytes) override
        {
            owner.written.emplace_back(bytes.begin(), bytes.end());
        }
        void flush(std::chrono::milliseconds) override { ++owner.flushes; }

        FakeSerialPorts& owner;
    };

    std::optional<SerialPort::Events> _events;
};

} // namespace ventrik
