#pragma once

#include "App/StatusNote.h"
#include "App/Toolkit/TableScreen.h"
#include "Model/DisplayTree.h"

#include <map>
#include <memory>
#include <string>

namespace ventrik
{

/// What the panes ask of the application.
class VentrikPaneHost : public DisplayTree
{
  public:
    virtual bool allowSaveButton() const = 0;
    virtual void showSaveView() = 0;
    /// Whether values that have changed are tinted for a moment.
    virtual bool tintsChanges() const = 0;
    /// What is said beside the status.
    virtual StatusNote statusNote() const { return {}; }
    /// Whether the panes show a moment of the past. Their places stay then, also where nothing
    /// stood.
    virtual bool showsPast() const { return false; }
    /// Whether a button leads to the time line, and what it does.
    virtual bool offersTimeLine() const { return false; }
    virtual void toggleTimeLine() {}
    /// Back to the present.
    virtual void goLive() {}
    /// Whether the number at a path can be drawn over time, and is.
    virtual bool canPin(const std::string&) { return false; }
    virtual bool isPinned(const std::string&) const { return false; }
    virtual void togglePin(const std::string&) {}
    /// Whether the value there was not told for long.
    virtual bool isStale(const std::string&) { return false; }
    /// In one line where the value there comes from; empty where nothing is known of that.
    virtual std::string briefSourceOf(const std::string&) { return {}; }
    /// Opens what tells all of it.
    virtual void showSourceOf(const std::string&) {}
    /// Why there is nothing to show, where a pane has no node that could have rows.
    virtual std::string reasonForNoData() const { return {}; }
};

/// A screen that shows the children of one node of the display tree, with the status below. A touch
/// on a row that has children opens a pane for it. Values that cannot be right are marked, and
/// above the rows stands which records were read without their layout being known.
class VentrikPaneController : public TableScreen
{
  public:
    /// The node may be none; the host outlives the pane.
    static std::unique_ptr<VentrikPaneController>
    initWithNode(VentrikPaneHost& host, ModelNodePointer node, std::string path);

    void createToolbarItems();
    void setStatus(const std::string& status, bool isLoading) override;
    /// Asks the host anew for what is said beside the status and on an empty pane.
    void updateNotes() override;
    /// Shows its place in the tree as that is now. The root also shows that there is no tree; a
    /// pane whose node is gone stays as it is.
    bool reload() override;
    /// Shows another node's children, or nothing.
    void reloadWithNode(ModelNodePointer node);
    const std::string& path() const { return _keyPath; }

    void viewWillAppear(bool animated) override;
    void viewWillDisappear(bool animated) override;
    int rowsInSection(int section) override;
    std::unique_ptr<TableRow> rowForIndexPath(TableView& table, IndexPath indexPath) override;
    void rowSelected(TableView& table, std::optional<IndexPath> indexPath) override;
    void rowWillBeReused(TableRow& row) override;
    /// "name: value", or the name of an inner node.
    QString textForCopying(IndexPath indexPath) override;
    std::vector<RowAction> actionsForRow(IndexPath indexPath) override;

  private:
    VentrikPaneController(VentrikPaneHost& host, ModelNodePointer node, std::string path);

    void updateTitle();
    void updateLayoutWarnings();
    void updateStaleness();
    std::string pathOf(const VentrikModelNode& child) const;
    QString doubtOf(const VentrikModelNode& leaf) const;
    QString reasonForNoRows() const;
    const VentrikModelNode::Children& children() const;
    const ModelNodePointer& childAt(IndexPath indexPath) const;

    VentrikPaneHost& _host;
    ModelNodePointer _nodes;
    ModelNodePointer _formerNodes; // while the table is reloaded
    // How far long values are moved, by name: their rows come and go with the scrolling.
    std::map<QString, int> _contentOffsets;
    std::string _keyPath;
    std::string _status;
    bool _isLoading = true;
};

} // namespace ventrik
