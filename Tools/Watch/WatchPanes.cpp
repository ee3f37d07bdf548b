#include "Tools/Watch/WatchPanes.h"

#include "Model/NodeRows.h"
#include "PropertyList/Utf8.h"

#include <algorithm>
#include <limits>
#include <utility>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

using Key = KeyPress::Key;

constexpr int farAway = std::numeric_limits<int>::max() / 2;
constexpr std::size_t longestSought = 200;

// Outside of a search j and k are arrows.
KeyPress withLettersAsArrows(KeyPress press)
{
    if (press.key == Key::Character && press.character == 'j')
        return {Key::Down};
    if (press.key == Key::Character && press.character == 'k')
        return {Key::Up};
    return press;
}

// How far a key moves in a list; none where it does not move.
std::optional<int> stepOf(Key key, int height)
{
    const int page = std::max(1, height - 1);
    switch (key) {
    case Key::Up:
        return -1;
    case Key::Down:
        return 1;
    case Key::PageUp:
        return -page;
    case Key::PageDown:
        return page;
    case Key::Home:
        return -farAway;
    case Key::End:
        return farAway;
    default:
        return std::nullopt;
    }
}

void removeLastCharacter(std::string& text)
{
    while (!text.empty() && (static_cast<unsigned char>(text.back()) & 0xc0) == 0x80)
        text.pop_back();
    if (!text.empty())
        text.pop_back();
}

bool isPrintable(char32_t code)
{
    return code >= 0x20 && code != 0x7f && (code < 0x80 || code >= 0xa0);
}

std::string nameOf(const VentrikModelNode* node)
{
    return node ? node->displayName() : std::string();
}

// The row that was selected before, in the rows as they are now.
void followRow(ListPlace& place, const VentrikModelNode::Children& before,
               const VentrikModelNode::Children& now)
{
    const auto row = static_cast<std::size_t>(place.selected);
    if (row < before.size())
        if (const auto moved = nearestNamed(now, before[row]->displayName(), place.selected)) {
            place.first = std::max(0, place.first + *moved - place.selected);
            place.selected = *moved;
        }
    place.move(0, static_cast<int>(now.size()));
}

} // namespace

void ListPlace::move(int rows, int count)
{
    selected = std::clamp(selected + rows, 0, std::max(0, count - 1));
    keepInSight(height, count);
}

void ListPlace::keepInSight(int newHeight, int count)
{
    height = std::max(1, newHeight);
    const int last = std::max(0, count - height);
    first = std::clamp(first, std::max(0, selected - height + 1), selected);
    first = std::min(first, last);
}

const VentrikModelNode::Children& WatchPane::rows() const
{
    return rowsOf(node);
}

const VentrikModelNode* WatchPane::selectedRow() const
{
    const auto row = static_cast<std::size_t>(place.selected);
    return row < rows().size() ? rows()[row].get() : nullptr;
}

std::string WatchPane::title() const
{
    return node ? node->displayName() : "Ventrik";
}

bool WatchPane::isChanged(int row) const
{
    return former && hasChanged(rowsOf(former), *rows().at(static_cast<std::size_t>(row)), row);
}

WatchPanes::WatchPanes(DisplayTree& tree) : _tree(tree)
{
    _panes.push_back({"/", _tree.topLevelNodes(), nullptr, {}});
}

WatchPanes::Outcome WatchPanes::handle(KeyPress press)
{
    _remark.clear();
    if (_mode != Mode::Finding && press.key == Key::Character && press.character == 'q')
        return Outcome::Quits;
    if (_mode == Mode::Rows && press.key == Key::Character && press.character == 'c')
        return Outcome::TogglesChannel;
    if (_mode == Mode::Finding)
        handleInFinding(press);
    else if (_mode == Mode::Rows)
        handleInRows(withLettersAsArrows(press));
    else
        handleInBox(withLettersAsArrows(press));
    return Outcome::Stays;
}

void WatchPanes::handleInRows(KeyPress press)
{
    WatchPane& current = _panes.back();
    if (const auto step = stepOf(press.key, current.place.height))
        return current.place.move(*step, current.rowCount());
    const VentrikModelNode* row = current.selectedRow();
    switch (press.key) {
    case Key::Enter:
        return open();
    case Key::Right:
        if (row && row->childNodes())
            open();
        return;
    case Key::Left:
    case Key::Escape:
    case Key::Backspace:
        return goBack();
    default:
        return handleCharacterInRows(press.character);
    }
}

void WatchPanes::handleCharacterInRows(char32_t character)
{
    switch (character) {
    case ' ':
        return open();
    case '/':
        return startFinding();
    case '?':
        _boxScroll = 0;
        _mode = Mode::Keys;
        return;
    case 'n':
    case 'N':
        return goToFound(character == 'n');
    default:
        return;
    }
}

void WatchPanes::handleInFinding(KeyPress press)
{
    if (const auto step = stepOf(press.key, _foundPlace.height))
        return _foundPlace.move(*step, static_cast<int>(_found.count()));
    switch (press.key) {
    case Key::Escape:
        return endFinding();
    case Key::Enter:
        return goToSelectedFound();
    case Key::Backspace:
        if (_typed.empty())
            return endFinding();
        removeLastCharacter(_typed);
        return seek();
    default:
        if (press.key != Key::Character || !isPrintable(press.character) ||
            _typed.size() >= longestSought)
            return;
        appendUtf8(_typed, press.character);
        return seek();
    }
}

void WatchPanes::handleInBox(KeyPress press)
{
    if (const auto step = stepOf(press.key, _boxHeight))
        _boxScroll = std::max(0, _boxScroll + *step);
    else
        _mode = Mode::Rows;
}

