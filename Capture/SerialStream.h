#pragma once

#include "Capture/ByteSource.h"
#include "Capture/CaptureContainer.h"
#include "Capture/HdlcFrames.h"
#include "Capture/LogFrames.h"

#include <memory>
#include <string>
#include <vector>

namespace ventrik
{

/// What a baseband's serial port sent: frames, among them the log's. Frames of other kinds are
/// counted and skipped.
class SerialStream : public CaptureContainer
{
  public:
    /// Whether there is a frame with a right checksum in the first bytes of a file.
    static bool isIn(ByteView firstBytes);

    /// The name is what the lines of errors and notes begin with.
    SerialStream(std::unique_ptr<ByteSource> source, std::string name);

    std::optional<CapturedMessage> next() override;
    std::string error() const override { return _source->error(); }
    std::vector<std::string> notes() const override;

  private:
    std::unique_ptr<ByteSource> _source;
    std::string _name;
    HdlcFrames _frames;
    LogFrames _records;
};

} // namespace ventrik
