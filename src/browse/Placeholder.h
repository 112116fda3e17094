#pragma once

#include <string_view>

#include "browse/TreeNodes.h"

namespace cv {

// The child that gives a node its expand button before its children are
// known. Opening the node removes it and fills the node instead.
inline constexpr std::string_view kPlaceholderText = "CorvalentFakeNodeUniqueName";

inline TreeNodes::Id AddPlaceholder(TreeNodes& cNodes, TreeNodes::Id lParent) {
    return cNodes.Add(lParent, std::string(), std::string(kPlaceholderText), std::string());
}

// Whether the node's first child is the placeholder.
inline bool HasPlaceholder(const TreeNodes& cNodes, TreeNodes::Id lNode) {
    const TreeNodes::Id lChild = cNodes.FirstChild(lNode);
    return lChild != 0 && cNodes.Text(lChild) == kPlaceholderText;
}

}  // namespace cv
