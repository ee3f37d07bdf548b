#pragma once

#include "Model/NodeNotes.h"
#include "Model/VentrikModelNode.h"

#include <string>

namespace ventrik
{

/// The tree as text: a line a node, children two blanks further in, leaves as "name: value". Names
/// and values show as `appendTerminalText` has them, so that a line stays a line and a terminal
/// obeys nothing that came from outside.
///
/// What the notes say goes with it: a sign behind a doubtful value, and below a section's name,
/// like its children, the lines about layouts that are not known.
std::string printTree(const VentrikModelNode& root, const NodeNotes& notes = {});

} // namespace ventrik
