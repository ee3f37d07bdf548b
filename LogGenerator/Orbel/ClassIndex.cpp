#include "LogGenerator/Orbel/ClassIndex.h"

#include <cstdio>

namespace ventrik
{

ClassIndex::~ClassIndex()
{
    std::puts("Deallocing ClassIndex");
}

Base* ClassIndex::getClass(std::string_view sectionName) const
{
    const auto section = classDict.find(sectionName);
    return section == classDict.end() ? nullptr : section->second;
}

const CodeDictionary::Subscribers* ClassIndex::getSubscribers(std::uint32_t logCode) const
{
    return codeDictionary.subscribers(logCode);
}

void ClassIndex::status() const
{
    // The table is a dictionary by its type, so the two answers never change.
    _log.warning("Dictionary = {}", 1);
    _log.warning("String = {}", 0);
}

} // namespace ventrik
