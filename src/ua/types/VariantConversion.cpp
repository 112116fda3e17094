#include "ua/types/VariantConversion.h"

#include <charconv>
#include <cmath>
#include <limits>
#include <string>

#include "ua/types/NodeIdText.h"

namespace cv::ua {
namespace {

bool IsNumber(BuiltinType type) {
    return type >= BuiltinType::Boolean && type <= BuiltinType::Double;
}

Error Mismatch(BuiltinType from, BuiltinType to) {
    return Error{status::BadTypeMismatch, "A value of built-in type " +
                                              std::to_string(static_cast<int>(from)) +
                                              " cannot be given to a node of built-in type " +
                                              std::to_string(static_cast<int>(to)) + "."};
}

Error OutOfRange(BuiltinType to) {
    return Error{status::BadOutOfRange, "The value does not fit the node's built-in type " +
                                            std::to_string(static_cast<int>(to)) + "."};
}

// A number held exactly: integers as such, floats as double.
struct Number {
    bool isFloat = false;
    long double value = 0;
};

Number NumberOf(const Variant& value) {
    return std::visit(
        [](const auto& v) -> Number {
            using T = std::decay_t<decltype(v)>;
            if constexpr (std::is_same_v<T, bool>) {
                return {false, v ? 1.0L : 0.0L};
            } else if constexpr (std::is_floating_point_v<T>) {
                return {true, static_cast<long double>(v)};
            } else if constexpr (std::is_integral_v<T>) {
                return {false, static_cast<long double>(v)};
            } else {
                return {};
            }
        },
        value.Value());
}

template <class T>
Result<Variant> FromNumber(Number number, BuiltinType target) {
    long double value = number.value;
    if constexpr (std::is_same_v<T, bool>) {
        return Variant(value != 0);
    } else if constexpr (std::is_floating_point_v<T>) {
        if (std::isfinite(value) &&
            std::fabs(value) > static_cast<long double>(std::numeric_limits<T>::max())) {
            return OutOfRange(target);
        }
        return Variant(static_cast<T>(value));
    } else {
        if (number.isFloat) {
            value = std::round(value);
        }
        if (!std::isfinite(value) ||
            value < static_cast<long double>(std::numeric_limits<T>::min()) ||
            value > static_cast<long double>(std::numeric_limits<T>::max())) {
            return OutOfRange(target);
        }
        return Variant(static_cast<T>(value));
    }
}

Result<Variant> NumberTo(Number number, BuiltinType target) {
    switch (target) {
        case BuiltinType::Boolean:
            return FromNumber<bool>(number, target);
        case BuiltinType::SByte:
            return FromNumber<int8_t>(number, target);
        case BuiltinType::Byte:
            return FromNumber<uint8_t>(number, target);
        case BuiltinType::Int16:
            return FromNumber<int16_t>(number, target);
        case BuiltinType::UInt16:
            return FromNumber<uint16_t>(number, target);
        case BuiltinType::Int32:
            return FromNumber<int32_t>(number, target);
        case BuiltinType::UInt32:
            return FromNumber<uint32_t>(number, target);
        case BuiltinType::Int64:
            return FromNumber<int64_t>(number, target);
        case BuiltinType::UInt64:
            return FromNumber<uint64_t>(number, target);
        case BuiltinType::Float:
            return FromNumber<float>(number, target);
        default:
            return FromNumber<double>(number, target);
    }
}

std::optional<Number> ParseNumber(const std::string& text) {
    const char* end = text.data() + text.size();
    long long integer = 0;
    if (auto [p, ec] = std::from_chars(text.data(), end, integer); ec == std::errc() && p == end) {
        return Number{false, static_cast<long double>(integer)};
    }
    unsigned long long unsignedInteger = 0;
    if (auto [p, ec] = std::from_chars(text.data(), end, unsignedInteger);
        ec == std::errc() && p == end) {
        return Number{false, static_cast<long double>(unsignedInteger)};
    }
    double real = 0;
    if (auto [p, ec] = std::from_chars(text.data(), end, real); ec == std::errc() && p == end) {
        return Number{true, real};
    }
    if (text == "true" || text == "True" || text == "TRUE") {
        return Number{false, 1};
    }
    if (text == "false" || text == "False" || text == "FALSE") {
        return Number{false, 0};
    }
    return std::nullopt;
}

std::string NumberText(const Variant& value) {
    if (const bool* b = value.Get<bool>()) {
        return *b ? "true" : "false";
    }
    return std::visit(
        [](const auto& v) -> std::string {
            using T = std::decay_t<decltype(v)>;
            if constexpr (std::is_arithmetic_v<T> && !std::is_same_v<T, bool>) {
                char text[64];
                const auto [end, ec] = std::to_chars(text, text + sizeof text, v);
                return std::string(text, ec == std::errc() ? end : text);
            } else {
                return {};
            }
        },
        value.Value());
}

Result<Variant> FromText(const std::string& text, BuiltinType from, BuiltinType target) {
    if (IsNumber(target)) {
        const auto number = ParseNumber(text);
        if (!number) {
            return Error{status::BadTypeMismatch, "The text \"" + text + "\" is not a number."};
        }
        return NumberTo(*number, target);
    }
    switch (target) {
        case BuiltinType::LocalizedText:
            return Variant(LocalizedText{"", text});
        case BuiltinType::QualifiedName:
            return Variant(QualifiedName{0, text});
        case BuiltinType::NodeId: {
            const auto node = ParseNodeId(text);
            if (!node || !node->namespaceUri.empty()) {
                return Error{status::BadTypeMismatch,
                             "The text \"" + text + "\" is not a node id."};
            }
            return Variant(node->nodeId);
        }
        default:
            return Mismatch(from, target);
    }
}

Result<Variant> ConvertScalar(const Variant& value, BuiltinType target) {
    const BuiltinType from = value.Type();
    if (from == target || from == BuiltinType::Null) {
        return value;
    }
    if (IsNumber(from) && IsNumber(target)) {
        return NumberTo(NumberOf(value), target);
    }
    if (IsNumber(from) && target == BuiltinType::String) {
        return Variant(NumberText(value));
    }
    if (const auto* text = value.Get<std::string>()) {
        return FromText(*text, from, target);
    }
    if (const auto* text = value.Get<LocalizedText>(); text && target == BuiltinType::String) {
        return Variant(text->text);
    }
    if (const auto* name = value.Get<QualifiedName>(); name && target == BuiltinType::String) {
        return Variant(name->name);
    }
    if (const auto* node = value.Get<NodeId>(); node && target == BuiltinType::String) {
        return Variant(FormatNodeId(*node));
    }
    if (const auto* code = value.Get<StatusCode>(); code && target == BuiltinType::UInt32) {
        return Variant(code->code);
    }
    if (const auto* number = value.Get<uint32_t>(); number && target == BuiltinType::StatusCode) {
        return Variant(StatusCode{*number});
    }
    return Mismatch(from, target);
}

}  // namespace

std::optional<BuiltinType> BuiltinTypeOf(const NodeId& dataType) {
    if (dataType.namespaceIndex != 0 || dataType.IdKind() != NodeId::Kind::Numeric) {
        return std::nullopt;
    }
    const uint32_t id = dataType.Numeric();
    if (id >= 1 && id <= 25 && id != 22 && id != 24) {
        return static_cast<BuiltinType>(id);
    }
    switch (id) {
        case 29:   // Enumeration
        case 256:  // IdType
        case 257:  // NodeClass
        case 852:  // ServerState
            return BuiltinType::Int32;
        case 288:  // IntegerId
        case 289:  // Counter
            return BuiltinType::UInt32;
        case 290:  // Duration
            return BuiltinType::Double;
        case 293:  // Date
        case 294:  // UtcTime
            return BuiltinType::DateTime;
        case 291:    // NumericRange
        case 292:    // Time
        case 295:    // LocaleId
        case 12877:  // NormalizedString
        case 12878:  // DecimalString
        case 12879:  // DurationString
        case 12880:  // TimeString
        case 12881:  // DateString
            return BuiltinType::String;
        case 30:   // Image
        case 311:  // ApplicationInstanceCertificate
            return BuiltinType::ByteString;
        default:
            return std::nullopt;
    }
}

Result<Variant> ConvertVariant(const Variant& value, BuiltinType target) {
    if (!value.IsArray()) {
        return ConvertScalar(value, target);
    }
    if (value.Type() == target || target == BuiltinType::Variant) {
        return value;
    }
    Variant::Elements elements;
    elements.reserve(value.ArrayElements().size());
    for (const Variant& element : value.ArrayElements()) {
        auto converted = ConvertScalar(element, target);
        if (!converted) {
            return converted.Failure();
        }
        elements.push_back(std::move(converted.Value()));
    }
    return Variant::Array(target, std::move(elements), value.Dimensions());
}

}  // namespace cv::ua
