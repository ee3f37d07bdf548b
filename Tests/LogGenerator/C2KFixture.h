#pragma once

#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

#include <string>
#include <utility>
#include <vector>

namespace ventrik
{

/// Every lookup key that the decoders publish.
const std::vector<std::string>& c2kLookupKeys();

/// One subpacket: its identifier and its bytes from offset 4 on.
using Subpacket = std::pair<std::uint8_t, Bytes>;
/// A record of subpackets, one right behind the other from offset 17 on.
PacketBuilder subpacketRecord(std::uint32_t logCode, const std::vector<Subpacket>& subpackets);

// A packet of each log code with sensible values, none longer than its record.
PacketBuilder evdoStatusPacket();
PacketBuilder activeSetPilotsPacket();
PacketBuilder fingerC2IPacket();
PacketBuilder oneXStatusPacket();
PacketBuilder oneXTrafficFERPacket(bool isErased);
PacketBuilder forwardDataPacket(std::uint32_t sequence);
PacketBuilder reverseDataPacket(std::uint32_t sequence);
PacketBuilder servingSystemPacket();

/// A generator whose display has a label for each lookup key, of the same name.
class C2KFixture : public GeneratorFixture
{
  protected:
    C2KFixture();

    void feed(const Bytes& packet) { generator->updateState(state, packet); }
    void feed(const PacketBuilder& packet) { feed(packet.build()); }

    PlistDictionary display() { return *state.find("Display")->dictionary(); }
    /// The text under a label, "" before anything was published; "(group)" for a group.
    std::string shown(std::string_view key);
    /// The entries of the group under a label, each as KEY=TEXT; "(no group)" when it is none.
    std::vector<std::string> group(std::string_view key);
    /// Has nothing been published yet?
    bool showsNothing();

    std::unique_ptr<C2KLogGenerator> generator;
};

} // namespace ventrik
