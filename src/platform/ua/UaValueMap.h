#pragma once

#include <cstddef>
#include <cstdint>

#include "platform/Variant.h"
#include "ua/types/Variant.h"

namespace cv::uaopc {

// The most bytes of one ByteString a value carries to the automation side.
inline constexpr size_t kMaxAutomationBytes = 64u << 10;

// Values between OPC UA and the automation interface. The automation
// Variant has no 8-bit scalar, unsigned or 64-bit types, so those take the
// nearest it has: SByte and Byte become I2, UInt16 I4, UInt32, Int64, UInt64
// and StatusCode R8 (exact up to 2^53). ByteString becomes a byte array
// (VT_ARRAY | VT_UI1); one longer than kMaxAutomationBytes becomes a text
// that says how long it is instead. Texts: String, LocalizedText (its
// text), QualifiedName ("ns:name", just the name in namespace 0), NodeId and
// ExpandedNodeId (their text form), Guid, XmlElement. DateTime becomes a
// date in local time. Arrays keep their elements (a matrix is flattened)
// with lower bound 0; structures and other values the interface cannot
// carry are empty.
Variant ToAutomation(const ua::Variant& value);

// The automation type ToAutomation gives values of this type (arrays aside).
uint16_t AutomationTypeOf(ua::BuiltinType type);

// A value to write: I2 Int16, I4 Int32, R4 Float, R8 Double, Boolean,
// text String, date DateTime (from local time; outside the years 100 to
// 9999 "no time"), a byte array ByteString, other arrays element by element;
// empty and null are null. The writer converts it to the node's type.
ua::Variant FromAutomation(const Variant& value);

}  // namespace cv::uaopc
