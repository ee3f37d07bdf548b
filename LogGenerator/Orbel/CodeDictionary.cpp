#include "LogGenerator/Orbel/CodeDictionary.h"

#include <fmt/format.h>

namespace ventrik
{

void CodeDictionary::append(std::uint32_t code, Base& section)
{
    const auto [entry, isNew] = _subscribers.try_emplace(code);
    if (isNew)
        _keys.push_back(fmt::format("{}", code));
    entry->second.push_back(&section);
}

const CodeDictionary::Subscribers* CodeDictionary::subscribers(std::uint32_t code) const
{
    const auto entry = _subscribers.find(code);
    return entry == _subscribers.end() ? nullptr : &entry->second;
}

} // namespace ventrik
