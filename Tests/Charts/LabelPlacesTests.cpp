#include "Charts/LabelPlaces.h"

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Places = std::vector<double>;

} // namespace

TEST(LabelPlacesTest, LabelsWithRoomStayWhereTheyAre)
{
    EXPECT_THAT(spreadLabels(Places{20, 50, 35}, 10, 0, 100), ElementsAre(20, 50, 35));
}

TEST(LabelPlacesTest, LabelsAreShiftedApartAroundTheirMiddle)
{
    EXPECT_THAT(spreadLabels(Places{50, 52}, 10, 0, 100), ElementsAre(46, 56));
    EXPECT_THAT(spreadLabels(Places{52, 50}, 10, 0, 100), ElementsAre(56, 46));
    EXPECT_THAT(spreadLabels(Places{50, 50, 50}, 10, 0, 100), ElementsAre(40, 50, 60));
}

TEST(LabelPlacesTest, LabelsStayBetweenTheEdges)
{
    EXPECT_THAT(spreadLabels(Places{0, 1, 99}, 10, 0, 100), ElementsAre(5, 15, 95));
}

TEST(LabelPlacesTest, LabelsThatShiftedOnesRunIntoAreShiftedToo)
{
    EXPECT_THAT(spreadLabels(Places{50, 50, 56}, 10, 0, 100), ElementsAre(42, 52, 62));
}

TEST(LabelPlacesTest, TheLastOnesAreLeftOutWhereThereIsNoRoom)
{
    EXPECT_THAT(spreadLabels(Places{50, 10, 90}, 10, 0, 25), ElementsAre(20, 10, std::nullopt));
    EXPECT_THAT(spreadLabels(Places{50}, 10, 0, 5), ElementsAre(std::nullopt));
}

TEST(LabelPlacesTest, MarksThatWouldOverlapGoToTheNextRow)
{
    const std::vector<LabelExtent> labels{{0, 30}, {20, 50}, {25, 60}, {30, 40}};
    EXPECT_THAT(labelRows(labels, 2), ElementsAre(0, 1, std::nullopt, 0));
    EXPECT_THAT(labelRows(labels, 0),
                ElementsAre(std::nullopt, std::nullopt, std::nullopt, std::nullopt));
}

TEST(LabelPlacesTest, MarksThatComeFirstHaveTheChoice)
{
    const std::vector<LabelExtent> labels{{50, 80}, {10, 40}, {35, 55}, {0, 10}};
    EXPECT_THAT(labelRows(labels, 1), ElementsAre(0, 0, std::nullopt, 0));
}

} // namespace ventrik
