#pragma once

#include "Files/PrivateFile.h"
#include "Platform/Clock.h"
#include "Platform/Technology.h"
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

    /// Begins a file that takes its name, and the place of what has it, at `commit`. On failure
    /// `error` says why in one line.
    static std::optional<CaptureWriter> create(const std::string& path,
                                               const Technology& technology, std::string& error);

    /// False, with nothing written, for a message above `maximumMessageSize`; false also when the
    /// file cannot be written, which `commit` explains.
    bool write(Clock::TimePoint time, ByteView message);
    /// After the last message. False, and the error, when something did not reach the file; there
    /// is none then.
    bool commit(std::string& error);

  private:
    struct Closer {
        void operator()(pcap* handle) const;
        void operator()(pcap_dumper* dumper) const;
    };
    CaptureWriter(PrivateFile file, std::unique_ptr<pcap, Closer> handle,
                  std::unique_ptr<pcap_dumper, Closer> dumper);

    void noteError();

    PrivateFile _file;
    std::unique_ptr<pcap, Closer> _handle;
    std::unique_ptr<pcap_dumper, Closer> _dumper;
    int _error = 0; // errno of the first write that failed
};

} // namespace ventrik
