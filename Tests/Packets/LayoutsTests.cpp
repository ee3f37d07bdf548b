#include "Packets/Layouts.h"

#include "Packets/AllRecords.h"
#include "Packets/GSMLayouts.h"
#include "Packets/LTELayouts.h"
#include "Packets/LTESignalRecords.h"
#include "Packets/LTEStateRecords.h"
#include "Packets/PacketBuilder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

PacketBuilder sized(std::uint32_t code, std::size_t size)
{
    PacketBuilder packet(code);
    packet.size(size);
    return packet;
}

PacketBuilder versioned(std::uint32_t code, std::uint8_t version, std::size_t size)
{
    return sized(code, size).u8(13, version);
}

ChosenLayout chosenFor(const PacketBuilder& builder)
{
    const Bytes packet = builder.build();
    const LogPacket bytes(packet);
    const std::uint32_t code = effectiveLogCode(bytes);
    return chooseLayout(*recordOf(code), layoutsOf(code), bytes);
}

void expectChoice(const PacketBuilder& packet, const Record& record, LayoutKind kind)
{
    const ChosenLayout chosen = chosenFor(packet);
    const std::string what = fmt::format("0x{:04X} version {} of {} bytes", record.logCode,
                                         packet.build()[13], packet.build().size());
    EXPECT_EQ(chosen.record, &record) << what;
    EXPECT_EQ(nameOf(chosen.kind), nameOf(kind)) << what;
}

// A version and a size that tell a layout by themselves. One byte less or more, or another version,
// tells none.
struct PlainLayout {
    const Record* record;
    const Record* base;
    std::uint8_t version;
    std::size_t size;
    LayoutKind kind;
};

const std::vector<PlainLayout>& plainLayouts()
{
    using enum LayoutKind;
    using namespace LTELayouts;
    static const std::vector<PlainLayout> plain{
        {&LTERecords::antennaCount, &LTERecords::antennaCount, 1, 22, Base},
        {&antennaCount2, &LTERecords::antennaCount, 2, 24, Newer},
        {&antennaCount3, &LTERecords::antennaCount, 3, 25, Newer},
        {&LTERecords::cellInfo, &LTERecords::cellInfo, 2, 38, Base},
        {&cellInfo3, &LTERecords::cellInfo, 3, 42, Newer},
        {&LTERecords::servingCellMeasurement, &LTERecords::servingCellMeasurement, 3, 33, Base},
        {&servingCellMeasurement3, &LTERecords::servingCellMeasurement, 3, 45, Newer},
        {&servingCellMeasurement4, &LTERecords::servingCellMeasurement, 4, 45, Newer},
        {&servingCellMeasurement5, &LTERecords::servingCellMeasurement, 5, 49, Newer},
    };
    return plain;
}

} // namespace

TEST(Layouts, OfACodeTellTheirVersionWhereItsBaseRecordDoes)
{
    for (const Record* base : allRecords()) {
        const auto layouts = layoutsOf(base->logCode);
        if (layouts.empty() || (!base->version && !base->subpacket))
            continue;
        EXPECT_EQ(layouts.front().record->version, base->version) << base->name;
        EXPECT_EQ(layouts.front().record->subpacket, base->subpacket) << base->name;
    }
}

TEST(Layouts, ARecordThatTellsNoVersionHasNone)
{
    const auto choice = chosenFor(sized(0x4005, 40).u8(13, 7));
    EXPECT_EQ(choice.record, &GSMRecords::rankedCells);
    EXPECT_EQ(choice.version, std::nullopt);
    EXPECT_EQ(chosenFor(versioned(0xB17F, 77, 45)).version, 77);
}

TEST(Layouts, VersionAndSizeTellTheLayout)
{
    for (const PlainLayout& plain : plainLayouts())
        expectChoice(versioned(plain.base->logCode, plain.version, plain.size), *plain.record,
                     plain.kind);
}

