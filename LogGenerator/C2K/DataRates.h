#pragma once

namespace ventrik
{

class C2KOutput;
class LogPacket;

// The rates at which EV-DO packets come and go. Each record counts all packets so far, by their
// kind; the rate is what was added since the record before, over the time between their sequence
// numbers.

/// Log code 0x1192.
void decodeForwardDataRate(const LogPacket& packet, const C2KOutput& output);
/// Log code 0x127E.
void decodeReverseDataRate(const LogPacket& packet, const C2KOutput& output);

} // namespace ventrik
