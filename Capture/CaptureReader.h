#pragma once

#include "Platform/Clock.h"
#include "Platform/Technology.h"
#include "PropertyList/PlistValue.h"

#include <memory>
#include <optional>
#include <string>

struct pcap;

namespace ventrik
{

/// One message of the log channel, as it was captured.
struct CapturedMessage {
    Clock::TimePoint time;
    ByteView data; ///< lives until the next one is read
};

/// Reads a capture, a pcap file of log-channel messages, one after the other in constant memory.
class CaptureReader
{
  public:
    /// Opens a file, or standard input for "-". On failure `error` says why in one line.
    static std::optional<CaptureReader> open(const std::string& path, std::string& error);

    /// None when the link type names no technology.
    std::optional<Technology> technology() const;
    int linkType() const;

    /// The next message; none at the end of the capture and at damage.
    std::optional<CapturedMessage> next();
    /// What is wrong with the capture, in one line; empty when it ended as it should.
    const std::string& error() const { return _error; }

  private:
    struct Closer {
        void operator()(pcap* handle) const;
    };
    CaptureReader(pcap* handle, std::string path) : _handle(handle), _path(std::move(path)) {}

    std::unique_ptr<pcap, Closer> _handle;
    std::string _path;
    std::string _error;
    std::size_t _count = 0;
};

} // namespace ventrik
