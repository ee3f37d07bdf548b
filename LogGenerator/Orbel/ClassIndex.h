#pragma once

#include "LogGenerator/Orbel/Base.h"

#include <memory>
#include <utility>
#include <vector>

namespace ventrik
{

/// The routing table of one technology: its sections by name, and by log code in the order in which
/// sections that share a code see a packet. A subclass lists its sections once, as members that are
/// added in their fixed order; the table never changes afterwards.
class ClassIndex
{
  public:
    explicit ClassIndex(SystemLog& log, RecordsMode records = RecordsMode::Newer)
        : _log(log), _recordsMode(records)
    {
    }
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
    /// Creates a section, which the index owns, and registers it.
    template <typename Section, typename... Args>
    Base& add(Args&&... args)
    {
        _sections.push_back(std::make_unique<Section>(_log, std::forward<Args>(args)...));
        _sections.back()->readRecords(_recordsMode);
        _sections.back()->initWithDict(classDict, codeDictionary);
        return *_sections.back();
    }

  private:
    SystemLog& _log;
    RecordsMode _recordsMode;
    ClassDictionary classDict;
    CodeDictionary codeDictionary;
    std::vector<std::unique_ptr<Base>> _sections;
};

} // namespace ventrik
