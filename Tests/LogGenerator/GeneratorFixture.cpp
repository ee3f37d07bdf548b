#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

std::string textAt(const PlistValue& root, std::initializer_list<std::string_view> path)
{
    const PlistValue* value = &root;
    for (const std::string_view key : path) {
        const PlistDictionary* dictionary = value ? value->dictionary() : nullptr;
        value = dictionary ? dictionary->find(key) : nullptr;
    }
    return value && value->string() ? *value->string() : "(none)";
}

std::vector<std::string> keysOf(const PlistDictionary& dictionary)
{
    std::vector<std::string> keys;
    for (const auto& entry : dictionary)
        keys.push_back(entry.key);
    return keys;
}

std::string plistXml(std::string_view content)
{
    return fmt::format("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                       "<plist version=\"1.0\">{}</plist>\n",
                       content);
}

} // namespace ventrik
