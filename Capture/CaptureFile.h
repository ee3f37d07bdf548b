#pragma once

#include "Platform/Clock.h"
#include "Platform/Technology.h"
#include "PropertyList/PlistValue.h"

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>

namespace ventrik
{

/// A capture that is being written, in the form that its name asks for: pcap, or pcapng where it
/// ends with ".pcapng". The file takes its name, and the place of what has it, at `commit`.
class CaptureFile
{
  public:
    /// The most that readers of either form take in one record.
    static constexpr std::size_t maximumMessageSize = 262144;

    /// The version is ours, for people who wonder where a file came from. On failure `error` says
    /// why in one line.
    static std::unique_ptr<CaptureFile> create(const std::string& path,
                                               const Technology& technology,
                                               std::string_view version, std::string& error);
    virtual ~CaptureFile() = default;

    /// False, with nothing written, for a message above `maximumMessageSize`; false also when the
    /// file cannot be written, which `commit` explains.
    virtual bool write(Clock::TimePoint time, ByteView message) = 0;
    /// After the last message. False, and the error, when something did not reach the file; there
    /// is none then.
    virtual bool commit(std::string& error) = 0;
};

} // namespace ventrik
