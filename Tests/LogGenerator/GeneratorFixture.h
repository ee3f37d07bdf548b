#pragma once

#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/Orbel/Base.h"
#include "TelephonyService/PacketBuilder.h"
#include "Tests/Support/FakePlatform.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <initializer_list>
#include <string>
#include <string_view>

namespace ventrik
{

/// The text at a path of keys; "(none)" where there is no such string.
std::string textAt(const PlistValue& root, std::initializer_list<std::string_view> path);

/// The keys of a dictionary in their order.
std::vector<std::string> keysOf(const PlistDictionary& dictionary);

/// Property-list XML with this content.
std::string plistXml(std::string_view content);

/// A platform and a state dictionary to run generators on.
class GeneratorFixture : public testing::Test
{
  protected:
    GeneratorServices services() { return {platform.log, platform.resources, platform.clock}; }

    FakePlatform platform;
    PlistDictionary state;
};

/// One section bound to a dictionary of its own.
template <typename Section>
class SectionFixture : public testing::Test
{
  protected:
    SectionFixture()
    {
        section.updateSectionRef(values);
        log.clear();
    }

    void feed(const Bytes& packet)
    {
        const LogPacket logPacket(packet);
        section.updateWithData(logPacket, effectiveLogCode(logPacket));
    }
    void feed(const PacketBuilder& packet) { feed(packet.build()); }

    std::string shown(std::string_view key) { return textAt(values, {key}); }

    CapturingSystemLog log;
    PlistDictionary values;
    Section section{log};
};

} // namespace ventrik
