#include "Platform/Linux/LinuxResources.h"

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <set>
#include <utility>

namespace ventrik
{

namespace fs = std::filesystem;

LinuxResources::LinuxResources(std::vector<std::string> directories,
                               std::optional<std::string> version)
    : _directories(std::move(directories)), _version(std::move(version))
{
}

std::vector<std::string> LinuxResources::defaultDirectories()
{
    std::vector<std::string> directories;
    if (const char* chosen = std::getenv("VENTRIK_RESOURCE_DIRECTORY");
        chosen != nullptr && *chosen != '\0')
        directories.emplace_back(chosen);
    std::error_code error;
    const fs::path executable = fs::read_symlink("/proc/self/exe", error);
    if (!error)
        directories.push_back(executable.parent_path().parent_path() / "share" / "ventrik");
    return directories;
}

std::optional<std::string> LinuxResources::path(std::string_view name, std::string_view type) const
{
    const std::string fileName = std::string(name) + "." + std::string(type);
    for (const fs::path directory : _directories) {
        std::error_code error;
        const fs::path path = directory / fileName;
        if (fs::is_regular_file(path, error))
            return path.string();
    }
    return std::nullopt;
}

std::vector<std::string> LinuxResources::paths(std::string_view type) const
{
    const std::string extension = "." + std::string(type);
    std::set<std::string> names;
    std::vector<std::string> paths;
    for (const std::string& directory : _directories) {
        std::error_code error;
        for (fs::directory_iterator entry(directory, error), end; !error && entry != end;
             entry.increment(error)) {
            std::error_code ignored;
            if (entry->path().extension() == extension && entry->is_regular_file(ignored) &&
                names.insert(entry->path().filename()).second)
                paths.push_back(entry->path().string());
        }
    }
    std::ranges::sort(paths);
    return paths;
}

std::optional<Bytes> LinuxResources::contents(const std::string& path) const
{
    std::error_code error;
    if (!fs::is_regular_file(path, error))
        return std::nullopt;
    std::ifstream file(path, std::ios::binary);
    if (!file)
        return std::nullopt;
    Bytes bytes{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
    return file.bad() ? std::nullopt : std::optional(std::move(bytes));
}

} // namespace ventrik
