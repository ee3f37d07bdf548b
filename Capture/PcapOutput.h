#pragma once

#include "Platform/Clock.h"
#include "Platform/Technology.h"
#include "PropertyList/Bytes.h"

#include <cstddef>
#include <cstdio>
#include <memory>
#include <optional>
#include <string>

struct pcap;
struct pcap_dumper;

namespace ventrik
{

/// Messages as the records of a pcap file, with microsecond times, into a stream.
class PcapOutput
{
  public:
    /// The most that readers of the format take in one record.
    static constexpr std::size_t maximumMessageSize = 262144;
    static constexpr std::size_t fileHeaderSize = 24;
    static constexpr std::size_t recordHeaderSize = 16;

    /// Takes the stream, in any case, and writes the file's header to it. On failure `reason` says
    /// why in a few words.
    static std::optional<PcapOutput> create(std::FILE* stream, const Technology& technology,
                                            std::string& reason);

    /// False, with nothing written, for a message above `maximumMessageSize`; false also once the
    /// stream has failed.
    bool write(Clock::TimePoint time, ByteView message);
    bool flush();
    /// The errno of the first write that failed; 0 when none did.
    int error() const { return _error; }
    std::FILE* stream() const;

  private:
    struct Closer {
        void operator()(pcap* handle) const;
        void operator()(pcap_dumper* dumper) const;
    };
    PcapOutput(std::unique_ptr<pcap, Closer> handle, std::unique_ptr<pcap_dumper, Closer> dumper);

    std::unique_ptr<pcap, Closer> _handle;
    std::unique_ptr<pcap_dumper, Closer> _dumper;
    int _error = 0;
};

} // namespace ventrik
