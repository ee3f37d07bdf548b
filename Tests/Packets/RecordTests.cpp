#include "Packets/Record.h"
#include "Packets/ShownNumbers.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <limits>

namespace ventrik
{

namespace
{

constexpr std::array<Mark, 2> marks{{{1, "Marked"}, {255, "Untold"}}};
constexpr std::array<std::string_view, 4> words{"Zero", "One", "", "Three"};

double half(std::int64_t raw)
{
    return static_cast<double>(raw) / 2;
}

std::string quoted(std::int64_t raw)
{
    return "<" + std::to_string(raw) + ">";
}

struct DigitsCase {
    Digits digits;
    double number;
    std::string_view text;
};

constexpr Field field(std::string_view key, std::uint16_t offset)
{
    return {key, u8(offset)};
}

} // namespace

TEST(Shown, EachKindOfDigitsHasItsText)
{
    const DigitsCase cases[]{
        {Digits::Whole, 0, "0"},
        {Digits::Whole, -5, "-5"},
        {Digits::Whole, 5.9, "5"},
        {Digits::Whole, -5.9, "-5"},
        {Digits::SignedWhole, 5, "+5"},
        {Digits::SignedWhole, 0, "+0"},
        {Digits::SignedWhole, -5, "-5"},
        {Digits::TwoDecimals, 5.25, "5.25"},
        {Digits::TwoDecimals, -140, "-140.00"},
        {Digits::TwoDecimals, 0.129, "0.13"},
        {Digits::SignedTwoDecimals, 5.25, "+5.25"},
        {Digits::SignedTwoDecimals, -5.25, "-5.25"},
        {Digits::SignedTwoDecimals, -std::numeric_limits<double>::infinity(), "-inf"},
        {Digits::SixDecimals, 5.25, "5.250000"},
        {Digits::SixDecimals, -0.00390625, "-0.003906"},
        {Digits::SixHexDigits, 31, "0x00001f"},
        {Digits::SixHexDigits, 0xABCDEF, "0xabcdef"},
    };
    for (const auto& [digits, number, text] : cases)
        EXPECT_EQ(Shown{.digits = digits}.textOfNumber(number), text);
}

TEST(Shown, ANumberIsTheRawOneTimesTheFactorPlusTheOffset)
{
    const Shown quarters = dbm(0.25, -140);
    EXPECT_EQ(quarters.number(3), -139.25);
    EXPECT_EQ(quarters.textOf(3), "-139.25 dBm");
    EXPECT_EQ(decimal.number(-7), -7);
    EXPECT_EQ(decimal.textOf(-7), "-7");
}

TEST(Shown, TheUnitStandsBehindABlank)
{
    EXPECT_EQ(wholeDb(2).textOf(3), "6 dB");
    EXPECT_EQ(wholeDbm(1, -30).textOf(3), "-27 dBm");
    EXPECT_EQ(db(0.5, -1).textOf(3), "0.50 dB");
    EXPECT_EQ(signedWholeDbm().textOf(3), "+3 dBm");
    EXPECT_EQ(signedDbm(0.5, 0).textOf(3), "+1.50 dBm");
    EXPECT_EQ(Shown{}.textOfNumber(3), "3");
}

TEST(Shown, AMarkStandsInTheNumbersPlace)
{
    const Shown shown = marked(wholeDb(2), marks);
    EXPECT_EQ(shown.textOf(255), "Untold");
    EXPECT_EQ(shown.textOf(254), "508 dB");
}

TEST(Shown, AMarkGoesBeforeALabel)
{
    const Shown shown = marked(labels(words, "?"), marks);
    EXPECT_EQ(shown.textOf(1), "Marked");
    EXPECT_EQ(shown.textOf(3), "Three");
    EXPECT_EQ(shown.textOf(255), "Untold");
}

TEST(Shown, ANumberWithoutALabelHasTheOtherText)
{
    const Shown shown = labels(words, "Unknown");
    EXPECT_EQ(shown.textOf(0), "Zero");
    for (const std::int64_t raw : {2, 4, 1000, -1})
        EXPECT_EQ(shown.textOf(raw), "Unknown") << raw;
}

TEST(Shown, TheOtherTextNamesTheRawNumberWhereItHasAPlaceForIt)
{
    EXPECT_EQ(labels(words, "[Bad {}]").textOf(2), "[Bad 2]");
    EXPECT_EQ(labels(words, "{}").textOf(-9), "-9");
    EXPECT_EQ(labels(words, "Bad {").textOf(2), "Bad {");
}

TEST(Shown, TheOtherTextShowsWithoutAnyLabels)
{
    EXPECT_EQ(labels({}, "Unknown").textOf(0), "Unknown");
}

TEST(Shown, ANumberThatHasNeitherALabelNorAnOtherTextShowsNothing)
{
    const Shown shown = labels(words, {});
    EXPECT_EQ(shown.textOf(3), "Three");
    for (const std::int64_t raw : {2, 4, -1})
        EXPECT_EQ(shown.textOf(raw), std::nullopt) << raw;
}

TEST(Shown, AScaleStandsInThePlaceOfFactorAndOffset)
{
    const Shown shown{
        .digits = Digits::TwoDecimals, .factor = 10, .offset = 7, .unit = "dB", .scale = half};
    EXPECT_EQ(shown.number(5), 2.5);
    EXPECT_EQ(shown.textOf(5), "2.50 dB");
}

TEST(Shown, ATextOfItsOwnGoesBeforeEverythingElse)
{
    const Shown shown{.unit = "dB", .marks = marks, .labels = words, .text = quoted};
    EXPECT_EQ(shown.textOf(1), "<1>");
    EXPECT_EQ(shown.textOf(9), "<9>");
}

TEST(Shown, ThereIsNoNumberWhereATextShows)
{
    EXPECT_EQ(marked(decimal, marks).number(255), std::nullopt);
    EXPECT_EQ(marked(decimal, marks).number(254), 254);
    EXPECT_EQ(labels(words, {}).number(0), std::nullopt);
    EXPECT_EQ(labels(words, {}).number(2), std::nullopt);
    EXPECT_EQ(labels({}, "Unknown").number(0), std::nullopt);
    EXPECT_EQ(Shown{.text = quoted}.number(0), std::nullopt);
}

TEST(List, ItsElementsAreThoseThatTheRecordCounts)
{
    const List list{.key = "", .offset = 14, .stride = 4, .needed = 3, .count = {bits(13, 4, 4)}};
    Bytes bytes(22);
    bytes[13] = 0x2F;
    const LogPacket packet(bytes);
    const RecordElements elements = list.elementsOf(packet);
    EXPECT_EQ(elements.offset, 14U);
    EXPECT_EQ(elements.stride, 4U);
    EXPECT_EQ(elements.needed, 3U);
    EXPECT_EQ(elements.count, 2U);
    EXPECT_EQ(elements.completeIn(packet), 2U);
}

TEST(List, HasAsManyMoreElementsAsItsCountLeavesOut)
{
    const List list{.key = "", .offset = 14, .stride = 2, .needed = 2, .count = {u8(13), 1}};
    Bytes bytes(14);
    EXPECT_EQ(list.elementsOf(LogPacket(bytes)).count, 1U);
    bytes[13] = 255;
    EXPECT_EQ(list.elementsOf(LogPacket(bytes)).count, 256U);
}

TEST(List, BeginsBehindTheOneBeforeIt)
{
    const List list{.key = "",
                    .offset = 15,
                    .stride = 2,
                    .needed = 2,
                    .count = {u8(14)},
                    .before = {u8(13), 100}};
    Bytes bytes(15);
    bytes[14] = 1;
    EXPECT_EQ(list.elementsOf(LogPacket(bytes)).offset, 15U);
    bytes[13] = 3;
    EXPECT_EQ(list.elementsOf(LogPacket(bytes)).offset, 315U);
    EXPECT_EQ(list.elementsOf(LogPacket(bytes)).count, 1U);
    EXPECT_EQ(list.elementsOf(LogPacket(bytes)).completeIn(LogPacket(bytes)), 0U);
}

TEST(List, HasNoElementsInAPacketThatEndsBeforeItsCount)
{
    const List list{.key = "", .offset = 14, .stride = 2, .needed = 2, .count = {u8(13)}};
    const Bytes bytes(13, 0xFF);
    EXPECT_EQ(list.elementsOf(LogPacket(bytes)).count, 0U);
}

TEST(Record, FindsAFieldInAnyOfItsGroups)
{
    static constexpr std::array<Field, 2> first{field("A", 13), field("B", 14)};
    static constexpr std::array<Field, 1> last{field("c", 15)};
    const Record record{0x1234, "Sample", 16, {first, {}, {}, last}};
    EXPECT_EQ(record.find("A"), &first[0]);
    EXPECT_EQ(record.find("B"), &first[1]);
    EXPECT_EQ(record.find("c"), &last[0]);
}

TEST(Record, FindsTheFirstOfSeveralFieldsOfOneName)
{
    static constexpr std::array<Field, 1> first{field("A", 13)};
    static constexpr std::array<Field, 1> second{field("A", 14)};
    EXPECT_EQ((Record{0x1234, "Sample", 16, {first, second}}.find("A")), &first[0]);
}

TEST(Record, FindsNoFieldThatItDoesNotHave)
{
    static constexpr std::array<Field, 1> fields{field("A", 13)};
    const Record record{0x1234, "Sample", 16, {fields}};
    EXPECT_EQ(record.find("a"), nullptr);
    EXPECT_EQ(record.find(""), nullptr);
    EXPECT_EQ((Record{0x1234, "Sample", 16}.find("A")), nullptr);
}

TEST(Record, ReadsTheNumberOfAField)
{
    const Bytes bytes{0, 7};
    EXPECT_EQ(numberOf(LogPacket(bytes), field("A", 1)), 7);
}

} // namespace ventrik
