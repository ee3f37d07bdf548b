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
            sendBusNotice(address, text, longestWait);
            _isSending = false;
        });
    } catch (const std::system_error&) { // no thread can be made
        _isSending = false;
    }
}

} // namespace ventrik
