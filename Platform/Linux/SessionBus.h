#pragma once

#include <chrono>
#include <optional>
#include <string>
#include <vector>

namespace ventrik
{

struct BusSignal {
    std::string path;
    std::string interface;
    std::string member;
    std::vector<std::string> arguments;
};

/// Where the session bus is: $DBUS_SESSION_BUS_ADDRESS, else the runtime directory's socket; none
/// when there is neither.
std::optional<std::string> sessionBusAddress();

/// Sends one signal on the bus of that address and returns when the bus has it, or else, after the
/// time at the latest, with the reason in one line.
///
/// Not by the toolkit's library, which waits 90 s for a login and whose thread then holds up the
/// process's end: this one never blocks by itself.
std::optional<std::string> sendBusSignal(const std::string& address, const BusSignal& signal,
                                         std::chrono::milliseconds longestWait);

/// Has the desktop show a notice, in the same manner; nobody waits for its answer. What a bus does
/// not take, bytes that are not UTF-8, becomes U+FFFD.
std::optional<std::string> sendBusNotice(const std::string& address, const std::string& text,
                                         std::chrono::milliseconds longestWait);

} // namespace ventrik
