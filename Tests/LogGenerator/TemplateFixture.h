#pragma once

#include "Tests/LogGenerator/GeneratorFixture.h"

#include <map>
#include <string>
#include <vector>

namespace ventrik
{

using Keys = std::vector<std::string>;

/// The keys of the section that every template has.
const Keys& simInfoKeys();

/// Looks into a display template that ships with the application.
class TemplateFixture : public testing::Test
{
  protected:
    explicit TemplateFixture(const std::string& fileName);

    /// The value of a key that must stand in the template once, however deep.
    const PlistValue* only(const std::string& key);
    /// The section is a dictionary of exactly these keys: a dash for each value, and an empty array
    /// for each list.
    void expectDictionary(const std::string& name, const Keys& keys, const Keys& lists = {});
    void expectEmptyArray(const std::string& name);

    PlistDictionary root;

  private:
    void collect(const PlistDictionary& dictionary);

    std::multimap<std::string, PlistValue> entries;
};

} // namespace ventrik
