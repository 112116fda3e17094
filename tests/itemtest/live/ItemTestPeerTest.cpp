// The item test against the node-opcua peer, on a real event loop: what the
// test window shows for good, uncertain and bad values, for a server that
// shuts down while it reads, and what a test closed while connecting leaves.

#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <string>

#include "channel/Channel.h"
#include "document/TunFile.h"
#include "itemtest/ItemTest.h"
#include "platform/ua/live/LiveUaPlatform.h"

namespace cv::test {
namespace {

struct ItemTestPeer : LiveUaTest, ItemTest::Listener {
    void Begin(const std::string& path) {
        doc.SetDefaults(9);
        Channel& channel = *doc.Archives().SPChannel();
        channel.SetOpcNodeAndServer(url);
        channel.SetItemName("ns=1;s=" + path);
        channel.SetDescription(path);
        itemTest = std::make_unique<ItemTest>(lp.platform, doc, channel, *this);
        itemTest->SetWaitOverride(10'000);
        itemTest->Start();
    }
    bool Said(const std::string& part) const {
        const auto& shown = lp.dialogs.Messages();
        return std::any_of(shown.begin(), shown.end(), [&](const auto& m) {
            return (m.title + "|" + m.text).find(part) != std::string::npos;
        });
    }

    // The peer's sessions now, read through the fixture's own client.
    int32_t Sessions() {
        if (sessionCount == nullptr) {
            sessionCount = &AddChannel("Control.SessionCount");
        }
        EXPECT_FALSE(client.SingleShotReadOneItem(*sessionCount));
        return sessionCount->RawValue().AsI4();
    }

    // With closeWhileCreating, the user closes the test 1 ms after it began
    // to create its client, while the client waits for the peer.
    void DisplayChanged() override {
        if (closeWhileCreating && itemTest->State() == 2) {
            closeWhileCreating = false;
            lp.events.StartTimer(1, false, [this] {
                itemTest->Unload();
                unloaded = true;
            });
        }
    }
    void CloseRequested() override { ++closes; }
    void ValuesShown() override { ++refreshes; }

    TunFile doc{lp.platform};
    std::unique_ptr<ItemTest> itemTest;
    Channel* sessionCount = nullptr;
    bool closeWhileCreating = false;
    bool unloaded = false;
    int closes = 0;
    int refreshes = 0;
};

// The quality carries the server's own name for its status; both time
// stamps are shown.
TEST_F(ItemTestPeer, ValuesOfEachQualityAndTheBackendAreShown) {
    struct Case {
        std::string path;
        bool shown;  // else the test closes with its diagnosis
        std::string instValue;
        std::string said;
        std::string quality;
    };
    const Case cases[] = {
        {"Plant.Area1.FIC101.PV", true, "42.5", "", "good"},
        {"Quality.Uncertain", true, "12.5", "Quality.Uncertain: Uncertain OPC Value",
         "uncertain (Uncertain)"},
        {"Quality.Uncertain_SensorNotAccurate", true, "12.5", "",
         "uncertain, sensor not accurate (Uncertain_SensorNotAccurate)"},
        {"Quality.Bad_DeviceFailure", false, "", "Device failure",
         "bad, device failure (Bad_DeviceFailure)"},
    };
    for (const Case& c : cases) {
        lp.dialogs.QueueAnswer(MsgBoxResult::Yes);
        lp.run.UncertainWarningOff = false;
        closes = refreshes = 0;
        Begin(c.path);
        ASSERT_TRUE(WaitUntil([&] { return refreshes > 0 || closes > 0; })) << c.path;
        EXPECT_EQ(refreshes > 0, c.shown) << c.path;
        EXPECT_EQ(itemTest->Display().backend, "OPC UA") << c.path;
        EXPECT_EQ(itemTest->Display().quality, c.quality) << c.path;
        EXPECT_FALSE(itemTest->Display().timeStamp.empty()) << c.path;
        if (c.shown) {
            EXPECT_EQ(itemTest->Display().instValue, c.instValue) << c.path;
            EXPECT_FALSE(itemTest->Display().sourceTimeStamp.empty()) << c.path;
        }
        if (!c.said.empty()) {
            EXPECT_TRUE(Said(c.said)) << c.path;
        }
        itemTest->Unload();
        itemTest.reset();
    }
}

TEST_F(ItemTestPeer, PeerShutdownDuringATestReadEndsIt) {
    Begin("Dynamic.Counter");
    ASSERT_TRUE(WaitUntil([&] { return refreshes > 0; }));
    for (const auto& [path, text] :
         {std::pair("Control.ShutdownReason", "Maintenance"),
          std::pair("Control.ShutdownDelay", "300"), std::pair("Control.Shutdown", "1")}) {
        ErrorInfo error;
        EXPECT_EQ(client.SendValue(AddChannel(path), text, error), "") << path;
    }
    ASSERT_TRUE(WaitUntil([&] { return closes > 0; }));
    EXPECT_TRUE(itemTest->Closed());
    // The shutdown is told by the clients (the fixture's too), not again by
    // the test.
    EXPECT_TRUE(Said("The OPC Server has been shutdown"));
    EXPECT_FALSE(Said("Error reading"));
    EXPECT_TRUE(doc.OpcClients().empty());
}

TEST_F(ItemTestPeer, ClosingWhileConnectingLeavesNoSession) {
    const int32_t before = Sessions();
    ASSERT_GE(before, 1) << "the fixture's own session";
    closeWhileCreating = true;
    Begin("Plant.Area1.FIC101.PV");
    // The outer wait sees the flag only once the create has given up.
    ASSERT_TRUE(WaitUntil([&] { return unloaded; }));
    EXPECT_TRUE(doc.OpcClients().empty());
    EXPECT_EQ(refreshes, 0);
    // The peer may take a moment to drop a session whose channel closed.
    int32_t after = Sessions();
    for (int poll = 0; poll < 50 && after > before; ++poll) {
        (void)lp.events.WaitUntil([] { return false; }, 100);
        after = Sessions();
    }
    EXPECT_LE(after, before);
    EXPECT_TRUE(lp.dialogs.Messages().empty());
}

}  // namespace
}  // namespace cv::test
