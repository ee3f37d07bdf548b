#pragma once

#include "Platform/TelephonyClient.h"
#include "Tests/Support/OperationRecord.h"

#include <cstddef>
#include <deque>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// A scripted telephony service. Its connections may outlive it.
///
/// Operations are recorded as "connection created", "log channel requested NAME" and "connection
/// released".
class FakeTelephonyClient : public TelephonyClient
{
  public:
    /// The remote port that a log channel gets by default.
    static constexpr std::string_view defaultRemotePortName = "org.ventrik.FakeLogChannel";

    explicit FakeTelephonyClient(
        std::shared_ptr<OperationRecord> record = std::make_shared<OperationRecord>());
    ~FakeTelephonyClient() override;

    /// None while the service is away.
    std::unique_ptr<ServerConnection>
    createServerConnection(NotificationCallback callback) override;

    void setServiceAvailable(bool available);
    /// What a request for a log channel gives when no result is queued; success with
    /// `defaultRemotePortName` at first.
    void setDefaultResult(LogChannelCreation result);
    void queueResult(LogChannelCreation result);
    void queueError(TelephonyError error) { queueResult({error, std::nullopt}); }

    /// Calls the callback of every live connection, at once. A callback may end connections.
    void notify();
    /// The service notifies in the middle of each request for a log channel.
    void notifyDuringRequests();

    /// Calls of `createServerConnection`, the ones that gave none included.
    std::size_t creationCount() const;
    std::size_t liveConnectionCount() const;
    /// The local port names of the log channels that were asked for.
    const std::vector<std::string>& requests() const;

  private:
    struct State;
    class Connection;

    std::shared_ptr<State> _state;
};

} // namespace ventrik
