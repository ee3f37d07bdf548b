#pragma once

#include "Capture/ByteSource.h"
#include "Capture/CaptureContainer.h"
#include "Capture/LogRecords.h"
#include "PropertyList/PlistValue.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace ventrik
{

/// A snapshot file: gives the raw packets of its periods, with their types and prefixes, or the
/// cell monitor's messages. The file is read whole, by the first `next`.
class SnapshotContainer : public CaptureContainer
{
  public:
    static constexpr std::size_t maximumSize = std::size_t{256} << 20; ///< of a file

    /// Whether the first bytes of a file are those of a property list.
    static bool isIn(ByteView firstBytes);

    /// The name is what the lines of errors and notes begin with.
    SnapshotContainer(std::unique_ptr<ByteSource> source, std::string name);

    std::optional<CapturedMessage> next() override;
    std::string error() const override { return _error; }
    std::vector<std::string> notes() const override;

  private:
    void readSnapshot();
    std::optional<Bytes> readFile();
    std::optional<CapturedMessage> nextPacket();
    std::optional<CapturedMessage> beginEntry(const PlistValue& entry);
    std::optional<CapturedMessage> beginPeriod(const PlistValue& displayState);

    std::unique_ptr<ByteSource> _source; // null when it was read
    std::string _name;
    std::string _error;
    PlistArray _entries;
    std::size_t _nextEntry = 0;
    std::uint64_t _unreadableEntries = 0;
    RecordDamage _damage;
    PlistValue _displayState;       // of the present period
    std::uint64_t _packetBytes = 0; // of the periods before it
    std::unique_ptr<ByteSource> _period;
    std::optional<LogRecords> _packets; // of the present period
    Clock::TimePoint _time;             // of the last message
};

} // namespace ventrik
