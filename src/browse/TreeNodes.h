#pragma once

#include <cstdint>
#include <string>
#include <unordered_map>
#include <vector>

namespace cv {

// The nodes of a browser's tree, without the control that shows them: each
// node has a key (unique when not empty), a text, a picture (and one for
// while it is open), a parent and its children in order. Nodes are
// numbered in the order they were added; numbers are never reused. One node
// may be selected. A listener (the window's tree control) hears every
// change.
class TreeNodes {
  public:
    // 0 is no node.
    using Id = int32_t;

    class Listener {
      public:
        virtual ~Listener() = default;
        virtual void NodeAdded(Id id) = 0;
        // Before the node and everything under it go.
        virtual void NodeRemoving(Id id) = 0;
        virtual void NodeExpanded(Id id, bool expanded) = 0;
        virtual void NodeSelected(Id id) = 0;
    };

    void SetListener(Listener* listener) { listener_ = listener; }

    // Adds a node as the last child of parent (0: at the top). A key that
    // another node holds is refused: the answer is 0 and nothing is added.
    Id Add(Id parent, const std::string& key, const std::string& text, const std::string& image,
           const std::string& expandedImage = {});
    // Removes the node with everything under it.
    void Remove(Id id);
    // Removes the first remaining node until none is left.
    void Clear();

    bool Exists(Id id) const;
    int32_t Count() const { return count_; }
    // The first node held and the one added after id, in the order added;
    // 0 at the end.
    Id First() const { return Next(0); }
    Id Next(Id id) const;
    // The node with that key; 0 when none has it.
    Id Find(const std::string& key) const;

    const std::string& Key(Id id) const { return At(id).key; }
    const std::string& Text(Id id) const { return At(id).text; }
    // The picture shown now: the open one while the node is open, when it
    // has one.
    const std::string& Image(Id id) const;
    Id Parent(Id id) const { return At(id).parent; }
    const std::vector<Id>& Children(Id id) const { return At(id).children; }
    Id FirstChild(Id id) const;

    bool Expanded(Id id) const { return At(id).expanded; }
    void SetExpanded(Id id, bool expanded);
    Id Selected() const { return selected_; }
    void Select(Id id);

  private:
    struct Node {
        std::string key;
        std::string text;
        std::string image;
        std::string expandedImage;
        Id parent = 0;
        std::vector<Id> children;
        bool expanded = false;
        bool alive = false;
    };

    // Every call names a node that exists; the browsers keep to that.
    const Node& At(Id id) const { return nodes_[static_cast<size_t>(id) - 1]; }
    Node& At(Id id) { return nodes_[static_cast<size_t>(id) - 1]; }
    void Forget(Id id);

    std::vector<Node> nodes_;
    std::vector<Id> top_;
    std::unordered_map<std::string, Id> byKey_;
    int32_t count_ = 0;
    Id selected_ = 0;
    Listener* listener_ = nullptr;
};

}  // namespace cv
