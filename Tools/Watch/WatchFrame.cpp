#include "Tools/Watch/WatchFrame.h"

#include "Tools/Watch/TextCells.h"

#include <algorithm>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr ScreenSize smallest{20, 5};
constexpr int columnsForTwoPanes = 100;
constexpr std::string_view doubtMark = "!";
constexpr std::string_view chevron = "›";
// Of a longer text the box shows the start: nobody reads more, and it is wrapped at each drawing.
constexpr std::size_t longestWholeText = std::size_t{64} << 10;

constexpr std::string_view keys[][2] = {
    {"Up Down j k", "one row"},
    {"PgUp PgDn", "one page"},
    {"Home End", "first or last row"},
    {"Enter Right", "open a row with ›"},
    {"Enter Space", "the whole value"},
    {"Left Bksp Esc", "back"},
    {"/", "find in all rows"},
    {"n N", "next, previous"},
    {"c", "the channel: why nothing appears"},
    {"q", "quit"},
};

std::string joined(const std::vector<std::string>& parts, std::string_view between)
{
    std::string text;
    for (const std::string& part : parts) {
        if (!part.empty() && !text.empty())
            text += between;
        text += part;
    }
    return text;
}

std::string padded(std::string text, int columns)
{
    const int width = widthOf(text, columns);
    return text.append(static_cast<std::size_t>(std::max(0, columns - width)), ' ');
}

/// A rectangle of the screen.
struct Area {
    int column = 0;
    int line = 0;
    int columns = 0;
    int lines = 0;
};

class Composer
{
  public:
    Composer(WatchPanes& panes, const WatchStatus& status, ScreenSize size)
        : _panes(panes), _status(status)
    {
        _frame.size = size;
        _frame.lines.resize(static_cast<std::size_t>(std::max(0, size.lines)));
    }

    WatchFrame compose() &&
    {
        if (columns() < smallest.columns || lines() < smallest.lines) {
            if (lines() > 0)
                put(0, 0, cutToWidth("too small", columns()));
            return std::move(_frame);
        }
        putBody({0, 1, columns(), lines() - 2});
        putTitle();
        if (_panes.mode() == WatchPanes::Mode::Finding)
            putPrompt();
        else
            putStatus();
        return std::move(_frame);
    }

  private:
    int columns() const { return _frame.size.columns; }
    int lines() const { return _frame.size.lines; }

    void put(int line, int column, std::string text, Ink ink = Ink::Plain, bool isSelected = false)
    {
        _frame.lines.at(static_cast<std::size_t>(line))
            .push_back({column, std::move(text), ink, isSelected});
    }
    void putBar(int line, std::string_view left, std::string_view right)
    {
        const int rightWidth = widthOf(right, columns());
        const int room = columns() - 2 - (rightWidth > 0 ? rightWidth + 2 : 0);
        std::string text = " " + padded(cutToWidth(left, room), room);
        if (rightWidth > 0)
            text += fmt::format("  {}", right);
        put(line, 0, padded(std::move(text), columns()), Ink::Bar);
    }

    void putTitle()
    {
        std::vector<std::string> titles;
        for (const WatchPane& pane : _panes.panes())
            titles.push_back(harmless(pane.title()));
        const std::string place = placeInList();
        const int placeWidth = static_cast<int>(place.size());
        const int room = columns() - 2 - (place.empty() ? 0 : placeWidth + 2);
        put(0, 1, cutFrontToWidth(joined(titles, " › "), room), Ink::Title);
        if (!place.empty())
            put(0, columns() - 1 - placeWidth, place, Ink::Quiet);
    }

    // Which row of how many is selected, where not all of them show.
    std::string placeInList() const
    {
        const bool isSearch = _panes.mode() == WatchPanes::Mode::Finding;
        const ListPlace& place = isSearch ? _panes.foundPlace() : _panes.pane().place;
        const int count =
            isSearch ? static_cast<int>(_panes.found().count()) : _panes.pane().rowCount();
        return count > place.height ? fmt::format("{}/{}", place.selected + 1, count)
                                    : std::string();
    }

    // So much of a name as can ever show.
    std::string harmless(std::string_view text) const { return cutToWidth(text, columns()); }

    void putBody(Area area)
    {
        switch (_panes.mode()) {
        case WatchPanes::Mode::Finding:
            return putFound(area);
        case WatchPanes::Mode::WholeText:
            putPanes(area);
            return putWholeText(area);
        case WatchPanes::Mode::Keys:
            putPanes(area);
            return putKeys(area);
        case WatchPanes::Mode::Rows:
            return putPanes(area);
        }
    }

    void putPanes(Area area)
    {
        const std::size_t last = _panes.panes().size() - 1;
        if (area.columns < columnsForTwoPanes)
            return putPane(last, area);
        const int left = area.columns * 2 / 5;
        const Area leftArea{0, area.line, left, area.lines};
        const Area rightArea{left + 1, area.line, area.columns - left - 1, area.lines};
        for (int line = area.line; line < area.line + area.lines; ++line)
            put(line, left, "│", Ink::Border);
        if (last > 0)
            putPane(last - 1, leftArea);
        putPane(last, last > 0 ? rightArea : leftArea);
        if (last == 0)
            putWhatWouldOpen(rightArea);
    }

