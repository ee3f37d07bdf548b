#include "Packets/RecordWriter.h"
#include "Packets/ShownNumbers.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <stdexcept>

namespace ventrik
{

using testing::ElementsAre;
using testing::Property;
using testing::Throws;

namespace
{

constexpr std::array<Field, 4> sampleFields{{
    {"Channel", u16(13)},
    {"Level", bits(15, 1, 9), dbm(0.25, -140)},
    {"Balance", {16, 4, 4, true}, wholeDb(2)},
    {"Area", u16BigEndian(17)},
}};
constexpr std::array<Field, 1> sampleUnshown{{{"version", u8(19)}}};
constexpr std::array<Field, 2> cellFields{{{"Cell", u8(0)}, {"RSSI", i8(1), wholeDbm()}}};
constexpr std::array<Field, 1> cellUnshown{{{"kind", bits(2, 0, 2)}}};
constexpr List cells{.key = "Cells",
                     .offset = 22,
                     .stride = 3,
                     .needed = 3,
                     .count = {u8(20)},
                     .fields = cellFields,
                     .unshown = cellUnshown};
constexpr std::array<Field, 1> carrierFields{{{"Carrier", u16(0)}}};
constexpr List carriers{.key = "Carriers",
                        .offset = 22,
                        .stride = 2,
                        .needed = 2,
                        .count = {bits(21, 0, 4)},
                        .fields = carrierFields,
                        .before = {u8(20), 3}};
constexpr Record sample{0x1234, "Sample", 22, {sampleFields, sampleUnshown}, {&cells, &carriers},
                        u8(19)};

// The bytes of a packet behind its header.
Bytes payloadOf(const RecordWriter& record)
{
    const Bytes packet = record.packet().build();
    return {packet.begin() + logPacketHeaderSize, packet.end()};
}

auto throwsInvalidArgument(const std::string& what)
{
    return Throws<std::invalid_argument>(
        Property(&std::invalid_argument::what, testing::StrEq(what)));
}

} // namespace

TEST(RecordWriter, BeginsWithZerosInTheRecordsSmallestSize)
{
    EXPECT_THAT(RecordWriter(sample).packet().build(),
                ElementsAre(1, 21, 0, 0x34, 0x12, 0, 0, 0, 0, 0, 0, 0, 0, //
                            0, 0, 0, 0, 0, 0, 0, 0, 0));
}

TEST(RecordWriter, ARecordOfAnySizeHasItsHeader)
{
    const Record record{extraCodeBase + 7, "Any size", 0};
    EXPECT_THAT(RecordWriter(record).packet().build(),
                ElementsAre(255, 12, 0, 7, 0, 0, 0, 0, 0, 0, 0, 0, 0));
}

TEST(RecordWriter, WritesRawNumbersWhereTheirFieldsLie)
{
    // 0x155 from bit 1 is 0x2AA; -3 in four bits is 0xD.
    EXPECT_EQ(payloadOf(RecordWriter(sample)
                            .set("Channel", 0x0102)
                            .set("Level", 0x155)
                            .set("Balance", -3)
                            .set("Area", 0x0304)
                            .set("version", 5)),
              (Bytes{0x02, 0x01, 0xAA, 0xD2, 0x03, 0x04, 5, 0, 0}));
}

TEST(RecordWriter, WritesNoBitsButTheFieldsOwn)
{
    EXPECT_EQ(payloadOf(RecordWriter(sample).set("Level", -1)),
              (Bytes{0, 0, 0xFE, 0x03, 0, 0, 0, 0, 0}));
    EXPECT_EQ(payloadOf(RecordWriter(sample).set("Channel", 0x12345)),
              (Bytes{0x45, 0x23, 0, 0, 0, 0, 0, 0, 0}));
    EXPECT_EQ(payloadOf(RecordWriter(sample).set("Area", 0x12345)),
              (Bytes{0, 0, 0, 0, 0x23, 0x45, 0, 0, 0}));
    EXPECT_EQ(payloadOf(RecordWriter(sample).set("Level", -1).set("Level", 1)),
              (Bytes{0, 0, 0x02, 0, 0, 0, 0, 0, 0}));
}

TEST(RecordWriter, TheRawNumberOfALevelShowsNearestToIt)
{
    const Field quarters{"Level", bits(0, 0, 9), dbm(0.25, -140)};
    const Field doubles{"Balance", {0, 0, 4, true}, wholeDb(2)};
    const std::tuple<Field, double, std::int64_t> cases[]{
        {quarters, -140, 0},    {quarters, -139.75, 1}, {quarters, -139.87, 1},
        {quarters, -139.88, 0}, {quarters, -90, 200},   {doubles, 6, 3},
        {doubles, -6, -3},      {doubles, 6.9, 3},      {doubles, -7.1, -4},
    };
    for (const auto& [field, value, raw] : cases)
        EXPECT_EQ(rawNumber(field, value), raw) << field.key << " of " << value;
}

TEST(RecordWriter, ALevelIsCutToWhatItsBitsHold)
{
    const Field quarters{"Level", bits(0, 0, 9), dbm(0.25, -140)};
    EXPECT_EQ(rawNumber(quarters, -141), 0);
    EXPECT_EQ(rawNumber(quarters, -12.25), 511);
    EXPECT_EQ(rawNumber(quarters, 1e9), 511);
    const Field steps{"Balance", {0, 0, 4, true}, wholeDb()};
    EXPECT_EQ(rawNumber(steps, -9), -8);
    EXPECT_EQ(rawNumber(steps, 8), 7);
    const Field bytes{"RSSI", i8(0), wholeDbm()};
    EXPECT_EQ(rawNumber(bytes, -200), -128);
    EXPECT_EQ(rawNumber(bytes, 200), 127);
    EXPECT_EQ(rawNumber({"Counter", u32(0)}, 1e12), 0xFFFFFFFF);
}

TEST(RecordWriter, WritesLevelsAsRawNumbers)
{
    // 4 in the nine bits from bit 1; -2 in the four from bit 4
    EXPECT_EQ(payloadOf(RecordWriter(sample).level("Level", -139).level("Balance", -4)),
              (Bytes{0, 0, 0x08, 0xE0, 0, 0, 0, 0, 0}));
}

TEST(RecordWriter, AppendsAndCountsTheElementsOfAList)
{
    RecordWriter record(sample);
    record.add(cells).set("Cell", 7).level("RSSI", -90);
    record.add(cells).set("Cell", 8).set("kind", 3);
    EXPECT_EQ(payloadOf(record), (Bytes{0, 0, 0, 0, 0, 0, 0, 2, 0, /**/ 7, 0xA6, 0, /**/ 8, 0, 3}));
}

TEST(RecordWriter, AListBehindAnotherBeginsWhereThatOneEnds)
{
    RecordWriter record(sample);
    record.add(cells).set("Cell", 7);
    record.add(cells).set("Cell", 8);
    record.add(carriers).set("Carrier", 0x0102);
    record.add(carriers).set("Carrier", 0x0304);
    EXPECT_EQ(payloadOf(record),
              (Bytes{0, 0, 0, 0, 0, 0, 0, 2, 2, /**/ 7, 0, 0, 8, 0, 0, /**/ 2, 1, 4, 3}));
}

TEST(RecordWriter, AListBehindAnEmptyOneBeginsInItsPlace)
{
    RecordWriter record(sample);
    record.add(carriers).set("Carrier", 0x0102);
    EXPECT_EQ(payloadOf(record), (Bytes{0, 0, 0, 0, 0, 0, 0, 0, 1, /**/ 2, 1}));
}

TEST(RecordWriter, ACountTellsOfFewerElementsWhereItLeavesSomeOut)
{
    const List list{.key = "",
                    .offset = 14,
                    .stride = 1,
                    .needed = 1,
                    .count = {u8(13), 1},
                    .fields = cellFields};
    const Record record{0x1234, "Sample", 14, {}, {&list}};
    RecordWriter writer(record);
    writer.add(list).set("Cell", 7);
    EXPECT_EQ(payloadOf(writer), (Bytes{0, 7}));
    writer.add(list).set("Cell", 8);
    EXPECT_EQ(payloadOf(writer), (Bytes{1, 7, 8}));
}

TEST(RecordWriter, OneNumberCountsTwoLists)
{
    const List second{.key = "",
                      .offset = 14,
                      .stride = 2,
                      .needed = 2,
                      .count = {u8(13)},
                      .fields = carrierFields,
                      .before = {u8(13), 1}};
    const List first{.key = "",
                     .offset = 14,
                     .stride = 1,
                     .needed = 1,
                     .count = {u8(13)},
                     .fields = std::span(cellFields).first(1)};
    const Record record{0x1234, "Sample", 14, {}, {&first, &second}};
    RecordWriter writer(record);
    for (const int cell : {7, 8, 9})
        writer.add(first).set("Cell", cell);
    for (const int carrier : {0x0102, 0x0304, 0x0506})
        writer.add(second).set("Carrier", carrier);
    EXPECT_EQ(payloadOf(writer), (Bytes{3, /**/ 7, 8, 9, /**/ 2, 1, 4, 3, 6, 5}));
}

TEST(RecordWriter, AListOverAnotherLeavesWhatReachesBehindIt)
{
    const List wide{
        .key = "", .offset = 15, .stride = 3, .needed = 3, .count = {u8(13)}, .fields = cellFields};
    const List narrow{.key = "",
                      .offset = 15,
                      .stride = 2,
                      .needed = 2,
                      .count = {u8(14)},
                      .fields = carrierFields};
    const Record record{0x1234, "Sample", 15, {}, {&wide, &narrow}};
    RecordWriter writer(record);
    writer.add(wide).set("Cell", 7).set("RSSI", 8);
    writer.add(wide).set("Cell", 9).set("RSSI", 10);
    writer.add(narrow).set("Carrier", 0x0102);
    EXPECT_EQ(payloadOf(writer), (Bytes{2, 1, /**/ 2, 1, 0, 9, 10, 0}));
}

TEST(RecordWriter, BeginningAListLeavesWhatReachesBehindItsPlace)
{
    RecordWriter record(sample);
    record.add(cells).set("Cell", 7);
    EXPECT_EQ(payloadOf(record.begin(cells)), (Bytes{0, 0, 0, 0, 0, 0, 0, 1, 0, /**/ 7, 0, 0}));
}

TEST(RecordWriter, BeginningAListFillsThePacketUpToIt)
{
    const List list{.key = "", .offset = 20, .stride = 1, .needed = 1, .count = {u8(13)}};
    const Record record{0x1234, "Sample", 14, {}, {&list}};
    EXPECT_EQ(payloadOf(RecordWriter(record).begin(list)), Bytes(7));
    EXPECT_EQ(payloadOf(RecordWriter(sample).set("Channel", 1).begin(cells)),
              (Bytes{1, 0, 0, 0, 0, 0, 0, 0, 0}));
}

TEST(RecordWriter, BeginsAListBehindThoseOfTheListBeforeIt)
{
    RecordWriter record(sample);
    record.add(cells);
    record.begin(carriers);
    EXPECT_EQ(payloadOf(record), (Bytes{0, 0, 0, 0, 0, 0, 0, 1, 0, /**/ 0, 0, 0}));
}

TEST(RecordWriter, WritesToAnElementThatNothingCounts)
{
    RecordWriter record(sample);
    record.at({14, 4, 2, 2}, 1, cellFields).set("Cell", 7).set("RSSI", -1);
    EXPECT_EQ(payloadOf(record), (Bytes{0, 0, 0, 0, 0, 7, 0xFF, 0, 0}));
}

TEST(RecordWriter, WritesToPartsOfAnElement)
{
    RecordWriter record(sample);
    record.add(cells).with(carrierFields).set("Carrier", 0x0102);
    record.add(cells).at(1, carrierFields).set("Carrier", 0x0304);
    EXPECT_EQ(payloadOf(record), (Bytes{0, 0, 0, 0, 0, 0, 0, 2, 0, /**/ 2, 1, 0, /**/ 0, 4, 3}));
}

TEST(RecordWriter, AppendsAndCountsSubpackets)
{
    static constexpr std::array<Field, 1> state{{{"State", u8(4)}}};
    static constexpr std::array<Field, 1> radio{{{"Channel", u16(4)}}};
    RecordWriter record(Record{0x119C, "Parts", Subpackets::minimumSize});
    record.add(Subpacket{1, state}, 5).set("State", 7);
    record.add(Subpacket{2, radio}, 300).set("Channel", 0x0102);
    record.add(Subpacket{4}, 4);
    Bytes expected{0, 3, 0, 0, /**/ 1, 0, 5, 0, 7, /**/ 2, 0, 0x2C, 1, 2, 1};
    expected.resize(4 + 5 + 300);
    expected.insert(expected.end(), {4, 0, 4, 0});
    EXPECT_EQ(payloadOf(record), expected);
}

TEST(RecordWriter, CutsThePacketOrFillsItUpWithZeros)
{
    EXPECT_EQ(payloadOf(RecordWriter(sample).set("Channel", 0x0102).size(14)), (Bytes{2}));
    EXPECT_EQ(payloadOf(RecordWriter(sample).size(24)), Bytes(11));
}

TEST(RecordWriter, RefusesAFieldThatTheRecordDoesNotHave)
{
    RecordWriter record(sample);
    EXPECT_THAT([&] { record.set("Chanel", 1); },
                throwsInvalidArgument("Sample has no field \"Chanel\""));
    EXPECT_THAT([&] { record.level("channel", 1); },
                throwsInvalidArgument("Sample has no field \"channel\""));
    EXPECT_THAT([&] { record.set("Cell", 1); },
                throwsInvalidArgument("Sample has no field \"Cell\""));
}

TEST(RecordWriter, RefusesAFieldThatThePartDoesNotHave)
{
    RecordWriter record(sample);
    record.add(cells);
    const FieldWriter cell = record.add(cells);
    EXPECT_THAT([&] { cell.set("Channel", 1); },
                throwsInvalidArgument("record 0x1234 has no field \"Channel\" in the part at 25"));
    EXPECT_THAT([&] { cell.level("", 1); },
                throwsInvalidArgument("record 0x1234 has no field \"\" in the part at 25"));
    EXPECT_THAT([&] { cell.with(carrierFields).set("Cell", 1); },
                throwsInvalidArgument("record 0x1234 has no field \"Cell\" in the part at 25"));
}

TEST(RecordWriter, WhatItWritesIsReadBack)
{
    for (const bool isSigned : {false, true})
        for (std::uint8_t bit = 0; bit < 16; ++bit)
            for (std::uint8_t width = 1; width <= 48; ++width) {
                const Place place{14, bit, width, isSigned};
                const std::int64_t top = std::int64_t{1} << (width - 1);
                const std::int64_t lowest = isSigned ? -top : 0;
                const std::int64_t highest = isSigned ? top - 1 : 2 * top - 1;
                for (const std::int64_t raw : {lowest, highest, highest / 3}) {
                    PacketBuilder packet(1);
                    packet.bytes(13, Bytes(10, 0xFF));
                    writeNumber(packet, 0, place, raw);
                    ASSERT_EQ(numberAt(LogPacket(packet.written()), place), raw)
                        << int{width} << " bits from bit " << int{bit};
                }
            }
}

TEST(RecordWriter, LeavesTheBitsAroundAFieldAlone)
{
    PacketBuilder packet(1);
    packet.bytes(13, Bytes(10, 0xFF));
    writeNumber(packet, 1, bits(13, 7, 40), 0);
    const ByteView payload = packet.written().subspan(13);
    EXPECT_THAT(payload, ElementsAre(0xFF, 0x7F, 0, 0, 0, 0, 0x80, 0xFF, 0xFF, 0xFF));
}

TEST(RecordWriter, WritesSignedBigEndianNumbers)
{
    PacketBuilder packet(1);
    const Place place{13, 0, 16, true, true};
    writeNumber(packet, 0, place, -2);
    EXPECT_THAT(packet.written().subspan(13), ElementsAre(0xFF, 0xFE));
    EXPECT_EQ(numberAt(LogPacket(packet.written()), place), -2);
}

} // namespace ventrik
