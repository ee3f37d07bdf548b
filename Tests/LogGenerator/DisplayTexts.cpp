#include "Tests/LogGenerator/DisplayTexts.h"

#include <algorithm>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

void collectTexts(const PlistValue& value, const std::string& path, std::vector<std::string>& texts)
{
    const auto below = [&](std::string_view name) {
        return path.empty() ? std::string(name) : fmt::format("{}/{}", path, name);
    };
    if (value.string()) {
        if (!value.string()->empty() && *value.string() != "-")
            texts.push_back(fmt::format("{}: {}", path, *value.string()));
    } else if (value.dictionary()) {
        for (const auto& [key, entry] : *value.dictionary()) {
            if (key != "_sorted")
                collectTexts(entry, below(key), texts);
        }
    } else if (value.array()) {
        for (std::size_t i = 0; i < value.array()->size(); ++i)
            collectTexts((*value.array())[i], below(std::to_string(i)), texts);
    }
}

} // namespace

std::vector<std::string> displayTexts(const PlistValue& display)
{
    std::vector<std::string> texts;
    collectTexts(display, "", texts);
    std::ranges::sort(texts);
    return texts;
}

} // namespace ventrik
