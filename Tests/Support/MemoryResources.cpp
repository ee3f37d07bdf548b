#include "Tests/Support/MemoryResources.h"

#include <utility>

namespace ventrik
{

namespace
{

std::string_view fileName(std::string_view path)
{
    const auto slash = path.rfind('/');
    return slash == std::string_view::npos ? path : path.substr(slash + 1);
}

} // namespace

void MemoryResources::add(const std::string& path, Bytes contents)
{
    _files[path] = std::move(contents);
}

void MemoryResources::add(const std::string& path, std::string_view contents)
{
    add(path, Bytes(contents.begin(), contents.end()));
}

void MemoryResources::setApplicationVersion(std::optional<std::string> version)
{
    _version = std::move(version);
}

std::optional<std::string> MemoryResources::path(std::string_view name, std::string_view type) const
{
    const std::string wanted = std::string(name) + "." + std::string(type);
    for (const auto& file : _files)
        if (fileName(file.first) == wanted)
            return file.first;
    return std::nullopt;
}

std::vector<std::string> MemoryResources::paths(std::string_view type) const
{
    const std::string ending = "." + std::string(type);
    std::vector<std::string> paths;
    for (const auto& file : _files)
        if (fileName(file.first).ends_with(ending))
            paths.push_back(file.first);
    return paths;
}

std::optional<Bytes> MemoryResources::contents(const std::string& path) const
{
    const auto found = _files.find(path);
    return found == _files.end() ? std::nullopt : std::optional(found->second);
}

} // namespace ventrik
