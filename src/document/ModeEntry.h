#pragma once

#include <string>

namespace cv {

// One row of the controller-mode table: the text by which a mode is
// recognised in the mode channel's value, its meaning, and whether it counts
// as automatic.
struct ModeEntry {
    std::string Key;
    std::string Value;
    bool Auto = false;
};

}  // namespace cv