TEST(Layouts, ASizeThatIsOneOffTellsNone)
{
    for (const PlainLayout& plain : plainLayouts())
        for (const std::size_t size : {plain.size - 1, plain.size + 1})
            expectChoice(versioned(plain.base->logCode, plain.version, size), *plain.base,
                         LayoutKind::NotKnown);
}

TEST(Layouts, AVersionThatIsNotKnownTellsNone)
{
    for (const PlainLayout& plain : plainLayouts())
        for (const std::uint8_t version : std::initializer_list<std::uint8_t>{7, 255})
            expectChoice(versioned(plain.base->logCode, version, plain.size), *plain.base,
                         LayoutKind::NotKnown);
}

// Release 1 has one more word.
TEST(Layouts, TheReleaseOfAServingCellMeasurementTellsItsSize)
{
    using namespace LTELayouts;
    const Record& base = LTERecords::servingCellMeasurement;
    expectChoice(versioned(0xB17F, 4, 49).u8(14, 1), servingCellMeasurement4, LayoutKind::Newer);
    expectChoice(versioned(0xB17F, 5, 53).u8(14, 1), servingCellMeasurement5, LayoutKind::Newer);
    expectChoice(versioned(0xB17F, 4, 45).u8(14, 1), base, LayoutKind::NotKnown);
    expectChoice(versioned(0xB17F, 4, 49).u8(14, 0), base, LayoutKind::NotKnown);
    expectChoice(versioned(0xB17F, 5, 49).u8(14, 1), base, LayoutKind::NotKnown);
    expectChoice(versioned(0xB17F, 5, 53).u8(14, 2), base, LayoutKind::NotKnown);
}

TEST(Layouts, ANarrowBandAntennaCountMayBeLonger)
{
    for (const std::size_t size : {31, 32, 60})
        expectChoice(versioned(0xB0C1, 17, size), LTELayouts::antennaCount17, LayoutKind::Newer);
    expectChoice(versioned(0xB0C1, 17, 30), LTERecords::antennaCount, LayoutKind::NotKnown);
}

// ---- Connected-mode measurements

TEST(Layouts, AConnectedModeRecordHoldsItsListsAndMaybeMore)
{
    const auto version3 = [](std::size_t size) {
        return versioned(0xB179, 3, size).u8(35, 2).u8(36, 1);
    };
    const std::size_t end = 37 + 2 * 12 + 16;
    for (const std::size_t size : {end, end + 12, end + 36})
        expectChoice(version3(size), LTELayouts::connectedMode3, LayoutKind::Newer);
    expectChoice(version3(end - 1), LTERecords::connectedMode, LayoutKind::NotKnown);
    expectChoice(versioned(0xB179, 4, 41 + 12).u8(37, 1), LTELayouts::connectedMode4,
                 LayoutKind::Newer);
    expectChoice(versioned(0xB179, 4, 40), LTERecords::connectedMode, LayoutKind::NotKnown);
}

TEST(Layouts, AConnectedModeRecordHasZerosBesideItsCarrier)
{
    for (const std::size_t offset : {14, 15, 16, 18, 19, 20})
        expectChoice(versioned(0xB179, 3, 37).u8(offset, 1), LTERecords::connectedMode,
                     LayoutKind::NotKnown);
    expectChoice(versioned(0xB179, 3, 37).u8(17, 7), LTELayouts::connectedMode3, LayoutKind::Newer);
}

TEST(Layouts, AnOlderConnectedModeRecordEndsWithItsLists)
{
    const auto older = [](std::size_t size) {
        return versioned(0xB179, 2, size).u8(27, 2).u8(28, 1);
    };
    expectChoice(older(29 + 2 * 6 + 2), LTERecords::connectedMode, LayoutKind::Base);
    expectChoice(older(29 + 2 * 6 + 3), LTERecords::connectedMode, LayoutKind::NotKnown);
}

// ---- Idle neighbours

