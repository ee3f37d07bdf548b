#pragma once

#include <cstdint>
#include <string_view>

namespace ventrik
{

/// What goes over the telephony service's port: a property list asks, a property list answers.
namespace TelephonyProtocol
{
inline constexpr std::int32_t requestMessageId = 0;

// The request.
inline constexpr std::string_view commandKey = "Command";
inline constexpr std::string_view createLogChannelCommand = "CreateNetworkMonitorLogChannel";
inline constexpr std::string_view localPortKey = "LocalPort";

// The answer. There is no remote port where the request failed.
inline constexpr std::string_view errorDomainKey = "ErrorDomain";
inline constexpr std::string_view errorCodeKey = "ErrorCode";
inline constexpr std::string_view remotePortKey = "RemotePort";

/// A log channel's command of our own service: the answer holds, under the same key, a dictionary
/// of what became of the messages, to be shown as it is. Other services do not know it.
inline constexpr std::string_view reportCommand = "GetReport";

/// The domain of the errors that the client finds itself.
inline constexpr std::int32_t clientErrorDomain = 1;
namespace ClientError
{
inline constexpr std::int32_t sendTimeout = 1;
inline constexpr std::int32_t receiveTimeout = 2;
inline constexpr std::int32_t serviceGone = 3;
inline constexpr std::int32_t transportFault = 4;
inline constexpr std::int32_t requestNotWritten = 5; ///< a port name that XML cannot carry
inline constexpr std::int32_t answerNotUnderstood = 6;
} // namespace ClientError
} // namespace TelephonyProtocol

} // namespace ventrik
