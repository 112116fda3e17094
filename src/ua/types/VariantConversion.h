#pragma once

#include <optional>

#include "ua/types/NodeId.h"
#include "ua/types/Result.h"
#include "ua/types/Variant.h"

namespace cv::ua {

// The built-in type that carries the values of a data type, for the
// built-in types themselves and their common standard subtypes
// (enumerations are Int32, Duration is Double, UtcTime is DateTime, ...).
// Nothing for abstract types (Number, BaseDataType) and unknown ones.
std::optional<BuiltinType> BuiltinTypeOf(const NodeId& dataType);

// The value as the target type, so that a server that insists on its node's
// data type takes it. Arrays convert element by element.
// - Numbers and Booleans convert among themselves when the value fits
//   (Bad_OutOfRange otherwise); floats become integers rounded to the
//   nearest; true is 1 and any non-zero number is true.
// - Text reads as a number ("12", "-3.5", "1e3"), as a Boolean ("true",
//   "false", or a number), as a LocalizedText, a QualifiedName (namespace 0)
//   or a NodeId in its text form; numbers and Booleans read as text.
// - StatusCode and UInt32 convert into each other.
// Anything else is Bad_TypeMismatch; a null value stays null.
Result<Variant> ConvertVariant(const Variant& value, BuiltinType target);

}  // namespace cv::ua
