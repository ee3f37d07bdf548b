#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace ventrik
{

/// Where our own preferences are.
inline constexpr std::string_view preferenceDomain = "org.ventrik.Ventrik";

/// Preferences of our own domain and of another application's, and the notice that they have
/// changed.
class Preferences
{
  public:
    virtual ~Preferences() = default;

    virtual void set(std::string_view domain, std::string_view key, bool value) = 0;
    virtual void setText(std::string_view domain, std::string_view key, std::string_view value) = 0;
    /// None where there is no such preference.
    virtual std::optional<std::string> text(std::string_view domain, std::string_view key) = 0;
    /// False when the domain could not be written.
    virtual bool synchronize(std::string_view domain) = 0;
    virtual void postChanged(std::string_view domain, std::string_view key) = 0;
};

} // namespace ventrik
