#include "Model/TreePrinter.h"

#include <algorithm>

namespace ventrik
{

namespace
{

void appendClean(std::string& text, std::string_view part)
{
    std::ranges::transform(part, std::back_inserter(text), [](char character) {
        const auto code = static_cast<unsigned char>(character);
        return code < 0x20 || code == 0x7F ? ' ' : character;
    });
}

void appendNode(std::string& text, const VentrikModelNode& node, std::size_t level)
{
    text.append(2 * level, ' ');
    appendClean(text, node.displayName());
    if (node.value()) {
        text += ": ";
        appendClean(text, *node.value());
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