void WatchPanes::open()
{
    const VentrikModelNode* row = pane().selectedRow();
    if (!row)
        return;
    if (row->childNodes())
        return openPaneOf(pane().place.selected);
    _boxScroll = 0;
    _mode = Mode::WholeText;
}

void WatchPanes::openPaneOf(int row)
{
    WatchPane& holder = _panes.back();
    holder.place.selected = row;
    const ModelNodePointer child = holder.rows().at(static_cast<std::size_t>(row));
    WatchPane opened{pathJoining(holder.path, child->displayName()), child, nullptr, {}};
    opened.place.height = holder.place.height;
    _panes.push_back(std::move(opened));
}

void WatchPanes::goBack()
{
    if (_panes.size() > 1)
        _panes.pop_back();
}

void WatchPanes::goToRoot()
{
    _panes.resize(1);
}

void WatchPanes::goToLastOfRoot()
{
    goToRoot();
    openPaneOf(pane().rowCount() - 1);
}

void WatchPanes::reload()
{
    const std::string former = nameOf(pane().selectedRow());
    std::size_t shown = 0;
    for (WatchPane& it : _panes) {
        ModelNodePointer node = shown == 0 ? _tree.topLevelNodes() : _tree.nodeAtPath(it.path);
        if (shown > 0 && !node)
            break;
        it.former = std::exchange(it.node, std::move(node));
        followRow(it.place, rowsOf(it.former), it.rows());
        ++shown;
    }
    const VentrikModelNode* row = pane().selectedRow();
    // Another row's text would stand in the box without being asked for.
    const bool hasText =
        shown == _panes.size() && row && row->value() && row->displayName() == former;
    _panes.erase(_panes.begin() + static_cast<std::ptrdiff_t>(shown), _panes.end());
    if (_mode == Mode::WholeText && !hasText)
        _mode = Mode::Rows;
    if (_mode == Mode::Finding)
        seekAgain();
}

void WatchPanes::fitPane(std::size_t index, int height)
{
    WatchPane& it = _panes.at(index);
    it.place.keepInSight(height, it.rowCount());
}

void WatchPanes::fitFound(int height)
{
    _foundPlace.keepInSight(height, static_cast<int>(_found.count()));
}

void WatchPanes::fitBox(int height, int lines)
{
    _boxHeight = height;
    _boxScroll = std::clamp(_boxScroll, 0, std::max(0, lines - height));
}

std::vector<std::string> WatchPanes::layoutWarnings(const WatchPane& pane) const
{
    return _tree.layoutWarningsAt(pane.path);
}

std::string_view WatchPanes::doubtOf(const WatchPane& pane, const VentrikModelNode& row) const
{
    return row.value() ? _tree.doubtAt(pathJoining(pane.path, row.displayName()))
                       : std::string_view();
}

std::string_view WatchPanes::doubtOfSelected() const
{
    const VentrikModelNode* row = pane().selectedRow();
    return row ? doubtOf(pane(), *row) : std::string_view();
}

void WatchPanes::startFinding()
{
    _typed.clear();
    _mode = Mode::Finding;
    seek();
}

void WatchPanes::endFinding()
{
    _mode = Mode::Rows;
    _found = {};
}

void WatchPanes::goToSelectedFound()
{
    _sought = _typed;
    if (_found.count() > 0)
        goTo(_found.trail(static_cast<std::size_t>(_foundPlace.selected)));
    else
        _remark = fmt::format("nothing found: {}", _sought);
    endFinding();
}

void WatchPanes::seek()
{
    _found = TreeSearch(_panes.front().node, _typed);
    _foundPlace = {0, 0, _foundPlace.height};
}

// In a new tree: the selected one stays so where it is found again.
void WatchPanes::seekAgain()
{
    const auto row = static_cast<std::size_t>(_foundPlace.selected);
    const auto former = row < _found.count() ? _found.trail(row) : TreeSearch::Trail();
    const ListPlace place = _foundPlace;
    seek();
    _foundPlace = place;
    if (!former.empty() && _found.count() > 0) {
        const std::size_t behind = _found.firstBehind(former);
        _foundPlace.selected = behind > 0 ? static_cast<int>(behind) - 1 : 0;
    }
    _foundPlace.move(0, static_cast<int>(_found.count()));
}

void WatchPanes::goTo(const TreeSearch::Trail& trail)
{
    const int height = pane().place.height;
    _panes.erase(_panes.begin() + 1, _panes.end());
    _panes.front().place.height = height;
    for (std::size_t level = 0; level + 1 < trail.size(); ++level)
        openPaneOf(trail[level]);
    WatchPane& last = _panes.back();
    last.place.selected = trail.back();
    last.place.move(0, last.rowCount());
}

// From the selected row on, and at the tree's end from its start.
void WatchPanes::goToFound(bool isForward)
{
    if (_sought.empty())
        return;
    const TreeSearch search(_panes.front().node, _sought);
    if (search.count() == 0) {
        _remark = fmt::format("nothing found: {}", _sought);
        return;
    }
    std::size_t match = isForward ? search.firstBehind(trail()) : search.lastBefore(trail());
    if (match == search.count())
        match = isForward ? 0 : search.count() - 1;
    goTo(search.trail(match));
    _remark = fmt::format("{} of {}: {}", match + 1, search.count(), _sought);
}

TreeSearch::Trail WatchPanes::trail() const
{
    TreeSearch::Trail trail;
    for (const WatchPane& it : _panes)
        trail.push_back(it.place.selected);
    return trail;
}

} // namespace ventrik
