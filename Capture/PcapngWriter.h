#pragma once

#include "Files/PrivateFile.h"
#include "Platform/Clock.h"
#include "Platform/Technology.h"
#include "PropertyList/PlistValue.h"

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace ventrik
{

/// Writes a capture as a pcapng file, which the library that writes the other form does not write:
/// one section with one interface, and a block for each message with its time in nanoseconds. Link
/// types of user applications say nothing to other tools; a comment and the interface's description
/// do.
class PcapngWriter
{
  public:
    /// As of a CaptureFile.
    static std::optional<PcapngWriter> create(const std::string& path, const Technology& technology,
                                              std::string_view version, std::string& error);
    bool write(Clock::TimePoint time, ByteView message);
    bool commit(std::string& error) { return _file.commit(error); }

  private:
    explicit PcapngWriter(PrivateFile file) : _file(std::move(file)) {}

    PrivateFile _file;
};

} // namespace ventrik
