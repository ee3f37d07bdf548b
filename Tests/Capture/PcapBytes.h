#pragma once

#include "PropertyList/PlistValue.h"

#include <fstream>
#include <string>

#include <gtest/gtest.h>

namespace ventrik
{

/// A pcap file byte by byte: the format as it is written down, not as our writer writes it.
class PcapBytes
{
  public:
    explicit PcapBytes(std::uint32_t linkType, std::uint32_t magic = 0xA1B2C3D4)
    {
        u32(magic);
        u32(2 | 4 << 16); // version 2.4
        u32(0);
        u32(0);
        u32(262144);
        u32(linkType);
    }

    PcapBytes& record(std::uint32_t seconds, std::uint32_t fraction, const Bytes& data)
    {
        return record(seconds, fraction, data, static_cast<std::uint32_t>(data.size()));
    }
    PcapBytes& record(std::uint32_t seconds, std::uint32_t fraction, const Bytes& data,
                      std::uint32_t originalSize)
    {
        u32(seconds);
        u32(fraction);
        u32(static_cast<std::uint32_t>(data.size()));
        u32(originalSize);
        _bytes.insert(_bytes.end(), data.begin(), data.end());
        return *this;
    }

    const Bytes& bytes() const { return _bytes; }

    /// Writes the first `size` bytes to a file under the test's own name and gives its path.
    std::string file(std::size_t size = SIZE_MAX) const
    {
        const auto* test = testing::UnitTest::GetInstance()->current_test_info();
        const std::string path =
            testing::TempDir() + test->test_suite_name() + "." + test->name() + ".pcap";
        std::ofstream stream(path, std::ios::binary);
        for (std::size_t i = 0; i < std::min(size, _bytes.size()); ++i)
            stream.put(static_cast<char>(_bytes[i]));
        return path;
    }

  private:
    void u32(std::uint32_t value)
    {
        for (unsigned shift = 0; shift < 32; shift += 8)
            _bytes.push_back(static_cast<std::uint8_t>(value >> shift));
    }

    Bytes _bytes;
};

} // namespace ventrik
