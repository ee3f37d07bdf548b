#pragma once

#include "Platform/SystemLog.h"
#include "PropertyList/PlistValue.h"

#include <optional>
#include <string_view>

namespace ventrik
{

/// Where a decoder leaves what it found: the labels of the display, through the lookup; and the
/// state dictionary, for what it must know at its next packet. It owns none of them.
class C2KOutput
{
  public:
    /// The lookup is null while there is no display.
    C2KOutput(const PlistDictionary* lookup, PlistDictionary& state, SystemLog& log)
        : _lookup(lookup), _state(state), _log(log)
    {
    }

    /// Stores the value under every label that the template gives to the lookup key. An entry of
    /// the lookup that is none ends it there.
    void publish(std::string_view lookupKey, const PlistValue& value) const;

    PlistDictionary& state() const { return _state; }
    /// Stores a value in the state's "ExtraInfo", which travels with the history.
    void keepExtra(std::string_view key, const PlistValue& value) const;
    SystemLog& log() const { return _log; }

  private:
    const PlistDictionary* _lookup;
    PlistDictionary& _state;
    SystemLog& _log;
};

} // namespace ventrik
