#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace cv {

// ISO 8601 texts of the OLE dates (local time) that OPC servers give, to
// the millisecond and with their zone: "2025-01-01T12:00:00.250+01:00", or
// "...Z" where local time is UTC. Empty for a date outside the years 100 to
// 9999.

// With the offset of this computer's time zone at that date; without a
// zone where the C library cannot tell the offset.
std::string IsoTimeText(double dOleDate);
// With the given offset from UTC in minutes, east of Greenwich positive.
std::string IsoTimeText(double dOleDate, std::optional<int32_t> lOffsetMinutes);
// The offset from UTC, in minutes, of local time at that local date.
std::optional<int32_t> LocalUtcOffsetMinutes(double dOleDate);

}  // namespace cv
