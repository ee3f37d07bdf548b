#pragma once

#include "Platform/Clock.h"
#include "PropertyList/PlistValue.h"

#include <optional>
#include <string>

namespace ventrik
{

/// The content of a snapshot file: "Timestamp", "Data" and "Description". Without save contents it
/// ends after "Timestamp": the first value that is missing ends it.
PlistDictionary makeSnapshot(const std::string& timestamp,
                             const std::optional<PlistValue>& saveContents,
                             const std::string& description);

/// DIRECTORY/VentrikSnapshot-SECONDS.ventrik, so that two saves within a second write one file.
std::string snapshotFileName(const std::string& directory, Clock::TimePoint now);

/// Writes an XML property list straight to its final name. On failure `error` says why.
bool writeSnapshot(const PlistDictionary& snapshot, const std::string& fileName,
                   std::string& error);

} // namespace ventrik
