#include "Model/TreePrinter.h"

#include "Packets/Plausibility.h"
#include "PropertyList/TerminalText.h"

#include <utility>

namespace ventrik
{

namespace
{

// Names of ours are far shorter. The limit keeps it from taking time without bound to ask about the
// many values below long names that come from outside.
constexpr std::size_t longestNotedPath = 1024;

class Printer
{
  public:
    explicit Printer(const NodeNotes& notes) : _notes(notes) {}

    void print(const VentrikModelNode& node, const std::string& path, std::size_t level)
    {
        startLine(level);
        appendTerminalText(_text, node.displayName());
        if (node.value())
            printValue(*node.value(), path);
        _text += '\n';
        if (node.childNodes())
            printInside(node, path, level + 1);
    }
    std::string text() && { return std::move(_text); }

  private:
    void startLine(std::size_t level) { _text.append(2 * level, ' '); }

    void printValue(const std::string& value, const std::string& path)
    {
        _text += ": ";
        appendTerminalText(_text, value);
        if (!path.empty() && !_notes.doubtAt(path).empty()) {
            _text += ' ';
            _text += doubtSign;
        }
    }

    void printInside(const VentrikModelNode& node, const std::string& path, std::size_t level)
    {
        // What a section has said is not said again of each of its rows.
        const bool isSaid = std::exchange(_hasWarned, _hasWarned || printWarnings(path, level));
        for (const ModelNodePointer& child : *node.childNodes())
            print(*child, pathOfChild(path, child->displayName()), level);
        _hasWarned = isSaid;
    }

    bool printWarnings(const std::string& path, std::size_t level)
    {
        if (path.empty())
            return false;
        const auto lines = _notes.layoutWarningsAt(path);
        for (const std::string& line : lines) {
            startLine(level);
            _text += line;
            _text += '\n';
        }
        return !lines.empty();
    }

    // Empty: of what stands there nothing is asked.
    static std::string pathOfChild(const std::string& path, const std::string& name)
    {
        const bool isLong = path.empty() || path.size() + name.size() > longestNotedPath;
        return isLong ? std::string() : pathJoining(path, name);
    }

    const NodeNotes& _notes;
    std::string _text;
    bool _hasWarned = false;
};

} // namespace

std::string printTree(const VentrikModelNode& root, const NodeNotes& notes)
{
    Printer printer(notes);
    printer.print(root, "/", 0);
    return std::move(printer).text();
}

} // namespace ventrik
