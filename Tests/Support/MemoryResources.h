#pragma once

#include "Platform/Resources.h"

#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// Resources in memory. A path's last component is NAME.TYPE; the type follows its last dot.
class MemoryResources : public Resources
{
  public:
    void add(const std::string& path, Bytes contents);
    void add(const std::string& path, std::string_view contents);
    void remove(const std::string& path) { _files.erase(path); }
    /// "1.0" at first; none when not set.
    void setApplicationVersion(std::optional<std::string> version);

    /// The first in path order, where several directories have such a file.
    std::optional<std::string> path(std::string_view name, std::string_view type) const override;
    std::vector<std::string> paths(std::string_view type) const override;
    std::optional<Bytes> contents(const std::string& path) const override;
    std::optional<std::string> applicationVersion() const override { return _version; }

  private:
    std::map<std::string, Bytes> _files;
    std::optional<std::string> _version = "1.0";
};

} // namespace ventrik
