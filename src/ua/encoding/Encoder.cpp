#include "ua/encoding/Encoder.h"

#include <bit>

namespace cv::ua {

static_assert(std::endian::native == std::endian::little,
              "the wire format is little-endian and is copied as is");

namespace {

enum NodeIdEncoding : uint8_t {
    kTwoByte = 0,
    kFourByte = 1,
    kNumeric = 2,
    kString = 3,
    kGuid = 4,
    kOpaque = 5,
    kHasServerIndex = 0x40,
    kHasNamespaceUri = 0x80,
};

}  // namespace

// An empty field goes as a null string: servers read an empty index range
// or locale differently from none. An empty text value keeps its length 0.
void Encoder::operator()(const std::string& v) {
    if (v.empty()) {
        Raw(int32_t{-1});
        return;
    }
    TextValue(v);
}

void Encoder::TextValue(const std::string& v) {
    Raw(static_cast<int32_t>(v.size()));
    Bytes(v.data(), v.size());
}

void Encoder::operator()(const ByteString& v) {
    (*this)(v.bytes);
}

void Encoder::operator()(const XmlElement& v) {
    (*this)(v.text);
}

void Encoder::operator()(const Guid& v) {
    Raw(v.data1);
    Raw(v.data2);
    Raw(v.data3);
    Bytes(v.data4.data(), v.data4.size());
}

void Encoder::operator()(const NodeId& v) {
    const uint16_t ns = v.namespaceIndex;
    switch (v.IdKind()) {
        case NodeId::Kind::Numeric: {
            const uint32_t id = std::get<uint32_t>(v.identifier);
            if (ns == 0 && id <= 0xFF) {
                Byte(kTwoByte);
                Byte(static_cast<uint8_t>(id));
            } else if (ns <= 0xFF && id <= 0xFFFF) {
                Byte(kFourByte);
                Byte(static_cast<uint8_t>(ns));
                Raw(static_cast<uint16_t>(id));
            } else {
                Byte(kNumeric);
                Raw(ns);
                Raw(id);
            }
            return;
        }
        case NodeId::Kind::String:
            Byte(kString);
            Raw(ns);
            (*this)(std::get<std::string>(v.identifier));
            return;
        case NodeId::Kind::Guid:
            Byte(kGuid);
            Raw(ns);
            (*this)(std::get<Guid>(v.identifier));
            return;
        case NodeId::Kind::Opaque:
            Byte(kOpaque);
            Raw(ns);
            (*this)(std::get<ByteString>(v.identifier));
            return;
    }
}

void Encoder::operator()(const ExpandedNodeId& v) {
    const size_t maskAt = out_.size();
    (*this)(v.nodeId);
    uint8_t flags = 0;
    if (!v.namespaceUri.empty()) {
        flags |= kHasNamespaceUri;
        (*this)(v.namespaceUri);
    }
    if (v.serverIndex != 0) {
        flags |= kHasServerIndex;
        Raw(v.serverIndex);
    }
    out_[maskAt] = static_cast<char>(static_cast<uint8_t>(out_[maskAt]) | flags);
}

void Encoder::operator()(const QualifiedName& v) {
    Raw(v.namespaceIndex);
    (*this)(v.name);
}

void Encoder::operator()(const LocalizedText& v) {
    Byte(static_cast<uint8_t>((v.locale.empty() ? 0 : 1) | (v.text.empty() ? 0 : 2)));
    if (!v.locale.empty()) {
        (*this)(v.locale);
    }
    if (!v.text.empty()) {
        (*this)(v.text);
    }
}

void Encoder::operator()(const ExtensionObject& v) {
    (*this)(v.typeId);
    Byte(static_cast<uint8_t>(v.encoding));
    if (v.encoding != ExtensionObject::Encoding::None) {
        (*this)(v.body);
    }
}

void Encoder::operator()(const DiagnosticInfo& v) {
    const uint8_t mask = static_cast<uint8_t>(
        (v.symbolicId ? 0x01 : 0) | (v.namespaceUri ? 0x02 : 0) | (v.localizedText ? 0x04 : 0) |
        (v.locale ? 0x08 : 0) | (v.additionalInfo ? 0x10 : 0) | (v.innerStatusCode ? 0x20 : 0) |
        (v.inner ? 0x40 : 0));
    Byte(mask);
    for (const auto* index : {&v.symbolicId, &v.namespaceUri, &v.locale, &v.localizedText}) {
        if (*index) {
            Raw(**index);
        }
    }
    if (v.additionalInfo) {
        (*this)(*v.additionalInfo);
    }
    if (v.innerStatusCode) {
        (*this)(*v.innerStatusCode);
    }
    if (v.inner) {
        (*this)(*v.inner);
    }
}

void Encoder::VariantValue(const Variant::Storage& storage) {
    std::visit(
        [this](const auto& value) {
            using T = std::decay_t<decltype(value)>;
            if constexpr (std::is_same_v<T, std::shared_ptr<const DataValue>> ||
                          std::is_same_v<T, std::shared_ptr<const DiagnosticInfo>>) {
                (*this)(value ? *value : typename T::element_type{});
            } else if constexpr (std::is_same_v<T, std::string>) {
                TextValue(value);
            } else if constexpr (!std::is_same_v<T, std::monostate> &&
                                 !std::is_same_v<T, Variant::Elements>) {
                (*this)(value);
            }
        },
        storage);
}

void Encoder::operator()(const Variant& v) {
    uint8_t mask = static_cast<uint8_t>(v.Type());
    if (!v.IsArray()) {
        Byte(mask);
        VariantValue(v.Value());
        return;
    }
    mask |= 0x80;
    if (!v.Dimensions().empty()) {
        mask |= 0x40;
    }
    Byte(mask);
    const Variant::Elements& elements = v.ArrayElements();
    Raw(static_cast<int32_t>(elements.size()));
    for (const Variant& element : elements) {
        if (v.Type() == BuiltinType::Variant) {
            (*this)(element);
        } else {
            VariantValue(element.Value());
        }
    }
    if (!v.Dimensions().empty()) {
        (*this)(v.Dimensions());
    }
}

void Encoder::operator()(const DataValue& v) {
    const uint8_t mask = static_cast<uint8_t>(
        (v.value.IsNull() ? 0 : 0x01) | (v.status.code != 0 ? 0x02 : 0) |
        (v.sourceTimestamp.ticks != 0 ? 0x04 : 0) | (v.serverTimestamp.ticks != 0 ? 0x08 : 0) |
        (v.sourcePicoseconds != 0 ? 0x10 : 0) | (v.serverPicoseconds != 0 ? 0x20 : 0));
    Byte(mask);
    if (mask & 0x01) {
        (*this)(v.value);
    }
    if (mask & 0x02) {
        (*this)(v.status);
    }
    if (mask & 0x04) {
        (*this)(v.sourceTimestamp);
    }
    if (mask & 0x10) {
        Raw(v.sourcePicoseconds);
    }
    if (mask & 0x08) {
        (*this)(v.serverTimestamp);
    }
    if (mask & 0x20) {
        Raw(v.serverPicoseconds);
    }
}

}  // namespace cv::ua
