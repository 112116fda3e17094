#pragma once

#include <cstdint>
#include <cstring>
#include <string>
#include <type_traits>
#include <vector>

#include "ua/encoding/Structure.h"
#include "ua/types/DataValue.h"

namespace cv::ua {

// Appends the binary encoding of values to a byte buffer: little-endian
// numbers, length-prefixed strings and arrays, masks for optional fields.
class Encoder {
  public:
    explicit Encoder(std::string& out) : out_(out) {}

    void operator()(bool v) { Byte(v ? 1 : 0); }
    void operator()(int8_t v) { Byte(static_cast<uint8_t>(v)); }
    void operator()(uint8_t v) { Byte(v); }
    void operator()(int16_t v) { Raw(v); }
    void operator()(uint16_t v) { Raw(v); }
    void operator()(int32_t v) { Raw(v); }
    void operator()(uint32_t v) { Raw(v); }
    void operator()(int64_t v) { Raw(v); }
    void operator()(uint64_t v) { Raw(v); }
    void operator()(float v) { Raw(v); }
    void operator()(double v) { Raw(v); }
    void operator()(DateTime v) { Raw(v.ticks); }
    void operator()(StatusCode v) { Raw(v.code); }
    void operator()(const std::string& v);
    void operator()(const char* v) { (*this)(std::string(v)); }
    void operator()(const ByteString& v);
    void operator()(const XmlElement& v);
    void operator()(const Guid& v);
    void operator()(const NodeId& v);
    void operator()(const ExpandedNodeId& v);
    void operator()(const QualifiedName& v);
    void operator()(const LocalizedText& v);
    void operator()(const ExtensionObject& v);
    void operator()(const DiagnosticInfo& v);
    void operator()(const Variant& v);
    void operator()(const DataValue& v);

    template <class E>
    requires std::is_enum_v<E>
    void operator()(E v) { Raw(static_cast<int32_t>(v)); }

    template <class T>
    requires StructureFor<const T, Encoder>
    void operator()(const T& v) { T::Visit(v, *this); }

    template <class T>
    void operator()(const std::vector<T>& v) {
        Raw(static_cast<int32_t>(v.size()));
        for (const T& element : v) {
            (*this)(element);
        }
    }

    // A structure wrapped as an extension object with its encoding id.
    template <class T>
    void Extension(const T& v) {
        (*this)(NodeId(0, uint32_t{T::kEncodingId}));
        Byte(1);
        const size_t lengthAt = out_.size();
        Raw(int32_t{0});
        (*this)(v);
        PatchInt32(lengthAt, static_cast<int32_t>(out_.size() - lengthAt - 4));
    }

    void Byte(uint8_t v) { out_.push_back(static_cast<char>(v)); }
    void Bytes(const void* data, size_t size) { out_.append(static_cast<const char*>(data), size); }
    void PatchUInt32(size_t at, uint32_t v) { std::memcpy(out_.data() + at, &v, 4); }
    void PatchInt32(size_t at, int32_t v) { std::memcpy(out_.data() + at, &v, 4); }

  private:
    template <class T>
    void Raw(T v) {
        static_assert(std::is_arithmetic_v<T>);
        Bytes(&v, sizeof v);
    }
    void VariantValue(const Variant::Storage& storage);
    void TextValue(const std::string& v);

    std::string& out_;
};

// The whole encoding of one value, for bodies and tests.
template <class T>
std::string Encode(const T& value) {
    std::string out;
    Encoder encoder(out);
    encoder(value);
    return out;
}

// A structure wrapped for a field of type ExtensionObject.
template <class T>
ExtensionObject MakeExtension(const T& value) {
    return {NodeId(0, uint32_t{T::kEncodingId}), ExtensionObject::Encoding::Binary, Encode(value)};
}

}  // namespace cv::ua
