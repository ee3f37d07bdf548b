#pragma once

namespace ventrik
{

class C2KOutput;
class LogPacket;

/// The identity of the 1x system that serves, and whether that is roaming: log code 0x134F.
void decodeOneXServingSystem(const LogPacket& packet, const C2KOutput& output);

} // namespace ventrik
