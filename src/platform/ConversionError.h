#pragma once

#include "platform/ErrorInfo.h"

namespace cv {

// The failures of value conversions, numbered and worded as the automation
// library's callers know them.
inline ErrorInfo OverflowError() {
    return {kErrOverflow, "Overflow"};
}
inline ErrorInfo TypeMismatchError() {
    return {kErrTypeMismatch, "Type mismatch"};
}
inline ErrorInfo InvalidArgumentError() {
    return {5, "Invalid procedure call or argument"};
}

}  // namespace cv
