#pragma once

#include "Platform/Resources.h"

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// Resources as files NAME.TYPE in a list of directories; of two files of one name, that of the
/// earlier directory counts.
class LinuxResources : public Resources
{
  public:
    LinuxResources(std::vector<std::string> directories, std::optional<std::string> version);

    /// $VENTRIK_RESOURCE_DIRECTORY where set, ../share/ventrik of the executable; in a build tree
    /// that is a link to the templates of the source tree.
    static std::vector<std::string> defaultDirectories();

    std::optional<std::string> path(std::string_view name, std::string_view type) const override;
    std::vector<std::string> paths(std::string_view type) const override;
    /// None when the file cannot be read.
    std::optional<Bytes> contents(const std::string& path) const override;
    std::optional<std::string> applicationVersion() const override { return _version; }

  private:
    std::vector<std::string> _directories;
    std::optional<std::string> _version;
};

} // namespace ventrik
