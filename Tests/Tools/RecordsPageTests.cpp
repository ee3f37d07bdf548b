#include "Tools/RecordsPage.h"

#include "Packets/AllRecords.h"

#include <gmock/gmock.h>

#include <fmt/format.h>

#include <fstream>
#include <iterator>

namespace ventrik
{

TEST(RecordsPage, IsTheOneAmongTheDocuments)
{
    std::ifstream file(VENTRIK_RECORDS_PAGE);
    const std::string page{std::istreambuf_iterator<char>(file), {}};
    EXPECT_TRUE(page == recordsPage())
        << "cmake --build build/dev --target update-records-page renews it";
}

TEST(RecordsPage, TellsOfEveryRecord)
{
    const std::string page = recordsPage();
    for (const Record* record : allRecords())
        EXPECT_TRUE(page.find(fmt::format("## 0x{:04X} {}\n", record->logCode, record->name)) !=
                    std::string::npos);
}

// As the record's own table has it: RSRP from bit 0 of byte 25 on, 12 bits, sixteenths of a dB.
TEST(RecordsPage, TellsTheFieldsOfANewerLayout)
{
    const std::string page = recordsPage();
    const std::size_t layout = page.find("### Version 5, 49 to 53 bytes");
    ASSERT_NE(layout, std::string::npos);
    EXPECT_THAT(page.substr(layout, 1000),
                testing::HasSubstr("| Measured RSRP | 25.0 12 bits | raw × 0.0625 − 180 dBm |"));
}

TEST(RecordsPage, NamesTheSectionsThatShowARecord)
{
    EXPECT_TRUE(recordsPage().find("Shown in \"UMTS RR Info\" (gsm).\n") != std::string::npos);
}

TEST(RecordsPage, SaysWhatDoesNotShow)
{
    EXPECT_TRUE(recordsPage().find("| repeated RSRP | 26.4 12 bits | not by itself |") !=
                std::string::npos);
}

} // namespace ventrik
