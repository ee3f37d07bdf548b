#pragma once

#include "Model/DisplayTree.h"
#include "Tools/Watch/TreeSearch.h"

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// A key as it was pressed; characters come with their code.
struct KeyPress {
    enum class Key {
        Up,
        Down,
        Left,
        Right,
        PageUp,
        PageDown,
        Home,
        End,
        Enter,
        Escape,
        Backspace,
        Character
    };
    Key key = Key::Character;
    char32_t character = 0;
};

/// A place in a list of which a part shows.
struct ListPlace {
    int selected = 0;
    int first = 0;   ///< the topmost row that shows
    int height = 10; ///< how many show, as far as is known

    /// The selected row is kept in the list, and in sight.
    void move(int rows, int count);
    void keepInSight(int newHeight, int count);
};

/// The rows of one node, and where the user is among them.
struct WatchPane {
    std::string path;
    ModelNodePointer node;   ///< may be none at the root
    ModelNodePointer former; ///< what it showed before the last refresh, if it did
    ListPlace place;

    const VentrikModelNode::Children& rows() const;
    int rowCount() const { return static_cast<int>(rows().size()); }
    /// Null where there are no rows.
    const VentrikModelNode* selectedRow() const;
    std::string title() const;
    bool isChanged(int row) const;
};

/// What a user of the terminal sees and does: panes one behind the other as in the window, with one
/// row selected, a search through all rows, and boxes with a whole text or the keys. It neither
/// draws nor reads keys, and asks the tree only for what it shows.
class WatchPanes
{
  public:
    enum class Mode { Rows, Finding, WholeText, Keys };
    enum class Outcome { Stays, TogglesChannel, Quits };

    /// The tree outlives the panes.
    explicit WatchPanes(DisplayTree& tree);

    Outcome handle(KeyPress press);
    /// Brings all panes up to date with the tree as it is now. A pane whose node has gone goes,
    /// with those behind it; marks follow their rows by name.
    void reload();
    void goToRoot();
    /// From the root to the last of its rows.
    void goToLastOfRoot();

    Mode mode() const { return _mode; }
    /// From the root to the one that shows; never empty.
    const std::vector<WatchPane>& panes() const { return _panes; }
    const WatchPane& pane() const { return _panes.back(); }
    /// Says how many rows of a pane can be shown, so that the selected one is among them.
    void fitPane(std::size_t index, int height);

    std::vector<std::string> layoutWarnings(const WatchPane& pane) const;
    /// Why the value of a row cannot be right; empty when it can.
    std::string_view doubtOf(const WatchPane& pane, const VentrikModelNode& row) const;
    std::string_view doubtOfSelected() const;

    /// What is sought, in UTF-8, and the rows found.
    const std::string& sought() const { return _typed; }
    const TreeSearch& found() const { return _found; }
    const ListPlace& foundPlace() const { return _foundPlace; }
    void fitFound(int height);

    /// Where the box with a text or the keys is scrolled to. The drawing knows how many lines there
    /// are.
    int boxScroll() const { return _boxScroll; }
    void fitBox(int height, int lines);

    /// What came of the last key, where that does not show; empty as a rule.
    const std::string& remark() const { return _remark; }

  private:
    void handleInRows(KeyPress press);
    void handleCharacterInRows(char32_t character);
    void handleInFinding(KeyPress press);
    void handleInBox(KeyPress press);

    void open();
    void openPaneOf(int row);
    void goBack();
    void startFinding();
    void endFinding();
    void goToSelectedFound();
    void seek();
    void seekAgain();
    void goTo(const TreeSearch::Trail& trail);
    void goToFound(bool isForward);
    TreeSearch::Trail trail() const;

    DisplayTree& _tree;
    std::vector<WatchPane> _panes;
    Mode _mode = Mode::Rows;
    std::string _sought;
    std::string _typed; // what is sought, while it is typed
    TreeSearch _found;
    ListPlace _foundPlace;
    int _boxScroll = 0;
    int _boxHeight = 1;
    std::string _remark;
};

} // namespace ventrik
