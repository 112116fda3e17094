#include "ua/encoding/Decoder.h"

#include <limits>

namespace cv::ua {
namespace {

// What the allocator keeps beside each block it hands out.
constexpr uint64_t kBlockOverhead = 16;
// The counts a shared value's block holds beside the value.
constexpr uint64_t kSharedOverhead = 16;

}  // namespace

Error Decoder::Failure() const {
    if (Ok()) {
        return {};
    }
    return {limitExceeded_ ? status::BadEncodingLimitsExceeded : status::BadDecodingError,
            "The message could not be decoded: " + failure_ + "."};
}

void Decoder::Fail(std::string_view sWhat, bool bLimit) {
    if (Ok()) {
        failure_ = std::string(sWhat) + " at byte " + std::to_string(Position());
        limitExceeded_ = bLimit;
    }
    pos_ = end_;
}

std::string_view Decoder::Bytes(size_t size) {
    if (Remaining() < size) {
        Fail("the data ends early");
        return {};
    }
    const std::string_view bytes(pos_, size);
    pos_ += size;
    return bytes;
}

uint32_t Decoder::ArrayLength(size_t elementSize) {
    int32_t length = 0;
    Raw(length);
    if (length < -1) {
        Fail("an array has the negative length " + std::to_string(length));
        return 0;
    }
    if (length <= 0) {
        return 0;
    }
    const auto count = static_cast<uint32_t>(length);
    if (count > limits_.maxArrayLength) {
        Fail("an array of " + std::to_string(count) + " elements exceeds the limit of " +
                 std::to_string(limits_.maxArrayLength),
             true);
        return 0;
    }
    // Each element takes at least one byte on the wire.
    if (count > Remaining()) {
        Fail("an array of " + std::to_string(count) + " elements is longer than the data");
        return 0;
    }
    if (!Charge(uint64_t{count} * elementSize + kBlockOverhead)) {
        return 0;
    }
    return count;
}

bool Decoder::Charge(uint64_t bytes) {
    if (bytes > limits_.maxAllocation - allocated_) {
        Fail("the message needs more memory than the " + std::to_string(limits_.maxAllocation) +
                 " bytes allowed",
             true);
        return false;
    }
    allocated_ += bytes;
    return true;
}

template <class T>
std::shared_ptr<T> Decoder::MakeNested() {
    if (!Charge(sizeof(T) + kSharedOverhead + kBlockOverhead)) {
        return nullptr;
    }
    return std::make_shared<T>();
}

void Decoder::operator()(std::string& v) {
    int32_t length = 0;
    Raw(length);
    v.clear();
    if (length < -1) {
        Fail("a string has the negative length " + std::to_string(length));
        return;
    }
    if (length <= 0) {
        return;
    }
    if (static_cast<uint32_t>(length) > limits_.maxStringLength) {
        Fail("a string of " + std::to_string(length) + " bytes exceeds the limit of " +
                 std::to_string(limits_.maxStringLength),
             true);
        return;
    }
    if (Remaining() < static_cast<size_t>(length)) {
        Fail("the data ends early");
        return;
    }
    // The text and its terminating zero.
    if (Charge(static_cast<uint64_t>(length) + 1 + kBlockOverhead)) {
        v = Bytes(static_cast<size_t>(length));
    }
}

void Decoder::operator()(Guid& v) {
    Raw(v.data1);
    Raw(v.data2);
    Raw(v.data3);
    const std::string_view tail = Bytes(8);
    if (tail.size() == 8) {
        std::memcpy(v.data4.data(), tail.data(), 8);
    }
}

void Decoder::NodeIdBody(uint8_t encoding, NodeId& v) {
    switch (encoding & 0x3F) {
        case 0:
            v = NodeId(0, uint32_t{Byte()});
            return;
        case 1: {
            const uint8_t ns = Byte();
            uint16_t id = 0;
            Raw(id);
            v = NodeId(ns, uint32_t{id});
            return;
        }
        case 2: {
            uint16_t ns = 0;
            uint32_t id = 0;
            Raw(ns);
            Raw(id);
            v = NodeId(ns, id);
            return;
        }
        case 3:
        case 4:
        case 5:
            break;
        default:
            Fail("a node id has the unknown encoding " + std::to_string(encoding & 0x3F));
            return;
    }
    uint16_t ns = 0;
    Raw(ns);
    if ((encoding & 0x3F) == 3) {
        std::string id;
        (*this)(id);
        v = NodeId(ns, std::move(id));
    } else if ((encoding & 0x3F) == 4) {
        Guid id;
        (*this)(id);
        v = NodeId(ns, id);
    } else {
        ByteString id;
        (*this)(id);
        v = NodeId(ns, std::move(id));
    }
}

void Decoder::operator()(NodeId& v) {
    const uint8_t encoding = Byte();
    if (encoding & 0xC0) {
        Fail("a node id carries the flags of an expanded node id");
        return;
    }
    NodeIdBody(encoding, v);
}

void Decoder::operator()(ExpandedNodeId& v) {
    const uint8_t encoding = Byte();
    NodeIdBody(encoding, v.nodeId);
    v.namespaceUri.clear();
    v.serverIndex = 0;
    if (encoding & 0x80) {
        (*this)(v.namespaceUri);
    }
    if (encoding & 0x40) {
        Raw(v.serverIndex);
    }
}

void Decoder::operator()(QualifiedName& v) {
    Raw(v.namespaceIndex);
    (*this)(v.name);
}

void Decoder::operator()(LocalizedText& v) {
    const uint8_t mask = Byte();
    v = {};
    if (mask & 0x01) {
        (*this)(v.locale);
    }
    if (mask & 0x02) {
        (*this)(v.text);
    }
}

void Decoder::operator()(ExtensionObject& v) {
    (*this)(v.typeId);
    const uint8_t encoding = Byte();
    v.body.clear();
    if (encoding > 2) {
        Fail("an extension object has the unknown encoding " + std::to_string(encoding));
        return;
    }
    v.encoding = static_cast<ExtensionObject::Encoding>(encoding);
    if (encoding != 0) {
        (*this)(v.body);
    }
}

bool Decoder::Enter() {
    if (depth_ >= limits_.maxDepth) {
        Fail("the values are nested deeper than " + std::to_string(limits_.maxDepth) + " levels",
             true);
        return false;
    }
    ++depth_;
    return true;
}

void Decoder::operator()(DiagnosticInfo& v) {
    v = {};
    if (!Enter()) {
        return;
    }
    const uint8_t mask = Byte();
    const auto index = [&](uint8_t bit, std::optional<int32_t>& field) {
        if (mask & bit) {
            Raw(field.emplace());
        }
    };
    index(0x01, v.symbolicId);
    index(0x02, v.namespaceUri);
    index(0x08, v.locale);
    index(0x04, v.localizedText);
    if (mask & 0x10) {
        (*this)(v.additionalInfo.emplace());
    }
    if (mask & 0x20) {
        (*this)(v.innerStatusCode.emplace());
    }
    if (mask & 0x40) {
        if (auto inner = MakeNested<DiagnosticInfo>()) {
            (*this)(*inner);
            v.inner = std::move(inner);
        }
    }
    Leave();
}

void Decoder::VariantScalar(BuiltinType type, Variant& v) {
    const auto read = [&]<class T>(std::type_identity<T>) {
        T value{};
        (*this)(value);
        v = Variant(std::move(value));
    };
    switch (type) {
        case BuiltinType::Null:
            v = Variant();
            return;
        case BuiltinType::Boolean:
            return read(std::type_identity<bool>());
        case BuiltinType::SByte:
            return read(std::type_identity<int8_t>());
        case BuiltinType::Byte:
            return read(std::type_identity<uint8_t>());
        case BuiltinType::Int16:
            return read(std::type_identity<int16_t>());
        case BuiltinType::UInt16:
            return read(std::type_identity<uint16_t>());
        case BuiltinType::Int32:
            return read(std::type_identity<int32_t>());
        case BuiltinType::UInt32:
            return read(std::type_identity<uint32_t>());
        case BuiltinType::Int64:
            return read(std::type_identity<int64_t>());
        case BuiltinType::UInt64:
            return read(std::type_identity<uint64_t>());
        case BuiltinType::Float:
            return read(std::type_identity<float>());
        case BuiltinType::Double:
            return read(std::type_identity<double>());
        case BuiltinType::String:
            return read(std::type_identity<std::string>());
        case BuiltinType::DateTime:
            return read(std::type_identity<DateTime>());
        case BuiltinType::Guid:
            return read(std::type_identity<Guid>());
        case BuiltinType::ByteString:
            return read(std::type_identity<ByteString>());
        case BuiltinType::XmlElement:
            return read(std::type_identity<XmlElement>());
        case BuiltinType::NodeId:
            return read(std::type_identity<NodeId>());
        case BuiltinType::ExpandedNodeId:
            return read(std::type_identity<ExpandedNodeId>());
        case BuiltinType::StatusCode:
            return read(std::type_identity<StatusCode>());
        case BuiltinType::QualifiedName:
            return read(std::type_identity<QualifiedName>());
        case BuiltinType::LocalizedText:
            return read(std::type_identity<LocalizedText>());
        case BuiltinType::ExtensionObject:
            return read(std::type_identity<ExtensionObject>());
        case BuiltinType::DataValue:
            if (auto value = MakeNested<DataValue>()) {
                (*this)(*value);
                v = Variant(std::shared_ptr<const DataValue>(std::move(value)));
            }
            return;
        case BuiltinType::Variant:
            v = Variant();
            Fail("a variant holds a variant outside an array");
            return;
        case BuiltinType::DiagnosticInfo:
            if (auto info = MakeNested<DiagnosticInfo>()) {
                (*this)(*info);
                v = Variant(std::shared_ptr<const DiagnosticInfo>(std::move(info)));
            }
            return;
    }
}

void Decoder::operator()(Variant& v) {
    if (!Enter()) {
        v = Variant();
        return;
    }
    const uint8_t mask = Byte();
    const uint8_t typeId = mask & 0x3F;
    // A scalar is assigned once, by VariantScalar; every other way starts
    // from null.
    if (typeId <= kMaxBuiltinType && (mask & 0xC0) == 0) {
        VariantScalar(static_cast<BuiltinType>(typeId), v);
        Leave();
        return;
    }
    v = Variant();
    if (typeId > kMaxBuiltinType) {
        Fail("a variant has the unknown type " + std::to_string(typeId));
    } else if ((mask & 0x80) == 0) {
        Fail("a scalar variant has array dimensions");
    } else if (typeId == 0) {
        Fail("a variant holds an array of null values");
    } else {
        const auto type = static_cast<BuiltinType>(typeId);
        const uint32_t count = ArrayLength(sizeof(Variant));
        Variant::Elements elements;
        elements.reserve(count);
        for (uint32_t i = 0; i < count && Ok(); ++i) {
            if (type == BuiltinType::Variant) {
                (*this)(elements.emplace_back());
            } else {
                VariantScalar(type, elements.emplace_back());
            }
        }
        std::vector<int32_t> dimensions;
        if (mask & 0x40) {
            (*this)(dimensions);
            // A product above any element count counts as too large.
            constexpr int64_t kBeyondAnyCount = int64_t{1} << 32;
            bool valid = !dimensions.empty();
            int64_t product = 1;
            for (const int32_t dimension : dimensions) {
                valid = valid && dimension >= 0;
                product = std::min(product * std::max(dimension, 0), kBeyondAnyCount);
            }
            if (Ok() && (!valid || product != static_cast<int64_t>(count))) {
                Fail("the array dimensions do not match the number of elements");
            }
        }
        v = Variant::Array(type, std::move(elements), std::move(dimensions));
    }
    Leave();
}

void Decoder::operator()(DataValue& v) {
    // Field by field: most values come fresh from an array, and resetting a
    // whole value would assign its variant twice.
    v.status = {};
    v.sourceTimestamp = {};
    v.serverTimestamp = {};
    v.sourcePicoseconds = 0;
    v.serverPicoseconds = 0;
    if (!Enter()) {
        v.value = Variant();
        return;
    }
    const uint8_t mask = Byte();
    if (mask & 0x01) {
        (*this)(v.value);
    } else {
        v.value = Variant();
    }
    if (mask & 0x02) {
        Raw(v.status.code);
    }
    if (mask & 0x04) {
        Raw(v.sourceTimestamp.ticks);
    }
    if (mask & 0x10) {
        Raw(v.sourcePicoseconds);
    }
    if (mask & 0x08) {
        Raw(v.serverTimestamp.ticks);
    }
    if (mask & 0x20) {
        Raw(v.serverPicoseconds);
    }
    Leave();
}

}  // namespace cv::ua
