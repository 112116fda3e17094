#include <gtest/gtest.h>

#include "ua/encoding/Decoder.h"
#include "ua/encoding/Encoder.h"
#include "ua/services/AttributeServices.h"

namespace cv::ua {
namespace {

std::string Repeat(std::string_view piece, uint32_t count) {
    std::string out;
    out.reserve(piece.size() * count);
    for (uint32_t i = 0; i < count; ++i) {
        out += piece;
    }
    return out;
}

// A Variant array of count elements of this type, each encoded as element.
std::string VariantArray(BuiltinType type, uint32_t count, std::string_view element) {
    return std::string(1, static_cast<char>(0x80 | static_cast<uint8_t>(type))) +
           Encode(static_cast<int32_t>(count)) + Repeat(element, count);
}

// The body of a ReadResponse whose one result holds this encoded Variant.
std::string ReadResponseHolding(const std::string& variant) {
    return Encode(ResponseHeader{}) + Encode(int32_t{1}) + std::string(1, '\x01') + variant +
           Encode(int32_t{-1});
}

struct Charged {
    const char* name;
    Variant value;
    // The bytes of memory the decoded value takes at least.
    uint64_t minimum;
};

// Every block of memory a decoded value takes is charged, and a limit one
// byte below the charge refuses the value.
TEST(DecodeMemory, EveryBlockOfADecodedValueIsCharged) {
    const std::string k1000(1000, 'x');
    auto inner = std::make_shared<DiagnosticInfo>();
    inner->additionalInfo = k1000;
    auto info = std::make_shared<DiagnosticInfo>();
    info->inner = inner;
    auto nested = std::make_shared<DataValue>();
    nested->value = Variant(std::shared_ptr<const DataValue>(std::make_shared<DataValue>()));
    const std::vector<Charged> cases = {
        {"String", Variant(k1000), 1000},
        {"ByteString", Variant(ByteString{k1000}), 1000},
        {"XmlElement", Variant(XmlElement{k1000}), 1000},
        {"string node id", Variant(NodeId(1, k1000)), 1000},
        {"namespace URI", Variant(ExpandedNodeId{NodeId(1, 1u), k1000, 0}), 1000},
        {"LocalizedText", Variant(LocalizedText{k1000, k1000}), 2000},
        {"extension body",
         Variant(ExtensionObject{NodeId(1, 1u), ExtensionObject::Encoding::Binary, k1000}), 1000},
        {"DataValues in DataValues", Variant(std::shared_ptr<const DataValue>(nested)),
         2 * sizeof(DataValue)},
        {"inner diagnostics", Variant(std::shared_ptr<const DiagnosticInfo>(info)),
         2 * sizeof(DiagnosticInfo) + 1000},
        {"matrix", Variant::Array(BuiltinType::Int32, Variant::Elements(100, int32_t{1}), {10, 10}),
         100 * sizeof(Variant) + 2 * sizeof(int32_t)},
    };
    for (const Charged& input : cases) {
        SCOPED_TRACE(input.name);
        const std::string bytes = Encode(input.value);
        Decoder decoder(bytes);
        Variant decoded;
        decoder(decoded);
        ASSERT_TRUE(decoder.Ok()) << decoder.Failure().text;
        EXPECT_EQ(decoded, input.value);
        EXPECT_GE(decoder.Allocated(), input.minimum);
        DecodeLimits limits;
        limits.maxAllocation = decoder.Allocated() - 1;
        auto refused = Decode<Variant>(bytes, limits);
        ASSERT_FALSE(refused);
        EXPECT_EQ(refused.Failure().status, status::BadEncodingLimitsExceeded);
        limits.maxAllocation = decoder.Allocated();
        EXPECT_TRUE(Decode<Variant>(bytes, limits));
    }
}

struct Hostile {
    const char* name;
    std::string variant;
    // Array elements in the message: the limit leaves room for their storage
    // but not for what they hold.
    uint32_t elements;
};

TEST(DecodeMemory, AHostileReadResponseStopsAtTheLimitBeforeAllocatingBeyondIt) {
    // Thirteen bytes make a data value in a data value, six deep.
    const std::string deepValue = Repeat("\x01\x17", 6) + std::string(1, '\0');
    const std::string diagnostics =
        VariantArray(BuiltinType::DiagnosticInfo, 5000, std::string(1, '\0'));
    const std::vector<Hostile> cases = {
        {"nested data values", VariantArray(BuiltinType::DataValue, 20'000, deepValue), 20'000},
        {"fourteen arrays of diagnostics", VariantArray(BuiltinType::Variant, 14, diagnostics),
         14 * 5000 + 14},
        {"byte strings",
         VariantArray(BuiltinType::ByteString, 10'000, Encode(ByteString{std::string(100, 'b')})),
         10'000},
    };
    for (const Hostile& input : cases) {
        SCOPED_TRACE(input.name);
        DecodeLimits limits;
        limits.maxAllocation = uint64_t{input.elements} * sizeof(Variant) * 3 / 2;
        const std::string body = ReadResponseHolding(input.variant);
        Decoder decoder(body, limits);
        ReadResponse response;
        decoder(response);
        ASSERT_FALSE(decoder.Ok());
        EXPECT_EQ(decoder.Failure().status, status::BadEncodingLimitsExceeded);
        EXPECT_NE(decoder.Failure().text.find("needs more memory than the"), std::string::npos)
            << decoder.Failure().text;
        EXPECT_LE(decoder.Allocated(), limits.maxAllocation);
    }
}

}  // namespace
}  // namespace cv::ua
