#pragma once

#include <string_view>

namespace ventrik
{

/// Preferences of another application's domain, and the notice that they have changed.
class Preferences
{
  public:
    virtual ~Preferences() = default;

    virtual void set(std::string_view domain, std::string_view key, bool value) = 0;
    /// False when the domain could not be written.
    virtual bool synchronize(std::string_view domain) = 0;
    virtual void postChanged(std::string_view domain, std::string_view key) = 0;
};

} // namespace ventrik
