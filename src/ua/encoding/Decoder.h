#pragma once

#include <cstdint>
#include <cstring>
#include <memory>
#include <string>
#include <string_view>
#include <type_traits>
#include <vector>

#include "ua/encoding/DecodeLimits.h"
#include "ua/encoding/Structure.h"
#include "ua/types/DataValue.h"
#include "ua/types/Result.h"

namespace cv::ua {

// Reads values from a binary encoding. Every read is bounds-checked; the
// first fault (end of data, a length over its limit, an unknown type, too
// deep a nesting) stops decoding: later reads give default values and do
// nothing, and Failure() says what went wrong and where.
class Decoder {
  public:
    explicit Decoder(std::string_view data, const DecodeLimits& limits = {})
        : begin_(data.data()),
          pos_(data.data()),
          end_(data.data() + data.size()),
          limits_(limits) {}

    bool Ok() const { return failure_.empty(); }
    // Bad_DecodingError with the reason, or Bad_EncodingLimitsExceeded.
    Error Failure() const;
    size_t Position() const { return static_cast<size_t>(pos_ - begin_); }
    size_t Remaining() const { return static_cast<size_t>(end_ - pos_); }
    // The memory the values decoded so far take, as charged against the
    // limit; a charge that did not fit is not in it.
    uint64_t Allocated() const { return allocated_; }
    // Records a fault found by a caller (the first one counts).
    void Fail(std::string_view sWhat, bool bLimit = false);

    void operator()(bool& v) { v = Byte() != 0; }
    void operator()(int8_t& v) { v = static_cast<int8_t>(Byte()); }
    void operator()(uint8_t& v) { v = Byte(); }
    void operator()(int16_t& v) { Raw(v); }
    void operator()(uint16_t& v) { Raw(v); }
    void operator()(int32_t& v) { Raw(v); }
    void operator()(uint32_t& v) { Raw(v); }
    void operator()(int64_t& v) { Raw(v); }
    void operator()(uint64_t& v) { Raw(v); }
    void operator()(float& v) { Raw(v); }
    void operator()(double& v) { Raw(v); }
    void operator()(DateTime& v) { Raw(v.ticks); }
    void operator()(StatusCode& v) { Raw(v.code); }
    void operator()(std::string& v);
    void operator()(ByteString& v) { (*this)(v.bytes); }
    void operator()(XmlElement& v) { (*this)(v.text); }
    void operator()(Guid& v);
    void operator()(NodeId& v);
    void operator()(ExpandedNodeId& v);
    void operator()(QualifiedName& v);
    void operator()(LocalizedText& v);
    void operator()(ExtensionObject& v);
    void operator()(DiagnosticInfo& v);
    void operator()(Variant& v);
    void operator()(DataValue& v);

    template <class E>
    requires std::is_enum_v<E>
    void operator()(E& v) {
        int32_t raw = 0;
        Raw(raw);
        v = static_cast<E>(raw);
    }

    template <class T>
    requires StructureFor<T, Decoder>
    void operator()(T& v) { T::Visit(v, *this); }

    template <class T>
    void operator()(std::vector<T>& v) {
        const uint32_t count = ArrayLength(sizeof(T));
        v.clear();
        v.reserve(count);
        for (uint32_t i = 0; i < count && Ok(); ++i) {
            (*this)(v.emplace_back());
        }
    }

    // A structure inside a length-prefixed body (an extension object's);
    // it must fill the body exactly.
    template <class T>
    void Embedded(T& v) {
        int32_t length = 0;
        Raw(length);
        if (length < 0 || static_cast<size_t>(length) > Remaining()) {
            Fail("an embedded structure has a length that does not fit the data");
            return;
        }
        const char* outerEnd = end_;
        end_ = pos_ + length;
        (*this)(v);
        if (Ok() && pos_ != end_) {
            Fail("an embedded structure is shorter than its body");
        }
        end_ = outerEnd;
        if (!Ok()) {
            pos_ = end_;
        }
    }

    uint8_t Byte() {
        if (pos_ == end_) {
            Fail("the data ends early");
            return 0;
        }
        return static_cast<uint8_t>(*pos_++);
    }
    // The next size bytes, or an empty view after a fault.
    std::string_view Bytes(size_t size);
    // An array's element count, checked against the limits, its storage
    // charged; 0 for null.
    uint32_t ArrayLength(size_t elementSize);

  private:
    template <class T>
    void Raw(T& v) {
        if (static_cast<size_t>(end_ - pos_) < sizeof v) {
            Fail("the data ends early");
            pos_ = end_;
            v = T{};
            return;
        }
        std::memcpy(&v, pos_, sizeof v);
        pos_ += sizeof v;
    }
    // Charges a block of memory about to be allocated; false (and a fault)
    // when the message would take more than allowed.
    bool Charge(uint64_t bytes);
    void NodeIdBody(uint8_t encoding, NodeId& v);
    void VariantScalar(BuiltinType type, Variant& v);
    // A value of its own block (a data value or diagnostics in a variant,
    // inner diagnostics), charged before it is made; null after a fault.
    template <class T>
    std::shared_ptr<T> MakeNested();
    bool Enter();
    void Leave() { --depth_; }

    const char* begin_;
    const char* pos_;
    const char* end_;
    DecodeLimits limits_;
    uint32_t depth_ = 0;
    uint64_t allocated_ = 0;
    bool limitExceeded_ = false;
    std::string failure_;
};

// Decodes one whole value; trailing bytes are a fault.
template <class T>
Result<T> Decode(std::string_view data, const DecodeLimits& limits = {}) {
    Decoder decoder(data, limits);
    T value{};
    decoder(value);
    if (decoder.Ok() && decoder.Remaining() != 0) {
        decoder.Fail("there are bytes after the end of the value");
    }
    if (!decoder.Ok()) {
        return decoder.Failure();
    }
    return value;
}

// The structure T carried in an extension object of T's encoding id.
template <class T>
Result<T> DecodeExtension(const ExtensionObject& object, const DecodeLimits& limits = {}) {
    if (object.encoding != ExtensionObject::Encoding::Binary ||
        object.typeId != NodeId(0, uint32_t{T::kEncodingId})) {
        return Error{status::BadDecodingError,
                     "The extension object does not hold the expected structure."};
    }
    return Decode<T>(object.body, limits);
}

}  // namespace cv::ua
