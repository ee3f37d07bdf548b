#include "Tests/Support/MemoryPreferences.h"

#include <fmt/format.h>

namespace ventrik
{

void MemoryPreferences::set(std::string_view domain, std::string_view key, bool value)
{
    _calls.push_back(fmt::format("set {} {} {}", domain, key, value));
    _values[{std::string(domain), std::string(key)}] = value;
}

void MemoryPreferences::setText(std::string_view domain, std::string_view key,
                                std::string_view value)
{
    _texts[{std::string(domain), std::string(key)}] = value;
}

std::optional<std::string> MemoryPreferences::text(std::string_view domain, std::string_view key)
{
    const auto found = _texts.find({std::string(domain), std::string(key)});
    return found == _texts.end() ? std::nullopt : std::optional(found->second);
}

bool MemoryPreferences::synchronize(std::string_view domain)
{
    _calls.push_back(fmt::format("synchronize {}", domain));
    return _synchronizeSucceeds;
}

void MemoryPreferences::postChanged(std::string_view domain, std::string_view key)
{
    _calls.push_back(fmt::format("post {} {}", domain, key));
}

std::optional<bool> MemoryPreferences::value(const std::string& domain,
                                             const std::string& key) const
{
    const auto found = _values.find({domain, key});
    return found == _values.end() ? std::nullopt : std::optional(found->second);
}

} // namespace ventrik
