#include "PropertyList/PropertyListReader.h"

#include "Tests/PropertyList/BinaryPlistBuilder.h"
#include "Tests/PropertyList/PlistText.h"

#include <gmock/gmock.h>

namespace ventrik
{

TEST(PropertyListReader, TellsTheFormsApart)
{
    EXPECT_EQ(readPropertyList(BinaryPlistBuilder().object({0x09}).build()).value,
              PlistValue(true));
    EXPECT_EQ(readPropertyList(bytesOf("<plist><true/></plist>")).value, PlistValue(true));
}

TEST(PropertyListReader, RefusesOtherBinaryVersions)
{
    Bytes data = BinaryPlistBuilder().object({0x09}).build();
    data[7] = '1';
    const PropertyListReading reading = readPropertyList(data);
    EXPECT_FALSE(reading);
    EXPECT_THAT(reading.error, testing::HasSubstr("does not start with \"bplist00\""));
}

TEST(PropertyListReader, RefusesNoDataAtAll)
{
    EXPECT_FALSE(readPropertyList({}));
    EXPECT_FALSE(readPropertyList({}).error.empty());
}

} // namespace ventrik
