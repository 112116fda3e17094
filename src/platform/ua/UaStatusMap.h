#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "ua/types/StatusCode.h"

namespace cv::uaopc {

// Between OPC UA status codes and the Data Access results and qualities.

// The Data Access quality of a value that came with this status: the named
// codes by their table, any other by its severity (bad 0x00, uncertain
// 0x40, good 0xC0), and the status's limit bits (low 0x100, high 0x200,
// constant 0x300) as the quality's limit bits 1, 2 and 3.
int32_t QualityOf(ua::StatusCode status);

// The result of one operation (an item added, read or written) that ended
// with this status: 0 for good and uncertain ones, the Data Access error
// for the codes that have one (an unknown or malformed node, no access
// rights, a wrong type or range, a write the server cannot do), and any
// other bad code as itself.
int32_t HresultOf(ua::StatusCode status);

// True when a read's status says the read failed (no such node, no right
// to read) rather than how good the value is.
bool IsOperationError(ua::StatusCode status);

// The UA status an HRESULT stands for: a code passed on as itself (a bad
// result, or the status behind a value's quality), or the code its Data
// Access error was made from.
std::optional<ua::StatusCode> StatusOfHresult(int32_t hresult);

// The text of an error the backend gives without a UA status behind it
// (a handle or access path it does not know, a server it cannot reach).
std::optional<std::string> OwnErrorText(int32_t hresult);

}  // namespace cv::uaopc
