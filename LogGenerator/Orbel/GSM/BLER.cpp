#include "LogGenerator/Orbel/GSM/BLER.h"

#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

namespace
{

constexpr std::uint32_t blockErrorsLogCode = 0x4116;

// Transport channel, 9 bytes
//   0 u8 identity | 1 u32 CRCs received | 5 u32 of these in error, both shown signed
PlistDictionary row(const LogPacket& channel)
{
    return {{"Transport Channel ID", decimal(channel.u8(0))},
            {"CRC Received", decimal(channel.i32(1))},
            {"CRC Received in Error", decimal(channel.i32(5))}};
}

} // namespace

std::string_view BLER::getSectionName() const
{
    return "BLER";
}

std::vector<std::uint32_t> BLER::getLogCodeArray() const
{
    return {blockErrorsLogCode};
}

// Block errors, 0x4116, at least 16 bytes
//   13 u8 n | 14 u16 measurement window | 16 n transport channels of 9 bytes
void BLER::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("BLER");
    if (logCode != blockErrorsLogCode)
        return logUnknownMessage(logCode);
    if (packet.size() < 16)
        return;
    show("Window Size", decimal(packet.u16(14)));

    const RecordElements channels{16, 9, packet.u8(13), 9};
    PlistArray rows;
    for (std::size_t i = 0; i < channels.completeIn(packet); ++i)
        rows.append(row(channels.element(packet, i)));
    show("Transport Channels", rows);
}

} // namespace ventrik
