#pragma once

#include "ua/types/BuiltinTypes.h"
#include "ua/types/DataValue.h"

namespace cv::uaopc {

// OPC UA times (UTC, 100 ns ticks since 1601) as the automation interface's
// dates: OLE dates in this computer's local time, to the millisecond.

// The date 0 for a time outside the years 100 to 9999.
double OleDateOf(ua::DateTime time);
// Nothing for a date outside the years 100 to 9999.
std::optional<ua::DateTime> UaDateTimeOf(double oleDate);
// A value's time stamp: its source time stamp, else its server time stamp,
// else the time it arrived (now).
double TimeStampOf(const ua::DataValue& value);

}  // namespace cv::uaopc
