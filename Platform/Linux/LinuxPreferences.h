#pragma once

#include "Platform/Preferences.h"

#include <map>
#include <memory>
#include <string>

class QSettings;

namespace ventrik
{

/// Preferences as ini files: the domain D is $XDG_CONFIG_HOME/D.conf. The change notice is the
/// session-bus signal org.ventrik.Preferences.Changed(domain, key) of /org/ventrik/Preferences.
class LinuxPreferences : public Preferences
{
  public:
    LinuxPreferences();
    ~LinuxPreferences() override;

    void set(std::string_view domain, std::string_view key, bool value) override;
    bool synchronize(std::string_view domain) override;
    /// Returns when the bus has the notice; does nothing where there is no session bus.
    void postChanged(std::string_view domain, std::string_view key) override;

  private:
    QSettings& settings(std::string_view domain);

    std::map<std::string, std::unique_ptr<QSettings>, std::less<>> _settings;
};

} // namespace ventrik
