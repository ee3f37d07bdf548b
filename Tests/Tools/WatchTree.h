#pragma once

#include "Model/DisplayTree.h"
#include "PropertyList/PlistValue.h"

#include <map>
#include <memory>
#include <string>
#include <vector>

namespace ventrik
{

/// A display tree as a test says, with what is to be noted of it.
class WatchTree : public DisplayTree
{
  public:
    void show(const PlistValue& display)
    {
        _index = std::make_unique<PathIndex>();
        _root = VentrikModelNode::makeTreeFromObject(&display, *_index);
    }

    ModelNodePointer topLevelNodes() override { return _root; }
    ModelNodePointer nodeAtPath(const std::string& path) override
    {
        return _index ? _index->find(path) : nullptr;
    }
    std::string_view doubtAt(const std::string& path) const override
    {
        ++questions;
        const auto found = doubts.find(path);
        return found == doubts.end() ? std::string_view() : std::string_view(found->second);
    }
    std::vector<std::string> layoutWarningsAt(const std::string& path) const override
    {
        const auto found = warnings.find(path);
        return found == warnings.end() ? std::vector<std::string>() : found->second;
    }

    std::map<std::string, std::string> doubts;
    std::map<std::string, std::vector<std::string>> warnings;
    mutable int questions = 0; ///< about doubts

  private:
    std::unique_ptr<PathIndex> _index;
    ModelNodePointer _root;
};

/// A display with a section of two values, a list of three cells and a value of its own.
inline PlistDictionary radioDisplay(const std::string& cell = "301", int cells = 3)
{
    PlistArray list;
    for (int row = 0; row < cells; ++row)
        list.append(PlistDictionary{{"PCI", std::to_string(10 + row)}});
    return PlistDictionary{{"Serving Cell", PlistDictionary{{"Cell ID", cell}, {"Band", "3"}}},
                           {"Neighbors", list},
                           {"State", "Idle"}};
}

} // namespace ventrik
