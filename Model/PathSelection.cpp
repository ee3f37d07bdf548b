#include "Model/PathSelection.h"

#include <algorithm>
#include <span>

namespace ventrik
{

namespace
{

std::vector<std::string> partsOf(std::string_view path)
{
    std::vector<std::string> parts;
    while (!path.empty()) {
        const std::size_t end = std::min(path.find('/'), path.size());
        if (end > 0)
            parts.emplace_back(path.substr(0, end));
        path.remove_prefix(std::min(end + 1, path.size()));
    }
    return parts;
}

// Walks both once; at a mismatch the last star takes one character more.
bool fits(std::string_view pattern, std::string_view part)
{
    std::size_t p = 0;
    std::size_t star = pattern.npos;
    std::size_t afterStar = 0;
    for (std::size_t i = 0; i < part.size();) {
        if (p < pattern.size() && pattern[p] == '*') {
            star = p++;
            afterStar = i;
        } else if (p < pattern.size() && (pattern[p] == '?' || pattern[p] == part[i])) {
            ++p;
            ++i;
        } else if (star != pattern.npos) {
            p = star + 1;
            i = ++afterStar;
        } else {
            return false;
        }
    }
    return pattern.find_first_not_of('*', p) == pattern.npos;
}

using PartSpan = std::span<const std::string>;

/// How a pattern and a path agree.
struct Fit {
    bool isWhole = false; ///< the pattern ends with the path, or above it
    bool isBegun = false; ///< the path ends within the pattern
};

// The places of the pattern that the parts of the path so far may lead to.
Fit fitOf(PartSpan pattern, PartSpan path)
{
    std::vector<bool> places(pattern.size() + 1, false);
    const auto enter = [&](std::vector<bool>& set, std::size_t place) {
        set[place] = true;
        for (; place < pattern.size() && pattern[place] == "**"; ++place)
            set[place + 1] = true;
    };
    enter(places, 0);
    for (const std::string& part : path) {
        if (places.back())
            return {true, true};
        std::vector<bool> next(places.size(), false);
        for (std::size_t i = 0; i < pattern.size(); ++i) {
            if (places[i] && pattern[i] == "**")
                enter(next, i);
            else if (places[i] && fits(pattern[i], part))
                enter(next, i + 1);
        }
        places = std::move(next);
    }
    return {places.back(), std::ranges::find(places, true) != places.end()};
}

} // namespace

PathSelection::PathSelection(const std::vector<std::string>& patterns)
{
    for (const std::string& pattern : patterns)
        _patterns.push_back(partsOf(pattern));
}

bool PathSelection::selects(std::string_view path) const
{
    if (_patterns.empty())
        return true;
    const Parts parts = partsOf(path);
    return std::ranges::any_of(_patterns,
                               [&](const Parts& pattern) { return fitOf(pattern, parts).isWhole; });
}

bool PathSelection::reaches(std::string_view path) const
{
    if (_patterns.empty())
        return true;
    const Parts parts = partsOf(path);
    return std::ranges::any_of(_patterns,
                               [&](const Parts& pattern) { return fitOf(pattern, parts).isBegun; });
}

} // namespace ventrik
