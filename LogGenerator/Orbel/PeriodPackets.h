#pragma once

#include "PropertyList/PlistValue.h"

#include <cstddef>
#include <deque>

namespace ventrik
{

/// The raw packets of one display period, one behind the other: the newest 64 MiB of them. The
/// oldest make way, always whole, and are counted.
class PeriodPackets
{
  public:
    static constexpr std::size_t maximumSize = std::size_t{64} << 20;

    void append(ByteView packet);
    /// How many packets of this period have made way.
    std::size_t droppedCount() const { return _dropped; }
    /// The period's packets; the next period begins.
    Bytes take();

  private:
    // Some packets that follow each other: their bounds alone would take more room than small
    // packets do.
    struct Run {
        std::size_t size = 0;
        std::size_t packets = 0;
    };

    std::size_t size() const { return _bytes.size() - _first; }
    void dropOldest();

    Bytes _bytes;
    std::size_t _first = 0; // where the packets begin that are still kept
    std::deque<Run> _runs;
    std::size_t _dropped = 0;
};

} // namespace ventrik