TEST(Layouts, IdleNeighborsHaveWholeElementsOfTheirReleasesStride)
{
    using namespace LTELayouts;
    const auto cells4 = [](std::size_t size, std::uint8_t release, std::uint32_t count) {
        return versioned(0xB180, 4, size).u8(14, release).bits(19, 6, 10, count);
    };
    const auto cells5 = [](std::size_t size, std::uint8_t release, std::uint32_t count) {
        return versioned(0xB180, 5, size).u8(14, release).bits(21, 6, 26, count);
    };
    const Record& base = LTERecords::idleNeighbors;
    expectChoice(cells4(21 + 28, 0, 1), idleNeighbors4, LayoutKind::Newer);
    expectChoice(cells4(21 + 32, 1, 1), idleNeighbors41, LayoutKind::Newer);
    expectChoice(cells5(25 + 2 * 28, 2, 2), idleNeighbors5, LayoutKind::Newer);
    expectChoice(cells5(25 + 32, 1, 1), idleNeighbors51, LayoutKind::Newer);
    expectChoice(cells4(21 + 3 * 28, 0, 1), idleNeighbors4, LayoutKind::Newer); // unused slots
    expectChoice(cells4(21 + 28, 0, 2), base, LayoutKind::NotKnown);
    expectChoice(cells4(21 + 28, 0, 0), base, LayoutKind::NotKnown);
    expectChoice(cells4(21 + 28 + 1, 0, 1), base, LayoutKind::NotKnown);
    expectChoice(cells4(21 + 28, 1, 1), base, LayoutKind::NotKnown);
    expectChoice(cells4(21 + 32, 0, 1), base, LayoutKind::NotKnown);
}

// The count is one less than the cells.
TEST(Layouts, OlderIdleNeighborsAreKnownBySize)
{
    expectChoice(versioned(0xB180, 2, 41), LTERecords::idleNeighbors, LayoutKind::Base);
    expectChoice(versioned(0xB180, 2, 61).bits(19, 6, 5, 1), LTERecords::idleNeighbors,
                 LayoutKind::Base);
    expectChoice(versioned(0xB180, 2, 42), LTERecords::idleNeighbors, LayoutKind::NotKnown);
    expectChoice(versioned(0xB180, 6, 41), LTERecords::idleNeighbors, LayoutKind::NotKnown);
}

// ---- GSM and UMTS

TEST(Layouts, RankedCellsEndWithTheirLists)
{
    using namespace GSMLayouts;
    const auto ranked = [](std::uint8_t version, std::uint8_t umts, std::uint8_t gsm,
                           std::size_t size) {
        return sized(0x4005, size)
            .u8(13, static_cast<std::uint8_t>(version << 6 | umts))
            .u8(14, gsm);
    };
    expectChoice(ranked(0, 2, 1, 15 + 2 * 10 + 7), rankedCells0, LayoutKind::Newer);
    expectChoice(ranked(1, 2, 1, 15 + 2 * 11 + 8), rankedCells1, LayoutKind::Newer);
    expectChoice(ranked(2, 2, 1, 20 + 2 * 16 + 13), rankedCells2, LayoutKind::Newer);
    expectChoice(ranked(0, 2, 1, 15 + 2 * 10), GSMRecords::rankedCells, LayoutKind::Base);
    expectChoice(ranked(0, 2, 1, 15 + 2 * 10 + 8), GSMRecords::rankedCells, LayoutKind::NotKnown);
    expectChoice(ranked(3, 0, 0, 15), GSMRecords::rankedCells, LayoutKind::NotKnown);
}

TEST(Layouts, TheUMTSServingCellIsKnownByItsSize)
{
    expectChoice(sized(0x4127, 29), GSMRecords::umtsCell, LayoutKind::Base);
    expectChoice(sized(0x4127, 45), GSMLayouts::umtsCell45, LayoutKind::Newer);
    for (const std::size_t size : {30, 44, 46})
        expectChoice(sized(0x4127, size), GSMRecords::umtsCell, LayoutKind::NotKnown);
}

