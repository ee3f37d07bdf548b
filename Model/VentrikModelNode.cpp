#include "Model/VentrikModelNode.h"

#include "LogGenerator/Orbel/ArrayLock.h"

#include <algorithm>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr std::string_view sortedMarker = "_sorted";

// In sorted mode a key of the form order;label shows as its label.
std::string_view labelOfSortedKey(std::string_view key)
{
    const auto separator = key.find(';');
    if (separator == std::string_view::npos || key.find(';', separator + 1) != key.npos)
        return key;
    return key.substr(separator + 1);
}

class TreeBuilder
{
  public:
    explicit TreeBuilder(PathIndex& index) : _index(index) {}

    ModelNodePointer build(std::string name, const PlistValue* object, const std::string& path)
    {
        auto node = makeNode(std::move(name), object, path);
        _index[path] = node;
        return node;
    }

  private:
    ModelNodePointer makeNode(std::string name, const PlistValue* object, const std::string& path)
    {
        if (object && object->string())
            return VentrikModelLeafNode::initWithName(std::move(name), *object->string());
        if (object && object->dictionary())
            return VentrikModelTreeNode::initWithName(std::move(name),
                                                      childrenOf(*object->dictionary(), path));
        if (object && object->array())
            return VentrikModelTreeNode::initWithName(std::move(name),
                                                      childrenOf(*object->array(), path));
        return VentrikModelLeafNode::initWithName(std::move(name), "(unknown)");
    }

    VentrikModelNode::Children childrenOf(const PlistDictionary& dictionary,
                                          const std::string& path)
    {
        std::vector<const PlistDictionary::Entry*> entries;
        for (const auto& entry : dictionary)
            if (entry.key != sortedMarker)
                entries.push_back(&entry);
        const bool isSorted = entries.size() != dictionary.size();
        if (isSorted)
            std::ranges::sort(entries, {}, &PlistDictionary::Entry::key);

        VentrikModelNode::Children children;
        children.reserve(entries.size());
        for (const auto* entry : entries) {
            const std::string name(isSorted ? labelOfSortedKey(entry->key) : entry->key);
            children.push_back(build(name, &entry->value, pathJoining(path, name)));
        }
        return children;
    }

    VentrikModelNode::Children childrenOf(const PlistArray& array, const std::string& path)
    {
        const ArrayLock::Scope locked;
        VentrikModelNode::Children children;
        children.reserve(array.size());
        for (const PlistValue& element : array) {
            const std::string name = fmt::format("{}", children.size());
            children.push_back(build(name, &element, pathJoining(path, name)));
        }
        return children;
    }

    PathIndex& _index;
};

} // namespace

ModelNodePointer VentrikModelNode::makeTreeFromObject(const PlistValue* object, PathIndex& index)
{
    return TreeBuilder(index).build("Ventrik", object, "/");
}

ModelNodePointer VentrikModelLeafNode::initWithName(std::string name, std::string value)
{
    return std::make_shared<VentrikModelLeafNode>(std::move(name), std::move(value));
}

ModelNodePointer VentrikModelTreeNode::initWithName(std::string name, Children children)
{
    return std::make_shared<VentrikModelTreeNode>(std::move(name), std::move(children));
}

std::string pathJoining(std::string_view path, std::string_view name)
{
    while (path.ends_with('/'))
        path.remove_suffix(1);
    while (name.starts_with('/'))
        name.remove_prefix(1);
    if (name.empty())
        return path.empty() ? "/" : std::string(path);
    return fmt::format("{}/{}", path, name);
}

} // namespace ventrik
