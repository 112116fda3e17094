#include <gtest/gtest.h>

#include "channel/Channel.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

constexpr int32_t Hr(uint32_t lCode) {
    return static_cast<int32_t>(lCode);
}

struct Diagnosis : testing::Test {
    Diagnosis() {
        channel.SetDescription("Loop Setpoint");
        channel.SetItemName("FIC101.SP");
        channel.SetOpcAccessPath("Area1");
        channel.SetOpcNodeAndServer("\\\\PLANT2\\X.Y");
    }
    std::string Of(int32_t lNumber, const std::string& sDescription = "") {
        return channel.GetErrorString("", buttons, question, ErrorInfo{lNumber, sDescription});
    }
    test::TestPlatform tp;
    Channel channel{tp.platform};
    int32_t buttons = 16;
    std::string question;
};

TEST_F(Diagnosis, ObjectCreationNamesServerAndNode) {
    EXPECT_EQ(Of(429),
              "OPC connection failed.\r\n\r\n1. Check your Server and Node.\r\n"
              "    Currently you have \"X.Y\" in computer \"\\\\PLANT2\".\r\n"
              "    Network Servers may be locked out by your DCOM settings.\r\n"
              "2. Click the Browse button to see if \"X.Y\" is registered.");
    channel.SetOpcComputer("");
    channel.SetComType(ComTypeCode::OpcHda);
    EXPECT_EQ(Of(429),
              "OPC HDA connection failed.\r\n\r\n1. Check your Server and Node.\r\n"
              "    Currently you have \"X.Y\" in this computer.\r\n"
              "2. Click the Browse button to see if \"X.Y\" is registered.");
}

TEST_F(Diagnosis, DdeFailures) {
    channel.SetDdeAppTopic("Excel|Sheet1");
    EXPECT_EQ(Of(282),
              "DDE Initiate Failed.\r\n\r\n1. Check your application and topic names.  Currently "
              "you have \"Excel|Sheet1\".\r\n2. Make sure that \"Excel\" is running.");
    EXPECT_EQ(Of(285),
              "DDE Link Error.\r\n\r\nYour DDE Server has not recognised the Loop Setpoint item "
              "name \"FIC101.SP\".");
    EXPECT_EQ(Of(297),
              "DDE Link Error.\r\n\r\nYour DDE Server has not recognised the topic name.  "
              "Currently you have \"Sheet1\".");
    EXPECT_EQ(buttons, 16);
    EXPECT_EQ(Of(286), "Time out while waiting for DDE response.");
    EXPECT_EQ(buttons, 4);
    EXPECT_EQ(question, "Do you want to increase the timeout time by 5 seconds?");
}

TEST_F(Diagnosis, OpcFailuresAndOverrides) {
    EXPECT_EQ(Of(13), "\"0\" has been sent from the Server.  This is not a number.");
    EXPECT_EQ(Of(Hr(0xC0040006)), "The OPC Server has not accepted the new value.");
    EXPECT_EQ(Of(-1073479673),
              "Either the Access Path or the Item Name are unknown to the OPC Server.  Currently "
              "you have \"Area1\" and \"FIC101.SP\".");
    EXPECT_EQ(Of(Hr(0xC0040008)),
              "The Item name doesn't conform to the OPC Server's syntax.  Currently you have "
              "\"FIC101.SP\".");
    EXPECT_EQ(Of(Hr(0xC004000A)),
              "The Item's access path is not known to the OPC Server.  Currently you have an "
              "access path of \"Area1\", and an Item name of \"FIC101.SP\".");
    EXPECT_EQ(Of(Hr(0xC00400FF)),
              "The OPC Automation interface has not been installed on this computer.\r\n"
              "Corvalent OPC Test Client uses the OPC Automation Interface, not the OPC Custom "
              "interface.  Contact your OPC Server supplier.");
    EXPECT_EQ(Of(Hr(0xC00400FE)),
              "Problem with your OPC Server: \"X.Y\".\r\nCorvalent OPC Test Client cannot "
              "subscribe to data change notifications from the OPC Server.");
    EXPECT_EQ(Of(Hr(0x80004005)),
              "Server ID \"X.Y\" is not registered as an OPC Server in computer \"PLANT2\".");
    channel.SetOpcComputer("");
    EXPECT_EQ(Of(Hr(0x80004005)),
              "Server ID \"X.Y\" is not registered as an OPC Server in this computer.");
    EXPECT_EQ(Of(Hr(0x800403FD)),
              "The Item Name is unknown to the OPC HDA Server.  Currently you have \"FIC101.SP\".");
    EXPECT_EQ(Of(91, "D"), "D (5B)");
    EXPECT_EQ(Of(Hr(0x80070005), "Access denied"), "Access denied (80070005)");
    EXPECT_EQ(Of(0), " (0)");
    const ErrorInfo error{286, "DDE time-out"};
    EXPECT_EQ(channel.GetErrorString("Timed out waiting for a response", buttons, question, error),
              "Timed out waiting for a response");
    EXPECT_EQ(channel.GetErrorString("BAD:NONSPECIFIC", buttons, question, error),
              "OPC communications failure.\r\n\r\n"
              "1.  Check Item name.  Currently you have \"FIC101.SP\".\r\n"
              "2.  Check Topic (or Access Path) name.  Currently you have \"Area1\".\r\n"
              "3.  Check communications cables.");
    EXPECT_EQ(buttons, 16);
    EXPECT_EQ(question, "");
}

}  // namespace
}  // namespace cv
