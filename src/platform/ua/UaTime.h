#pragma once

#include "platform/opc/ValueDetail.h"
#include "ua/types/BuiltinTypes.h"
#include "ua/types/DataValue.h"

namespace cv::uaopc {

// OPC UA times (UTC, 100 ns ticks since 1601) as the automation interface's
// dates: OLE dates in this computer's local time, to the millisecond.

// The date 0 for a time outside the years 100 to 9999.
double OleDateOf(ua::DateTime time);
// Nothing for a date outside the years 100 to 9999.
std::optional<ua::DateTime> UaDateTimeOf(double oleDate);
// A value's time stamp: its server time stamp, else its source time stamp,
// else the time it arrived (now).
double TimeStampOf(const ua::DataValue& value);
// What the time stamp and quality leave out: the source time stamp (0 when
// the server sent none) and the status behind the quality (0 for Good).
platform::ValueDetail DetailOf(const ua::DataValue& value);

}  // namespace cv::uaopc
