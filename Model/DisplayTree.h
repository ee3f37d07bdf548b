#pragma once

#include "Model/NodeNotes.h"
#include "Model/VentrikModelNode.h"

#include <string>

namespace ventrik
{

/// The display tree as it is now, and what is to be said about it: all that panes show. Of itself,
/// there is none.
class DisplayTree : public NodeNotes
{
  public:
    /// The root, or null where there is no display.
    virtual ModelNodePointer topLevelNodes() { return nullptr; }
    /// Null where nothing stands at the path.
    virtual ModelNodePointer nodeAtPath(const std::string&) { return nullptr; }
};

} // namespace ventrik
