#pragma once

namespace ventrik
{

class C2KOutput;
class LogPacket;

/// The strengths of the EV-DO active set's pilots: log code 0x12B6.
void decodeActiveSetPilots(const LogPacket& packet, const C2KOutput& output);

} // namespace ventrik
