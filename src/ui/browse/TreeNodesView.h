#pragma once

#include <vector>

#include "browse/TreeNodes.h"

class QTreeWidget;
class QTreeWidgetItem;

namespace cv {

class BrowseImages;

// Shows a TreeNodes in a tree control and follows its changes. Nodes added
// wait until Flush, so that a branch of thousands of items goes into the
// control in one step; every other change flushes first. While the view
// changes the control itself (Syncing), the window ignores the control's
// signals: they are not the user's.
class TreeNodesView : public TreeNodes::Listener {
  public:
    TreeNodesView(QTreeWidget& tree, TreeNodes& nodes, BrowseImages& images);
    ~TreeNodesView() override;
    TreeNodesView(const TreeNodesView&) = delete;
    TreeNodesView& operator=(const TreeNodesView&) = delete;

    // Puts the nodes added since the last flush into the control.
    void Flush();
    bool Syncing() const { return syncing_; }
    // The node an item of the control shows; 0 for none.
    TreeNodes::Id IdOf(const QTreeWidgetItem* item) const;
    QTreeWidgetItem* ItemOf(TreeNodes::Id id) const;

    void NodeAdded(TreeNodes::Id id) override;
    void NodeRemoving(TreeNodes::Id id) override;
    void NodeExpanded(TreeNodes::Id id, bool expanded) override;
    void NodeSelected(TreeNodes::Id id) override;

  private:
    QTreeWidgetItem* NewItem(TreeNodes::Id id);
    void Forget(TreeNodes::Id id);

    QTreeWidget& tree_;
    TreeNodes& nodes_;
    BrowseImages& images_;
    std::vector<QTreeWidgetItem*> items_;  // by node number - 1
    std::vector<TreeNodes::Id> pending_;
    bool syncing_ = false;
};

}  // namespace cv
