#pragma once

#include "Capture/CaptureTechnology.h"
#include "Platform/Clock.h"
#include "PropertyList/PlistValue.h"

#include <memory>
#include <optional>
#include <string>

struct pcap;
struct pcap_dumper;

namespace ventrik
{

/// Writes a capture: each message of the log channel as one record of a pcap file, with microsecond
/// times.
class CaptureWriter
{
  public:
    /// The most that readers of the format take in one record.
    static constexpr std::size_t maximumMessageSize = 262144;

    /// Creates or overwrites a file. On failure `error` says why in one line.
    static std::optional<CaptureWriter>
    create(const std::string& path, const CaptureTechnology& technology, std::string& error);

    /// False, with nothing written, for a message above `maximumMessageSize`.
    bool write(Clock::TimePoint time, ByteView message);
    /// False when something did not reach the file.
    bool flush();

  private:
    struct Closer {
        void operator()(pcap* handle) const;
        void operator()(pcap_dumper* dumper) const;
    };
    CaptureWriter(std::unique_ptr<pcap, Closer> handle,
                  std::unique_ptr<pcap_dumper, Closer> dumper);

    std::unique_ptr<pcap, Closer> _handle;
    std::unique_ptr<pcap_dumper, Closer> _dumper;
};

} // namespace ventrik
