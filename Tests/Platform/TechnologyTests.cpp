#include "Platform/Technology.h"

#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

struct Row {
    int linkType;
    std::string_view identifier;
    std::string_view name;
};

constexpr Row rows[] = {
    {147, "kQXLogChannelTechnology_IFX", "ifx"},
    {148, "kQXLogChannelTechnology_Orbel_GSM", "gsm"},
    {149, "kQXLogChannelTechnology_Orbel_CDMA", "c2k"},
    {150, "kQXLogChannelTechnology_Orbel_LTE", "lte"},
    {151, "kQXLogChannelTechnology_Orbel_UTRAN2", "utran"},
};

} // namespace

TEST(Technology, LinkTypesAndNamesGiveTheTechnologies)
{
    for (const Row& row : rows) {
        const auto byLinkType = technologyOfLinkType(row.linkType);
        ASSERT_TRUE(byLinkType) << row.name;
        EXPECT_EQ(byLinkType->identifier, row.identifier);
        EXPECT_EQ(byLinkType->name, row.name);
        const auto byName = technologyNamed(row.name);
        ASSERT_TRUE(byName) << row.name;
        EXPECT_EQ(byName->linkType, row.linkType);
    }
}

TEST(Technology, OthersGiveNone)
{
    EXPECT_FALSE(technologyOfLinkType(146));
    EXPECT_FALSE(technologyOfLinkType(152));
    EXPECT_FALSE(technologyNamed("LTE"));
    EXPECT_FALSE(technologyNamed(""));
}

} // namespace ventrik
