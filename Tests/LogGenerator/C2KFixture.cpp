#include "Tests/LogGenerator/C2KFixture.h"

#include <algorithm>

namespace ventrik
{

const std::vector<std::string>& c2kLookupKeys()
{
    static const std::vector<std::string> keys{"kChannel",         "k1xEVDODeviceState",
                                               "kBandClass",       "kRxAGC0",
                                               "kRxAGC1",          "kTxAGC",
                                               "kServingPNOffset", "kSessionState",
                                               "kUATI24",          "kColorCode",
                                               "kActiveSetPilots", "kFingerC2I",
                                               "k1xDeviceState",   "k1xRx0BandClass",
                                               "k1xRx0ChanNum",    "k1xRxAGC0",
                                               "k1xRx1BandClass",  "k1xRx1ChanNum",
                                               "k1xRxAGC1",        "k1xTxAGC",
                                               "k1xActiveSetInfo", "k1xTrafficFER",
                                               "kFLDataRate",      "kRLDataRate",
                                               "k1xRoamingHome",   "kSystemId",
                                               "kNetworkId",       "kPacketZoneId",
                                               "kBaseId",          "kProtocolRevision"};
    return keys;
}

PacketBuilder subpacketRecord(std::uint32_t logCode, const std::vector<Subpacket>& subpackets)
{
    PacketBuilder packet(logCode);
    packet.u8(14, static_cast<std::uint8_t>(subpackets.size())).size(17);
    std::size_t offset = 17;
    for (const auto& [identifier, content] : subpackets) {
        const std::size_t size = 4 + content.size();
        packet.u8(offset, identifier)
            .u16(offset + 2, static_cast<std::uint16_t>(size))
            .bytes(offset + 4, content);
        offset += size;
    }
    return packet;
}

PacketBuilder evdoStatusPacket()
{
    return PacketBuilder(0x1183)
        .u8(13, 0x1B) // channel 283 = 0x11B
        .u8(14, 0x09) // and band class 1
        .u8(15, 0xB9)
        .u8(16, 0xB6)
        .u8(17, 0xF4)
        .u16(18, 264)
        .u8(36, 5)
        .u8(37, 4)
        .bytes(38, Bytes{0x2C, 0x1B, 0x0A, 37})
        .size(50);
}

PacketBuilder activeSetPilotsPacket()
{
    return PacketBuilder(0x12B6)
        .u8(15, 2)
        .bytes(25, Bytes{0x08, 0x01, 0x00, 0x02, 9, 9, 9, 9, 9, 9, 9, 9})  // PN 264, 512
        .bytes(37, Bytes{0x0C, 0x00, 0x00, 0x01, 9, 9, 9, 9, 9, 9, 9, 9}); // PN 12, 256
}

PacketBuilder fingerC2IPacket()
{
    return PacketBuilder(0x108A)
        .u8(22, 3)
        .bytes(23, Bytes{0xA8, 0x00, 9, 9, 9, 9, 0x00, 0x01, 9, 9, 9, 9, 9, 9})  // PN 168, 256
        .bytes(37, Bytes{0xFF, 0xFF, 9, 9, 9, 9, 0x00, 0x01, 9, 9, 9, 9, 9, 9})  // unassigned
        .bytes(51, Bytes{0x00, 0x02, 9, 9, 9, 9, 0x00, 0x04, 9, 9, 9, 9, 9, 9}); // PN 512, 1024
}

PacketBuilder oneXStatusPacket()
{
    return subpacketRecord(
        0x119C,
        {{1,
          {8}}, // traffic
                // Classes 1 and 0, channels 283 and 384, AGC 10 and -1, transmitting at -12.5 dBm.
         {2, {1, 0, 0x1B, 0x01, 0x80, 0x01, 10, 0xFF, 0x83, 0xFF}},
         // N 1, M 1, E 0; two pilots of 20 bytes with their energies, 792 and 108, at byte 16. The
         // first is the reference.
         {3, {1,   0, 1, 0, 2, 1, 168, 0, //
              168, 0, 9, 9, 9, 9, 9,   9, 9, 9, 9, 9, 9, 9, 9, 9, 0x18, 0x03, 9, 9,
              12,  0, 9, 9, 9, 9, 9,   9, 9, 9, 9, 9, 9, 9, 9, 9, 108,  0,    9, 9}},
         {4, {}}});
}

PacketBuilder oneXTrafficFERPacket(bool isErased)
{
    Bytes demodulation(21);
    demodulation[20] = isErased ? 1 : 0;
    return subpacketRecord(0x119D, {{5, {1, 2, 3}}, {11, demodulation}});
}

PacketBuilder forwardDataPacket(std::uint32_t sequence)
{
    return PacketBuilder(0x1192).u32(13, sequence).size(241);
}

PacketBuilder reverseDataPacket(std::uint32_t sequence)
{
    return PacketBuilder(0x127E).u32(14, sequence).size(1750);
}

PacketBuilder servingSystemPacket()
{
    return PacketBuilder(0x134F)
        .u8(13, 2)
        .u32(42, 1)
        .u32(46, 2)
        .u16(50, 4139)
        .u16(52, 7)
        .u8(131, 9)
        .u8(133, 6)
        .u16(184, 1201);
}

C2KFixture::C2KFixture()
{
    std::string entries;
    for (const std::string& key : c2kLookupKeys())
        entries += fmt::format("<key>{0}</key><string>{0}</string>", key);
    platform.resources.add("/res/C2KTemplate.plist",
                           plistXml(fmt::format("<dict>{}</dict>", entries)));
    generator = C2KLogGenerator::generator(services());
    generator->getDisplayFromState(state);
    platform.log.clear();
}

std::string C2KFixture::shown(std::string_view key)
{
    const PlistDictionary displayed = display();
    const PlistValue* value = displayed.find(key);
    if (!value)
        return "(no label)";
    return value->string() ? *value->string() : "(group)";
}

std::vector<std::string> C2KFixture::group(std::string_view key)
{
    const PlistDictionary displayed = display();
    const PlistValue* value = displayed.find(key);
    if (!value || !value->dictionary())
        return {"(no group)"};
    std::vector<std::string> entries;
    for (const auto& [name, text] : *value->dictionary())
        entries.push_back(name + "=" + (text.string() ? *text.string() : "(no text)"));
    return entries;
}

bool C2KFixture::showsNothing()
{
    return std::ranges::all_of(c2kLookupKeys(),
                               [this](const std::string& key) { return shown(key).empty(); });
}

} // namespace ventrik
