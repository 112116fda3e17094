#include "browse/TreeNodes.h"

#include <algorithm>

namespace cv {

TreeNodes::Id TreeNodes::Add(Id parent, const std::string& key, const std::string& text,
                             const std::string& image, const std::string& expandedImage) {
    if (parent != 0 && !Exists(parent)) {
        return 0;
    }
    const Id id = static_cast<Id>(nodes_.size()) + 1;
    if (!key.empty() && !byKey_.emplace(key, id).second) {
        return 0;
    }
    nodes_.push_back(Node{key, text, image, expandedImage, parent, {}, false, true});
    (parent == 0 ? top_ : At(parent).children).push_back(id);
    ++count_;
    if (listener_ != nullptr) {
        listener_->NodeAdded(id);
    }
    return id;
}

void TreeNodes::Remove(Id id) {
    if (!Exists(id)) {
        return;
    }
    if (listener_ != nullptr) {
        listener_->NodeRemoving(id);
    }
    auto& siblings = At(id).parent == 0 ? top_ : At(At(id).parent).children;
    siblings.erase(std::find(siblings.begin(), siblings.end(), id));
    Forget(id);
}

void TreeNodes::Forget(Id id) {
    // Iterative, so that a deep tree cannot exhaust the stack.
    std::vector<Id> pending{id};
    while (!pending.empty()) {
        Node& node = At(pending.back());
        if (pending.back() == selected_) {
            selected_ = 0;
        }
        pending.pop_back();
        pending.insert(pending.end(), node.children.begin(), node.children.end());
        if (!node.key.empty()) {
            byKey_.erase(node.key);
        }
        node = Node{};
        --count_;
    }
}

void TreeNodes::Clear() {
    while (const Id first = First()) {
        Remove(first);
    }
}

bool TreeNodes::Exists(Id id) const {
    return id >= 1 && static_cast<size_t>(id) <= nodes_.size() && At(id).alive;
}

TreeNodes::Id TreeNodes::Next(Id id) const {
    for (size_t i = static_cast<size_t>(std::max(id, 0)); i < nodes_.size(); ++i) {
        if (nodes_[i].alive) {
            return static_cast<Id>(i) + 1;
        }
    }
    return 0;
}

TreeNodes::Id TreeNodes::Find(const std::string& key) const {
    const auto found = byKey_.find(key);
    return found == byKey_.end() ? 0 : found->second;
}

const std::string& TreeNodes::Image(Id id) const {
    const Node& node = At(id);
    return node.expanded && !node.expandedImage.empty() ? node.expandedImage : node.image;
}

TreeNodes::Id TreeNodes::FirstChild(Id id) const {
    const auto& children = At(id).children;
    return children.empty() ? 0 : children.front();
}

void TreeNodes::SetExpanded(Id id, bool expanded) {
    At(id).expanded = expanded;
    if (listener_ != nullptr) {
        listener_->NodeExpanded(id, expanded);
    }
}

void TreeNodes::Select(Id id) {
    selected_ = Exists(id) ? id : 0;
    if (listener_ != nullptr) {
        listener_->NodeSelected(selected_);
    }
}

}  // namespace cv
