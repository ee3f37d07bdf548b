#pragma once

#include <string_view>

namespace ventrik
{

/// The keys of the state dictionary. The monitor model owns it; only generators write it.
namespace StateKey
{

// Of every generator.

/// An array of dictionaries, the newest last: what was on display, with "DisplayState", "Display",
/// "ExtraInfo", "Date" and "Description".
inline constexpr std::string_view history = "History";
/// What the display was made of: the period's raw packets as bytes, of the cell monitor its
/// message.
inline constexpr std::string_view displayState = "DisplayState";
/// The display object.
inline constexpr std::string_view display = "Display";
/// A dictionary that travels with the history.
inline constexpr std::string_view extraInfo = "ExtraInfo";
/// A string: the template or the kind of generator that made the display.
inline constexpr std::string_view displayOwner = "DisplayOwner";

// Of the generators whose display has a template.

/// The template as it was read.
inline constexpr std::string_view displayTemplate = "Template";
/// A dictionary, C2K's: for each lookup key an array of the labels that show it.
inline constexpr std::string_view lookup = "Lookup";

// C2K's running totals.

/// A real: the smoothed share of erased frames on the traffic channel; there only during traffic.
inline constexpr std::string_view trafficFER = "TrafficFER";
// Integers: the sequence number and the bits so far of the last record of either direction.
inline constexpr std::string_view forwardSequence = "FLDataSeqNum";
inline constexpr std::string_view forwardSent = "FLDataSent";
inline constexpr std::string_view reverseSequence = "RLDataSeqNum";
inline constexpr std::string_view reverseSent = "RLDataSent";

} // namespace StateKey

/// The keys of a history entry that are none of the state's.
namespace HistoryKey
{
inline constexpr std::string_view date = "Date";
inline constexpr std::string_view description = "Description";
} // namespace HistoryKey

} // namespace ventrik
