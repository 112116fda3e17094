#include "ua/live/PeerSession.h"

namespace cv::ua::test {
namespace {

class PeerWrite : public PeerSession {
  protected:
    Result<std::vector<StatusCode>> WriteValues(std::vector<std::pair<NodeId, Variant>> values) {
        return Await<std::vector<StatusCode>>(
            queue_, [&](auto done) { client_->WriteValues(std::move(values), std::move(done)); });
    }
};

// Each value is given in a type other than the node's; the client converts
// it to the node's data type, and the value read back is the converted one.
TEST_F(PeerWrite, ConvertsEachValueToTheNodesDataType) {
    const std::vector<std::tuple<std::string, Variant, Variant>> cases = {
        {"Boolean", int32_t{0}, false},
        {"SByte", 12.0, int8_t{12}},
        {"Byte", "7", uint8_t{7}},
        {"Int16", 1234.4, int16_t{1234}},
        {"UInt16", int32_t{65535}, uint16_t{65535}},
        {"Int32", -5.5f, int32_t{-6}},
        {"UInt32", "4000000000", uint32_t{4000000000u}},
        {"Int64", -2.0, int64_t{-2}},
        {"UInt64", uint32_t{99}, uint64_t{99}},
        {"Float", 0.75, 0.75f},
        {"Double", int16_t{-3}, -3.0},
        {"String", 2.5, "2.5"},
        {"LocalizedText", "Pumpe steht", LocalizedText{"", "Pumpe steht"}},
        {"NodeId", "ns=1;s=Plant.Area2", NodeId(1, std::string("Plant.Area2"))},
        {"DateTime", DateTime::FromUnixMilliseconds(86'400'000),
         DateTime::FromUnixMilliseconds(86'400'000)},
        {"DoubleArray", Variant::Array(BuiltinType::Int32, {1, 2}),
         Variant::Array(BuiltinType::Double, {1.0, 2.0})},
        {"StringArray", Variant::Array(BuiltinType::String, {"x", ""}),
         Variant::Array(BuiltinType::String, {"x", ""})},
    };
    std::vector<std::pair<NodeId, Variant>> values;
    for (const auto& [name, given, stored] : cases) {
        values.emplace_back(Node("Memory." + name), given);
    }
    auto results = WriteValues(values);
    ASSERT_TRUE(results) << results.Failure().text;
    for (size_t i = 0; i < cases.size(); ++i) {
        const auto& [name, given, stored] = cases[i];
        EXPECT_EQ(results.Value()[i], status::Good) << name;
        EXPECT_EQ(ReadOne(Node("Memory." + name)).value, stored) << name;
    }
}

TEST_F(PeerWrite, ReportsWhatTheServerOrTheConversionRefuses) {
    auto results = WriteValues({{Node("Static.Double"), 1.0},
                                {Node("Plant.Area1.FIC101.OUT"), 150.0},
                                {Node("Memory.SByte"), int32_t{1000}},
                                {Node("Memory.Int32"), "twelve"},
                                {Node("No.Such.Node"), 1.0},
                                {Node("Memory.Int16"), int16_t{5}}});
    ASSERT_TRUE(results) << results.Failure().text;
    EXPECT_EQ(results.Value(),
              (std::vector<StatusCode>{status::BadNotWritable, status::BadOutOfRange,
                                       status::BadOutOfRange, status::BadTypeMismatch,
                                       status::BadNodeIdUnknown, status::Good}));
}

TEST_F(PeerWrite, APlainWriteSendsTheValueUnconverted) {
    DataValue wrong;
    wrong.value = 3.0;
    auto results = Await<std::vector<StatusCode>>(queue_, [&](auto done) {
        client_->Write({{Node("Memory.Int16"), attribute::Value, "", wrong}}, std::move(done));
    });
    ASSERT_TRUE(results);
    EXPECT_EQ(results.Value()[0], status::BadTypeMismatch);
}

}  // namespace
}  // namespace cv::ua::test
