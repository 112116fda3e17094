#include <tuple>

#include "ua/encoding/Decoder.h"
#include "ua/live/PeerSession.h"
#include "ua/services/AttributeServices.h"

namespace cv::ua::test {
namespace {

using PeerRead = PeerSession;

Variant Array(BuiltinType type, Variant::Elements elements) {
    return Variant::Array(type, std::move(elements));
}

TEST_F(PeerRead, ReadsEveryBuiltInTypeAsTheServerHoldsIt) {
    const std::vector<std::pair<std::string, Variant>> expected = {
        {"Boolean", true},
        {"SByte", int8_t{-100}},
        {"Byte", uint8_t{200}},
        {"Int16", int16_t{-12345}},
        {"UInt16", uint16_t{54321}},
        {"Int32", int32_t{-123456789}},
        {"UInt32", uint32_t{3123456789u}},
        {"Int64", int64_t{-1234567890123}},
        {"UInt64", uint64_t{12345678901234567890u}},
        {"Float", 3.25f},
        {"Double", 2.718281828459045},
        {"String", "Flow \xE2\x89\xA5 10 m\xC2\xB3/h"},
        {"DateTime", DateTime::FromUnixMilliseconds(1710506096789)},
        {"LocalizedText", LocalizedText{"de-DE", "Pumpe l\xC3\xA4uft"}},
        {"NodeId", NodeId(1, std::string("Plant.Area1.FIC101"))},
        {"Guid", *Guid::FromText("72962B91-FA75-4AE6-8D28-B404DC7DAF63")},
        {"ByteString", ByteString{"\xDE\xAD\xBE\xEF"}},
        {"BooleanArray", Array(BuiltinType::Boolean, {true, false, true})},
        {"Int16Array", Array(BuiltinType::Int16, {int16_t{-1}, int16_t{0}, int16_t{32767}})},
        {"Int32Array", Array(BuiltinType::Int32, {1, -2, 2147483647})},
        {"FloatArray", Array(BuiltinType::Float, {0.5f, -1.25f, 1024.0f})},
        {"DoubleArray", Array(BuiltinType::Double, {1.5, -2.25, 1e300})},
        {"StringArray", Array(BuiltinType::String, {"alpha", "Beta", "\xCE\xB3"})},
        {"EmptyDoubleArray", Array(BuiltinType::Double, {})},
    };
    std::vector<ReadValueId> nodes;
    for (const auto& [name, value] : expected) {
        nodes.push_back(ValueOf(Node("Static." + name)));
    }
    auto values = Read(nodes);
    ASSERT_TRUE(values) << values.Failure().text;
    for (size_t i = 0; i < expected.size(); ++i) {
        EXPECT_TRUE(values.Value()[i].status.IsGood()) << expected[i].first;
        EXPECT_EQ(values.Value()[i].value, expected[i].second) << expected[i].first;
        EXPECT_NE(values.Value()[i].sourceTimestamp.ticks, 0) << expected[i].first;
    }
}

TEST_F(PeerRead, KeepsEachValuesStatusCode) {
    const std::vector<std::pair<std::string, uint32_t>> qualities = {
        {"Good_LimitHigh", 0x00000200},
        {"Uncertain_SensorNotAccurate_LimitLow", 0x40930100},
        {"Bad_SensorFailure_LimitConstant", 0x808C0300},
        {"Bad_WaitingForInitialData", 0x80320000},
    };
    for (const auto& [name, code] : qualities) {
        const DataValue value = ReadOne(Node("Quality." + name));
        EXPECT_EQ(value.status.code, code) << name;
        EXPECT_EQ(value.value, Variant(12.5)) << name;
    }
}

TEST_F(PeerRead, ReportsUnknownNodesAndAttributesPerOperation) {
    auto values = Read({ValueOf(Node("No.Such.Node")), ValueOf(Node("Static.Double"), 999),
                        ValueOf(Node("Static.Double"), attribute::DataType),
                        ValueOf(Node("Static.Double"), attribute::AccessLevel)});
    ASSERT_TRUE(values) << values.Failure().text;
    EXPECT_EQ(values.Value()[0].status, status::BadNodeIdUnknown);
    EXPECT_EQ(values.Value()[1].status.code, 0x80350000u);
    EXPECT_EQ(values.Value()[2].value, Variant(NodeId(0, 11u)));
    EXPECT_EQ(values.Value()[3].value, Variant(uint8_t{1}));
}

TEST_F(PeerRead, AServiceFaultEndsTheRequestWithItsStatus) {
    auto values = Read({});
    ASSERT_FALSE(values);
    EXPECT_EQ(values.Failure().status, status::BadNothingToDo);
    EXPECT_NE(values.Failure().text.find("Bad_NothingToDo"), std::string::npos);
}

TEST_F(PeerRead, ADeviceReadWaitsForTheDeviceAndACachedReadDoesNot) {
    const DataValue device = ReadOne(Node("Slow.Device"));
    ASSERT_TRUE(device.status.IsGood()) << device.status.code;
    const double* reads = device.value.Get<double>();
    ASSERT_TRUE(reads);
    EXPECT_GE(*reads, 1.0);
    auto cached = Read({ValueOf(Node("Slow.Device"))}, 60'000);
    ASSERT_TRUE(cached);
    EXPECT_EQ(cached.Value()[0].value, device.value);
}

TEST_F(PeerRead, DecodesTheRangeAndUnitsOfAnAnalogItem) {
    auto values = Read({ValueOf(Node("Plant.Area1.TIC102.PV-EURange")),
                        ValueOf(Node("Plant.Area1.TIC102.PV-InstrumentRange")),
                        ValueOf(Node("Plant.Area1.TIC102.PV-EngineeringUnits"))});
    ASSERT_TRUE(values);
    const auto range = [&](size_t i) {
        auto decoded = DecodeExtension<Range>(*values.Value()[i].value.Get<ExtensionObject>());
        return decoded ? std::make_tuple(decoded.Value().low, decoded.Value().high)
                       : std::make_tuple(-1.0, -1.0);
    };
    EXPECT_EQ(range(0), std::make_tuple(0.0, 150.0));
    EXPECT_EQ(range(1), std::make_tuple(-50.0, 250.0));
    auto units = DecodeExtension<EUInformation>(*values.Value()[2].value.Get<ExtensionObject>());
    ASSERT_TRUE(units) << units.Failure().text;
    EXPECT_EQ(units.Value().unitId, 4408652);
}

}  // namespace
}  // namespace cv::ua::test
