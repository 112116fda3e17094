#include "ua/types/Variant.h"

#include "ua/types/DataValue.h"

namespace cv::ua {

Variant::Variant(std::shared_ptr<const DataValue> v)
    : type_(BuiltinType::DataValue), storage_(std::move(v)) {}

Variant::Variant(std::shared_ptr<const DiagnosticInfo> v)
    : type_(BuiltinType::DiagnosticInfo), storage_(std::move(v)) {}

Variant Variant::Array(BuiltinType elementType, Elements elements,
                       std::vector<int32_t> dimensions) {
    Variant array;
    array.type_ = elementType;
    array.storage_ = std::move(elements);
    array.dimensions_ = std::move(dimensions);
    return array;
}

const Variant::Elements& Variant::ArrayElements() const {
    static const Elements kNone;
    const Elements* elements = std::get_if<Elements>(&storage_);
    return elements ? *elements : kNone;
}

bool Variant::operator==(const Variant& other) const {
    if (type_ != other.type_ || dimensions_ != other.dimensions_ ||
        storage_.index() != other.storage_.index()) {
        return false;
    }
    if (const auto* value = Get<std::shared_ptr<const DataValue>>()) {
        const auto& otherValue = *other.Get<std::shared_ptr<const DataValue>>();
        return *value == otherValue || (*value && otherValue && **value == *otherValue);
    }
    if (const auto* info = Get<std::shared_ptr<const DiagnosticInfo>>()) {
        const auto& otherInfo = *other.Get<std::shared_ptr<const DiagnosticInfo>>();
        return *info == otherInfo || (*info && otherInfo && **info == *otherInfo);
    }
    return storage_ == other.storage_;
}

}  // namespace cv::ua
