#include "Model/TreePrinter.h"

#include "PropertyList/TerminalText.h"

namespace ventrik
{

namespace
{

void appendNode(std::string& text, const VentrikModelNode& node, std::size_t level)
{
    text.append(2 * level, ' ');
    appendTerminalText(text, node.displayName());
    if (node.value()) {
        text += ": ";
        appendTerminalText(text, *node.value());
    }
    text += '\n';
    if (node.childNodes())
        for (const ModelNodePointer& child : *node.childNodes())
            appendNode(text, *child, level + 1);
}

} // namespace

std::string printTree(const VentrikModelNode& root)
{
    std::string text;
    appendNode(text, root, 0);
    return text;
}

} // namespace ventrik