    // Beside the root, which has nothing above it, stands what the selected row leads to.
    void putWhatWouldOpen(Area area)
    {
        const WatchPane& root = _panes.pane();
        const VentrikModelNode* row = root.selectedRow();
        if (!row || !row->childNodes())
            return;
        const auto place = static_cast<std::size_t>(root.place.selected);
        const WatchPane next{pathJoining(root.path, row->displayName()),
                             root.rows()[place],
                             nullptr,
                             {.selected = -1}};
        putRows(next, belowWarnings(next, area), false);
    }

    void putPane(std::size_t index, Area area)
    {
        const Area rows = belowWarnings(_panes.panes()[index], area);
        _panes.fitPane(index, rows.lines);
        const WatchPane& pane = _panes.panes()[index];
        putRows(pane, rows, index + 1 == _panes.panes().size());
        if (pane.rowCount() == 0)
            putReasonForNoRows(pane, rows);
    }

    // What is left below the lines about a pane.
    Area belowWarnings(const WatchPane& pane, Area area)
    {
        const auto warnings = _panes.layoutWarnings(pane);
        for (const std::string& warning : warnings) {
            if (area.lines <= 1)
                break;
            put(area.line++, area.column + 1, cutToWidth(warning, area.columns - 2), Ink::Notice);
            --area.lines;
        }
        return area;
    }

    void putReasonForNoRows(const WatchPane& pane, Area area)
    {
        const bool isList = pane.node && pane.node->childNodes();
        const std::string reason = isList ? "This list is empty" : _status.reasonForNoData;
        put(area.line, area.column + 1, cutToWidth(reason, area.columns - 2), Ink::Quiet);
    }

    void putRows(const WatchPane& pane, Area area, bool isFront)
    {
        const int end = std::min(pane.place.first + area.lines, pane.rowCount());
        for (int row = pane.place.first; row < end; ++row) {
            const Area line{area.column, area.line + row - pane.place.first, area.columns, 1};
            putRow(pane, row, line, isFront);
        }
    }

    void putRow(const WatchPane& pane, int row, Area area, bool isFront)
    {
        const VentrikModelNode& node = *pane.rows()[static_cast<std::size_t>(row)];
        const bool isHere = row == pane.place.selected;
        const bool isSelected = isHere && isFront;
        const Ink ink = isFront ? Ink::Plain : isHere ? Ink::Lead : Ink::Quiet;
        put(area.line, area.column, std::string(static_cast<std::size_t>(area.columns), ' '), ink,
            isSelected);
        const std::string_view mark = markOf(pane, node);
        if (!mark.empty())
            put(area.line, area.column + area.columns - 2, std::string(mark),
                mark == doubtMark ? Ink::Doubt : ink, isSelected);
        const Ink valueInk = pane.isChanged(row) ? Ink::Changed : ink;
        putNameAndValue(node.displayName(), node.value(), area, ink, valueInk, isSelected);
    }

    std::string_view markOf(const WatchPane& pane, const VentrikModelNode& node) const
    {
        if (node.childNodes())
            return chevron;
        return _panes.doubtOf(pane, node).empty() ? std::string_view() : doubtMark;
    }

    // The value stands at the right; where both do not fit, each keeps half of the room at least.
    void putNameAndValue(std::string_view name, const std::string* value, Area area, Ink ink,
                         Ink valueInk, bool isSelected)
    {
        const int room = area.columns - 4; // a blank on the left; a blank, a mark and a blank
        const int gap = value && !value->empty() ? 2 : 0;
        const int valueNeeds = value ? widthOf(*value, room) : 0;
        const int nameNeeds = widthOf(name, room);
        const int half = (room - gap) / 2;
        const int nameRoom = std::min(nameNeeds, std::max(half, room - gap - valueNeeds));
        put(area.line, area.column + 1, cutToWidth(name, nameRoom), ink, isSelected);
        if (!value)
            return;
        std::string text = cutToWidth(*value, room - gap - nameRoom);
        const int width = widthOf(text, room);
        put(area.line, area.column + 1 + room - width, std::move(text), valueInk, isSelected);
    }

    void putFound(Area area)
    {
        _panes.fitFound(area.lines);
        const TreeSearch& found = _panes.found();
        const ListPlace& place = _panes.foundPlace();
        const int end = std::min(place.first + area.lines, static_cast<int>(found.count()));
        for (int row = place.first; row < end; ++row) {
            const auto match = static_cast<std::size_t>(row);
            const VentrikModelNode& node = found.node(match);
            const Area line{0, area.line + row - place.first, area.columns, 1};
            const bool isSelected = row == place.selected;
            put(line.line, 0, std::string(static_cast<std::size_t>(area.columns), ' '), Ink::Plain,
                isSelected);
            putNameAndValue(found.names(match), node.value(), line, Ink::Plain, Ink::Plain,
                            isSelected);
            if (node.childNodes())
                put(line.line, area.columns - 2, std::string(chevron), Ink::Plain, isSelected);
        }
        if (found.count() == 0)
            put(area.line, 1, "Nothing found", Ink::Quiet);
    }

