#include "Packets/AllRecords.h"

#include "Packets/C2KRecords.h"
#include "Packets/LTERecords.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <set>

namespace ventrik
{

namespace
{

// What the start command of each technology asks for, extra codes as effective ones.
const std::vector<std::uint32_t> gsmCodes{
    0x4005, 0x4031, 0x4116, 0x4125, 0x4127, 0x4157,   0x417A,   0x4221,  0x5072, 0x5076,
    0x512C, 0x5134, 0x5137, 0x51F4, 0x51F5, 0x51F6,   0x51F8,   0x51FB,  0x51FD, 0x51FF,
    0x7130, 0x7131, 0x7132, 0x7135, 0x7150, 0xFF0000, 0xFF0001, 0xFF0002};
const std::vector<std::uint32_t> lteCodes{0xB0C1, 0xB0C2,   0xB179,   0xB17F,  0xB180,
                                          0xB186, 0xFF0000, 0xFF0001, 0xFF0002};
const std::vector<std::uint32_t> utranCodes{0xD00A, 0xD00C,   0xD00E,   0xD0E0,
                                            0xD0E2, 0xFF0000, 0xFF0001, 0xFF0002};
const std::vector<std::uint32_t> c2kCodes{0x108A, 0x1183, 0x1192, 0x119C,
                                          0x119D, 0x127E, 0x12B6, 0x134F};
const std::vector<std::uint32_t> extensionCodes{0xB0C0, 0xB0EE, 0xB192, 0xB193, 0xB195};
constexpr std::uint32_t dlfVersionReport = 0x1FFD; // which nobody asks for

std::set<std::uint32_t> askedCodes()
{
    std::set<std::uint32_t> codes;
    for (const auto& of : {gsmCodes, lteCodes, utranCodes, c2kCodes, extensionCodes})
        codes.insert(of.begin(), of.end());
    return codes;
}

// The offset behind the last byte that a place reaches into, counted in bits by hand.
std::size_t endOf(const Place& place)
{
    const std::size_t lastBit = std::size_t{place.offset} * 8 + place.bit + place.width - 1;
    return lastBit / 8 + 1;
}

struct FieldOfRecord {
    const Record* record;
    const Field* field;
};

std::vector<FieldOfRecord> fieldsOfRecords()
{
    std::vector<FieldOfRecord> fields;
    for (const Record* record : allRecords())
        for (const std::span<const Field> group : record->groups)
            for (const Field& field : group)
                fields.push_back({record, &field});
    return fields;
}

struct ListOfRecord {
    const Record* record;
    const List* list;
};

std::vector<ListOfRecord> listsOfRecords()
{
    std::vector<ListOfRecord> lists;
    for (const Record* record : allRecords())
        for (const List* list : record->lists)
            if (list)
                lists.push_back({record, list});
    return lists;
}

// The places that tell where a list begins and ends.
std::vector<Place> countsOf(const List& list)
{
    if (list.before.bytesEach == 0)
        return {list.count.place};
    return {list.count.place, list.before.count};
}

void expectDifferentKeys(std::span<const Field> fields, std::string_view record)
{
    std::set<std::string_view> keys;
    for (const Field& field : fields)
        EXPECT_TRUE(keys.insert(field.key).second) << record << " has two of " << field.key;
}

} // namespace

TEST(AllRecords, EveryCodeThatATechnologyAsksForHasItsRecord)
{
    for (const std::uint32_t code : askedCodes()) {
        const Record* record = recordOf(code);
        ASSERT_TRUE(record) << std::hex << code;
        EXPECT_EQ(record->logCode, code);
    }
}

TEST(AllRecords, NoRecordIsThereForACodeThatNobodyAsksFor)
{
    auto codes = askedCodes();
    codes.insert(dlfVersionReport);
    std::vector<std::uint32_t> ofRecords;
    for (const Record* record : allRecords())
        ofRecords.push_back(record->logCode);
    EXPECT_THAT(ofRecords, testing::ElementsAreArray(codes)); // which a set keeps sorted
}

TEST(AllRecords, OnlyTheExtensionsAreMarkedAsSuch)
{
    std::vector<std::uint32_t> marked;
    for (const Record* record : allRecords())
        if (record->isExtension)
            marked.push_back(record->logCode);
    EXPECT_EQ(marked, extensionCodes);
}

TEST(AllRecords, AnotherCodeHasNoRecord)
{
    for (const std::uint32_t code :
         {0U, 0x1089U, 0x108BU, 0x4006U, 0xB0C3U, 0xFF0003U, 0xFFFFFFFFU})
        EXPECT_FALSE(recordOf(code)) << std::hex << code;
}

TEST(AllRecords, EachHasANameOfItsOwn)
{
    std::set<std::string_view> names;
    for (const Record* record : allRecords()) {
        EXPECT_FALSE(record->name.empty()) << std::hex << record->logCode;
        EXPECT_TRUE(names.insert(record->name).second) << record->name;
    }
}

TEST(AllRecords, TheSmallestPacketHoldsEveryField)
{
    for (const auto& [record, field] : fieldsOfRecords()) {
        if (field->key == "kBaseId") // longer records have it
            continue;
        EXPECT_LE(endOf(field->place), record->minimumSize) << record->name << ": " << field->key;
    }
}

TEST(AllRecords, EveryFieldLiesBehindTheHeader)
{
    for (const auto& [record, field] : fieldsOfRecords()) {
        if (field->key == "k1xDeviceState") // which counts from its subpacket
            continue;
        EXPECT_GE(field->place.offset, 13) << record->name << ": " << field->key;
    }
}

TEST(AllRecords, TheSmallestPacketHoldsEveryVersion)
{
    for (const Record* record : allRecords())
        if (record->version) {
            EXPECT_LE(endOf(*record->version), record->minimumSize) << record->name;
        }
}

TEST(AllRecords, TheSmallestPacketHoldsEveryCount)
{
    for (const auto& [record, list] : listsOfRecords())
        for (const Place& count : countsOf(*list)) {
            EXPECT_GE(count.offset, 13) << record->name;
            EXPECT_LE(endOf(count), record->minimumSize) << record->name;
        }
}

TEST(AllRecords, EveryListBeginsBehindItsCount)
{
    for (const auto& [record, list] : listsOfRecords())
        EXPECT_GE(list->offset, endOf(list->count.place)) << record->name;
}

TEST(AllRecords, NoTwoFieldsOfAGroupShareAKey)
{
    for (const Record* record : allRecords())
        for (const std::span<const Field> group : record->groups)
            expectDifferentKeys(group, record->name);
    for (const auto& [record, list] : listsOfRecords()) {
        expectDifferentKeys(list->fields, record->name);
        expectDifferentKeys(list->unshown, record->name);
    }
}

TEST(AllRecords, ACompleteElementHoldsAllOfItsFields)
{
    for (const auto& [record, list] : listsOfRecords())
        for (const std::span<const Field> fields : {list->fields, list->unshown})
            for (const Field& field : fields)
                EXPECT_LE(endOf(field.place), list->needed) << record->name << ": " << field.key;
}

TEST(AllRecords, ACompleteCandidateHoldsTheFieldsOfItsTechnology)
{
    for (const LTERecords::CandidatePart& part : LTERecords::candidateParts)
        for (const Field& field : part.fields) {
            EXPECT_LE(endOf(field.place), part.needed) << field.key;
            EXPECT_GE(field.place.offset, LTERecords::candidates.needed) << field.key;
        }
}

TEST(AllRecords, TheSmallestPacketHoldsTheCountersOfADataRate)
{
    const auto endOfCounters = [](const RecordElements& counters) {
        return counters.offset + counters.stride * (counters.count - 1) + counters.needed;
    };
    EXPECT_EQ(endOfCounters(C2KRecords::forwardCounters), 17 + 56 * 4U);
    EXPECT_LE(endOfCounters(C2KRecords::forwardCounters), C2KRecords::forwardPackets.minimumSize);
    EXPECT_EQ(endOfCounters(C2KRecords::reverseCounters), 18 + 3 * 576 - 8U);
    EXPECT_LE(endOfCounters(C2KRecords::reverseCounters), C2KRecords::reversePackets.minimumSize);
}

TEST(AllRecords, PlacesFitTheWordsThatTheyAreReadFrom)
{
    const auto expectFits = [](const Field& field, std::string_view record) {
        EXPECT_GE(field.place.width, 1) << record << ": " << field.key;
        EXPECT_LE(field.place.width, 48) << record << ": " << field.key;
        EXPECT_LE(field.place.bit, 15) << record << ": " << field.key;
    };
    for (const auto& [record, field] : fieldsOfRecords())
        expectFits(*field, record->name);
    for (const auto& [record, list] : listsOfRecords())
        for (const std::span<const Field> fields : {list->fields, list->unshown})
            for (const Field& field : fields)
                expectFits(field, record->name);
}

} // namespace ventrik
