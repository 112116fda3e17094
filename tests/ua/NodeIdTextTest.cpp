#include <gtest/gtest.h>

#include "ua/transport/EndpointUrl.h"
#include "ua/types/Base64.h"
#include "ua/types/NodeIdText.h"
#include "ua/types/StatusCodeTable.h"

namespace cv::ua {
namespace {

TEST(NodeIdText, ParsesAndFormatsEveryForm) {
    const Guid guid = *Guid::FromText("72962B91-FA75-4AE6-8D28-B404DC7DAF63");
    const std::vector<std::tuple<std::string, ExpandedNodeId, std::string>> cases = {
        {"i=2258", {NodeId(0, 2258u), "", 0}, "i=2258"},
        {"ns=0;i=85", {NodeId(0, 85u), "", 0}, "i=85"},
        {"ns=1;s=Plant.FIC101.PV",
         {NodeId(1, std::string("Plant.FIC101.PV")), "", 0},
         "ns=1;s=Plant.FIC101.PV"},
        {"ns=1;s=a;b=c", {NodeId(1, std::string("a;b=c")), "", 0}, "ns=1;s=a;b=c"},
        {"ns=2;g=72962b91-fa75-4ae6-8d28-b404dc7daf63",
         {NodeId(2, guid), "", 0},
         "ns=2;g=72962B91-FA75-4AE6-8D28-B404DC7DAF63"},
        {"ns=3;b=AQID", {NodeId(3, ByteString{"\x01\x02\x03"}), "", 0}, "ns=3;b=AQID"},
        {"nsu=http://x.org/;s=Tank",
         {NodeId(0, std::string("Tank")), "http://x.org/", 0},
         "nsu=http://x.org/;s=Tank"},
        {"ns-1;s-Tank", {NodeId(1, std::string("Tank")), "", 0}, "ns=1;s=Tank"},
        {"ns=65535;i=4294967295", {NodeId(65535, 4294967295u), "", 0}, "ns=65535;i=4294967295"},
    };
    for (const auto& [text, node, formatted] : cases) {
        const auto parsed = ParseNodeId(text);
        ASSERT_TRUE(parsed) << text;
        EXPECT_EQ(*parsed, node) << text;
        EXPECT_EQ(FormatNodeId(*parsed), formatted) << text;
    }
}

TEST(NodeIdText, RefusesMalformedText) {
    for (const char* text : {"", "2258", "i=", "i=-1", "i=4294967296", "i=12x", "ns=1", "ns=1;",
                             "ns=65536;i=1", "ns=x;i=1", "s=", "x=1", "ns=1;g=1234", "ns=1;b=A",
                             "ns=1;b=AQ=D", "nsu=;s=a", "nsu=urn", " i=1"}) {
        EXPECT_FALSE(ParseNodeId(text)) << text;
    }
}

TEST(NodeIdText, Base64RoundTripsAndRefusesBrokenText) {
    for (const std::string& bytes :
         std::vector<std::string>{"", "a", "ab", "abc", "abcd", std::string("\0\xFF\x10", 3)}) {
        EXPECT_EQ(Base64Decode(Base64Encode(bytes)), bytes);
    }
    EXPECT_EQ(Base64Encode("ab"), "YWI=");
    for (const char* text : {"YWI", "Y=I=", "YW!=", "====", "=WIx"}) {
        EXPECT_FALSE(Base64Decode(text)) << text;
    }
}

TEST(NodeIdText, EndpointUrlsGiveHostPortAndPath) {
    const std::vector<std::tuple<std::string, std::string, uint16_t, std::string>> cases = {
        {"opc.tcp://host:4841/UA/Server", "host", 4841, "/UA/Server"},
        {"OPC.TCP://Host", "Host", 4840, ""},
        {"opc.tcp://[::1]:4850/x", "::1", 4850, "/x"},
        {"opc.tcp://[fe80::1]", "fe80::1", 4840, ""},
    };
    for (const auto& [text, host, port, path] : cases) {
        auto url = EndpointUrl::Parse(text);
        ASSERT_TRUE(url) << text;
        EXPECT_EQ(url.Value().host, host);
        EXPECT_EQ(url.Value().port, port);
        EXPECT_EQ(url.Value().path, path);
    }
    for (const char* text :
         {"opc.tcp://host:", "opc.tcp://host:0", "opc.tcp://[::1", "tcp://h", "opc.tcp://[::1]x"}) {
        EXPECT_FALSE(EndpointUrl::Parse(text)) << text;
    }
}

TEST(NodeIdText, StatusCodesHaveNameAndText) {
    EXPECT_EQ(DescribeStatusCode(status::BadNodeIdUnknown),
              "Bad_NodeIdUnknown: The node id refers to a node that does not exist.");
    EXPECT_EQ(StatusCodeName(StatusCode{0x80340000 | 0x300}), "Bad_NodeIdUnknown");
    EXPECT_EQ(StatusCodeName(StatusCode{0x40000000}), "Uncertain");
    EXPECT_EQ(DescribeStatusCode(StatusCode{0x81230000}),
              "Bad (0x81230000): The code is not known to this program.");
    EXPECT_EQ(StatusCodeName(StatusCode{0x00420000}), "Good");
}

}  // namespace
}  // namespace cv::ua
