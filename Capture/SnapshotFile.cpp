#include "Capture/SnapshotFile.h"

#include "PropertyList/PropertyListWriter.h"

#include <cerrno>
#include <cstring>
#include <fstream>

#include <fmt/format.h>

namespace ventrik
{

PlistDictionary makeSnapshot(const std::string& timestamp,
                             const std::optional<PlistValue>& saveContents,
                             const std::string& description)
{
    PlistDictionary snapshot{{"Timestamp", timestamp}};
    if (!saveContents)
        return snapshot;
    snapshot.set("Data", *saveContents);
    snapshot.set("Description", description);
    return snapshot;
}

std::string snapshotFileName(const std::string& directory, Clock::TimePoint now)
{
    const auto seconds = std::chrono::floor<std::chrono::seconds>(now).time_since_epoch().count();
    return fmt::format("{}/VentrikSnapshot-{}.ventrik", directory, seconds);
}

bool writeSnapshot(const PlistDictionary& snapshot, const std::string& fileName, std::string& error)
{
    const auto writing = writeXmlPropertyList(snapshot);
    if (!writing) {
        error = fmt::format("{}: {}", fileName, writing.error);
        return false;
    }
    std::ofstream file(fileName, std::ios::binary | std::ios::trunc);
    file << *writing.text;
    file.close();
    if (!file) {
        error = fmt::format("{}: {}", fileName, std::strerror(errno));
        return false;
    }
    return true;
}

} // namespace ventrik
