#include "platform/Variant.h"

namespace cv {

namespace {

template <typename T>
T ValueOr(const T* stored, T fallback) {
    return stored != nullptr ? *stored : fallback;
}

}  // namespace

Variant Variant::Null() {
    return Variant(VT_NULL, std::monostate{});
}

Variant Variant::I2(int16_t value) {
    return Variant(VT_I2, value);
}

Variant Variant::I4(int32_t value) {
    return Variant(VT_I4, value);
}

Variant Variant::R4(float value) {
    return Variant(VT_R4, value);
}

Variant Variant::R8(double value) {
    return Variant(VT_R8, value);
}

Variant Variant::Date(double oleDate) {
    return Variant(VT_DATE, oleDate);
}

Variant Variant::Bool(bool value) {
    return Variant(VT_BOOL, value);
}

Variant Variant::Str(std::string value) {
    return Variant(VT_BSTR, std::move(value));
}

Variant Variant::Array(uint16_t elementType, std::vector<Variant> elements, int32_t lowerBound) {
    const auto vt = static_cast<uint16_t>(VT_ARRAY | (elementType & ~VT_ARRAY));
    return Variant(vt, ArrayData{std::move(elements), lowerBound});
}

Variant Variant::Bytes(std::vector<uint8_t> bytes, int32_t lowerBound) {
    return Variant(static_cast<uint16_t>(VT_ARRAY | VT_UI1),
                   ByteData{std::move(bytes), lowerBound});
}

int16_t Variant::AsI2() const {
    return ValueOr(std::get_if<int16_t>(&value_), int16_t{0});
}

int32_t Variant::AsI4() const {
    return ValueOr(std::get_if<int32_t>(&value_), int32_t{0});
}

float Variant::AsR4() const {
    return ValueOr(std::get_if<float>(&value_), 0.0F);
}

double Variant::AsR8() const {
    return ValueOr(std::get_if<double>(&value_), 0.0);
}

bool Variant::AsBool() const {
    return ValueOr(std::get_if<bool>(&value_), false);
}

const std::string& Variant::AsStr() const {
    static const std::string kNone;
    const auto* text = std::get_if<std::string>(&value_);
    return text != nullptr ? *text : kNone;
}

const std::vector<Variant>& Variant::Elements() const {
    static const std::vector<Variant> kNone;
    const auto* array = std::get_if<ArrayData>(&value_);
    return array != nullptr ? array->elements : kNone;
}

const std::vector<uint8_t>& Variant::AsBytes() const {
    static const std::vector<uint8_t> kNone;
    const auto* bytes = std::get_if<ByteData>(&value_);
    return bytes != nullptr ? bytes->bytes : kNone;
}

int32_t Variant::LowerBound() const {
    if (const auto* bytes = std::get_if<ByteData>(&value_)) {
        return bytes->lowerBound;
    }
    const auto* array = std::get_if<ArrayData>(&value_);
    return array != nullptr ? array->lowerBound : 0;
}

size_t Variant::ElementCount() const {
    return Elements().size() + AsBytes().size();
}

Variant Variant::Element(size_t index) const {
    if (index < AsBytes().size()) {
        return I2(AsBytes()[index]);
    }
    return index < Elements().size() ? Elements()[index] : Variant();
}

std::optional<double> NumberOf(const Variant& value) {
    switch (value.VarType()) {
        case VT_EMPTY:
            return 0.0;
        case VT_I2:
            return value.AsI2();
        case VT_I4:
            return value.AsI4();
        case VT_R4:
            return value.AsR4();
        case VT_R8:
        case VT_DATE:
            return value.AsR8();
        case VT_BOOL:
            return value.AsBool() ? -1.0 : 0.0;
        default:
            return std::nullopt;
    }
}

std::string TextOf(const Variant& value, const platform::Locale& locale) {
    Variant text;
    if (ChangeType(text, value, VT_BSTR, locale)) {
        return {};
    }
    return text.AsStr();
}

}  // namespace cv
