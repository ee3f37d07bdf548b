#pragma once

#include "LogGenerator/Core/LogGenerator.h"
#include "LogGenerator/Orbel/Base.h"
#include "Packets/PacketBuilder.h"
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

/// One section bound to a container of its own.
template <typename Section, typename Container>
class BoundSectionFixture : public testing::Test
{
  protected:
    BoundSectionFixture()
    {
        section.updateSectionRef(container);
        log.clear();
    }

    void feed(const Bytes& packet)
    {
        const LogPacket logPacket(packet);
        section.updateWithData(logPacket, effectiveLogCode(logPacket));
    }
    void feed(const PacketBuilder& packet) { feed(packet.build()); }

    CapturingSystemLog log;
    Container container;
    Section section{log};
};

/// A section of keys and values.
template <typename Section>
class SectionFixture : public BoundSectionFixture<Section, PlistDictionary>
{
  protected:
    std::string shown(std::string_view key) { return textAt(values, {key}); }

    PlistDictionary& values = this->container;
};

/// A section of rows.
template <typename Section>
class ListSectionFixture : public BoundSectionFixture<Section, PlistArray>
{
  protected:
    /// The text under a key of a row; "(none)" where there is none.
    std::string shown(std::size_t row, std::string_view key)
    {
        return row < rows.size() ? textAt(rows[row], {key}) : "(none)";
    }

    PlistArray& rows = this->container;
};

} // namespace ventrik
