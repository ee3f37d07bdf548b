#include "LogGenerator/Orbel/LTE/LTESections.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;

class ServingCellMeasurementTest : public SectionFixture<ServingCellMeasurement>
{
  protected:
    static PacketBuilder measurement() { return PacketBuilder(0xB17F).size(33); }

    std::string shownFor(std::size_t offset, unsigned shift, unsigned width, std::uint32_t value,
                         std::string_view key)
    {
        feed(measurement().bits(offset, shift, width, value));
        return shown(key);
    }
};

struct FieldRow {
    std::size_t offset;
    unsigned shift;
    unsigned width;
    std::uint32_t raw;
    std::string_view key;
    std::string_view text;
};

// The field's lowest bit is bit `shift` of the byte at `offset`.
constexpr FieldRow fieldRows[] = {
    {13, 0, 8, 4, "Version", "4"},
    {13, 0, 8, 255, "Version", "255"},
    {17, 0, 16, 1300, "E-ARFCN", "1300"},
    {17, 0, 16, 65535, "E-ARFCN", "65535"},
    {19, 0, 9, 503, "Physical Cell ID", "503"},
    {19, 0, 9, 511, "Physical Cell ID", "511"},
    {19, 9, 4, 15, "Serving Layer Priority", "15"},
    {21, 0, 9, 0, "Measured RSRP", "-140.00 dBm"},
    {21, 0, 9, 181, "Measured RSRP", "-94.75 dBm"},
    {21, 0, 9, 511, "Measured RSRP", "-12.25 dBm"},
    {22, 1, 9, 0, "Average RSRP", "-140.00 dBm"},
    {22, 1, 9, 511, "Average RSRP", "-12.25 dBm"},
    {23, 2, 7, 0, "Measured RSRQ", "-30.00 dB"},
    {23, 2, 7, 77, "Measured RSRQ", "-10.75 dB"},
    {23, 2, 7, 127, "Measured RSRQ", "1.75 dB"},
    {24, 1, 7, 0, "Average RSRQ", "-30.00 dB"},
    {24, 1, 7, 127, "Average RSRQ", "1.75 dB"},
    {25, 0, 9, 0, "Measured RSSI", "-140.00 dBm"},
    {25, 0, 9, 147, "Measured RSSI", "-66.50 dBm"},
    {25, 0, 9, 511, "Measured RSSI", "115.50 dBm"},
    {26, 1, 6, 0, "Qrxlevmin", "-140 dBm"},
    {26, 1, 6, 63, "Qrxlevmin", "-14 dBm"},
    {26, 7, 7, 0, "P_Max", "-30 dBm"},
    {26, 7, 7, 63, "P_Max", "33 dBm"},
    {26, 7, 7, 64, "P_Max", "Not Present"},
    {26, 7, 7, 127, "P_Max", "97 dBm"},
    {27, 6, 6, 0, "Max UE Tx Power", "-30 dBm"},
    {27, 6, 6, 63, "Max UE Tx Power", "33 dBm"},
    {29, 0, 7, 0, "Srxlev", "-30 dBm"},
    {29, 0, 7, 127, "Srxlev", "97 dBm"},
    {29, 7, 6, 63, "Num of Consecutive DRX Cycles of S < 0", "63"},
    {30, 5, 6, 0, "S Intra Search", "0 dB"},
    {30, 5, 6, 31, "S Intra Search", "62 dB"},
    {30, 5, 6, 32, "S Intra Search", "Not Present"},
    {30, 5, 6, 63, "S Intra Search", "126 dB"},
    {31, 3, 6, 0, "S Non Intra Search", "0 dBm"},
    {31, 3, 6, 31, "S Non Intra Search", "62 dBm"},
    {31, 3, 6, 32, "S Non Intra Search", "Not Present"},
    {31, 3, 6, 63, "S Non Intra Search", "126 dBm"},
    {32, 1, 1, 0, "Measurement Rules Updated", "False"},
    {32, 1, 1, 1, "Measurement Rules Updated", "True"},
    {32, 2, 4, 15, "Measurement Rules", "15"},
};

} // namespace

TEST_F(ServingCellMeasurementTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "Serving Cell Measurements");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xB17F));
}

TEST_F(ServingCellMeasurementTest, EachFieldIsReadFromItsBitsAndFormatted)
{
    for (const FieldRow& row : fieldRows)
        EXPECT_EQ(shownFor(row.offset, row.shift, row.width, row.raw, row.key), row.text)
            << row.key << " raw " << row.raw;
}

TEST_F(ServingCellMeasurementTest, NoFieldIsTouchedByTheBitsAroundIt)
{
    for (const FieldRow& row : fieldRows) {
        PacketBuilder packet = measurement();
        for (std::size_t offset = 13; offset < 33; ++offset)
            packet.u8(offset, 0xFF);
        feed(packet.bits(row.offset, row.shift, row.width, row.raw));
        EXPECT_EQ(shown(row.key), row.text) << row.key << " raw " << row.raw;
    }
}

TEST_F(ServingCellMeasurementTest, KeysAreWrittenInTheRecordsOrder)
{
    feed(measurement());
    EXPECT_THAT(keysOf(values),
                ElementsAre("Version", "E-ARFCN", "Physical Cell ID", "Serving Layer Priority",
                            "Measured RSRP", "Average RSRP", "Measured RSRQ", "Average RSRQ",
                            "Measured RSSI", "Qrxlevmin", "P_Max", "Max UE Tx Power", "Srxlev",
                            "Num of Consecutive DRX Cycles of S < 0", "S Intra Search",
                            "S Non Intra Search", "Measurement Rules Updated",
                            "Measurement Rules"));
}

TEST_F(ServingCellMeasurementTest, ARecordOf32BytesChangesNothing)
{
    feed(measurement().size(32));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.texts(), ElementsAre("Serving Cell Measurements"));
}

TEST_F(ServingCellMeasurementTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0xB179).size(60));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.texts(),
                ElementsAre("Serving Cell Measurements", "Received an unknown log message: 45433"));
}

} // namespace ventrik
