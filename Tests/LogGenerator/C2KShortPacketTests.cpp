#include "Tests/LogGenerator/C2KFixture.h"

#include <algorithm>

namespace ventrik
{

namespace
{

struct Golden {
    std::string name;
    PacketBuilder packet;
    std::size_t minimumSize; ///< below it nothing is shown
};

std::vector<Golden> goldens()
{
    return {{"FingerC2I", fingerC2IPacket(), 65},
            {"EVDOStatus", evdoStatusPacket(), 50},
            {"ForwardDataRate", forwardDataPacket(1), 241},
            {"ActiveSetPilots", activeSetPilotsPacket(), 49},
            // A subpacket is found once its identifier is there.
            {"OneXStatus", oneXStatusPacket(), 89},
            {"OneXTrafficFER", oneXTrafficFERPacket(true), 25},
            {"ReverseDataRate", reverseDataPacket(1), 1750},
            {"ServingSystem", servingSystemPacket(), 171}};
}

class C2KShortPacketTest : public C2KFixture, public testing::WithParamInterface<Golden>
{
};

} // namespace

INSTANTIATE_TEST_SUITE_P(, C2KShortPacketTest, testing::ValuesIn(goldens()),
                         [](const auto& golden) { return golden.param.name; });

TEST_P(C2KShortPacketTest, EveryShorterPacketIsTakenOrLeft)
{
    const Bytes whole = GetParam().packet.build();
    for (std::size_t size = 0; size < whole.size(); ++size) {
        feed(Bytes(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(size)));
        if (size < GetParam().minimumSize) {
            EXPECT_TRUE(showsNothing()) << size;
        }
    }
    EXPECT_FALSE(state.contains("FLDataSeqNum"));
}

TEST_P(C2KShortPacketTest, APacketOfZerosIsTakenOrLeft)
{
    const Bytes whole = GetParam().packet.build();
    for (const std::size_t size : {std::size_t{13}, whole.size(), std::size_t{4000}}) {
        Bytes zeros(size);
        std::copy_n(whole.begin(), 13, zeros.begin());
        feed(zeros);
    }
    EXPECT_EQ(display().size(), c2kLookupKeys().size());
}

TEST_P(C2KShortPacketTest, APacketOfOnesIsTakenOrLeft)
{
    const Bytes whole = GetParam().packet.build();
    for (const std::size_t size : {std::size_t{13}, whole.size(), std::size_t{4000}}) {
        Bytes ones(size, 0xFF);
        std::copy_n(whole.begin(), 13, ones.begin());
        feed(ones);
    }
    EXPECT_EQ(display().size(), c2kLookupKeys().size());
}

} // namespace ventrik
