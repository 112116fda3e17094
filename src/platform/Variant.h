#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <variant>
#include <vector>

#include "platform/ErrorInfo.h"

namespace cv {

namespace platform {
class Locale;
}

// COM variant type codes.
enum VarType : uint16_t {
    VT_EMPTY = 0,
    VT_NULL = 1,
    VT_I2 = 2,
    VT_I4 = 3,
    VT_R4 = 4,
    VT_R8 = 5,
    VT_DATE = 7,
    VT_BSTR = 8,
    VT_BOOL = 11,
    VT_VARIANT = 12,
    VT_UI1 = 17,
    VT_ARRAY = 0x2000,
};

// A value as the automation library carries it: empty, null, 16- and 32-bit
// integers, single and double floats, Boolean, date (OLE automation date:
// days since 1899-12-30), text, one-dimensional arrays of these, and byte
// arrays (VT_ARRAY | VT_UI1), which keep their bytes in one buffer.
class Variant {
  public:
    Variant() = default;  // empty

    static Variant Null();
    static Variant I2(int16_t value);
    static Variant I4(int32_t value);
    static Variant R4(float value);
    static Variant R8(double value);
    static Variant Date(double oleDate);
    static Variant Bool(bool value);
    static Variant Str(std::string value);
    // elementType is the type of every element (VT_VARIANT for mixed ones).
    static Variant Array(uint16_t elementType, std::vector<Variant> elements,
                         int32_t lowerBound = 0);
    static Variant Bytes(std::vector<uint8_t> bytes, int32_t lowerBound = 0);

    // The type code; arrays answer VT_ARRAY | element type.
    uint16_t VarType() const { return vt_; }
    bool IsEmpty() const { return vt_ == VT_EMPTY; }
    bool IsNull() const { return vt_ == VT_NULL; }
    bool IsArray() const { return (vt_ & VT_ARRAY) != 0; }

    // Accessors for the stored value. Each answers for its own type only
    // (AsR8 also for dates); asked of another type it gives 0, false or an
    // empty text or list.
    int16_t AsI2() const;
    int32_t AsI4() const;
    float AsR4() const;
    double AsR8() const;  // VT_R8 and VT_DATE
    bool AsBool() const;
    const std::string& AsStr() const;
    // The elements of an array made by Array; a byte array's are in AsBytes.
    const std::vector<Variant>& Elements() const;
    const std::vector<uint8_t>& AsBytes() const;
    int32_t LowerBound() const;
    // Any array's elements one by one, a byte array's as I2 (the scalar
    // nearest a byte); 0 and empty for a scalar or an index past the end.
    size_t ElementCount() const;
    Variant Element(size_t index) const;

    bool operator==(const Variant& other) const = default;

  private:
    struct ArrayData {
        std::vector<Variant> elements;
        int32_t lowerBound = 0;
        bool operator==(const ArrayData&) const = default;
    };
    struct ByteData {
        std::vector<uint8_t> bytes;
        int32_t lowerBound = 0;
        bool operator==(const ByteData&) const = default;
    };
    using Storage = std::variant<std::monostate, int16_t, int32_t, float, double, bool, std::string,
                                 ArrayData, ByteData>;

    Variant(uint16_t vt, Storage value) : vt_(vt), value_(std::move(value)) {}

    uint16_t vt_ = VT_EMPTY;
    Storage value_;
};

// Converts source to the type vt as the automation library's VariantChangeType
// does with flags 0: texts are read and written with the user's regional
// settings, floats round to integers with halves to even, and a failure comes
// back as type mismatch (13) or overflow (6) with result left empty.
// - Anything but null becomes empty; anything becomes null.
// - Empty gives 0, False, the date 0 or an empty text; null gives only null.
// - Booleans are -1 and 0 as numbers and as text ("-1", "0"); text gives a
//   Boolean from "True"/"False" in any case or from a number (non-zero is
//   True).
// - Numbers as text: integers plainly, R4 with 7 and R8 with 15 significant
//   digits, the regional decimal separator, 1E+20 and 1E-05 forms for large
//   and small numbers. Dates as text: see DateText.h.
// - Arrays convert only to their own type; types this value does not carry
//   (currency, decimal, objects, unsigned) are a type mismatch too.
ErrorInfo ChangeType(Variant& result, const Variant& source, uint16_t vt,
                     const platform::Locale& locale);

// The value's text as ChangeType to VT_BSTR gives it; empty when it has
// none (null, arrays).
std::string TextOf(const Variant& value, const platform::Locale& locale);

// The number a scalar that is not text stands for: empty 0, True -1, a date
// its day count. Nothing for null, text and arrays.
std::optional<double> NumberOf(const Variant& value);

}  // namespace cv
