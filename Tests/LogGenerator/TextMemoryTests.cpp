#include "LogGenerator/Orbel/TextMemory.h"
#include "Packets/ShownNumbers.h"

#include <array>

#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

int formed = 0;

std::string countingText(std::int64_t raw)
{
    ++formed;
    return std::to_string(raw);
}

constexpr std::array<Field, 2> fields{
    {{"A", i32(0), {.text = countingText}}, {"B", i32(0), wholeDbm()}}};

} // namespace

TEST(TextMemory, FormsATextOnce)
{
    TextMemory texts;
    formed = 0;
    EXPECT_EQ(texts.textOf(fields[0], -5), "-5");
    EXPECT_EQ(texts.textOf(fields[0], 7), "7");
    EXPECT_EQ(texts.textOf(fields[0], -5), "-5");
    EXPECT_EQ(formed, 2);
}

TEST(TextMemory, GivesEachFieldItsOwnTextOfEachNumber)
{
    TextMemory texts;
    for (int round = 0; round < 2; ++round)
        for (int raw = -1000; raw < 1000; ++raw) {
            EXPECT_EQ(texts.textOf(fields[0], raw), std::to_string(raw));
            EXPECT_EQ(texts.textOf(fields[1], raw), std::to_string(raw) + " dBm");
        }
}

TEST(TextMemory, KeepsThatANumberShowsNothing)
{
    static constexpr std::array<std::string_view, 1> zero{"zero"};
    constexpr Field field{"C", u8(0), labels(zero, {})};
    TextMemory texts;
    EXPECT_EQ(texts.textOf(field, 0), "zero");
    EXPECT_EQ(texts.textOf(field, 1), std::nullopt);
    EXPECT_EQ(texts.textOf(field, 1), std::nullopt);
}

} // namespace ventrik
