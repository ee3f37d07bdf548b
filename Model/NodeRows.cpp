#include "Model/NodeRows.h"

namespace ventrik
{

const VentrikModelNode::Children& rowsOf(const ModelNodePointer& node)
{
    static const VentrikModelNode::Children none;
    const auto* childNodes = node ? node->childNodes() : nullptr;
    return childNodes ? *childNodes : none;
}

// Rows seldom move: the first look finds it as a rule.
std::optional<int> nearestNamed(const VentrikModelNode::Children& rows, const std::string& name,
                                int place)
{
    const int count = static_cast<int>(rows.size());
    const auto isIt = [&](int row) {
        return row >= 0 && row < count &&
               rows[static_cast<std::size_t>(row)]->displayName() == name;
    };
    for (int away = 0; place - away >= 0 || place + away < count; ++away)
        for (const int row : {place - away, place + away})
            if (isIt(row))
                return row;
    return std::nullopt;
}

bool hasChanged(const VentrikModelNode::Children& before, const VentrikModelNode& leaf, int place)
{
    const auto row = nearestNamed(before, leaf.displayName(), place);
    const std::string* value = row ? before[static_cast<std::size_t>(*row)]->value() : nullptr;
    return value && leaf.value() && *value != *leaf.value();
}

} // namespace ventrik
