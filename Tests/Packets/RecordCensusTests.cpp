#include "Packets/RecordCensus.h"

#include "Packets/PacketBuilder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

using Kind = RecordCensus::Kind;

Bytes cellInfo(std::uint8_t version, std::size_t size)
{
    return PacketBuilder(0xB0C2).size(size).u8(13, version).build();
}

Bytes mobilityState()
{
    return PacketBuilder(0xB0EE).size(32).u8(13, 2).build();
}

} // namespace

TEST(RecordCensus, CountsByCodeVersionSizeAndLayout)
{
    RecordCensus census(RecordsMode::Newer);
    census.take(cellInfo(3, 42));
    census.take(cellInfo(3, 42));
    census.take(cellInfo(2, 38));
    census.take(cellInfo(9, 42));
    EXPECT_EQ(census.kinds().at(Kind{0xB0C2, 3, 42, LayoutKind::Newer}).count, 2U);
    EXPECT_EQ(census.kinds().at(Kind{0xB0C2, 2, 38, LayoutKind::Base}).count, 1U);
    EXPECT_EQ(census.kinds().at(Kind{0xB0C2, 9, 42, LayoutKind::NotKnown}).count, 1U);
}

TEST(RecordCensus, InBaseModeEveryRecordIsBase)
{
    RecordCensus census(RecordsMode::Base);
    census.take(cellInfo(3, 42));
    EXPECT_EQ(census.kinds().begin()->first, (Kind{0xB0C2, 3, 42, LayoutKind::Base}));
}

TEST(RecordCensus, AnExtensionHasALayoutOnlyWhereItIsDecoded)
{
    RecordCensus newer(RecordsMode::Newer);
    newer.take(mobilityState());
    EXPECT_EQ(newer.kinds().begin()->first, (Kind{0xB0EE, 2, 32, std::nullopt}));
    RecordCensus extended(RecordsMode::Extended);
    extended.take(mobilityState());
    EXPECT_EQ(extended.kinds().begin()->first, (Kind{0xB0EE, 2, 32, LayoutKind::Newer}));
}

// A payload byte is no version where nobody knows the record.
TEST(RecordCensus, ACodeThatNobodyKnowsHasNoVersion)
{
    RecordCensus census(RecordsMode::Extended);
    census.take(PacketBuilder(0x1234).size(20).u8(13, 5).build());
    EXPECT_EQ(census.kinds().begin()->first, (Kind{0x1234, std::nullopt, 20, std::nullopt}));
}

TEST(RecordCensus, KeepsTheFirstPayloadOfAKindWhereThatIsAskedFor)
{
    RecordCensus dropping(RecordsMode::Newer);
    dropping.take(PacketBuilder(0x1234).size(15).u8(13, 5).build());
    EXPECT_TRUE(dropping.kinds().begin()->second.firstPayload.empty());
    RecordCensus census(RecordsMode::Newer, RecordCensus::Payloads::Kept);
    census.take(PacketBuilder(0x1234).size(15).u8(13, 5).build());
    census.take(PacketBuilder(0x1234).size(15).u8(13, 6).build());
    EXPECT_EQ(census.kinds().begin()->second.firstPayload, (Bytes{5, 0}));
}

TEST(RecordCensus, PayloadsBeyondALimitAreNotKept)
{
    constexpr std::size_t size = std::size_t{1} << 20;
    RecordCensus census(RecordsMode::Newer, RecordCensus::Payloads::Kept);
    std::size_t kept = 0;
    for (std::uint32_t code = 0x2000; code < 0x2020; ++code)
        census.take(PacketBuilder(code).size(size).build());
    for (const auto& [kind, counted] : census.kinds())
        kept += counted.firstPayload.size();
    EXPECT_EQ(kept, 16 * (size - 13));
}

// A cell info of the base layout has 38 bytes.
TEST(RecordCensus, TellsWhichKindsAreTooShortForTheirRecord)
{
    RecordCensus census(RecordsMode::Newer);
    census.take(cellInfo(2, 37));
    census.take(cellInfo(2, 38));
    census.take(PacketBuilder(0x1234).size(13).build());
    EXPECT_TRUE(census.kinds().at(Kind{0xB0C2, 2, 37, LayoutKind::NotKnown}).isTooShort);
    EXPECT_FALSE(census.kinds().at(Kind{0xB0C2, 2, 38, LayoutKind::Base}).isTooShort);
    EXPECT_FALSE(census.kinds().begin()->second.isTooShort);
}

TEST(RecordCensus, ATransportPrefixIsNoPartOfARecord)
{
    RecordCensus census(RecordsMode::Newer);
    Bytes message{0x81, 0x00};
    const Bytes packet = cellInfo(3, 42);
    message.insert(message.end(), packet.begin(), packet.end());
    census.take(message);
    EXPECT_EQ(census.kinds().begin()->first, (Kind{0xB0C2, 3, 42, LayoutKind::Newer}));
}

TEST(RecordCensus, MessagesThatAreNoRecordsAreCountedApart)
{
    RecordCensus census(RecordsMode::Newer);
    for (const Bytes& message : {Bytes{}, Bytes{1}, Bytes(12, 1), Bytes(13, 2)})
        census.take(message);
    EXPECT_TRUE(census.kinds().empty());
    EXPECT_EQ(census.brokenCount(), 4U);
}

TEST(RecordCensus, KindsBeyondTheLimitAreOnlyCounted)
{
    RecordCensus census(RecordsMode::Newer);
    for (std::uint32_t code = 0; code < 20; ++code)
        for (std::size_t size = 13; size < 13 + 600; ++size)
            census.take(PacketBuilder(0x2000 + code).size(size).build());
    EXPECT_EQ(census.kinds().size(), RecordCensus::maximumKinds);
    EXPECT_EQ(census.otherCount(), 20 * 600 - RecordCensus::maximumKinds);
}

TEST(RecordCensus, OnlyExtensionsOfAKnownLayoutAreForExtendedModeOnly)
{
    const auto isOnly = [](const Bytes& packet) { return isExtensionOnly(LogPacket(packet)); };
    EXPECT_TRUE(isOnly(mobilityState()));
    EXPECT_FALSE(isOnly(PacketBuilder(0xB0EE).size(32).u8(13, 3).build()));
    EXPECT_FALSE(isOnly(cellInfo(3, 42)));
    EXPECT_FALSE(isOnly(Bytes(5, 1)));
}

} // namespace ventrik
