#include "Packets/LogPacket.h"
#include "Packets/PacketBuilder.h"

#include <gtest/gtest.h>

namespace ventrik
{

TEST(PropertyListMemory, GivesTheReadingOfTheSameBytesAgain)
{
    PropertyListMemory memory;
    const Bytes packet = propertyListPacket(0xFF0001, PlistArray{"a"});
    const LogPacket first(packet, memory);
    const LogPacket second(packet, memory);
    EXPECT_EQ(*first.propertyList().value, PlistArray{"a"});
    EXPECT_EQ(&first.propertyList(), &second.propertyList());
}

TEST(PropertyListMemory, OtherBytesAreReadAnew)
{
    PropertyListMemory memory;
    const Bytes first = propertyListPacket(0xFF0001, PlistArray{"a"});
    const Bytes second = propertyListPacket(0xFF0001, PlistArray{"b"});
    EXPECT_EQ(*LogPacket(first, memory).propertyList().value, PlistArray{"a"});
    EXPECT_EQ(*LogPacket(second, memory).propertyList().value, PlistArray{"b"});
    EXPECT_EQ(*LogPacket(first, memory).propertyList().value, PlistArray{"a"});
}

TEST(PropertyListMemory, CodesAreKeptApart)
{
    PropertyListMemory memory;
    const Bytes monitor = propertyListPacket(0xFF0001, PlistArray{"a"});
    const Bytes contexts = propertyListPacket(0xFF0002, PlistArray{"b"});
    const LogPacket first(monitor, memory);
    const PropertyListReading* reading = &first.propertyList();
    EXPECT_EQ(*LogPacket(contexts, memory).propertyList().value, PlistArray{"b"});
    EXPECT_EQ(&LogPacket(monitor, memory).propertyList(), reading);
}

TEST(PropertyListMemory, WhatDoesNotParseIsReportedEachTime)
{
    PropertyListMemory memory;
    const Bytes packet = PacketBuilder(0xFF0001).u8(13, 'x').build();
    EXPECT_FALSE(LogPacket(packet, memory).propertyList());
    EXPECT_FALSE(LogPacket(packet, memory).propertyList());
}

TEST(PropertyListMemory, AVeryLargeOneIsNotKept)
{
    PropertyListMemory memory;
    const Bytes packet = propertyListPacket(0xFF0001, PlistArray{std::string(70000, 'a')});
    const LogPacket first(packet, memory);
    const LogPacket second(packet, memory);
    EXPECT_NE(&first.propertyList(), &second.propertyList());
}

} // namespace ventrik
