#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// Which paths of the display are wanted: all, or those that one of the patterns fits. In a pattern
/// "*" stands for any characters within a part of a path, "?" for one, and a part "**" for any
/// parts. A pattern that fits a group wants all that is below it.
class PathSelection
{
  public:
    PathSelection() = default;
    explicit PathSelection(const std::vector<std::string>& patterns);

    bool selects(std::string_view path) const;
    /// Whether something below the path may be selected, or the path itself is.
    bool reaches(std::string_view path) const;

  private:
    using Parts = std::vector<std::string>;
    std::vector<Parts> _patterns;
};

} // namespace ventrik
