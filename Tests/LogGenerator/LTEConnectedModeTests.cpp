#include "LogGenerator/Orbel/LTE/LTESections.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;

class ConnectedModeTest : public SectionFixture<ConnectedModeMeasurementMisc>
{
  protected:
    static PacketBuilder measurement()
    {
        return PacketBuilder(0xB179)
            .u16(17, 1300)
            .u16(19, 301)
            .u16(21, 65535)
            .u16(23, 160)
            .u16(25, 84)
            .size(29);
    }
};

} // namespace

TEST_F(ConnectedModeTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "Connected mode LTE Intra-frequency Measurement");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xB179));
}

TEST_F(ConnectedModeTest, ShowsEachField)
{
    feed(measurement());
    EXPECT_EQ(shown("E-ARFCN"), "1300");
    EXPECT_EQ(shown("Serving Physical Cell ID"), "301");
    EXPECT_EQ(shown("Subframe Number"), "65535");
    EXPECT_EQ(shown("Serving Filtered RSRP"), "-100.00 dBm"); // 160 / 4 - 140
    EXPECT_EQ(shown("Serving Filtered RSRQ"), "-9.50 dB");    // 84 / 8 - 20
    EXPECT_THAT(keysOf(values),
                ElementsAre("E-ARFCN", "Serving Physical Cell ID", "Subframe Number",
                            "Serving Filtered RSRP", "Serving Filtered RSRQ"));
}

TEST_F(ConnectedModeTest, ShowsTheEndsOfTheLevels)
{
    feed(measurement().u16(23, 0).u16(25, 0));
    EXPECT_EQ(shown("Serving Filtered RSRP"), "-140.00 dBm");
    EXPECT_EQ(shown("Serving Filtered RSRQ"), "-20.00 dB");
    feed(measurement().u16(23, 65535).u16(25, 65535));
    EXPECT_EQ(shown("Serving Filtered RSRP"), "16243.75 dBm"); // 16383.75 - 140
    EXPECT_EQ(shown("Serving Filtered RSRQ"), "8171.88 dB");   // 8191.875 - 20 = 8171.875
}

TEST_F(ConnectedModeTest, ARecordOf28BytesChangesNothing)
{
    feed(measurement().size(28));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.texts(), ElementsAre("Connected mode LTE Intra-frequency Measurement"));
}

TEST_F(ConnectedModeTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0xB17F).size(60));
    EXPECT_TRUE(values.empty());
    EXPECT_TRUE(log.contains("Received an unknown log message: 45439"));
}

} // namespace ventrik
