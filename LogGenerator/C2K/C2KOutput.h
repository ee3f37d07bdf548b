#pragma once

#include "LogGenerator/C2K/C2KLabels.h"
#include "Packets/Record.h"
#include "Platform/SystemLog.h"
#include "PropertyList/PlistValue.h"

#include <cstddef>
#include <string_view>
#include <vector>

namespace ventrik
{

/// Where the running totals stood the last time, so that they are found without a search.
struct TotalPlaces {
    struct Rate {
        // In the state.
        std::size_t sequence = 0;
        std::size_t sent = 0;
        // In the extra information: the last record and the one before it.
        std::size_t sequence1 = 0;
        std::size_t sent1 = 0;
        std::size_t sequence2 = 0;
        std::size_t sent2 = 0;
    };
    Rate forward;
    Rate reverse;
    // In the state.
    std::size_t trafficFER = 0;
    std::size_t extraInfo = 0;
};

/// Where a decoder leaves what it found: the labels of the display; and the state dictionary, for
/// what it must know at its next packet. It owns none of them.
class C2KOutput
{
  public:
    /// The record is the one that is being decoded; null where there is none.
    C2KOutput(C2KLabels& labels, TotalPlaces& totals, PlistDictionary& state, SystemLog& log,
              const Record* record = nullptr)
        : _labels(labels), _totals(totals), _state(state), _log(log), _record(record)
    {
    }

    /// Shows a field of a part of the record under every label that the template gives to its key.
    void publish(const Field& field, const LogPacket& part) const;
    /// A table of them, a constant.
    void publish(std::span<const Field> fields, const LogPacket& part) const;
    /// Shows a text in the place of the field's number.
    void publish(const Field& field, std::string_view text) const;
    /// Shows a text, a constant, in the place of each number of a table of fields.
    void publish(std::span<const Field> fields, std::string_view text) const;
    /// Shows a group of pilots, or the text while there is none.
    void publish(const Field& field, std::vector<ShownPilot> pilots,
                 std::string_view textOfNone) const;
    /// Shows the group of pilots that `pilots()` works out from those bytes, and from nothing else.
    template <typename Pilots>
    void publish(const Field& field, ByteView source, const Pilots& pilots) const
    {
        if (!_labels.showsPilotsOf(field, source))
            _labels.publish(field, pilots(), source);
    }

    PlistDictionary& state() const { return _state; }
    TotalPlaces& totals() const { return _totals; }
    /// The state's "ExtraInfo", which travels with the history; null when there is none.
    PlistDictionary* extraInfo() const;
    SystemLog& log() const { return _log; }

  private:
    C2KLabels& _labels;
    TotalPlaces& _totals;
    PlistDictionary& _state;
    SystemLog& _log;
    const Record* _record;
};

} // namespace ventrik
