#pragma once

#include "Tools/Watch/WatchPanes.h"

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// What a part of the screen is, and thus how it looks.
enum class Ink {
    Plain,
    Title,   ///< the line at the top
    Bar,     ///< the line at the bottom
    Notice,  ///< what is said of a section
    Changed, ///< a value that was another one before the last refresh
    Doubt,   ///< a sign that a value cannot be right, or the reason
    Quiet,   ///< what is there beside what the user is at
    Lead,    ///< the row of that which leads to where the user is
    Border
};

/// A text at a place of its line. It holds nothing that a terminal would obey, and has its width.
struct FramePart {
    int column = 0;
    std::string text;
    Ink ink = Ink::Plain;
    bool isSelected = false;
    bool operator==(const FramePart&) const = default;
};

/// Parts that stand later hide what they cover.
using FrameLine = std::vector<FramePart>;

struct ScreenSize {
    int columns = 80;
    int lines = 24;
    bool operator==(const ScreenSize&) const = default;
};

/// A whole screen as it shall look.
struct WatchFrame {
    ScreenSize size;
    std::vector<FrameLine> lines;
    std::optional<int> cursorColumn; ///< on the last line; none: no cursor shows
    bool operator==(const WatchFrame&) const = default;
};

/// What stands at the bottom beside the hints.
struct WatchStatus {
    std::string technology; ///< empty before it is known
    std::string state;
    std::string updated; ///< the time of day of the last refresh; empty before
    std::string note;
    std::string reasonForNoData; ///< stands in a pane without a node that could have rows
};

/// The screen for what the panes show. It tells them how much of them fits.
WatchFrame composeFrame(WatchPanes& panes, const WatchStatus& status, ScreenSize size);

} // namespace ventrik
