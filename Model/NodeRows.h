#pragma once

#include "Model/VentrikModelNode.h"

#include <optional>
#include <string>

namespace ventrik
{

/// The rows that a pane has for a node; none for a leaf and for no node.
const VentrikModelNode::Children& rowsOf(const ModelNodePointer& node);

/// The row of that name nearest to a place, so that marks follow their rows to a new tree.
std::optional<int> nearestNamed(const VentrikModelNode::Children& rows, const std::string& name,
                                int place);

/// Whether the leaf that stands at a place now shows another value than its like did before.
bool hasChanged(const VentrikModelNode::Children& before, const VentrikModelNode& leaf, int place);

} // namespace ventrik
