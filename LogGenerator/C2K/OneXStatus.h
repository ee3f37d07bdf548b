#pragma once

namespace ventrik
{

class C2KOutput;
class LogPacket;

/// 1x device state, radio values and active set: log code 0x119C.
void decodeOneXStatus(const LogPacket& packet, const C2KOutput& output);

} // namespace ventrik
