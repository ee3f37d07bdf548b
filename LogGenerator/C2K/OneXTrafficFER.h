#pragma once

namespace ventrik
{

class C2KOutput;
class LogPacket;

/// The smoothed share of erased frames on the 1x traffic channel: log code 0x119D.
void decodeOneXTrafficFER(const LogPacket& packet, const C2KOutput& output);

/// Shows the last share as an old one, and lets the next traffic channel start its own.
void endTrafficFER(const C2KOutput& output);

} // namespace ventrik
