#include "Tests/Support/FakeTelephonyClient.h"

#include <cstdint>
#include <map>
#include <utility>

namespace ventrik
{

struct FakeTelephonyClient::State {
    std::shared_ptr<OperationRecord> record;
    bool isAvailable = true;
    bool notifiesDuringRequests = false;
    std::size_t creationCount = 0;
    std::uint64_t nextConnection = 0;
    std::map<std::uint64_t, NotificationCallback> callbacks; // of the live connections
    std::vector<std::string> requests;
    std::deque<LogChannelCreation> queued;
    LogChannelCreation defaultResult{{}, std::string(defaultRemotePortName)};

    LogChannelCreation nextResult()
    {
        if (queued.empty())
            return defaultResult;
        auto result = std::move(queued.front());
        queued.pop_front();
        return result;
    }
};

class FakeTelephonyClient::Connection : public ServerConnection
{
  public:
    Connection(std::shared_ptr<State> state, NotificationCallback callback)
        : _state(std::move(state)), _id(_state->nextConnection++)
    {
        _state->callbacks.emplace(_id, std::move(callback));
        _state->record->add("connection created");
    }
    ~Connection() override
    {
        _state->callbacks.erase(_id);
        _state->record->add("connection released");
    }

    LogChannelCreation networkMonitorCreateLogChannel(std::string_view localPortName) override
    {
        _state->requests.emplace_back(localPortName);
        _state->record->add("log channel requested " + std::string(localPortName));
        if (const auto callback = _state->callbacks.at(_id);
            callback && _state->notifiesDuringRequests)
            callback();
        return _state->nextResult();
    }

  private:
    std::shared_ptr<State> _state;
    std::uint64_t _id;
};

FakeTelephonyClient::FakeTelephonyClient(std::shared_ptr<OperationRecord> record)
    : _state(std::make_shared<State>())
{
    _state->record = std::move(record);
}

FakeTelephonyClient::~FakeTelephonyClient() = default;

std::unique_ptr<ServerConnection>
FakeTelephonyClient::createServerConnection(NotificationCallback callback)
{
    ++_state->creationCount;
    if (!_state->isAvailable)
        return nullptr;
    return std::make_unique<Connection>(_state, std::move(callback));
}

void FakeTelephonyClient::setServiceAvailable(bool available)
{
    _state->isAvailable = available;
}

void FakeTelephonyClient::setDefaultResult(LogChannelCreation result)
{
    _state->defaultResult = std::move(result);
}

void FakeTelephonyClient::queueResult(LogChannelCreation result)
{
    _state->queued.push_back(std::move(result));
}

void FakeTelephonyClient::notify()
{
    // A callback may end its own connection or another one, which must not be called any more.
    const auto state = _state;
    const auto before = state->callbacks;
    for (const auto& [id, callback] : before)
        if (state->callbacks.contains(id) && callback)
            callback();
}

void FakeTelephonyClient::notifyDuringRequests()
{
    _state->notifiesDuringRequests = true;
}

std::size_t FakeTelephonyClient::creationCount() const
{
    return _state->creationCount;
}

std::size_t FakeTelephonyClient::liveConnectionCount() const
{
    return _state->callbacks.size();
}

const std::vector<std::string>& FakeTelephonyClient::requests() const
{
    return _state->requests;
}

} // namespace ventrik
