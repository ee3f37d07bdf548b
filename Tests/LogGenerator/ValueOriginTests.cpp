#include "LogGenerator/Orbel/GSM/Orbel_GSMLogGenerator.h"
#include "LogGenerator/Orbel/LTE/LTELogGenerator.h"
#include "Tests/LogGenerator/C2KFixture.h"
#include "Tests/Support/ResourceFiles.h"

namespace ventrik
{

namespace
{

using Path = std::vector<std::string_view>;

// Where a value of a generator's display comes from.
class ValueOriginTest : public GeneratorFixture
{
  protected:
    ValueOriginTest() { addTemplates(platform.resources, VENTRIK_RESOURCES); }

    template <typename Generator>
    std::unique_ptr<LogGenerator> make()
    {
        return Generator::generator(services());
    }
    void feed(const PacketBuilder& packet) { generator->updateState(state, packet.build()); }
    std::optional<ValueOrigin> originOf(const Path& path)
    {
        return generator->originOf(state, path);
    }

    std::unique_ptr<LogGenerator> generator;
};

class C2KValueOriginTest : public C2KFixture
{
};

} // namespace

TEST_F(ValueOriginTest, AValueTellsItsRecordItsBitsAndItsNumber)
{
    generator = make<LTELogGenerator>();
    feed(PacketBuilder(0xB17F).u8(13, 3).bits(22, 1, 9, 160).size(33)); // -140 + 160 / 4
    const auto origin = originOf({"Serving Cell Measurements", "Average RSRP"});
    ASSERT_TRUE(origin);
    EXPECT_EQ(origin->record->logCode, 0xB17FU);
    EXPECT_EQ(origin->version, 3);
    EXPECT_EQ(origin->firstByte(), 22U);
    EXPECT_EQ(origin->field->place.bit, 1);
    EXPECT_EQ(origin->field->place.width, 9);
    EXPECT_EQ(origin->raw, 160);
    EXPECT_EQ(origin->number(), -100.0);
    EXPECT_EQ(origin->field->shown.unit, "dBm");
}

TEST_F(ValueOriginTest, ALabelHasNoNumber)
{
    generator = make<LTELogGenerator>();
    feed(PacketBuilder(0xB0C2).u8(20, 50).size(38));
    const auto origin = originOf({"Serving Cell Info", "Download Bandwidth"});
    ASSERT_TRUE(origin);
    EXPECT_EQ(origin->raw, 50);
    EXPECT_FALSE(origin->number());
}

TEST_F(ValueOriginTest, AValueOfARowCountsFromItsElement)
{
    generator = make<LTELogGenerator>();
    feed(PacketBuilder(0xB179).u8(27, 2).u16(29, 11).u16(35, 12).u16(37, 200).size(41));
    const auto origin = originOf({"Measured Neighbor Cells", "1", "Filtered RSRP"});
    ASSERT_TRUE(origin);
    EXPECT_EQ(origin->firstByte(), 37U); // 29 + 6 + 2
    EXPECT_EQ(origin->number(), -90.0);  // -140 + 200 / 4
}

TEST_F(ValueOriginTest, AValueOfARowUnderAKeyIsFoundByAllThree)
{
    generator = make<Orbel_GSMLogGenerator>();
    feed(PacketBuilder(0x4116).u8(13, 2).u32(26, 70).size(34));
    const auto origin = originOf({"BLER", "Transport Channels", "1", "CRC Received"});
    ASSERT_TRUE(origin);
    EXPECT_EQ(origin->record->name, "UMTS block errors");
    EXPECT_EQ(origin->firstByte(), 26U); // 16 + 9 + 1
    EXPECT_EQ(origin->raw, 70);
}

TEST_F(ValueOriginTest, WhatNoFieldShowsHasNone)
{
    generator = make<LTELogGenerator>();
    feed(PacketBuilder(0xB0C1).u8(20, 2).size(22));
    EXPECT_FALSE(originOf({}));
    EXPECT_FALSE(originOf({"Serving Cell Info"}));
    EXPECT_FALSE(originOf({"Serving Cell Info", "Cell Identity"})); // still the template's dash
    EXPECT_FALSE(originOf({"Serving Cell Info", "0", "Cell Identity"}));
    EXPECT_FALSE(originOf({"Measured Neighbor Cells", "0", "Physical Cell ID"}));
    EXPECT_FALSE(originOf({"Measured Neighbor Cells", "x", "Physical Cell ID"}));
    EXPECT_FALSE(originOf({"No such section", "Cell Identity"}));
}

TEST_F(C2KValueOriginTest, ALabelTellsTheFieldThatItShows)
{
    feed(evdoStatusPacket());
    const auto origin = generator->originOf(state, Path{"kServingPNOffset"});
    ASSERT_TRUE(origin);
    EXPECT_EQ(origin->record->logCode, 0x1183U);
    EXPECT_EQ(origin->raw, 264);
    EXPECT_FALSE(generator->originOf(state, Path{"kActiveSetPilots"}));
    EXPECT_FALSE(generator->originOf(state, Path{"no such group", "kServingPNOffset"}));
    EXPECT_FALSE(generator->originOf(state, Path{}));
}

} // namespace ventrik
