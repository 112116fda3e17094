#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <variant>
#include <vector>

#include "ua/types/BuiltinTypes.h"

namespace cv::ua {

struct DataValue;

// The built-in types with their ids on the wire.
enum class BuiltinType : uint8_t {
    Null = 0,
    Boolean = 1,
    SByte = 2,
    Byte = 3,
    Int16 = 4,
    UInt16 = 5,
    Int32 = 6,
    UInt32 = 7,
    Int64 = 8,
    UInt64 = 9,
    Float = 10,
    Double = 11,
    String = 12,
    DateTime = 13,
    Guid = 14,
    ByteString = 15,
    XmlElement = 16,
    NodeId = 17,
    ExpandedNodeId = 18,
    StatusCode = 19,
    QualifiedName = 20,
    LocalizedText = 21,
    ExtensionObject = 22,
    DataValue = 23,
    Variant = 24,
    DiagnosticInfo = 25,
};

inline constexpr uint8_t kMaxBuiltinType = 25;

// A value of any built-in type: null, a scalar, or an array of one element
// type (arrays of type Variant hold values of mixed types) with optional
// dimensions for a matrix.
class Variant {
  public:
    using Elements = std::vector<Variant>;
    using Storage =
        std::variant<std::monostate, bool, int8_t, uint8_t, int16_t, uint16_t, int32_t, uint32_t,
                     int64_t, uint64_t, float, double, std::string, DateTime, Guid, ByteString,
                     XmlElement, NodeId, ExpandedNodeId, StatusCode, QualifiedName, LocalizedText,
                     ExtensionObject, std::shared_ptr<const DataValue>,
                     std::shared_ptr<const DiagnosticInfo>, Elements>;

    Variant() = default;
    Variant(bool v) : type_(BuiltinType::Boolean), storage_(v) {}
    Variant(int8_t v) : type_(BuiltinType::SByte), storage_(v) {}
    Variant(uint8_t v) : type_(BuiltinType::Byte), storage_(v) {}
    Variant(int16_t v) : type_(BuiltinType::Int16), storage_(v) {}
    Variant(uint16_t v) : type_(BuiltinType::UInt16), storage_(v) {}
    Variant(int32_t v) : type_(BuiltinType::Int32), storage_(v) {}
    Variant(uint32_t v) : type_(BuiltinType::UInt32), storage_(v) {}
    Variant(int64_t v) : type_(BuiltinType::Int64), storage_(v) {}
    Variant(uint64_t v) : type_(BuiltinType::UInt64), storage_(v) {}
    Variant(float v) : type_(BuiltinType::Float), storage_(v) {}
    Variant(double v) : type_(BuiltinType::Double), storage_(v) {}
    Variant(std::string v) : type_(BuiltinType::String), storage_(std::move(v)) {}
    Variant(const char* v) : Variant(std::string(v)) {}
    Variant(DateTime v) : type_(BuiltinType::DateTime), storage_(v) {}
    Variant(Guid v) : type_(BuiltinType::Guid), storage_(v) {}
    Variant(ByteString v) : type_(BuiltinType::ByteString), storage_(std::move(v)) {}
    Variant(XmlElement v) : type_(BuiltinType::XmlElement), storage_(std::move(v)) {}
    Variant(NodeId v) : type_(BuiltinType::NodeId), storage_(std::move(v)) {}
    Variant(ExpandedNodeId v) : type_(BuiltinType::ExpandedNodeId), storage_(std::move(v)) {}
    Variant(StatusCode v) : type_(BuiltinType::StatusCode), storage_(v) {}
    Variant(QualifiedName v) : type_(BuiltinType::QualifiedName), storage_(std::move(v)) {}
    Variant(LocalizedText v) : type_(BuiltinType::LocalizedText), storage_(std::move(v)) {}
    Variant(ExtensionObject v) : type_(BuiltinType::ExtensionObject), storage_(std::move(v)) {}
    Variant(std::shared_ptr<const DataValue> v);
    Variant(std::shared_ptr<const DiagnosticInfo> v);

    // An array whose elements are scalars of elementType (any type for
    // BuiltinType::Variant). Dimensions, when given, multiply to the size.
    static Variant Array(BuiltinType elementType, Elements elements,
                         std::vector<int32_t> dimensions = {});

    // The scalar's type, or an array's element type.
    BuiltinType Type() const { return type_; }
    bool IsNull() const { return type_ == BuiltinType::Null; }
    bool IsArray() const { return std::holds_alternative<Elements>(storage_); }

    // The scalar of type T, or null for another type or an array.
    template <class T>
    const T* Get() const {
        return std::get_if<T>(&storage_);
    }
    const Storage& Value() const { return storage_; }
    // An array's elements; empty for a scalar.
    const Elements& ArrayElements() const;
    const std::vector<int32_t>& Dimensions() const { return dimensions_; }

    bool operator==(const Variant& other) const;

  private:
    BuiltinType type_ = BuiltinType::Null;
    Storage storage_;
    std::vector<int32_t> dimensions_;
};

}  // namespace cv::ua
