#pragma once

#include "Capture/ByteSource.h"
#include "Capture/CaptureContainer.h"
#include "Capture/LogRecords.h"

#include <memory>
#include <string>
#include <vector>

namespace ventrik
{

/// A file of log records, as a save makes it and as other tools do. Packets that kept their type
/// byte in a save are read as well.
class DlfFile : public CaptureContainer
{
  public:
    /// Whether a plausible record stands at the start of a file; a version report is one.
    static bool isIn(ByteView firstBytes);

    /// The name is what the lines of errors and notes begin with.
    DlfFile(std::unique_ptr<ByteSource> source, std::string name);

    std::optional<CapturedMessage> next() override;
    std::string error() const override;
    std::vector<std::string> notes() const override;

  private:
    std::unique_ptr<ByteSource> _source;
    std::string _name;
    RecordDamage _damage;
    LogRecords _records;
    Clock::TimePoint _time; // of the last record
};

} // namespace ventrik
