#include "platform/ua/UaValueMap.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <limits>
#include <string>

#include "platform/OleDate.h"
#include "platform/ua/UaTime.h"

namespace cv::uaopc {
namespace {

using ua::BuiltinType;

// 2024-01-02 06:00:00 UTC and 2024-07-01 12:00:00.250 UTC.
const ua::DateTime kWinter = ua::DateTime::FromUnixMilliseconds(1'704'175'200'000);
const ua::DateTime kSummer = ua::DateTime::FromUnixMilliseconds(1'719'835'200'250);

double Local(int32_t year, int32_t month, int32_t day, int32_t hour, int32_t ms = 0) {
    return *OleDateFromParts({year, month, day, hour, 0, 0, ms});
}

// Dates are local time: these tests run in Central European time.
class UaValueMap : public ::testing::Test {
  protected:
    void SetUp() override {
        const char* zone = std::getenv("TZ");
        saved_ = zone ? std::optional<std::string>(zone) : std::nullopt;
        setenv("TZ", "CET-1CEST,M3.5.0,M10.5.0/3", 1);
        tzset();
    }
    void TearDown() override {
        if (saved_) {
            setenv("TZ", saved_->c_str(), 1);
        } else {
            unsetenv("TZ");
        }
        tzset();
    }

  private:
    std::optional<std::string> saved_;
};

ua::Variant Array(BuiltinType type, ua::Variant::Elements elements,
                  std::vector<int32_t> dimensions = {}) {
    return ua::Variant::Array(type, std::move(elements), std::move(dimensions));
}

TEST_F(UaValueMap, EachBuiltInTypeBecomesTheNearestAutomationType) {
    const std::vector<std::pair<ua::Variant, Variant>> cases = {
        {ua::Variant(), Variant()},
        {ua::Variant(true), Variant::Bool(true)},
        {ua::Variant(int8_t{-100}), Variant::I2(-100)},
        {ua::Variant(uint8_t{200}), Variant::I2(200)},
        {ua::Variant(int16_t{-12345}), Variant::I2(-12345)},
        {ua::Variant(uint16_t{54321}), Variant::I4(54321)},
        {ua::Variant(int32_t{-123456789}), Variant::I4(-123456789)},
        {ua::Variant(uint32_t{3123456789u}), Variant::R8(3123456789.0)},
        {ua::Variant(int64_t{-1234567890123}), Variant::R8(-1234567890123.0)},
        {ua::Variant(uint64_t{12345678901234567890u}), Variant::R8(12345678901234567890.0)},
        {ua::Variant(3.25f), Variant::R4(3.25f)},
        {ua::Variant(2.5), Variant::R8(2.5)},
        {ua::Variant("Flow ≥ 10 m³/h"), Variant::Str("Flow ≥ 10 m³/h")},
        {ua::Variant(kWinter), Variant::Date(Local(2024, 1, 2, 7))},
        {ua::Variant(kSummer), Variant::Date(Local(2024, 7, 1, 14, 250))},
        {ua::Variant(*ua::Guid::FromText("72962B91-FA75-4AE6-8D28-B404DC7DAF63")),
         Variant::Str("72962B91-FA75-4AE6-8D28-B404DC7DAF63")},
        {ua::Variant(ua::ByteString{"\xDE\xAD"}), Variant::Bytes({0xDE, 0xAD})},
        {ua::Variant(ua::XmlElement{"<a/>"}), Variant::Str("<a/>")},
        {ua::Variant(ua::NodeId(1, std::string("Plant.FIC101"))),
         Variant::Str("ns=1;s=Plant.FIC101")},
        {ua::Variant(ua::ExpandedNodeId{ua::NodeId(0, 2258u), "", 0}), Variant::Str("i=2258")},
        {ua::Variant(ua::StatusCode{0x80340000}), Variant::R8(2150891520.0)},
        {ua::Variant(ua::QualifiedName{1, "Pump"}), Variant::Str("1:Pump")},
        {ua::Variant(ua::QualifiedName{0, "EURange"}), Variant::Str("EURange")},
        {ua::Variant(ua::LocalizedText{"de-DE", "Pumpe läuft"}), Variant::Str("Pumpe läuft")},
        {ua::Variant(ua::ExtensionObject{}), Variant()},
    };
    for (const auto& [value, expected] : cases) {
        EXPECT_EQ(ToAutomation(value), expected) << "type " << static_cast<int>(value.Type());
    }
}

TEST_F(UaValueMap, ArraysKeepTheirElementsFlattenedWithVariantsForMixedOrNestedOnes) {
    const std::vector<std::pair<ua::Variant, Variant>> cases = {
        {Array(BuiltinType::Int16, {int16_t{-1}, int16_t{32767}}),
         Variant::Array(VT_I2, {Variant::I2(-1), Variant::I2(32767)})},
        {Array(BuiltinType::Byte, {uint8_t{7}}), Variant::Array(VT_I2, {Variant::I2(7)})},
        {Array(BuiltinType::Double, {}), Variant::Array(VT_R8, {})},
        {Array(BuiltinType::Int32, {1, 2, 3, 4}, {2, 2}),
         Variant::Array(VT_I4, {Variant::I4(1), Variant::I4(2), Variant::I4(3), Variant::I4(4)})},
        {Array(BuiltinType::Variant, {int16_t{5}, "five"}),
         Variant::Array(VT_VARIANT, {Variant::I2(5), Variant::Str("five")})},
        {Array(BuiltinType::ByteString, {ua::ByteString{"\x01"}}),
         Variant::Array(VT_VARIANT, {Variant::Bytes({1})})},
        {Array(BuiltinType::ExtensionObject, {ua::ExtensionObject{}}),
         Variant::Array(VT_VARIANT, {Variant()})},
    };
    for (const auto& [value, expected] : cases) {
        EXPECT_EQ(ToAutomation(value), expected) << "type " << static_cast<int>(value.Type());
    }
}

TEST_F(UaValueMap, WrittenValuesTakeTheirOwnUaTypes) {
    const std::vector<std::pair<Variant, ua::Variant>> cases = {
        {Variant(), ua::Variant()},
        {Variant::Null(), ua::Variant()},
        {Variant::I2(-7), ua::Variant(int16_t{-7})},
        {Variant::I4(70000), ua::Variant(int32_t{70000})},
        {Variant::R4(1.5f), ua::Variant(1.5f)},
        {Variant::R8(-2.25), ua::Variant(-2.25)},
        {Variant::Bool(true), ua::Variant(true)},
        {Variant::Str("AUTO"), ua::Variant("AUTO")},
        {Variant::Date(Local(2024, 7, 1, 14, 250)), ua::Variant(kSummer)},
        {Variant::Date(kOleDateMax + 5), ua::Variant(ua::DateTime{})},
        {Variant::Array(VT_I2, {Variant::I2(1)}), Array(BuiltinType::Int16, {int16_t{1}})},
        {Variant::Array(VT_VARIANT, {Variant::I2(1), Variant::Str("x")}),
         Array(BuiltinType::Variant, {int16_t{1}, "x"})},
        {Variant::Bytes({0xDE, 0, 0xAD}),
         ua::Variant(ua::ByteString{std::string("\xDE\0\xAD", 3)})},
        {Variant::Array(VT_VARIANT, {Variant::Bytes({})}),
         Array(BuiltinType::Variant, {ua::ByteString{}})},
    };
    for (const auto& [value, expected] : cases) {
        EXPECT_EQ(FromAutomation(value), expected) << "automation type " << value.VarType();
    }
}

// A ByteString is one buffer up to the limit and a text saying how long it
// is beyond; the buffer goes back as the same ByteString.
TEST_F(UaValueMap, AByteStringIsOneBufferUpToItsLimit) {
    std::string bytes(kMaxAutomationBytes, '\0');
    for (size_t i = 0; i < bytes.size(); ++i) {
        bytes[i] = static_cast<char>(i % 251);
    }
    const ua::Variant largest{ua::ByteString{bytes}};
    const Variant mapped = ToAutomation(largest);
    EXPECT_EQ(mapped.VarType(), VT_ARRAY | VT_UI1);
    EXPECT_EQ(mapped.AsBytes(), std::vector<uint8_t>(bytes.begin(), bytes.end()));
    EXPECT_EQ(FromAutomation(mapped), largest);
    const ua::Variant tooLong{ua::ByteString{bytes + "x"}};
    EXPECT_EQ(
        ToAutomation(tooLong),
        Variant::Str("ByteString of 65537 bytes, too long to show (the limit is 65536 bytes)"));
    EXPECT_EQ(ToAutomation(Array(BuiltinType::ByteString, {tooLong})).Element(0),
              ToAutomation(tooLong));
}

TEST_F(UaValueMap, TimesGoToLocalDatesAndBackToTheMillisecond) {
    for (const ua::DateTime time :
         {kWinter, kSummer, ua::DateTime::FromUnixMilliseconds(-86'400'001)}) {
        EXPECT_EQ(UaDateTimeOf(OleDateOf(time)), time) << time.ticks;
    }
    EXPECT_FALSE(UaDateTimeOf(kOleDateMin - 2));
    for (const int64_t ticks :
         {std::numeric_limits<int64_t>::min(), std::numeric_limits<int64_t>::max()}) {
        EXPECT_EQ(OleDateOf({ticks}), 0.0) << ticks;
    }
}

// The time stamp is the server's, else the source's; the source's goes
// beside it with the status behind the quality.
TEST_F(UaValueMap, ATimeStampIsTheServersElseTheSourcesWhichTheDetailCarries) {
    ua::DataValue value;
    value.sourceTimestamp = kWinter;
    value.status = ua::StatusCode{0x40930000 | 0x0400};
    EXPECT_EQ(TimeStampOf(value), Local(2024, 1, 2, 7));
    EXPECT_EQ(DetailOf(value), (platform::ValueDetail{Local(2024, 1, 2, 7), 0x40930000}));
    value.serverTimestamp = kSummer;
    value.sourceTimestamp = {};
    value.status = {};
    EXPECT_EQ(TimeStampOf(value), Local(2024, 7, 1, 14, 250));
    EXPECT_EQ(DetailOf(value), platform::ValueDetail{});
}

}  // namespace
}  // namespace cv::uaopc
