#pragma once

#include "Model/VentrikModelNode.h"

#include <string>

namespace ventrik
{

/// The tree as text: a line a node, children two blanks further in, leaves as "name: value". Names
/// and values show as `appendTerminalText` has them, so that a line stays a line and a terminal
/// obeys nothing that came from outside.
std::string printTree(const VentrikModelNode& root);

} // namespace ventrik
