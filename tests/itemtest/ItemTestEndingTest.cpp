// How a test read ends: closed by the user while a server call waits, or by
// its server shutting down. Either way nothing is left connected or running,
// and nothing more is said than what happened.

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "channel/Channel.h"
#include "document/TunFile.h"
#include "itemtest/ItemTest.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

constexpr const char* kPlant = "Sim.Plant.1";
constexpr const char* kSlow = "Sim.Slow.1";

class ItemTestEnding : public testing::Test, public ItemTest::Listener {
  protected:
    ItemTestEnding() {
        cTunFile.SetDefaults(9);
        cChannel = cTunFile.Archives().SPChannel();
    }

    void Begin(const std::string& sServer, const std::string& sItem) {
        cChannel->SetOpcNodeAndServer(sServer);
        cChannel->SetItemName(sItem);
        cChannel->SetDescription(sItem);
        test = std::make_unique<ItemTest>(t.platform, cTunFile, *cChannel, *this);
        test->Start();
    }
    // Runs act at the first 10 ms tick at which bWhen holds.
    void AtFirst(std::function<bool()> bWhen, std::function<void()> act) {
        watcher = t.events.StartTimer(10, true, [this, bWhen, act] {
            if (bWhen()) {
                t.events.StopTimer(watcher);
                act();
            }
        });
    }
    // The user closes the window once bWhen holds.
    void CloseWhen(std::function<bool()> bWhen) {
        AtFirst(std::move(bWhen), [this] {
            closedAtTrace = t.trace.Entries().size();
            test->Unload();
        });
    }
    // The trace written since the window was closed.
    std::vector<std::string> TraceSinceClose() const {
        std::vector<std::string> labels;
        const auto& entries = t.trace.Entries();
        for (size_t i = closedAtTrace; i < entries.size(); ++i) {
            labels.push_back(entries[i].label);
        }
        return labels;
    }
    size_t Connected(const std::string& sServer) {
        std::vector<std::string> names;
        EXPECT_FALSE(t.plant.ClientNames("", sServer, names));
        return names.size();
    }
    void ExpectNothingLeft() {
        EXPECT_TRUE(cTunFile.OpcClients().empty());
        EXPECT_EQ(Connected(kSlow), 0u);
        EXPECT_EQ(Connected(kPlant), 0u);
        EXPECT_EQ(t.events.ActiveTimers(), 0) << "no notification, call or test timer runs";
        EXPECT_EQ(cChannel->OpcClient(), nullptr);
    }

    void DisplayChanged() override {}
    void CloseRequested() override { ++closes; }

    test::TestPlatform t;
    TunFile cTunFile{t.platform};
    Channel* cChannel = nullptr;
    std::unique_ptr<ItemTest> test;
    platform::EventLoop::TimerId watcher = 0;
    size_t closedAtTrace = 0;
    int closes = 0;
};

// Closed while the slow server's new client connects (1 s), adds its group
// (7 s) or subscribes it (19 s), or while the item is added (27 s): the
// client ends with the test, and the next test read shows its own server's
// values only.
class ClosingWhileCreating : public ItemTestEnding, public testing::WithParamInterface<uint32_t> {};

