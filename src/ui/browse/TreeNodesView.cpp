#include "ui/browse/TreeNodesView.h"

#include <algorithm>
#include <utility>

#include <QList>
#include <QTreeWidget>
#include <QTreeWidgetItem>

#include "ui/browse/BrowseImages.h"

namespace cv {

namespace {

constexpr int kIdRole = Qt::UserRole;

// Sets a flag for as long as it lives.
class Raised {
  public:
    explicit Raised(bool& flag) : flag_(flag), before_(flag) { flag_ = true; }
    ~Raised() { flag_ = before_; }
    Raised(const Raised&) = delete;
    Raised& operator=(const Raised&) = delete;

  private:
    bool& flag_;
    bool before_;
};

}  // namespace

TreeNodesView::TreeNodesView(QTreeWidget& tree, TreeNodes& nodes, BrowseImages& images)
    : tree_(tree), nodes_(nodes), images_(images) {
    nodes_.SetListener(this);
}

TreeNodesView::~TreeNodesView() {
    nodes_.SetListener(nullptr);
}

TreeNodes::Id TreeNodesView::IdOf(const QTreeWidgetItem* item) const {
    return item == nullptr ? 0 : item->data(0, kIdRole).toInt();
}

QTreeWidgetItem* TreeNodesView::ItemOf(TreeNodes::Id id) const {
    const auto index = static_cast<size_t>(id) - 1;
    return id >= 1 && index < items_.size() ? items_[index] : nullptr;
}

QTreeWidgetItem* TreeNodesView::NewItem(TreeNodes::Id id) {
    auto* item = new QTreeWidgetItem(QStringList(QString::fromStdString(nodes_.Text(id))));
    item->setData(0, kIdRole, id);
    const std::string& image = nodes_.Image(id);
    if (!image.empty()) {
        item->setIcon(0, images_.Image(image));
    }
    if (items_.size() < static_cast<size_t>(id)) {
        items_.resize(static_cast<size_t>(id), nullptr);
    }
    items_[static_cast<size_t>(id) - 1] = item;
    return item;
}

void TreeNodesView::Flush() {
    if (pending_.empty()) {
        return;
    }
    const Raised syncing(syncing_);
    const std::vector<TreeNodes::Id> added = std::move(pending_);
    pending_.clear();
    // Numbers only grow, so a parent numbered from the first one added is
    // new too: its children join it before it goes into the control. The
    // rest go in with one call for each parent already shown.
    std::vector<std::pair<TreeNodes::Id, QList<QTreeWidgetItem*>>> shown;
    for (const TreeNodes::Id id : added) {
        QTreeWidgetItem* item = NewItem(id);
        const TreeNodes::Id parent = nodes_.Parent(id);
        if (parent >= added.front()) {
            ItemOf(parent)->addChild(item);
            continue;
        }
        auto entry = std::find_if(shown.begin(), shown.end(),
                                  [parent](const auto& e) { return e.first == parent; });
        if (entry == shown.end()) {
            entry = shown.insert(shown.end(), {parent, {}});
        }
        entry->second.append(item);
    }
    for (auto& [parent, items] : shown) {
        if (parent == 0) {
            tree_.addTopLevelItems(items);
        } else {
            ItemOf(parent)->addChildren(items);
        }
    }
}

void TreeNodesView::NodeAdded(TreeNodes::Id id) {
    pending_.push_back(id);
}

void TreeNodesView::NodeRemoving(TreeNodes::Id id) {
    Flush();
    QTreeWidgetItem* item = ItemOf(id);
    Forget(id);
    const Raised syncing(syncing_);
    delete item;  // takes the item out of the control, with its children
}

void TreeNodesView::Forget(TreeNodes::Id id) {
    std::vector<TreeNodes::Id> pending{id};
    while (!pending.empty()) {
        const TreeNodes::Id next = pending.back();
        pending.pop_back();
        items_[static_cast<size_t>(next) - 1] = nullptr;
        const auto& children = nodes_.Children(next);
        pending.insert(pending.end(), children.begin(), children.end());
    }
}

void TreeNodesView::NodeExpanded(TreeNodes::Id id, bool expanded) {
    Flush();
    QTreeWidgetItem* item = ItemOf(id);
    const Raised syncing(syncing_);
    item->setExpanded(expanded);
    const std::string& image = nodes_.Image(id);
    item->setIcon(0, image.empty() ? QIcon() : images_.Image(image));
}

void TreeNodesView::NodeSelected(TreeNodes::Id id) {
    Flush();
    const Raised syncing(syncing_);
    QTreeWidgetItem* item = ItemOf(id);
    tree_.setCurrentItem(item);
    if (item != nullptr) {
        tree_.scrollToItem(item);
    }
}

}  // namespace cv
