#include "LogGenerator/Orbel/UTRAN/UTRANSections.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

// A record that announces so many cells, all bytes of them 0.
PacketBuilder utranRecord(std::uint8_t count)
{
    return PacketBuilder(0xD00A)
        .u8(16, static_cast<std::uint8_t>(count << 1))
        .size(168 + std::size_t{16} * count);
}

PacketBuilder gsmRecord(std::uint8_t count)
{
    return PacketBuilder(0xD00E).u8(16, count).size(17 + std::size_t{8} * count);
}

using UTRANNeighborsTest = ListSectionFixture<UTRANNeighbhorMeasurements>;
using GSMNeighborsTest = ListSectionFixture<GSMNeighbhorMeasurements>;

struct CellRow {
    Bytes bytes; // of the element
    std::string_view key;
    std::string_view text;
};

const CellRow utranCellRows[] = {
    {{0x46, 0x27, 0x00, 0x00}, "UARFCN", "10054"},
    {{0xFF, 0x3F, 0x00, 0x00}, "UARFCN", "16383"},
    {{0x00, 0xC0, 0xFF, 0xFF}, "UARFCN", "0"},
    {{0x00, 0x40, 0x00, 0x00}, "Cell ID", "1"},
    {{0x00, 0x80, 0x00, 0x00}, "Cell ID", "2"},
    {{0x00, 0x00, 0x01, 0x00}, "Cell ID", "4"},
    {{0x00, 0xC0, 0x0B, 0x00}, "Cell ID", "47"}, // 3 + 4 * 11
    {{0x00, 0xC0, 0x1F, 0x00}, "Cell ID", "127"},
    {{0xFF, 0x3F, 0xE0, 0xFF}, "Cell ID", "0"},
    {{0x00, 0x00, 0x20, 0x00}, "Filter RSCP", "0.003906"}, // 1 / 256
    {{0x00, 0x00, 0x00, 0x01}, "Filter RSCP", "0.031250"}, // 8 / 256
    {{0x00, 0x00, 0x00, 0x10}, "Filter RSCP", "0.500000"}, // 128 / 256
    {{0x00, 0x00, 0xE0, 0x1F}, "Filter RSCP", "0.996094"}, // 255 / 256
    {{0xFF, 0xFF, 0x1F, 0xE0}, "Filter RSCP", "0.000000"},
    {{0x00, 0x00, 0x00, 0x00}, "Status", "ASET"},
    {{0xFF, 0xFF, 0xFF, 0x9F}, "Status", "ASET"},
    {{0x00, 0x00, 0x00, 0x20}, "Status", "MSET"},
    {{0x00, 0x00, 0x00, 0x40}, "Status", "DSET"},
    {{0x00, 0x00, 0x00, 0x60}, "Status", "(none)"},
    {{0x00, 0x00, 0x00, 0xE0}, "Status", "(none)"},
    {{0x00, 0x00, 0x00, 0x80}, "inJDCS", "TRUE"},
    {{0x00, 0x00, 0x00, 0xE0}, "inJDCS", "TRUE"},
    {{0x00, 0x00, 0x00, 0x40}, "inJDCS", "FALSE"},
    {{0xFF, 0xFF, 0xFF, 0x7F}, "inJDCS", "FALSE"},
};

const CellRow gsmCellRows[] = {
    {{0xB1, 0x04, 0, 0, 0, 0, 0, 0}, "Cell ID", "1201"}, // 4 * 256 + 177
    {{0xFF, 0x3F, 0, 0, 0, 0, 0, 0}, "Cell ID", "16383"},
    {{0x00, 0xC0, 0, 0, 0, 0, 0, 0}, "Cell ID", "0"},
    {{0x00, 0x40, 0, 0, 0, 0, 0, 0}, "Band Indicator", "1"},
    {{0xFF, 0xBF, 0, 0, 0, 0, 0, 0}, "Band Indicator", "0"},
    {{0x00, 0x80, 0, 0, 0, 0, 0, 0}, "BSIC Valid", "1"},
    {{0xFF, 0x7F, 0, 0, 0, 0, 0, 0}, "BSIC Valid", "0"},
    {{0, 0, 7, 0, 0, 0, 0, 0}, "NCC", "7"},
    {{0, 0, 255, 0, 0, 0, 0, 0}, "NCC", "255"},
    {{0, 0, 0, 5, 0, 0, 0, 0}, "BCC", "5"},
    {{0, 0, 0, 255, 0, 0, 0, 0}, "BCC", "255"},
    {{0, 0, 0, 0, 0x24, 0x02, 0, 0}, "ARFCN", "548"}, // 2 * 256 + 36
    {{0, 0, 0, 0, 0xFF, 0xFF, 0, 0}, "ARFCN", "65535"},
    {{0, 0, 0, 0, 0, 0, 0xA6, 0xFF}, "RSSI", "-90"}, // 65446 - 65536
    {{0, 0, 0, 0, 0, 0, 0xFF, 0x7F}, "RSSI", "32767"},
    {{0, 0, 0, 0, 0, 0, 0x00, 0x80}, "RSSI", "-32768"},
};

PlistArray gsmRows(const PacketBuilder& builder)
{
    const Bytes packet = builder.build();
    RowList list;
    PlistArray rows;
    RowList::Rewrite(list, rows, UTRANRecords::gsmNeighborMeasurements)
        .showElements(UTRANRecords::gsmNeighbors, LogPacket(packet));
    return rows;
}

} // namespace

