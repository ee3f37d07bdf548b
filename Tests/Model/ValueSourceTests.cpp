#include "Model/ValueSource.h"
#include "Packets/PacketBuilder.h"
#include "Platform/Technology.h"
#include "Tests/Support/FakePlatform.h"
#include "Tests/Support/ResourceFiles.h"

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::Contains;
using testing::Pair;

/// What the LTE generator shows, and a store beside it.
class ValueSourceTest : public testing::Test
{
  protected:
    ValueSourceTest()
    {
        addTemplates(fake.resources, VENTRIK_RESOURCES);
        store.useGenerator(generator.get(), "lte");
    }

    void take(const Bytes& message)
    {
        generator->updateState(state, message);
        store.messageTaken(fake.clock.now(), message, state);
        fake.clock.advance(1s);
    }
    static Bytes cellInfo(std::uint16_t physicalCellId)
    {
        return PacketBuilder(0xB0C2).u16(14, physicalCellId).size(38).build();
    }
    std::optional<ValueSource> find(const std::string& path)
    {
        DisplayMoment now = store.at(store.present());
        return sources.find(now, store, path);
    }

    FakePlatform fake;
    std::unique_ptr<LogGenerator> generator = [this] {
        addTemplates(fake.resources, VENTRIK_RESOURCES);
        return LogGenerator::generatorFromTechnology(Technologies::lte.identifier,
                                                     {fake.log, fake.resources, fake.clock});
    }();
    PlistDictionary state;
    ChangeStore store{RecordsMode::Newer};
    ValueSources sources{fake.resources, fake.clock, RecordsMode::Newer};
    const std::string identity = "/Serving Cell Info/Physical Cell ID";
};

} // namespace

TEST_F(ValueSourceTest, IsTheRecordThatToldTheValueAndItsBitsInIt)
{
    take(cellInfo(301));
    const auto source = find(identity);
    ASSERT_TRUE(source);
    EXPECT_EQ(source->text, "301");
    EXPECT_EQ(source->raw, 301);
    EXPECT_EQ(source->packet, cellInfo(301));
    ASSERT_TRUE(source->bits);
    EXPECT_EQ(source->bits->firstByte, 14U);
    EXPECT_TRUE(source->isMarked(14));
    EXPECT_TRUE(source->isMarked(15));
    EXPECT_FALSE(source->isMarked(13));
    EXPECT_FALSE(source->isMarked(16));
}

TEST_F(ValueSourceTest, CountsBytesBehindTheTransportPrefix)
{
    Bytes message = cellInfo(301);
    message.insert(message.begin(), {0x81, 0x00});
    take(message);
    const auto source = find(identity);
    EXPECT_EQ(source->packet, cellInfo(301));
    EXPECT_EQ(source->bits->firstByte, 14U);
}

TEST_F(ValueSourceTest, TellsSinceWhenItShowsAndWhenItWasToldLast)
{
    take(cellInfo(300));
    take(cellInfo(301));
    take(cellInfo(301));
    take(cellInfo(301));
    const auto source = find(identity);
    EXPECT_EQ(source->changed, FixedClock().now() + 1s);
    EXPECT_EQ(source->written, FixedClock().now() + 3s);
    const auto lines = source->lines(fake.clock);
    EXPECT_THAT(lines, Contains(Pair("Shown Since", "2026-11-16 06:10:29.000")));
    EXPECT_THAT(lines, Contains(Pair("Told Last", "2026-11-16 06:10:31.000")));
}

TEST_F(ValueSourceTest, TellsCodeLayoutRawNumberAndPlace)
{
    take(cellInfo(301));
    const auto lines = find(identity)->lines(fake.clock);
    EXPECT_THAT(lines, Contains(Pair("Value", "301")));
    EXPECT_THAT(lines, Contains(Pair("Path", identity)));
    EXPECT_THAT(lines, Contains(Pair("Log Code", testing::StartsWith("0xB0C2 "))));
    EXPECT_THAT(lines, Contains(Pair("Raw Number", "301 (0x12D)")));
    EXPECT_THAT(lines, Contains(Pair("Packet", "38 bytes")));
    EXPECT_THAT(lines, Contains(Pair("Layout", testing::_)));
}

TEST_F(ValueSourceTest, MarksTheBytesThatHoldTheValue)
{
    ValueSource source{"/a", "1", {}, {}};
    source.packet = {0, 1, 2, 3, 4, 5};
    source.bits = {1, {.offset = 1, .bit = 0, .width = 16}};
    EXPECT_EQ(source.packetText(4), "0000  00[01 02]03\n0004  04 05\n");
    source.bits->firstByte = 3;
    EXPECT_EQ(source.packetText(4), "0000  00 01 02[03]\n0004 [04]05\n");
    source.bits->firstByte = 4;
    EXPECT_EQ(source.packetText(8), "0000  00 01 02 03[04 05]\n");
}

TEST_F(ValueSourceTest, OfAPlaceSaysWhichBits)
{
    ValueSource source{"/a", "1", {}, {}};
    const auto place = [&](std::size_t byte, const Place& bits) {
        source.bits = {byte, bits};
        const auto lines = source.lines(fake.clock);
        const auto found = std::ranges::find(lines, "Place", [](auto& line) { return line.first; });
        return found == lines.end() ? "" : found->second;
    };
    EXPECT_EQ(place(14, u8(14)), "byte 14");
    EXPECT_EQ(place(14, i8(14)), "byte 14, signed");
    EXPECT_EQ(place(14, u16(14)), "bytes 14 to 15, little-endian");
    EXPECT_EQ(place(14, u16BigEndian(14)), "bytes 14 to 15, big-endian");
    EXPECT_EQ(place(14, bits(14, 3, 1)), "byte 14, bit 3");
    EXPECT_EQ(place(14, bits(14, 4, 9)), "bytes 14 to 15, bits 4 to 12, little-endian");
}

TEST_F(ValueSourceTest, IsNoneWhereNoValueStands)
{
    take(cellInfo(301));
    EXPECT_FALSE(find("/Serving Cell Info"));
    EXPECT_FALSE(find("/Nothing"));
}

TEST_F(ValueSourceTest, OfAValueThatNoRecordToldHasNoBits)
{
    take(cellInfo(301));
    const auto source = find("/Serving Cell Measurements/Measured RSRP");
    ASSERT_TRUE(source);
    EXPECT_EQ(source->text, "-");
    EXPECT_FALSE(source->record);
    EXPECT_FALSE(source->bits);
    EXPECT_FALSE(source->raw);
}

TEST_F(ValueSourceTest, HasNoBitsInAPacketThatDidNotTellIt)
{
    take(cellInfo(301));
    ASSERT_TRUE(find(identity)->bits);
    // A store that begins now takes all for told by the next packet.
    ChangeStore later(RecordsMode::Newer);
    later.useGenerator(generator.get(), "lte");
    const Bytes other = PacketBuilder(0xB17F).size(60).build();
    generator->updateState(state, other);
    later.messageTaken(fake.clock.now(), other, state);
    DisplayMoment now = later.at(later.present());
    const auto source = sources.find(now, later, identity);
    ASSERT_TRUE(source);
    EXPECT_EQ(source->text, "301");
    EXPECT_EQ(source->packet, other);
    EXPECT_FALSE(source->bits);
}

TEST_F(ValueSourceTest, SaysWhereThePacketIsNotKept)
{
    ValueSource source{"/a", "1", {}, {}};
    EXPECT_THAT(source.lines(fake.clock), Contains(Pair("Packet", "not kept any more")));
    EXPECT_EQ(source.packetText(16), "");
}

} // namespace ventrik
