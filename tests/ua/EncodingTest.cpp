#include <gtest/gtest.h>

#include "ua/encoding/Decoder.h"
#include "ua/encoding/Encoder.h"
#include "ua/services/SubscriptionServices.h"
#include "ua/support/Printers.h"

namespace cv::ua {
namespace {

std::string Hex(std::string_view bytes) {
    std::string text;
    char digits[4];
    for (const char c : bytes) {
        std::snprintf(digits, sizeof digits, "%02X", static_cast<uint8_t>(c));
        text += digits;
    }
    return text;
}

std::string Bytes(std::initializer_list<int> values) {
    std::string bytes;
    for (const int v : values) {
        bytes += static_cast<char>(v);
    }
    return bytes;
}

TEST(Encoding, WritesTheWireFormOfEachBuiltInType) {
    const std::vector<std::pair<Variant, std::string>> cases = {
        {true, "0101"},
        {int16_t{-2}, "04FEFF"},
        {uint32_t{0x01020304}, "0704030201"},
        {1.0, "0B000000000000F03F"},
        {"Hi", "0C020000004869"},
        {"", "0C00000000"},
        {NodeId(0, 13u), "11000D"},
        {NodeId(2, 1025u), "1101020104"},
        {NodeId(300, 7u), "11022C0107000000"},
        {NodeId(1, std::string("A")), "110301000100000041"},
        {StatusCode{0x80340000}, "1300003480"},
        {QualifiedName{1, "N"},
         "14010001000000"
         "4E"},
        {LocalizedText{"", "T"},
         "150201000000"
         "54"},
        {LocalizedText{}, "1500"},
        {ExpandedNodeId{NodeId(0, 5u), "urn:x", 0}, "1280050500000075726E3A78"},
        {Variant::Array(BuiltinType::Int16, {int16_t{1}, int16_t{2}}),
         "84020000000100"
         "0200"},
        {Variant::Array(BuiltinType::Byte, {uint8_t{1}, uint8_t{2}}, {1, 2}),
         "C3020000000102020000000100000002000000"},
    };
    for (const auto& [value, hex] : cases) {
        EXPECT_EQ(Hex(Encode(value)), hex) << testing::PrintToString(value);
    }
}

TEST(Encoding, EveryBuiltInTypeReadsBackAsWritten) {
    DiagnosticInfo inner;
    inner.additionalInfo = "inner";
    DiagnosticInfo info;
    info.symbolicId = 1;
    info.localizedText = 2;
    info.locale = 3;
    info.innerStatusCode = status::BadTimeout;
    info.inner = std::make_shared<DiagnosticInfo>(inner);
    auto nested = std::make_shared<DataValue>();
    nested->value = 2.5;
    nested->status = StatusCode{0x40000000};
    nested->sourceTimestamp = DateTime{1234};
    nested->serverPicoseconds = 9;
    const std::vector<Variant> values = {
        Variant(),
        false,
        int8_t{-8},
        uint8_t{250},
        uint16_t{65000},
        int32_t{-7},
        int64_t{-1} << 40,
        uint64_t{1} << 63,
        1.5f,
        "text \xE2\x89\xA5",
        DateTime{132000000000000000},
        *Guid::FromText("72962B91-FA75-4AE6-8D28-B404DC7DAF63"),
        ByteString{"\x01\x00\x02"},
        XmlElement{"<a/>"},
        NodeId(3, *Guid::FromText("00000001-0002-0003-0405-060708090A0B")),
        NodeId(4, ByteString{"id"}),
        ExpandedNodeId{NodeId(1, 2u), "urn:ns", 3},
        LocalizedText{"de", "Text"},
        ExtensionObject{NodeId(0, 886u), ExtensionObject::Encoding::Binary, "12345678abcdefgh"},
        std::shared_ptr<const DataValue>(nested),
        std::shared_ptr<const DiagnosticInfo>(std::make_shared<DiagnosticInfo>(info)),
        Variant::Array(BuiltinType::Variant, {int32_t{1}, "two", Variant()}),
        Variant::Array(BuiltinType::String, {}),
    };
    for (const Variant& value : values) {
        auto decoded = Decode<Variant>(Encode(value));
        ASSERT_TRUE(decoded) << decoded.Failure().text;
        EXPECT_EQ(decoded.Value(), value) << testing::PrintToString(value);
    }
}

TEST(Encoding, ADataChangeMessageReadsBackWithItsNotificationsInPlace) {
    PublishResponse response;
    response.subscriptionId = 4;
    response.availableSequenceNumbers = {9};
    response.notificationMessage.sequenceNumber = 9;
    DataChangeNotification change;
    change.monitoredItems = {{1, DataValue{3.0, {}, DateTime{5}, {}, 0, 0}},
                             {2, DataValue{Variant(), StatusCode{0x80340000}, {}, {}, 0, 0}}};
    response.notificationMessage.dataChanges = {change};
    response.notificationMessage.statusChanges = {{status::BadTimeout, {}}};
    response.notificationMessage.otherNotifications = {
        ExtensionObject{NodeId(0, 916u), ExtensionObject::Encoding::Binary, "event"}};
    auto decoded = Decode<PublishResponse>(Encode(response));
    ASSERT_TRUE(decoded) << decoded.Failure().text;
    const NotificationMessage& message = decoded.Value().notificationMessage;
    ASSERT_EQ(message.dataChanges.size(), 1u);
    EXPECT_EQ(message.dataChanges[0].monitoredItems[0].value, change.monitoredItems[0].value);
    EXPECT_EQ(message.dataChanges[0].monitoredItems[1].value.status.code, 0x80340000u);
    ASSERT_EQ(message.statusChanges.size(), 1u);
    EXPECT_EQ(message.statusChanges[0].status, status::BadTimeout);
    EXPECT_EQ(message.otherNotifications, response.notificationMessage.otherNotifications);
    EXPECT_FALSE(message.IsKeepAlive());
}

struct Malformed {
    const char* name;
    std::string bytes;
    const char* why;
    StatusCode status = status::BadDecodingError;
};

// Each input is a Variant on the wire; none may crash, allocate without
// bound or decode to anything.
TEST(Encoding, RefusesMalformedInputWithTheReason) {
    const std::string deep = [] {
        std::string bytes;
        for (int i = 0; i < 40; ++i) {
            bytes += Bytes({0x98, 1, 0, 0, 0});
        }
        return bytes + Bytes({0});
    }();
    const std::vector<Malformed> cases = {
        {"empty", "", "ends early"},
        {"cut Double", Bytes({11, 0, 0, 0}), "ends early"},
        {"unknown type", Bytes({30}), "unknown type 30"},
        {"scalar Variant", Bytes({24}), "outside an array"},
        {"dimensions on a scalar", Bytes({0x46, 0, 0, 0, 0}), "array dimensions"},
        {"string longer than data", Bytes({12, 10, 0, 0, 0, 'a'}), "ends early"},
        {"negative string length", Bytes({12, 0xFE, 0xFF, 0xFF, 0xFF}), "negative length"},
        {"huge string", Bytes({12, 0xFF, 0xFF, 0xFF, 0x7F}), "exceeds the limit",
         status::BadEncodingLimitsExceeded},
        {"huge array", Bytes({0x86, 0xFF, 0xFF, 0xFF, 0x7F}), "exceeds the limit",
         status::BadEncodingLimitsExceeded},
        {"array longer than data", Bytes({0x86, 100, 0, 0, 0, 1}), "longer than the data"},
        {"negative array length", Bytes({0x86, 0xFE, 0xFF, 0xFF, 0xFF}), "negative length"},
        {"dimensions that do not match", Bytes({0xC3, 2, 0, 0, 0, 1, 2, 1, 0, 0, 0, 3, 0, 0, 0}),
         "do not match"},
        {"dimensions whose product overflows",
         Bytes({0xC3, 0, 0, 0, 0, 3, 0, 0, 0, 0, 0, 0, 0x40, 0, 0, 0, 0x40, 0, 0, 0, 0x40}),
         "do not match"},
        {"array of null values", Bytes({0x80, 1, 0, 0, 0}), "array of null values"},
        {"unknown node id encoding", Bytes({17, 9}), "unknown encoding 9"},
        {"expanded flags on a node id", Bytes({17, 0x80, 1}), "flags of an expanded"},
        {"unknown extension encoding", Bytes({22, 0, 1, 7}), "unknown encoding 7"},
        {"nesting too deep", deep, "nested deeper than 16", status::BadEncodingLimitsExceeded},
        {"trailing bytes", Bytes({1, 1, 0}), "after the end"},
    };
    for (const Malformed& input : cases) {
        auto decoded = Decode<Variant>(input.bytes);
        ASSERT_FALSE(decoded) << input.name;
        EXPECT_EQ(decoded.Failure().status, input.status) << input.name;
        EXPECT_NE(decoded.Failure().text.find(input.why), std::string::npos)
            << input.name << ": " << decoded.Failure().text;
    }
}

TEST(Encoding, AMessageMayNotTakeMoreMemoryThanAllowed) {
    DecodeLimits limits;
    limits.maxAllocation = 1000;
    std::string bytes = Bytes({0x8B, 200, 0, 0, 0});
    bytes += std::string(200 * 8, '\0');
    auto decoded = Decode<Variant>(bytes, limits);
    ASSERT_FALSE(decoded);
    EXPECT_EQ(decoded.Failure().status, status::BadEncodingLimitsExceeded);
    EXPECT_TRUE(Decode<Variant>(bytes));
}

TEST(Encoding, AnEmbeddedStructureMustFillItsBody) {
    std::string message = Encode(uint32_t{1}) + Encode(DateTime{}) + Encode(int32_t{1});
    message += Encode(NodeId(0, 820u)) + Bytes({1});
    message += Encode(int32_t{9}) + Encode(StatusCode{}) + Bytes({0}) + "xxxx";
    auto decoded = Decode<NotificationMessage>(message);
    ASSERT_FALSE(decoded);
    EXPECT_NE(decoded.Failure().text.find("shorter than its body"), std::string::npos);
}

}  // namespace
}  // namespace cv::ua
