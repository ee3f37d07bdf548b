#include "Platform/Linux/LinuxTelephonyClient.h"

#include "Platform/TelephonyConstants.h"
#include "Platform/TelephonyProtocol.h"
#include "PropertyList/PropertyListReader.h"
#include "PropertyList/PropertyListWriter.h"

#include <limits>
#include <utility>

namespace ventrik
{

namespace
{

using namespace TelephonyProtocol;

LogChannelCreation failure(std::int32_t code)
{
    return {{clientErrorDomain, code}, std::nullopt};
}

std::int32_t clientErrorCode(int portError)
{
    switch (portError) {
    case PortError::sendTimeout:
        return ClientError::sendTimeout;
    case PortError::receiveTimeout:
        return ClientError::receiveTimeout;
    case PortError::invalidPort:
        return ClientError::serviceGone;
    default:
        return ClientError::transportFault;
    }
}

std::optional<std::int32_t> number(const PlistDictionary& answer, std::string_view key)
{
    const PlistValue* value = answer.find(key);
    const PlistInteger* integer = value == nullptr ? nullptr : value->integer();
    if (integer == nullptr || *integer != PlistInteger(std::int32_t(integer->signedBits())))
        return std::nullopt;
    return static_cast<std::int32_t>(integer->signedBits());
}

LogChannelCreation parseAnswer(ByteView data)
{
    const auto reading = readPropertyList(data);
    const PlistDictionary* answer = reading ? reading.value->dictionary() : nullptr;
    if (answer == nullptr)
        return failure(ClientError::answerNotUnderstood);
    const auto domain = number(*answer, errorDomainKey);
    const auto code = number(*answer, errorCodeKey);
    const PlistValue* port = answer->find(remotePortKey);
    if (!domain || !code || (port != nullptr && port->string() == nullptr))
        return failure(ClientError::answerNotUnderstood);
    LogChannelCreation creation{{*domain, *code}, std::nullopt};
    if (port != nullptr)
        creation.remotePortName = *port->string();
    return creation;
}

class Connection : public ServerConnection
{
  public:
    Connection(std::shared_ptr<RemotePort> port, MainQueue& queue,
               TelephonyClient::NotificationCallback callback)
        : _port(std::move(port)),
          _callback(
              std::make_shared<const TelephonyClient::NotificationCallback>(std::move(callback)))
    {
        _port->setInvalidationCallback([&queue, weak = std::weak_ptr(_callback)] {
            queue.async([weak] {
                if (const auto live = weak.lock(); live != nullptr && *live)
                    (*live)();
            });
        });
    }
    ~Connection() override
    {
        _port->setInvalidationCallback(nullptr);
        _port->invalidate();
    }

    LogChannelCreation networkMonitorCreateLogChannel(std::string_view localPortName) override
    {
        const auto request = propertyListBytes(
            PlistDictionary{{commandKey, createLogChannelCommand}, {localPortKey, localPortName}});
        if (!request)
            return failure(ClientError::requestNotWritten);
        constexpr RemotePort::Seconds timeout{1.0};
        const auto result =
            _port->send(requestMessageId, *request, timeout, timeout, RemotePort::Reply::Wanted);
        if (result.error != PortError::success)
            return failure(clientErrorCode(result.error));
        if (!result.reply)
            return failure(ClientError::answerNotUnderstood);
        return parseAnswer(*result.reply);
    }

  private:
    std::shared_ptr<RemotePort> _port;
    // Notifications die with the connection: they hold this weakly.
    std::shared_ptr<const TelephonyClient::NotificationCallback> _callback;
};

} // namespace

std::unique_ptr<ServerConnection>
LinuxTelephonyClient::createServerConnection(NotificationCallback callback)
{
    auto port = _ports.createRemotePort(telephonyServicePortName);
    if (port == nullptr)
        return nullptr;
    return std::make_unique<Connection>(std::move(port), _queue, std::move(callback));
}

} // namespace ventrik