TEST_P(ClosingWhileCreating, LeavesNothingForTheNextTestRead) {
    Begin(kSlow, "Unit1.FIC101.PV");
    CloseWhen([this] { return t.events.TimeGetTime() >= GetParam(); });
    t.events.Advance(60000);
    ASSERT_GT(closedAtTrace, 0u);
    const std::vector<std::string> since = TraceSinceClose();
    ASSERT_FALSE(since.empty());
    EXPECT_EQ(since.back(), "Server.Disconnect");
    EXPECT_EQ(std::count(since.begin(), since.end(), "Server.Disconnect"), 1);
    ExpectNothingLeft();
    EXPECT_TRUE(t.dialogs.Messages().empty());
    EXPECT_EQ(closes, 0);

    ASSERT_FALSE(t.plant.SetItemValue("", kPlant, "Types.Memory.R8", Variant::R8(12.5)));
    Begin(kPlant, "Types.Memory.R8");
    t.events.Advance(2000);
    for (int second = 0; second < 3; ++second) {
        t.events.Advance(1000);
        EXPECT_EQ(test->Display().instValue, "12.5") << second;
    }
    EXPECT_EQ(cTunFile.OpcClients().size(), 1u);
    EXPECT_EQ(Connected(kSlow), 0u);
    EXPECT_TRUE(t.dialogs.Messages().empty()) << t.dialogs.Last().text;
    test->Unload();
    ExpectNothingLeft();
}

INSTANTIATE_TEST_SUITE_P(At, ClosingWhileCreating, testing::Values(1000u, 7000u, 19000u, 27000u));

// Closed while a one-shot read of the slow server waits: nothing is said.
TEST_F(ItemTestEnding, ClosingDuringAOneShotReadReportsNothing) {
    cTunFile.General().SetUseHotLinks(false);
    Begin(kSlow, "Unit1.FIC101.PV");
    t.events.Advance(60000);
    ASSERT_EQ(test->State(), 6);
    t.dialogs.Clear();
    CloseWhen([this] { return test->InTimer(); });
    t.events.Advance(20000);
    ASSERT_GT(closedAtTrace, 0u);
    EXPECT_EQ(t.trace.Entries()[closedAtTrace - 1].label, "Group.SyncRead , Items=1");
    EXPECT_TRUE(t.dialogs.Messages().empty()) << t.dialogs.Last().text;
    ExpectNothingLeft();
}

struct ShutDownCase {
    const char* server;
    const char* item;
    bool hotLinks;
    int16_t state;     // when the server shuts down
    bool duringRead;   // and while a one-shot read waits
    uint32_t readyMs;  // till then
};

// Whenever the server shuts down, its one message is all the user sees, and
// the test stops reading.
TEST_F(ItemTestEnding, AServerShutDownIsToldOnceAndReadingStops) {
    const ShutDownCase cases[] = {
        {kPlant, "Signals.Ramp", true, 6, false, 2000},
        {kPlant, "Signals.Ramp", false, 6, false, 2000},
        {kPlant, "Quality.CommFailure", true, 5, false, 2000},
        {kSlow, "Unit1.FIC101.PV", false, 6, true, 60000},
    };
    for (const ShutDownCase& c : cases) {
        SCOPED_TRACE(std::string(c.item) + (c.hotLinks ? " hot" : " cold"));
        t.dialogs.Clear();
        closes = 0;
        cTunFile.General().SetUseHotLinks(c.hotLinks);
        Begin(c.server, c.item);
        t.events.Advance(c.readyMs);
        ASSERT_EQ(test->State(), c.state);
        size_t tracedBefore = 0;
        AtFirst([&] { return test->InTimer() || !c.duringRead; },
                [&] {
                    tracedBefore = t.trace.Entries().size();
                    ASSERT_FALSE(t.plant.ShutDownServer("", c.server, "Maintenance"));
                });
        t.events.Advance(10000);
        EXPECT_EQ(closes, 1);
        ASSERT_EQ(t.dialogs.Messages().size(), 1u) << t.dialogs.Last().text;
        EXPECT_EQ(t.dialogs.Last().text, "The OPC Server has been shutdown");
        EXPECT_TRUE(t.modeless.windows.empty());
        const auto& entries = t.trace.Entries();
        EXPECT_EQ(std::count_if(
                      entries.begin() + static_cast<std::ptrdiff_t>(tracedBefore), entries.end(),
                      [](const auto& e) { return e.label.find("SyncRead") != std::string::npos; }),
                  0);
        ExpectNothingLeft();
    }
}

}  // namespace
}  // namespace cv
