#pragma once

#include "Platform/Preferences.h"

#include <map>
#include <memory>
#include <optional>
#include <string>

class QSettings;

namespace ventrik
{

class SystemLog;

/// Preferences as ini files: the domain D is $XDG_CONFIG_HOME/D.conf, below ~/.config where that is
/// not set or not absolute. The change notice is the session-bus signal
/// org.ventrik.Preferences.Changed(domain, key) of /org/ventrik/Preferences. What fails is logged.
class LinuxPreferences : public Preferences
{
  public:
    explicit LinuxPreferences(SystemLog& log);
    ~LinuxPreferences() override;

    void set(std::string_view domain, std::string_view key, bool value) override;
    void setText(std::string_view domain, std::string_view key, std::string_view value) override;
    std::optional<std::string> text(std::string_view domain, std::string_view key) override;
    /// Leaves alone what has the file's name and is none.
    bool synchronize(std::string_view domain) override;
    /// Returns when the bus has the notice, after less than a second in any case; does nothing
    /// where there is no session bus.
    void postChanged(std::string_view domain, std::string_view key) override;

  private:
    /// Null where the file's name is taken by something else.
    QSettings* settings(std::string_view domain);

    SystemLog& _log;
    std::map<std::string, std::unique_ptr<QSettings>, std::less<>> _settings;
};

} // namespace ventrik
