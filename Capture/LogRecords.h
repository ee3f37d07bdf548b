#pragma once

#include "Capture/ByteSource.h"
#include "Capture/RecordDamage.h"
#include "Platform/Clock.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>

namespace ventrik
{

/// A log record, or what begins like one.
struct LogRecordHead {
    std::size_t before = 0; ///< bytes in front of the record: type, transport prefix
    std::size_t length = 0; ///< as the record says it: without those, modulo 65536
    std::uint16_t code = 0;
    std::optional<Clock::TimePoint> time = {}; ///< none for version reports
    bool isUnfinished = false; ///< the bytes end within the head; only `before` is known
};

/// Log records that lie one behind the other without a separator, read in constant memory. Behind
/// damage, reading goes on at the next plausible record.
///
/// A plausible one has a length of its head or more, a code, a time within 10 years of the last
/// one's, and at its end the end of the bytes or another such head.
class LogRecords
{
  public:
    enum class Framing {
        Bare,  ///< a record alone; here and there a type byte stands before it
        Typed, ///< a packet: a type byte, and before it perhaps a transport prefix
    };
    struct Packet {
        ByteView data; ///< with its type, and the prefix of typed ones; lives until the next one
        std::uint16_t code;
        std::optional<Clock::TimePoint> time;
    };

    static bool isPlausibleAtStart(ByteView firstBytes, Framing framing);

    /// Offsets are told from where the source stands in the whole, `baseOffset`.
    LogRecords(ByteSource& source, Framing framing, RecordDamage& damage,
               std::uint64_t baseOffset = 0)
        : _source(source), _framing(framing), _damage(damage), _baseOffset(baseOffset)
    {
    }

    std::optional<Packet> next();
    /// Where and why the records end before their time; empty when they do not.
    const std::string& error() const { return _error; }

  private:
    enum class TimeRule { Needed, Free };
    using Time = std::optional<Clock::TimePoint>;

    void load(std::size_t size);
    void consume(std::size_t size);
    std::uint64_t offset() const { return _baseOffset + _source.offset(); }

    TimeRule rule() const;
    std::optional<LogRecordHead> headAt(std::size_t position, std::size_t before, Time near,
                                        TimeRule timeRule) const;
    std::optional<LogRecordHead> bestHead() const;
    int chainAt(std::size_t position, int depth, Time near, TimeRule timeRule) const;
    bool fits(std::size_t end, const LogRecordHead& head, TimeRule timeRule) const;
    bool isPlausibleAt(std::size_t position, Time near, int followers) const;
    bool findsPlausibleAt(std::size_t position);

    std::optional<std::size_t> sizeOf(const LogRecordHead& head);
    std::optional<std::size_t> sizeOfPropertyList(const LogRecordHead& head);
    bool holdsPropertyList(const LogRecordHead& head) const;
    bool hasPlausibleWithin(std::size_t end);
    bool skipToPlausible(bool isRecord);
    Packet take(const LogRecordHead& head, std::size_t size);
    void endTruncated(std::uint64_t start, std::string_view what);
    void endUnfinished();

    ByteSource& _source;
    Framing _framing;
    RecordDamage& _damage;
    std::uint64_t _baseOffset;
    ByteView _view; // of the source, from the next byte on
    bool _isAtEnd = false;
    std::size_t _taken = 0;        // the size of the packet that was given last
    std::uint64_t _lookedOnTo = 0; // where looking on for a property list's end failed
    Time _lastTime;
    Bytes _packet;
    std::string _error;
};

} // namespace ventrik