TEST(Layouts, TheGSMServingCellIsKnownByItsBand)
{
    for (const std::uint32_t band : {8, 12})
        expectChoice(sized(0x5134, 26).bits(13, 12, 4, band), GSMLayouts::cellIdentityWithBand,
                     LayoutKind::Newer);
    for (const std::uint32_t band : {1, 7, 13, 15})
        expectChoice(sized(0x5134, 26).bits(13, 12, 4, band), GSMRecords::cellIdentity,
                     LayoutKind::NotKnown);
    expectChoice(sized(0x5134, 26).bits(13, 0, 12, 0xFFF), GSMRecords::cellIdentity,
                 LayoutKind::Base);
}

TEST(Layouts, EquivalentNetworksAreDigitsInNibblesAndEmptySlots)
{
    const auto networks = [](std::uint8_t count, const Bytes& first) {
        return sized(0x7150, 32).bytes(17, Bytes(15, 0xFF)).bytes(17, first).u8(16, count);
    };
    const Bytes network{0x62, 0xF2, 0x10};
    expectChoice(networks(1, network), GSMLayouts::equivalentPLMNs, LayoutKind::Newer);
    expectChoice(networks(0, {}), GSMLayouts::equivalentPLMNs, LayoutKind::Newer);
    for (const Bytes& none : std::vector<Bytes>{{0x61, 0xF2, 0x10}, // a country of 1..
                                                {0x68, 0xF2, 0x10}, // .. or 8..
                                                {0x62, 0xE2, 0x10}, // the last digit
                                                {0x62, 0xF2, 0xA0}, // another one
                                                {0xA2, 0xF2, 0x10},
                                                {0x62, 0xFA, 0x10}})
        expectChoice(networks(1, none), GSMRecords::equivalentPLMNs, LayoutKind::NotKnown);
    expectChoice(networks(2, network), GSMRecords::equivalentPLMNs, LayoutKind::NotKnown);
    expectChoice(networks(6, network), GSMRecords::equivalentPLMNs, LayoutKind::NotKnown);
    expectChoice(networks(1, network).size(33), GSMRecords::equivalentPLMNs, LayoutKind::NotKnown);
}

TEST(Layouts, OlderEquivalentNetworksAreADigitAByte)
{
    const auto digits = [](std::size_t size) { return sized(0x7150, size).u8(16, 2); };
    expectChoice(digits(17 + 3 + 6), GSMRecords::equivalentPLMNs, LayoutKind::Base);
    expectChoice(digits(17 + 3 + 6).u8(25, 10), GSMRecords::equivalentPLMNs, LayoutKind::NotKnown);
    expectChoice(digits(17 + 3 + 7), GSMRecords::equivalentPLMNs, LayoutKind::NotKnown);
}

// ---- Records that have no base layout

TEST(Layouts, SubpacketsTellTheirVersion)
{
    const auto signal = [](std::uint8_t version) {
        return sized(0xB193, 21).u8(14, 1).u8(17, 25).u8(18, version).u16(19, 4);
    };
    for (const std::uint8_t version :
         std::initializer_list<std::uint8_t>{4, 7, 18, 19, 22, 35, 36, 40, 48, 56, 59, 60})
        expectChoice(signal(version), LTESignalRecords::servingCellSignal, LayoutKind::Newer);
    for (const std::uint8_t version : std::initializer_list<std::uint8_t>{3, 5, 24, 50, 61})
        expectChoice(signal(version), LTESignalRecords::servingCellSignal, LayoutKind::NotKnown);
    expectChoice(signal(36).u8(17, 24), LTESignalRecords::servingCellSignal, LayoutKind::NotKnown);
}

