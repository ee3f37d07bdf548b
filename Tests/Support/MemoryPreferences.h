#pragma once

#include "Platform/Preferences.h"

#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace ventrik
{

/// Preferences in memory, with a record of the calls.
class MemoryPreferences : public Preferences
{
  public:
    void set(std::string_view domain, std::string_view key, bool value) override;
    /// Leaves no record.
    void setText(std::string_view domain, std::string_view key, std::string_view value) override;
    std::optional<std::string> text(std::string_view domain, std::string_view key) override;
    bool synchronize(std::string_view domain) override;
    void postChanged(std::string_view domain, std::string_view key) override;

    std::optional<bool> value(const std::string& domain, const std::string& key) const;
    /// In call order: "set DOMAIN KEY true", "synchronize DOMAIN", "post DOMAIN KEY".
    const std::vector<std::string>& calls() const { return _calls; }
    void setSynchronizeSucceeds(bool succeeds) { _synchronizeSucceeds = succeeds; }

  private:
    std::map<std::pair<std::string, std::string>, bool> _values;
    std::map<std::pair<std::string, std::string>, std::string> _texts;
    std::vector<std::string> _calls;
    bool _synchronizeSucceeds = true;
};

} // namespace ventrik
