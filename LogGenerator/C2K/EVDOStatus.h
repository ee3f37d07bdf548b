#pragma once

namespace ventrik
{

class C2KOutput;
class LogPacket;

/// EV-DO channel, device and session state, and levels: log code 0x1183.
void decodeEVDOStatus(const LogPacket& packet, const C2KOutput& output);

} // namespace ventrik
