#include <gtest/gtest.h>

#include <limits>

#include "ua/support/Printers.h"
#include "ua/types/VariantConversion.h"

namespace cv::ua {
namespace {

TEST(VariantConversion, ConvertsToTheTargetTypeWhenTheValueFits) {
    const std::vector<std::tuple<Variant, BuiltinType, Variant>> cases = {
        {2.5, BuiltinType::Int16, int16_t{3}},
        {-2.5, BuiltinType::Int32, int32_t{-3}},
        {int32_t{-1}, BuiltinType::Boolean, true},
        {true, BuiltinType::Double, 1.0},
        {uint64_t{1} << 63, BuiltinType::Double, 9223372036854775808.0},
        {int64_t{-9}, BuiltinType::SByte, int8_t{-9}},
        {"255", BuiltinType::Byte, uint8_t{255}},
        {"-1.5e2", BuiltinType::Float, -150.0f},
        {"18446744073709551615", BuiltinType::UInt64, uint64_t{18446744073709551615u}},
        {"FALSE", BuiltinType::Boolean, false},
        {0.1, BuiltinType::String, "0.1"},
        {false, BuiltinType::String, "false"},
        {"Text", BuiltinType::LocalizedText, LocalizedText{"", "Text"}},
        {LocalizedText{"en", "Text"}, BuiltinType::String, "Text"},
        {"Name", BuiltinType::QualifiedName, QualifiedName{0, "Name"}},
        {"ns=2;i=7", BuiltinType::NodeId, NodeId(2, 7u)},
        {NodeId(2, 7u), BuiltinType::String, "ns=2;i=7"},
        {uint32_t{0x80000000}, BuiltinType::StatusCode, StatusCode{0x80000000}},
        {Variant(), BuiltinType::Double, Variant()},
        {Variant::Array(BuiltinType::Double, {1.0, 2.6}), BuiltinType::Int16,
         Variant::Array(BuiltinType::Int16, {int16_t{1}, int16_t{3}})},
    };
    for (const auto& [value, target, expected] : cases) {
        auto converted = ConvertVariant(value, target);
        ASSERT_TRUE(converted) << testing::PrintToString(value) << ": " << converted.Failure().text;
        EXPECT_EQ(converted.Value(), expected) << testing::PrintToString(value);
    }
}

TEST(VariantConversion, RefusesValuesThatDoNotFitOrDoNotConvert) {
    const std::vector<std::tuple<Variant, BuiltinType, StatusCode>> cases = {
        {int32_t{128}, BuiltinType::SByte, status::BadOutOfRange},
        {-1.0, BuiltinType::UInt32, status::BadOutOfRange},
        {std::numeric_limits<double>::quiet_NaN(), BuiltinType::Int32, status::BadOutOfRange},
        {1e39, BuiltinType::Float, status::BadOutOfRange},
        {"256", BuiltinType::Byte, status::BadOutOfRange},
        {"12 apples", BuiltinType::Int32, status::BadTypeMismatch},
        {"ns=1", BuiltinType::NodeId, status::BadTypeMismatch},
        {"nsu=urn:x;i=1", BuiltinType::NodeId, status::BadTypeMismatch},
        {1.0, BuiltinType::DateTime, status::BadTypeMismatch},
        {Variant::Array(BuiltinType::Int32, {1, 300}), BuiltinType::Byte, status::BadOutOfRange},
    };
    for (const auto& [value, target, code] : cases) {
        auto converted = ConvertVariant(value, target);
        ASSERT_FALSE(converted) << testing::PrintToString(value);
        EXPECT_EQ(converted.Failure().status, code) << testing::PrintToString(value);
    }
}

TEST(VariantConversion, MapsDataTypesToTheirBuiltInTypes) {
    const std::vector<std::pair<NodeId, std::optional<BuiltinType>>> cases = {
        {NodeId(0, 11u), BuiltinType::Double},  {NodeId(0, 21u), BuiltinType::LocalizedText},
        {NodeId(0, 29u), BuiltinType::Int32},   {NodeId(0, 852u), BuiltinType::Int32},
        {NodeId(0, 290u), BuiltinType::Double}, {NodeId(0, 294u), BuiltinType::DateTime},
        {NodeId(0, 295u), BuiltinType::String}, {NodeId(0, 24u), std::nullopt},
        {NodeId(0, 26u), std::nullopt},         {NodeId(1, 11u), std::nullopt},
        {NodeId(0, 22u), std::nullopt},
    };
    for (const auto& [dataType, builtin] : cases) {
        EXPECT_EQ(BuiltinTypeOf(dataType), builtin) << dataType.Numeric();
    }
}

}  // namespace
}  // namespace cv::ua