TEST(Layouts, EveryKnownVersionOfARadioResourceMessageHasItsHeader)
{
    using namespace LTEStateRecords;
    const auto chosen = [](std::uint8_t version) {
        return chosenFor(versioned(0xB0C0, version, 60)).record->minimumSize;
    };
    for (const auto& [versions, size] :
         std::vector<std::pair<std::vector<std::uint8_t>, std::size_t>>{
             {{2, 3, 4}, 26},
             {{5, 6, 7}, 30},
             {{8, 9, 10, 11, 12, 13, 14, 15, 16, 17, 18, 19, 20, 21, 22, 23, 24}, 32},
             {{25, 26, 27}, 34},
             {{30}, 37}})
        for (const std::uint8_t version : versions)
            EXPECT_EQ(chosen(version), size) << int{version};
    for (const std::uint8_t version : std::initializer_list<std::uint8_t>{0, 1, 28, 29, 31})
        expectChoice(versioned(0xB0C0, version, 60), message2, LayoutKind::NotKnown);
}

TEST(Layouts, ACodeWithoutOtherLayoutsIsBase)
{
    EXPECT_TRUE(layoutsOf(0xB186).empty());
    expectChoice(versioned(0xB186, 200, 21), LTERecords::reselection, LayoutKind::Base);
}

TEST(Layouts, AreOfTheCodesThatAreAsked)
{
    for (const std::uint32_t code : {0xB0C1U, 0xB0C2U, 0xB179U, 0xB17FU, 0xB180U, 0x4005U, 0x4127U,
                                     0x5134U, 0x7150U, 0xB0C0U, 0xB0EEU, 0xB192U, 0xB193U, 0xB195U})
        EXPECT_FALSE(layoutsOf(code).empty()) << std::hex << code;
    for (const Layout& layout : layoutsOf(0xB17F))
        EXPECT_EQ(layout.record->logCode, 0xB17F);
}

TEST(Layouts, AWarningNamesCodeAndVersion)
{
    EXPECT_EQ(warningOf({0xB17F, 7, 60, LayoutKind::NotKnown}),
              "0xB17F version 7: layout not known, values may be wrong");
    EXPECT_EQ(warningOf({0x4127, std::nullopt, 44, LayoutKind::NotKnown}),
              "0x4127 of 44 bytes: layout not known, values may be wrong");
}

TEST(Layouts, ModesAreKnownByTheirNames)
{
    for (const RecordsMode mode : {RecordsMode::Base, RecordsMode::Newer, RecordsMode::Extended})
        EXPECT_EQ(recordsModeNamed(nameOf(mode)), mode);
    EXPECT_FALSE(recordsModeNamed("older"));
}

// ---- Every layout's table

TEST(Layouts, GroupsAndListsStandAsInTheBaseLayout)
{
    for (const Record* base : allRecords())
        for (const Layout& layout : layoutsOf(base->logCode)) {
            EXPECT_EQ(layout.record->name, base->name);
            for (std::size_t i = 0; i < base->lists.size(); ++i)
                EXPECT_EQ(!layout.record->lists[i], !base->lists[i]) << base->name;
        }
}

TEST(Layouts, AFieldLiesInTheSmallestPacketOfItsLayout)
{
    for (const Record* base : allRecords())
        for (const Layout& layout : layoutsOf(base->logCode))
            for (const std::span<const Field> group : layout.record->groups)
                for (const Field& field : group)
                    EXPECT_LE(field.place.offset + field.place.bytes(),
                              std::max(layout.minimumSize, layout.record->minimumSize))
                        << base->name << ": " << field.key;
}

TEST(Layouts, AListsFieldsLieInItsElements)
{
    for (const Record* base : allRecords())
        for (const Layout& layout : layoutsOf(base->logCode))
            for (const List* list : layout.record->lists)
                for (const Field& field : list ? list->fields : std::span<const Field>())
                    EXPECT_LE(field.place.offset + field.place.bytes(), list->needed)
                        << base->name << ": " << field.key;
}

} // namespace ventrik
