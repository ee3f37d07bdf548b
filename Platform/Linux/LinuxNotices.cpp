#include "Platform/Linux/LinuxNotices.h"

#include "Platform/Linux/SessionBus.h"

#include <system_error>

namespace ventrik
{

void LinuxNotices::post(const std::string& text)
{
    const auto address = sessionBusAddress();
    if (!address || _isSending.exchange(true))
        return;
    try {
        _sender = std::jthread([this, text, address = *address] {
            send(address, text);
            _isSending = false;
        });
    } catch (const std::system_error&) { // no thread can be made
        _isSending = false;
    }
}

void LinuxNotices::send(const std::string& address, const std::string& text)
{
    const auto failure = sendBusNotice(address, text, longestWait);
    if (failure && failure != _lastFailure)
        _log.error("The session bus did not take the notice: {}", *failure);
    _lastFailure = failure;
}

} // namespace ventrik
