#pragma once

namespace ventrik
{

class C2KOutput;
class LogPacket;

/// The carrier-to-interference ratios of the 1x receiver's fingers: log code 0x108A.
void decodeFingerC2I(const LogPacket& packet, const C2KOutput& output);

} // namespace ventrik
