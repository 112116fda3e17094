#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <vector>

#include "browse/NetResource.h"
#include "platform/NetEnumApi.h"

namespace cv {

// The network as a tree that grows where it is looked at: a flat list of
// NetResource nodes, each knowing its parent's key. A node's key is its
// position in the list (from 1; the root is 1), never reused while the
// tree lives. One node is current: Count, Key, Item and GetResources act on
// it. A node's children are enumerated the first time they are asked for,
// and only then.
class Network {
  public:
    explicit Network(platform::NetEnumApi& cNetEnum);
    // Removes the nodes front first.
    ~Network();
    Network(const Network&) = delete;
    Network& operator=(const Network&) = delete;

    // How many children the current node has (0 before GetResources).
    int32_t Count() const;
    int32_t Key() const;
    // The lIndex-th child (from 1) of the current node; nullptr when there
    // is none.
    NetResource* Item(int32_t lIndex) const;
    // Makes the node with that key current; an unknown key changes nothing.
    void GoToKey(int32_t lKey);
    void GoToRoot();
    // Enumerates the current node's children once; asking again does
    // nothing, also when the first enumeration failed.
    void GetResources();

  private:
    void AddNode(std::unique_ptr<NetResource> cNode, int32_t lParent);

    std::vector<std::unique_ptr<NetResource>> mcNodes;
    NetResource* mcCurrent = nullptr;
    int32_t mlRootKey = 0;
    // Where each enumerated node's children stand in the list: GetResources
    // adds them together, so they stand side by side.
    struct ChildRange {
        size_t first = 0;
        size_t count = 0;
    };
    std::map<int32_t, ChildRange> mcChildRanges;
};

}  // namespace cv
