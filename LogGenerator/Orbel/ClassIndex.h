#pragma once

#include "LogGenerator/Orbel/Base.h"

#include <initializer_list>

namespace ventrik
{

/// The routing table of one technology: its sections by name, and by log code in the order in which
/// sections that share a code see a packet. A subclass holds the sections as members and registers
/// them in their fixed order; the table never changes afterwards.
class ClassIndex
{
  public:
    explicit ClassIndex(SystemLog& log) : _log(log) {}
    /// Says farewell on standard output.
    virtual ~ClassIndex();
    ClassIndex(const ClassIndex&) = delete;
    ClassIndex& operator=(const ClassIndex&) = delete;

    /// The section of that name, or null.
    Base* getClass(std::string_view sectionName) const;
    /// The sections that want the effective log code, in order, or null.
    const CodeDictionary::Subscribers* getSubscribers(std::uint32_t logCode) const;
    /// All registered codes as decimal strings.
    const std::vector<std::string>& getAllLogCodes() const { return codeDictionary.keys(); }
    const ClassDictionary& sections() const { return classDict; }
    /// Writes two diagnostic lines about the section dictionary.
    void status() const;

  protected:
    void createSections(std::initializer_list<Base*> sections);

  private:
    SystemLog& _log;
    ClassDictionary classDict;
    CodeDictionary codeDictionary;
};

} // namespace ventrik
