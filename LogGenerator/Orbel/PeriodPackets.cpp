#include "LogGenerator/Orbel/PeriodPackets.h"

#include <utility>

namespace ventrik
{

namespace
{

constexpr std::size_t runSize = 4096;
constexpr std::size_t maximumWaste = PeriodPackets::maximumSize / 8;

} // namespace

void PeriodPackets::append(ByteView packet)
{
    if (packet.empty())
        return;
    while (!_runs.empty() && size() + packet.size() > maximumSize)
        dropOldest();
    if (_runs.empty() || _runs.back().size >= runSize)
        _runs.emplace_back();
    _runs.back().size += packet.size();
    ++_runs.back().packets;
    _bytes.insert(_bytes.end(), packet.begin(), packet.end());
}

void PeriodPackets::dropOldest()
{
    _first += _runs.front().size;
    _dropped += _runs.front().packets;
    _runs.pop_front();
    if (_first > maximumWaste || _runs.empty())
        _bytes.erase(_bytes.begin(),
                     _bytes.begin() + static_cast<std::ptrdiff_t>(std::exchange(_first, 0)));
}

Bytes PeriodPackets::take()
{
    _runs.clear();
    _dropped = 0;
    Bytes packets = std::exchange(_bytes, {});
    packets.erase(packets.begin(),
                  packets.begin() + static_cast<std::ptrdiff_t>(std::exchange(_first, 0)));
    // The history keeps them for long.
    if (packets.capacity() > 2 * packets.size())
        packets.shrink_to_fit();
    // The next period will be much like this one.
    _bytes.reserve(packets.size());
    return packets;
}

} // namespace ventrik
