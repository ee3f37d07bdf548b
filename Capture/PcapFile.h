#pragma once

#include "Capture/ByteSource.h"
#include "Capture/CaptureContainer.h"

#include <cstddef>

struct pcap;

namespace ventrik
{

/// A pcap or pcapng file, of any byte order and precision.
class PcapFile : public CaptureContainer
{
  public:
    static bool isIn(ByteView firstBytes);
    /// None, with the error, when the library cannot read its head.
    static std::unique_ptr<PcapFile> open(std::unique_ptr<ByteSource> source, std::string name,
                                          std::string& error);

    std::optional<CapturedMessage> next() override;
    std::string error() const override { return _error; }
    /// Of the message that cannot be read; only the plain form tells.
    std::optional<std::uint64_t> errorOffset() const override { return _offset; }
    std::optional<int> linkType() const override;

  private:
    struct Closer {
        void operator()(pcap* handle) const;
    };
    PcapFile(std::unique_ptr<ByteSource> source, std::string name)
        : _source(std::move(source)), _name(std::move(name))
    {
    }
    void fail(std::string_view reason);

    std::unique_ptr<ByteSource> _source;
    std::unique_ptr<pcap, Closer> _handle; // reads from the source
    std::string _name;
    std::string _error;
    std::size_t _count = 0;
    std::optional<std::uint64_t> _offset; // of the next message, where that is known
};

} // namespace ventrik
