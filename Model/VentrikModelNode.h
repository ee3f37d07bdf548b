#pragma once

#include "Model/PathIndex.h"
#include "PropertyList/PlistValue.h"

#include <memory>
#include <string>
#include <vector>

namespace ventrik
{

/// A node of the display tree: what a pane shows as one row, or one level deeper as a screen. Nodes
/// never change; a new display gives a new tree.
class VentrikModelNode
{
  public:
    using Children = std::vector<ModelNodePointer>;

    explicit VentrikModelNode(std::string name) : _name(std::move(name)) {}
    virtual ~VentrikModelNode() = default;
    VentrikModelNode(const VentrikModelNode&) = delete;
    VentrikModelNode& operator=(const VentrikModelNode&) = delete;

    const std::string& displayName() const { return _name; }
    /// Null for a leaf; present, and possibly empty, for an inner node.
    virtual const Children* childNodes() const { return nullptr; }
    /// Null for an inner node.
    virtual const std::string* value() const { return nullptr; }
    /// The date that the value stands for; null where it is none.
    virtual const PlistDate* date() const { return nullptr; }

    /// Builds the tree of a display object with its root "Ventrik" at the path "/", and fills the
    /// path index. No object gives a root leaf "(unknown)".
    static ModelNodePointer makeTreeFromObject(const PlistValue* object, PathIndex& index);

  private:
    std::string _name;
};

/// A name with a value.
class VentrikModelLeafNode : public VentrikModelNode
{
  public:
    static ModelNodePointer initWithName(std::string name, std::string value);

    VentrikModelLeafNode(std::string name, std::string value)
        : VentrikModelNode(std::move(name)), _string(std::move(value))
    {
    }
    const std::string* value() const override { return &_string; }

  private:
    std::string _string;
};

/// A name with a date, which shows as any value that is no text.
class VentrikModelDateNode : public VentrikModelLeafNode
{
  public:
    VentrikModelDateNode(std::string name, std::string value, PlistDate date)
        : VentrikModelLeafNode(std::move(name), std::move(value)), _date(date)
    {
    }
    const PlistDate* date() const override { return &_date; }

  private:
    PlistDate _date;
};

/// A name with children, in display order.
class VentrikModelTreeNode : public VentrikModelNode
{
  public:
    static ModelNodePointer initWithName(std::string name, Children children);

    VentrikModelTreeNode(std::string name, Children children)
        : VentrikModelNode(std::move(name)), _childNodes(std::move(children))
    {
    }
    const Children* childNodes() const override { return &_childNodes; }

  private:
    Children _childNodes;
};

} // namespace ventrik
