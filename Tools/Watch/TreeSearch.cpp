#include "Tools/Watch/TreeSearch.h"

#include "PropertyList/Utf8.h"

#include <algorithm>

#include <wctype.h>

namespace ventrik
{

namespace
{

void appendFolded(std::string& text, std::string_view part)
{
    while (!part.empty()) {
        const Utf8Character character = decodeUtf8(part);
        const std::size_t length = std::max<std::size_t>(character.length, 1);
        const auto lower = static_cast<char32_t>(towlower(static_cast<wint_t>(character.code)));
        if (character.length == 0)
            text += part.front();
        else if (lower == character.code)
            text += part.substr(0, length);
        else
            appendUtf8(text, lower);
        part.remove_prefix(length);
    }
}

std::string folded(std::string_view text)
{
    std::string result;
    appendFolded(result, text);
    return result;
}

} // namespace

/// One way through the tree. Of the path only its last letters are looked at together with a name,
/// so that long names do not take time again for everything below them.
class TreeSearch::Walk
{
  public:
    Walk(TreeSearch& search, std::string_view text) : _search(search), _text(folded(text)) {}

    void walk(const VentrikModelNode& node, std::uint32_t holder, const std::string& pathEnd,
              bool isMatch)
    {
        std::uint32_t row = 0;
        for (const ModelNodePointer& child : *node.childNodes())
            visit(*child, holder, row++, pathEnd, isMatch);
    }

  private:
    void visit(const VentrikModelNode& child, std::uint32_t holder, std::uint32_t row,
               const std::string& pathEnd, bool isBelowMatch)
    {
        std::string path = pathEnd + '/';
        appendFolded(path, child.displayName());
        const bool pathMatches = isBelowMatch || path.find(_text) != std::string::npos;
        if (pathMatches || (child.value() && holds(*child.value())))
            _search._matches.push_back({holder, row});
        if (!child.childNodes())
            return;
        if (path.size() >= _text.size())
            path.erase(0, path.size() - std::max<std::size_t>(_text.size(), 1) + 1);
        const auto place = static_cast<std::uint32_t>(_search._holders.size());
        _search._holders.push_back({&child, holder, row});
        walk(child, place, path, pathMatches);
    }

    bool holds(const std::string& value)
    {
        _value.clear();
        appendFolded(_value, value);
        return _value.find(_text) != std::string::npos;
    }

    TreeSearch& _search;
    std::string _text;
    std::string _value; // keeps its room
};

TreeSearch::TreeSearch(ModelNodePointer root, std::string_view text) : _root(std::move(root))
{
    if (!_root || !_root->childNodes())
        return;
    _holders.push_back({_root.get(), 0, 0});
    Walk(*this, text).walk(*_root, 0, {}, text.empty());
}

const VentrikModelNode& TreeSearch::node(std::size_t match) const
{
    const Match& it = _matches.at(match);
    return *_holders[it.holder].node->childNodes()->at(it.row);
}

TreeSearch::Trail TreeSearch::trail(std::size_t match) const
{
    const Match& it = _matches.at(match);
    Trail trail{static_cast<int>(it.row)};
    for (std::uint32_t holder = it.holder; holder != 0; holder = _holders[holder].above)
        trail.push_back(static_cast<int>(_holders[holder].row));
    std::ranges::reverse(trail);
    return trail;
}

std::string TreeSearch::names(std::size_t match) const
{
    std::string text;
    const VentrikModelNode* node = _root.get();
    for (const int row : trail(match)) {
        node = node->childNodes()->at(static_cast<std::size_t>(row)).get();
        text += text.empty() ? "" : " › ";
        text += node->displayName();
    }
    return text;
}

std::size_t TreeSearch::firstBehind(const Trail& place) const
{
    std::size_t first = 0;
    for (std::size_t count = _matches.size(); count > 0;) {
        const std::size_t half = count / 2;
        if (trail(first + half) <= place) {
            first += half + 1;
            count -= half + 1;
        } else {
            count = half;
        }
    }
    return first;
}

std::size_t TreeSearch::lastBefore(const Trail& place) const
{
    std::size_t behind = firstBehind(place);
    while (behind > 0 && trail(behind - 1) == place)
        --behind;
    return behind > 0 ? behind - 1 : count();
}

} // namespace ventrik
