#pragma once

#include "Platform/Clock.h"
#include "PropertyList/PlistValue.h"

#include <cstddef>
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

struct SnapshotWriting {
    std::string error;        ///< one line; empty when the file was written
    std::size_t replaced = 0; ///< characters and values that XML cannot carry: U+FFFD stands there

    explicit operator bool() const { return error.empty(); }
};
/// Writes an XML property list as a private file, which is there when it is whole.
SnapshotWriting writeSnapshot(const PlistDictionary& snapshot, const std::string& fileName);

} // namespace ventrik
