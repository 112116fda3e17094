#pragma once

#include <string>

#include "browse/TreeNodes.h"

namespace cv::test {

// The tree as text, one node a line, indented two blanks a level: the key
// (or "-"), the text, the picture in brackets, "+" when open, "*" when
// selected. A placeholder shows as "...".
inline void DumpNode(const TreeNodes& nodes, TreeNodes::Id id, int depth, std::string& text) {
    text += std::string(static_cast<size_t>(depth) * 2, ' ');
    if (nodes.Text(id) == "CorvalentFakeNodeUniqueName") {
        text += "...\n";
        return;
    }
    text += (nodes.Key(id).empty() ? std::string("-") : nodes.Key(id)) + " " + nodes.Text(id);
    text += " [" + nodes.Image(id) + "]";
    text += nodes.Expanded(id) ? " +" : "";
    text += nodes.Selected() == id ? " *" : "";
    text += "\n";
    for (TreeNodes::Id child : nodes.Children(id)) {
        DumpNode(nodes, child, depth + 1, text);
    }
}

inline std::string Dump(const TreeNodes& nodes) {
    std::string text;
    for (TreeNodes::Id id = nodes.First(); id != 0; id = nodes.Next(id)) {
        if (nodes.Parent(id) == 0) {
            DumpNode(nodes, id, 0, text);
        }
    }
    return text;
}

}  // namespace cv::test
