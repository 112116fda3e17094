#include "opc/PriorToConnect.h"

#include <gtest/gtest.h>

#include "platform/fake/RecordingBusyNotice.h"
#include "platform/fake/VirtualEventLoop.h"

namespace cv {
namespace {

TEST(PriorToConnect, NamesTheServerAndOnlyANamedComputer) {
    fake::VirtualEventLoop events;
    fake::RecordingBusyNotice notice;
    platform::ServerCallWait wait(events, notice);
    wait.SetBusyTimeout(1);
    PriorToConnect(wait, "Sim.Slow.1", "");
    EXPECT_EQ(wait.BusyTimeout(), 5000u);
    EXPECT_EQ(wait.BusyText(),
              "Please wait...\r\n\r\nThe OPC Server, \"Sim.Slow.1\", is still busy.");
    PriorToConnect(wait, "Sim.Slow.1", "OPCHOST1");
    EXPECT_EQ(wait.BusyText(),
              "Please wait...\r\n\r\nThe OPC Server, \"Sim.Slow.1\", in computer \"OPCHOST1\", "
              "is still busy.");
}

}  // namespace
}  // namespace cv
