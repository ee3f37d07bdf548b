#include "Capture/SnapshotFile.h"

#include "Files/PrivateFile.h"
#include "PropertyList/PropertyListWriter.h"

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

SnapshotWriting writeSnapshot(const PlistDictionary& snapshot, const std::string& fileName)
{
    const auto writing = writeXmlPropertyListReplacing(snapshot);
    SnapshotWriting result{{}, writing.replaced};
    auto file = PrivateFile::create(fileName, result.error);
    if (!file)
        return result;
    file->write(*writing.text);
    file->commit(result.error);
    return result;
}

} // namespace ventrik
