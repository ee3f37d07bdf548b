#include "Report/ReportValues.h"

#include "Model/NodeRows.h"
#include "Packets/Plausibility.h"

#include <algorithm>
#include <string>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

// Names of ours are far shorter, and it takes time to ask about the values below longer ones.
constexpr std::size_t longestNotedPath = 1024;

/// Writes rows as long as there is room, and counts the values that are left.
class ValuesWriter
{
  public:
    ValuesWriter(HtmlWriter& html, const DisplayMoment& display, std::size_t mostBytes)
        : _html(html), _display(display), _end(html.size() + mostBytes)
    {
    }

    void writeSections(const VentrikModelNode& root)
    {
        writeLeaves(root, "/");
        for (const ModelNodePointer& child : *root.childNodes())
            if (child->childNodes() && hasRoom(*child)) {
                const auto section = _html.inside("section", R"(class="group")");
                _html.element("h3", child->displayName());
                writeInside(*child, pathJoining("/", child->displayName()));
            }
    }
    std::size_t leftOutCount() const { return _leftOutCount; }

  private:
    void writeInside(const VentrikModelNode& node, const std::string& path)
    {
        if (node.childNodes()->empty())
            return _html.element("p", "Empty.", R"(class="note")");
        writeLeaves(node, path);
        for (const ModelNodePointer& child : *node.childNodes())
            if (child->childNodes() && hasRoom(*child)) {
                const auto group = _html.inside("details", R"(open="open")");
                _html.element("summary", child->displayName());
                writeInside(*child, pathJoining(path, child->displayName()));
            }
    }

    void writeLeaves(const VentrikModelNode& node, const std::string& path)
    {
        const auto isLeaf = [](const ModelNodePointer& child) { return child->value() != nullptr; };
        if (!std::ranges::any_of(*node.childNodes(), isLeaf) || !hasRoomForLeaves(node))
            return;
        const auto table = _html.inside("table", R"(class="values")");
        const auto body = _html.inside("tbody");
        for (const ModelNodePointer& child : *node.childNodes())
            if (child->value() && hasRoom(*child))
                writeLeaf(*child, pathJoining(path, child->displayName()));
    }

    void writeLeaf(const VentrikModelNode& leaf, const std::string& path)
    {
        const auto row = _html.inside("tr");
        _html.element("th", leaf.displayName(), R"(scope="row")");
        const auto cell = _html.inside("td");
        _html.text(*leaf.value());
        if (path.size() > longestNotedPath)
            return;
        if (const std::string_view doubt = _display.doubtAt(path); !doubt.empty())
            _html.element("small", fmt::format("{} {}", doubtSign, doubt), R"(class="doubt")");
    }

    // A table has a row at least.
    bool hasRoomForLeaves(const VentrikModelNode& node)
    {
        if (_html.size() < _end)
            return true;
        for (const ModelNodePointer& child : *node.childNodes())
            _leftOutCount += child->value() ? 1 : 0;
        return false;
    }

    bool hasRoom(const VentrikModelNode& node)
    {
        if (_html.size() < _end)
            return true;
        count(node);
        return false;
    }

    void count(const VentrikModelNode& node)
    {
        if (node.value())
            ++_leftOutCount;
        if (node.childNodes())
            for (const ModelNodePointer& child : *node.childNodes())
                count(*child);
    }

    HtmlWriter& _html;
    const DisplayMoment& _display;
    std::size_t _end;
    std::size_t _leftOutCount = 0;
};

} // namespace

void writeValues(HtmlWriter& html, DisplayMoment& display, std::size_t mostBytes)
{
    const auto part = html.inside("section", R"(class="last")");
    html.element("h2", "Values at the end");
    const ModelNodePointer root = display.topLevelNodes();
    if (!root || !root->childNodes())
        return html.element("p", "None.", R"(class="note")");
    ValuesWriter values(html, display, mostBytes);
    {
        const auto columns = html.inside("div", R"(class="columns")");
        values.writeSections(*root);
    }
    if (values.leftOutCount() > 0)
        html.element("p", fmt::format("{} more values are left out.", values.leftOutCount()),
                     R"(class="note")");
}

} // namespace ventrik
