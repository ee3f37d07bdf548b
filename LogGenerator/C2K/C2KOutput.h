#pragma once

#include "LogGenerator/C2K/C2KLabels.h"
#include "Packets/Record.h"
#include "Platform/SystemLog.h"
#include "PropertyList/PlistValue.h"

#include <string_view>

namespace ventrik
{

/// Where a decoder leaves what it found: the labels of the display; and the state dictionary, for
/// what it must know at its next packet. It owns none of them.
class C2KOutput
{
  public:
    /// The record is the one that is being decoded; null where there is none.
    C2KOutput(C2KLabels& labels, PlistDictionary& state, SystemLog& log,
              const Record* record = nullptr)
        : _labels(labels), _state(state), _log(log), _record(record)
    {
    }

    /// Shows a field of a part of the record under every label that the template gives to its key.
    void publish(const Field& field, const LogPacket& part) const;
    /// A table of them, a constant.
    void publish(std::span<const Field> fields, const LogPacket& part) const;
    /// Shows a text in the place of the field's number.
    void publish(const Field& field, std::string_view text) const;
    /// Shows a group of pilots, or the text while there is none.
    void publish(const Field& field, const std::vector<ShownPilot>& pilots,
                 std::string_view textOfNone) const;
    /// Shows the group of pilots that `pilots()` works out from those bytes, and from nothing else.
    template <typename Pilots>
    void publish(const Field& field, ByteView source, const Pilots& pilots) const
    {
        if (!_labels.showsPilotsOf(field, source))
            _labels.publish(field, pilots(), source);
    }

    PlistDictionary& state() const { return _state; }
    /// The state's "ExtraInfo", which travels with the history; null when there is none.
    PlistDictionary* extraInfo() const;
    SystemLog& log() const { return _log; }

  private:
    C2KLabels& _labels;
    PlistDictionary& _state;
    SystemLog& _log;
    const Record* _record;
};

} // namespace ventrik
