#include "Capture/RecordingPorts.h"

#include "Platform/TelephonyConstants.h"
#include "PropertyList/PropertyListReader.h"

#include <utility>

namespace ventrik
{

namespace
{

constexpr std::int32_t messageId = 0;

// Hears what the service answers.
class ListeningPort : public RemotePort
{
  public:
    ListeningPort(std::shared_ptr<RemotePort> port, CaptureRecorder& recorder)
        : _port(std::move(port)), _recorder(recorder)
    {
    }

    const std::string& name() const override { return _port->name(); }
    SendResult send(std::int32_t id, ByteView data, Seconds sendTimeout, Seconds receiveTimeout,
                    Reply reply) override
    {
        auto result = _port->send(id, data, sendTimeout, receiveTimeout, reply);
        if (result.reply)
            hear(*result.reply);
        return result;
    }
    void setInvalidationCallback(InvalidationCallback callback) override
    {
        _port->setInvalidationCallback(std::move(callback));
    }
    void invalidate() override { _port->invalidate(); }
    bool isValid() const override { return _port->isValid(); }
    ProcessNumber process() const override { return _port->process(); }

  private:
    void hear(ByteView reply)
    {
        const auto reading = readPropertyList(reply);
        const PlistDictionary* answer = reading ? reading.value->dictionary() : nullptr;
        if (const PlistValue* technology = answer ? answer->find("GetTechnology") : nullptr)
            _recorder.setTechnology(technologyOfIdentifier(*technology));
    }

    std::shared_ptr<RemotePort> _port;
    CaptureRecorder& _recorder;
};

} // namespace

LocalPortCreation RecordingPorts::createLocalPort(std::string_view name, PortSenders senders,
                                                  LocalPort::DataCallback callback)
{
    if (name != logChannelLocalPortName)
        return _ports.createLocalPort(name, senders, std::move(callback));
    return _ports.createLocalPort(
        name, senders, [this, callback = std::move(callback)](const PortMessage& message) {
            if (message.id == messageId)
                _recorder.record(message.data);
            return callback(message);
        });
}

std::shared_ptr<RemotePort> RecordingPorts::createRemotePort(std::string_view name)
{
    auto port = _ports.createRemotePort(name);
    return port ? std::make_shared<ListeningPort>(std::move(port), _recorder) : nullptr;
}

} // namespace ventrik
