#include "platform/ua/UaValueMap.h"

#include <string>
#include <vector>

#include "platform/ua/UaTime.h"
#include "ua/types/NodeIdText.h"
#include "ua/types/PlainText.h"

namespace cv::uaopc {

namespace {

using ua::BuiltinType;

Variant Bytes(const ua::ByteString& bytes) {
    const std::string& data = bytes.bytes;
    if (data.size() > kMaxAutomationBytes) {
        return Variant::Str("ByteString of " + std::to_string(data.size()) +
                            " bytes, too long to show (the limit is " +
                            std::to_string(kMaxAutomationBytes) + " bytes)");
    }
    return Variant::Bytes(std::vector<uint8_t>(data.begin(), data.end()));
}

std::string Text(const ua::QualifiedName& name) {
    return name.namespaceIndex == 0 ? name.name
                                    : std::to_string(name.namespaceIndex) + ":" + name.name;
}

struct ScalarOf {
    Variant operator()(bool v) const { return Variant::Bool(v); }
    Variant operator()(int8_t v) const { return Variant::I2(v); }
    Variant operator()(uint8_t v) const { return Variant::I2(v); }
    Variant operator()(int16_t v) const { return Variant::I2(v); }
    Variant operator()(uint16_t v) const { return Variant::I4(v); }
    Variant operator()(int32_t v) const { return Variant::I4(v); }
    Variant operator()(uint32_t v) const { return Variant::R8(v); }
    Variant operator()(int64_t v) const { return Variant::R8(static_cast<double>(v)); }
    Variant operator()(uint64_t v) const { return Variant::R8(static_cast<double>(v)); }
    Variant operator()(float v) const { return Variant::R4(v); }
    Variant operator()(double v) const { return Variant::R8(v); }
    Variant operator()(const std::string& v) const { return Variant::Str(v); }
    Variant operator()(ua::DateTime v) const { return Variant::Date(OleDateOf(v)); }
    Variant operator()(const ua::Guid& v) const { return Variant::Str(v.ToText()); }
    Variant operator()(const ua::ByteString& v) const { return Bytes(v); }
    Variant operator()(const ua::XmlElement& v) const { return Variant::Str(v.text); }
    Variant operator()(const ua::NodeId& v) const { return Variant::Str(ua::FormatNodeId(v)); }
    Variant operator()(const ua::ExpandedNodeId& v) const {
        return Variant::Str(ua::FormatNodeId(v));
    }
    Variant operator()(ua::StatusCode v) const { return Variant::R8(v.code); }
    Variant operator()(const ua::QualifiedName& v) const { return Variant::Str(Text(v)); }
    Variant operator()(const ua::LocalizedText& v) const { return Variant::Str(v.text); }
    template <class Other>
    Variant operator()(const Other&) const {
        return Variant();
    }
};

// Texts come from the server: they are shown plain, on one line.
Variant Scalar(const ua::Variant& value) {
    Variant scalar = std::visit(ScalarOf{}, value.Value());
    return scalar.VarType() == VT_BSTR ? Variant::Str(ua::PlainText(scalar.AsStr())) : scalar;
}

// The UA type FromAutomation gives elements of this automation type.
BuiltinType ElementTypeOf(uint16_t vt) {
    switch (vt) {
        case VT_I2:
            return BuiltinType::Int16;
        case VT_I4:
            return BuiltinType::Int32;
        case VT_R4:
            return BuiltinType::Float;
        case VT_R8:
            return BuiltinType::Double;
        case VT_BOOL:
            return BuiltinType::Boolean;
        case VT_BSTR:
            return BuiltinType::String;
        case VT_DATE:
            return BuiltinType::DateTime;
        default:
            return BuiltinType::Variant;
    }
}

}  // namespace

uint16_t AutomationTypeOf(BuiltinType type) {
    switch (type) {
        case BuiltinType::Boolean:
            return VT_BOOL;
        case BuiltinType::SByte:
        case BuiltinType::Byte:
        case BuiltinType::Int16:
            return VT_I2;
        case BuiltinType::UInt16:
        case BuiltinType::Int32:
            return VT_I4;
        case BuiltinType::Float:
            return VT_R4;
        case BuiltinType::UInt32:
        case BuiltinType::Int64:
        case BuiltinType::UInt64:
        case BuiltinType::StatusCode:
        case BuiltinType::Double:
            return VT_R8;
        case BuiltinType::DateTime:
            return VT_DATE;
        case BuiltinType::String:
        case BuiltinType::Guid:
        case BuiltinType::XmlElement:
        case BuiltinType::NodeId:
        case BuiltinType::ExpandedNodeId:
        case BuiltinType::QualifiedName:
        case BuiltinType::LocalizedText:
            return VT_BSTR;
        case BuiltinType::ByteString:
            return VT_ARRAY | VT_UI1;
        case BuiltinType::Variant:
            return VT_VARIANT;
        default:
            return VT_EMPTY;
    }
}

Variant ToAutomation(const ua::Variant& value) {
    if (!value.IsArray()) {
        return Scalar(value);
    }
    const uint16_t scalarType = AutomationTypeOf(value.Type());
    // Arrays of byte arrays, of mixed values and of values the interface
    // cannot carry hold Variants.
    const bool variants = (scalarType & VT_ARRAY) != 0 || scalarType == VT_EMPTY;
    const uint16_t elementType = variants ? static_cast<uint16_t>(VT_VARIANT) : scalarType;
    std::vector<Variant> elements;
    elements.reserve(value.ArrayElements().size());
    for (const ua::Variant& element : value.ArrayElements()) {
        elements.push_back(element.IsArray() ? ToAutomation(element) : Scalar(element));
    }
    return Variant::Array(elementType, std::move(elements));
}

ua::Variant FromAutomation(const Variant& value) {
    if (value.VarType() == (VT_ARRAY | VT_UI1)) {
        const std::vector<uint8_t>& bytes = value.AsBytes();
        return ua::Variant(ua::ByteString{std::string(bytes.begin(), bytes.end())});
    }
    if (value.IsArray()) {
        ua::Variant::Elements elements;
        elements.reserve(value.Elements().size());
        for (const Variant& element : value.Elements()) {
            elements.push_back(FromAutomation(element));
        }
        return ua::Variant::Array(ElementTypeOf(value.VarType() & ~VT_ARRAY), std::move(elements));
    }
    switch (value.VarType()) {
        case VT_I2:
            return ua::Variant(value.AsI2());
        case VT_I4:
            return ua::Variant(value.AsI4());
        case VT_R4:
            return ua::Variant(value.AsR4());
        case VT_R8:
            return ua::Variant(value.AsR8());
        case VT_BOOL:
            return ua::Variant(value.AsBool());
        case VT_BSTR:
            return ua::Variant(value.AsStr());
        case VT_DATE:
            // A date outside the years 100 to 9999 is "no time".
            return ua::Variant(UaDateTimeOf(value.AsR8()).value_or(ua::DateTime{}));
        default:
            return ua::Variant();
    }
}

}  // namespace cv::uaopc
