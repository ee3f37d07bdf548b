#include "Model/VentrikModelNode.h"

#include "LogGenerator/Orbel/ArrayLock.h"
#include "Model/DisplayNames.h"

#include <algorithm>
#include <optional>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

class TreeBuilder
{
  public:
    explicit TreeBuilder(PathIndex& index) : _index(index) {}

    ModelNodePointer buildRoot(std::string name, const PlistValue* object)
    {
        auto node = makeNode(std::move(name), object, _index.root());
        _index.put(_index.root(), node, nullptr);
        return node;
    }

  private:
    ModelNodePointer makeNode(std::string name, const PlistValue* object, PathIndex::Place& place)
    {
        if (object && object->string())
            return VentrikModelLeafNode::initWithName(std::move(name), *object->string());
        if (object && object->dictionary())
            return VentrikModelTreeNode::initWithName(std::move(name),
                                                      childrenOf(*object->dictionary(), place));
        if (object && object->array())
            return VentrikModelTreeNode::initWithName(std::move(name),
                                                      childrenOf(*object->array(), place));
        if (object && object->date())
            return std::make_shared<VentrikModelDateNode>(std::move(name), std::string(notText),
                                                          *object->date());
        return VentrikModelLeafNode::initWithName(std::move(name), std::string(notText));
    }

    // The key is given where it is more than the name.
    ModelNodePointer buildChild(std::string name, const PlistValue& object,
                                PathIndex::Place& parent, std::string key = {})
    {
        PathIndex::Place& place = _index.join(parent, name);
        auto node = makeNode(std::move(name), &object, place);
        _index.put(place, node, &parent, std::move(key));
        return node;
    }

    VentrikModelNode::Children childrenOf(const PlistDictionary& dictionary,
                                          PathIndex::Place& place)
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
            const std::string_view name = isSorted ? labelOfSortedKey(entry->key) : entry->key;
            const bool isWhole = name.size() == entry->key.size();
            children.push_back(buildChild(std::string(name), entry->value, place,
                                          isWhole ? std::string() : std::string(entry->key)));
        }
        return children;
    }

    VentrikModelNode::Children childrenOf(const PlistArray& array, PathIndex::Place& place)
    {
        // Arrays in an array are walked under its lock. Each lock within a lock would leave a level
        // behind, and the levels of a lock are finite.
        const bool isOutermost = !_locked;
        if (isOutermost)
            _locked.emplace();
        VentrikModelNode::Children children;
        children.reserve(array.size());
        for (const PlistValue& element : array)
            children.push_back(buildChild(fmt::format("{}", children.size()), element, place));
        if (isOutermost)
            _locked.reset();
        return children;
    }

    PathIndex& _index;
    std::optional<ArrayLock::Scope> _locked; // while an array is walked
};

} // namespace

std::string_view labelOfSortedKey(std::string_view key)
{
    const auto separator = key.find(';');
    if (separator == std::string_view::npos || key.find(';', separator + 1) != key.npos)
        return key;
    return key.substr(separator + 1);
}

ModelNodePointer VentrikModelNode::makeTreeFromObject(const PlistValue* object, PathIndex& index)
{
    return TreeBuilder(index).buildRoot("Ventrik", object);
}

ModelNodePointer VentrikModelLeafNode::initWithName(std::string name, std::string value)
{
    return std::make_shared<VentrikModelLeafNode>(std::move(name), std::move(value));
}

ModelNodePointer VentrikModelTreeNode::initWithName(std::string name, Children children)
{
    return std::make_shared<VentrikModelTreeNode>(std::move(name), std::move(children));
}

} // namespace ventrik
