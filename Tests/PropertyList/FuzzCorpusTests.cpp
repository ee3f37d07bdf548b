#include "Tests/PropertyList/PlistText.h"

#include <filesystem>
#include <fstream>
#include <iterator>

#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

Bytes fileContent(const std::filesystem::path& path)
{
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

void expectValueOrOneLine(const PropertyListReading& reading)
{
    EXPECT_EQ(reading.value.has_value(), reading.error.empty()) << reading.error;
    EXPECT_EQ(reading.error.find('\n'), std::string::npos) << reading.error;
}

// Feeds every file of the folder; the number of them.
template <typename Reader>
int replay(const char* folder, Reader read)
{
    int count = 0;
    const auto path = std::filesystem::path(VENTRIK_PLIST_CORPUS) / folder;
    for (const auto& file : std::filesystem::directory_iterator(path)) {
        SCOPED_TRACE(file.path());
        expectValueOrOneLine(read(fileContent(file)));
        ++count;
    }
    return count;
}

} // namespace

TEST(FuzzCorpus, EveryBinaryFileGivesAValueOrAnError)
{
    EXPECT_GT(replay("binary", readBinaryPropertyList), 5);
}

TEST(FuzzCorpus, EveryXmlFileGivesAValueOrAnError)
{
    EXPECT_GT(replay("xml", readXmlPropertyList), 5);
}

} // namespace ventrik
