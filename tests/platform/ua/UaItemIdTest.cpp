#include "platform/ua/UaItemId.h"

#include <gtest/gtest.h>

#include "platform/opc/OpcResult.h"
#include "platform/ua/UaBackend.h"
#include "platform/ua/UaRuntime.h"

namespace cv::uaopc {
namespace {

using namespace platform::OpcResult;

struct ItemCase {
    const char* itemId;
    int32_t error;
    ua::NodeId node;
};

TEST(UaItemId, ItemIdsAreNodeIdTextsAndMalformedOnesAreRefusedWithoutAskingTheServer) {
    const std::vector<std::string> namespaces = {"http://opcfoundation.org/UA/", "urn:peer"};
    const ItemCase cases[] = {
        {"ns=1;s=Plant.FIC101.PV", 0, ua::NodeId(1, std::string("Plant.FIC101.PV"))},
        {"ns-1;s-Plant.FIC101.PV", 0, ua::NodeId(1, std::string("Plant.FIC101.PV"))},
        {"i=2258", 0, ua::NodeId(0, 2258u)},
        {"nsu=urn:peer;s=Tank", 0, ua::NodeId(1, std::string("Tank"))},
        {"nsu=urn:elsewhere;s=Tank", OPC_E_UNKNOWNITEMID, {}},
        {"Plant.FIC101.PV", OPC_E_INVALIDITEMID, {}},
        {"ns=1;x=7", OPC_E_INVALIDITEMID, {}},
        {"", OPC_E_INVALIDITEMID, {}},
    };
    for (const ItemCase& c : cases) {
        ua::NodeId node;
        EXPECT_EQ(NodeOfItemId(c.itemId, namespaces, node), c.error) << c.itemId;
        if (c.error == 0) {
            EXPECT_EQ(node, c.node) << c.itemId;
        }
    }
}

TEST(UaItemId, EndpointUrlsAreServerIdsComputerNamesHostsAndPortsNumbers) {
    for (const char* url :
         {"opc.tcp://plant2:4840", "OPC.TCP://127.0.0.1:4841/UA/Peer", "opc.tcp://[::1]:4840/x"}) {
        EXPECT_TRUE(UaBackend::IsEndpointUrl(url)) << url;
    }
    for (const char* id : {"Sim.Server.1", "", "http://plant2:4840", "opc.tcp://:4840",
                           "\\\\PLANT2\\Sim.Server.1"}) {
        EXPECT_FALSE(UaBackend::IsEndpointUrl(id)) << id;
    }
    EXPECT_EQ(HostOfNode(""), "localhost");
    EXPECT_EQ(HostOfNode("."), "localhost");
    EXPECT_EQ(HostOfNode("\\\\PLANT2"), "PLANT2");
    EXPECT_EQ(HostOfNode("plant2.example"), "plant2.example");
    EXPECT_EQ(PortFromText("4841"), 4841);
    for (const char* text : {"0", "65536", "48a", "", " 4840"}) {
        EXPECT_FALSE(PortFromText(text)) << text;
    }
    EXPECT_FALSE(PortFromText(nullptr));
}

}  // namespace
}  // namespace cv::uaopc
