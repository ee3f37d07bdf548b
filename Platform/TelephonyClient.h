#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace ventrik
{

struct TelephonyError {
    std::int32_t domain = 0;
    std::int32_t code = 0; ///< 0: success
};

struct LogChannelCreation {
    TelephonyError error;
    /// Where the service takes the commands of this channel.
    std::optional<std::string> remotePortName;
};

/// A connection to the telephony service; it ends with the object.
class ServerConnection
{
  public:
    virtual ~ServerConnection() = default;
    /// Asks for a network-monitor log channel that streams to the named local port.
    virtual LogChannelCreation networkMonitorCreateLogChannel(std::string_view localPortName) = 0;
};

/// The telephony service's client library.
class TelephonyClient
{
  public:
    using NotificationCallback = std::function<void()>;

    virtual ~TelephonyClient() = default;
    /// None when there is no service. Notifications come on the main queue while the connection
    /// lives.
    virtual std::unique_ptr<ServerConnection>
    createServerConnection(NotificationCallback callback) = 0;
};

} // namespace ventrik