    void putPrompt()
    {
        const auto count = _panes.found().count();
        const std::string number = fmt::format("{} row{}", count, count == 1 ? "" : "s");
        const int numberWidth = widthOf(number, columns());
        const std::string sought =
            "/" + cutFrontToWidth(_panes.sought(), columns() - numberWidth - 5);
        _frame.cursorColumn = widthOf(sought, columns());
        put(lines() - 1, 0, sought);
        put(lines() - 1, columns() - 1 - numberWidth, number, Ink::Quiet);
    }

    void putStatus()
    {
        const std::string doubt(_panes.doubtOfSelected());
        const std::string state = stateIn(columns() - 2);
        const int room = columns() - 4 - widthOf(state, columns());
        if (!_panes.remark().empty())
            return putBar(lines() - 1, _panes.remark(), "");
        // A doubt tells more than the hints; where there is little room, more than the state.
        if (!doubt.empty()) {
            const std::string reason = fmt::format("{} {}", doubtMark, doubt);
            const bool fits = widthOf(reason, columns()) <= room;
            return fits ? putBar(lines() - 1, state, reason) : putBar(lines() - 1, reason, "");
        }
        putBar(lines() - 1, state, hintFor(room));
    }

    // What is said of the channel, the less of it the less room there is.
    std::string stateIn(int room) const
    {
        const auto& [technology, state, updated, note, reason] = _status;
        const std::string time = updated.empty() ? "" : "updated " + updated;
        const std::vector<std::string> forms[] = {{technology, state, time, note},
                                                  {technology, state, updated, note},
                                                  {technology, state, note},
                                                  {state, note}};
        for (const auto& form : forms)
            if (std::string text = joined(form, " · "); widthOf(text, room) <= room)
                return text;
        return joined(std::end(forms)[-1], " · ");
    }

    static std::string_view hintFor(int room)
    {
        for (const std::string_view hint : {"? keys  / find  q quit", "? keys  q quit", "? keys"})
            if (static_cast<int>(hint.size()) <= room)
                return hint;
        return {};
    }

    void putWholeText(Area area)
    {
        const VentrikModelNode* row = _panes.pane().selectedRow();
        if (!row || !row->value())
            return;
        const std::string& value = *row->value();
        const int width = area.columns - 4;
        auto text = wrapToWidth(std::string_view(value).substr(0, longestWholeText), width);
        if (value.size() > longestWholeText)
            text.push_back(fmt::format("… ({} bytes in all)", value.size()));
        const std::string doubt(_panes.doubtOfSelected());
        if (!doubt.empty())
            for (std::string& line : wrapToWidth(fmt::format("{} {}", doubtMark, doubt), width))
                text.push_back(std::move(line));
        putBox(area, row->displayName(), text);
    }

    void putKeys(Area area)
    {
        constexpr int columnsForTable = 38;
        std::vector<std::string> text;
        for (const auto& [key, effect] : keys)
            if (area.columns >= columnsForTable)
                text.push_back(fmt::format("{:<15}{}", key, effect));
            else
                text.insert(text.end(), {std::string(key), fmt::format("  {}", effect)});
        putBox(area, "Keys", text);
    }

    // In the middle, as large as its text, or as the area.
    void putBox(Area area, std::string_view title, const std::vector<std::string>& text)
    {
        int width = widthOf(title, area.columns - 4) + 2;
        for (const std::string& line : text)
            width = std::max(width, widthOf(line, area.columns - 4));
        width = std::min(width, area.columns - 4);
        const int height = std::min(static_cast<int>(text.size()), area.lines - 2);
        _panes.fitBox(height, static_cast<int>(text.size()));
        const int column = area.column + (area.columns - width - 4) / 2;
        const int top = area.line + (area.lines - height - 2) / 2;

        const std::string name = fmt::format(" {} ", cutToWidth(title, width - 2));
        put(top, column, "┌─" + name + line(width + 1 - widthOf(name, width)) + "┐", Ink::Border);
        for (int row = 0; row < height; ++row) {
            const auto place = static_cast<std::size_t>(row + _panes.boxScroll());
            put(top + 1 + row, column, "│ " + padded(cutToWidth(text[place], width), width) + " │");
        }
        const int left = static_cast<int>(text.size()) - height - _panes.boxScroll();
        const std::string more = left > 0 ? fmt::format(" {} more ", left) : std::string();
        const int moreWidth = widthOf(more, width);
        put(top + 1 + height, column, "└" + line(width + 1 - moreWidth) + more + "─┘", Ink::Border);
    }

    static std::string line(int columns)
    {
        std::string text;
        for (int column = 0; column < columns; ++column)
            text += "─";
        return text;
    }

    WatchPanes& _panes;
    const WatchStatus& _status;
    WatchFrame _frame;
};

} // namespace

WatchFrame composeFrame(WatchPanes& panes, const WatchStatus& status, ScreenSize size)
{
    return Composer(panes, status, size).compose();
}

} // namespace ventrik
