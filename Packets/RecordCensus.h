#pragma once

#include "Packets/Layouts.h"
#include "PropertyList/Bytes.h"

#include <compare>
#include <map>

namespace ventrik
{

/// Of which kind a record is.
struct RecordKind {
    std::uint32_t logCode; ///< effective
    std::optional<std::uint8_t> version;
    std::size_t size; ///< of the packet, its header included
    /// None for a code that nobody decodes.
    std::optional<LayoutKind> layout;

    auto operator<=>(const RecordKind&) const = default;
};

/// None for what is too short to have a code, or of a type that no record has. The layouts are
/// judged by the mode.
std::optional<RecordKind> recordKindOf(ByteView message, RecordsMode mode);

/// Counts the records of messages, as they arrive, by log code, version, size and layout. Of kinds
/// beyond a limit only the records are counted, so that no input makes it grow without end.
class RecordCensus
{
  public:
    enum class Payloads { Dropped, Kept };

    /// The mode says what the layouts are judged by. Each kind's first payload is kept on demand.
    explicit RecordCensus(RecordsMode mode, Payloads payloads = Payloads::Dropped)
        : _mode(mode), _payloads(payloads)
    {
    }

    void take(ByteView message);

    using Kind = RecordKind;
    struct Counted {
        std::size_t count = 0;
        bool isTooShort = false; ///< for what the record holds at least
        Bytes firstPayload;      ///< empty where it is not kept
    };
    /// In the order of code, version and size.
    const std::map<Kind, Counted>& kinds() const { return _kinds; }
    /// Of further kinds.
    std::size_t otherCount() const { return _otherCount; }
    /// Those that are too short to have a code, or of a type that no record has.
    std::size_t brokenCount() const { return _brokenCount; }

    static constexpr std::size_t maximumKinds = 10000;
    static constexpr std::size_t maximumPayloads = std::size_t{16} << 20; ///< bytes, of all kinds

  private:
    Counted& add(const Kind& kind, const LogPacket& packet);

    RecordsMode _mode;
    Payloads _payloads;
    std::size_t _payloadBytes = 0;
    std::map<Kind, Counted> _kinds;
    std::size_t _otherCount = 0;
    std::size_t _brokenCount = 0;
};

/// Whether the record is one that only those decode who ask for more than the base records.
bool isExtensionOnly(const LogPacket& packet);

} // namespace ventrik
