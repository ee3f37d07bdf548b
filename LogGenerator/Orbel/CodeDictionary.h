#pragma once

#include <cstdint>
#include <string>
#include <unordered_map>
#include <vector>

namespace ventrik
{

class Base;

/// Effective log codes and the sections that want them, in the order in which they registered.
/// Codes show as decimal strings; a packet is routed by its number. Sections are not owned.
class CodeDictionary
{
  public:
    using Subscribers = std::vector<Base*>;

    void append(std::uint32_t code, Base& section);
    /// Null when no section registered the code.
    const Subscribers* subscribers(std::uint32_t code) const;
    /// The decimal strings of all codes, in the order of their first registration.
    const std::vector<std::string>& keys() const { return _keys; }

  private:
    std::unordered_map<std::uint32_t, Subscribers> _subscribers;
    std::vector<std::string> _keys;
};

} // namespace ventrik