TEST_F(UTRANNeighborsTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "Neighbor Cell List");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xD00A));
}

TEST_F(UTRANNeighborsTest, EachFieldIsReadFromItsBitsAndFormatted)
{
    for (const CellRow& row : utranCellRows) {
        feed(utranRecord(2).bytes(184, row.bytes)); // 168 + 16: the second cell
        EXPECT_EQ(shown(1, row.key), row.text) << row.key;
    }
}

TEST_F(UTRANNeighborsTest, RowsHaveTheirKeysInOrder)
{
    feed(utranRecord(2).u8(187, 0xE0));
    EXPECT_THAT(keysOf(*rows[0].dictionary()),
                ElementsAre("UARFCN", "Cell ID", "Filter RSCP", "Status", "inJDCS"));
    EXPECT_THAT(keysOf(*rows[1].dictionary()),
                ElementsAre("UARFCN", "Cell ID", "Filter RSCP", "inJDCS"));
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "NeighbhorMeasurements List"}));
}

TEST_F(UTRANNeighborsTest, TheCountLeavesOutTheLowestBit)
{
    feed(utranRecord(127).u8(16, 0x07));
    EXPECT_EQ(rows.size(), 3U);
    feed(utranRecord(127).u8(16, 0xFF));
    EXPECT_EQ(rows.size(), 127U);
    feed(utranRecord(127).u8(16, 0x01));
    EXPECT_TRUE(rows.empty());
}

TEST_F(UTRANNeighborsTest, ACellNeedsItsFirst4Bytes)
{
    feed(utranRecord(2).size(168 + 16 + 3));
    EXPECT_EQ(rows.size(), 1U);
    feed(utranRecord(2).size(168 + 16 + 4));
    EXPECT_EQ(rows.size(), 2U);
}

TEST_F(UTRANNeighborsTest, ARecordWithoutACompleteCellEmptiesTheList)
{
    for (const std::size_t size : {21U, 168U, 171U}) {
        rows.append("row");
        feed(utranRecord(5).size(size));
        EXPECT_TRUE(rows.empty()) << size;
    }
}

TEST_F(UTRANNeighborsTest, ARecordOf20BytesLeavesTheListAsItWas)
{
    rows.append("row");
    feed(utranRecord(1).size(20));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "NeighbhorMeasurements List"}));
}

TEST_F(UTRANNeighborsTest, AnotherCodeLeavesTheListAsItWas)
{
    rows.append("row");
    feed(PacketBuilder(0xD00E).size(200));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "NeighbhorMeasurements List"}));
}

TEST_F(UTRANNeighborsTest, WithoutAContainerARecordIsHarmless)
{
    UTRANNeighbhorMeasurements unbound(log);
    const Bytes packet = utranRecord(3).build();
    unbound.updateWithData(LogPacket(packet), 0xD00A);
    EXPECT_TRUE(rows.empty());
}

TEST_F(GSMNeighborsTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "GSM Neighbor Cell List");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xD00E));
}

TEST_F(GSMNeighborsTest, AnyRecordEmptiesTheListForGood)
{
    for (const std::uint8_t count : Bytes{0, 1, 3, 255}) {
        rows.append("row");
        feed(gsmRecord(count));
        EXPECT_TRUE(rows.empty()) << int{count};
    }
    EXPECT_EQ(log.lines(), std::vector<Line>(4, Line{4, "GSM Neighbor Cell List"}));
}

TEST_F(GSMNeighborsTest, ARecordOf17BytesEmptiesTheList)
{
    rows.append("row");
    feed(gsmRecord(3).size(17));
    EXPECT_TRUE(rows.empty());
}

TEST_F(GSMNeighborsTest, ARecordOf16BytesLeavesTheListAsItWas)
{
    rows.append("row");
    feed(gsmRecord(0).size(16));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "GSM Neighbor Cell List"}));
}

TEST_F(GSMNeighborsTest, AnotherCodeLeavesTheListAsItWas)
{
    rows.append("row");
    feed(PacketBuilder(0xD00A).size(200));
    EXPECT_EQ(rows.size(), 1U);
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "GSM Neighbor Cell List"}));
}

TEST(GSMNeighborRows, EachFieldIsReadFromItsBitsAndFormatted)
{
    for (const CellRow& row : gsmCellRows) {
        const PlistArray cells = gsmRows(gsmRecord(2).bytes(25, row.bytes)); // 17 + 8
        EXPECT_EQ(textAt(cells[1], {row.key}), row.text) << row.key;
    }
}

TEST(GSMNeighborRows, HaveTheirKeysInOrder)
{
    EXPECT_THAT(
        keysOf(*gsmRows(gsmRecord(1))[0].dictionary()),
        ElementsAre("Cell ID", "Band Indicator", "BSIC Valid", "NCC", "BCC", "ARFCN", "RSSI"));
}

TEST(GSMNeighborRows, StopAtTheLastCompleteCell)
{
    EXPECT_EQ(gsmRows(gsmRecord(0)).size(), 0U);
    EXPECT_EQ(gsmRows(gsmRecord(1)).size(), 1U);
    EXPECT_EQ(gsmRows(gsmRecord(255)).size(), 255U);
    EXPECT_EQ(gsmRows(gsmRecord(3).size(17 + 15)).size(), 1U);
    EXPECT_EQ(gsmRows(gsmRecord(3).size(17 + 16)).size(), 2U);
    EXPECT_EQ(gsmRows(gsmRecord(3).size(17 + 7)).size(), 0U);
}

} // namespace ventrik
