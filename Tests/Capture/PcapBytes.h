#pragma once

#include "PropertyList/PlistValue.h"
#include "Tests/Support/TemporaryFile.h"

#include <fstream>
#include <memory>
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

    /// Writes the first `size` bytes to a file, which lives as long as these bytes, and gives its
    /// path.
    std::string file(std::size_t size = SIZE_MAX) const
    {
        std::ofstream stream(_file->path(), std::ios::binary);
        for (std::size_t i = 0; i < std::min(size, _bytes.size()); ++i)
            stream.put(static_cast<char>(_bytes[i]));
        return _file->path();
    }

  private:
    void u32(std::uint32_t value)
    {
        for (unsigned shift = 0; shift < 32; shift += 8)
            _bytes.push_back(static_cast<std::uint8_t>(value >> shift));
    }

    Bytes _bytes;
    std::shared_ptr<TemporaryFile> _file = std::make_shared<TemporaryFile>("capture.pcap");
};

} // namespace ventrik
