#pragma once

#include "PropertyList/PlistValue.h"

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// The application's resources: files by name and type ("plist"), and its version.
class Resources
{
  public:
    virtual ~Resources() = default;

    virtual std::optional<std::string> path(std::string_view name, std::string_view type) const = 0;
    /// The paths of all resources of a type, sorted.
    virtual std::vector<std::string> paths(std::string_view type) const = 0;
    virtual std::optional<Bytes> contents(const std::string& path) const = 0;
    virtual std::optional<std::string> applicationVersion() const = 0;
};

} // namespace ventrik
