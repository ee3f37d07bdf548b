#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// What is to be said about nodes of a display tree, by their paths. Of itself, nothing.
class NodeNotes
{
  public:
    virtual ~NodeNotes() = default;
    /// One line that says why the value there cannot be right; empty when it can.
    virtual std::string_view doubtAt(const std::string&) const { return {}; }
    /// Lines that say which records were read without their layout being known, of the section
    /// that stands there or holds what does. There are three at most: the third counts the others.
    virtual std::vector<std::string> layoutWarningsAt(const std::string&) const { return {}; }
};

} // namespace ventrik
