#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <string>
#include <utility>
#include <vector>

#include "channel/Channel.h"
#include "document/TunFile.h"
#include "itemtest/ItemTest.h"
#include "stores/RegClass.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

constexpr const char* kPlant = "Sim.Plant.1";
const std::string kWaitKey = "Software\\Corvalent\\Faceplate";

class ItemTestTest : public testing::Test, public ItemTest::Listener {
  protected:
    ItemTestTest() {
        cTunFile.SetDefaults(9);
        cChannel = cTunFile.Archives().SPChannel();
    }

    // Starts a test of the item on the server, as the main window does.
    void Begin(const std::string& sServer, const std::string& sItem) {
        cChannel->SetOpcNodeAndServer(sServer);
        cChannel->SetItemName(sItem);
        cChannel->SetDescription(sItem);
        test = std::make_unique<ItemTest>(t.platform, cTunFile, *cChannel, *this);
        test->Start();
    }
    void SetValue(const std::string& sItem, const Variant& value) {
        ASSERT_FALSE(t.plant.SetItemValue("", kPlant, sItem, value));
    }
    void SetScaling(double dInstMin, double dInstMax, double dEngMin, double dEngMax) {
        cTunFile.General().SetScalePVandCO(true);
        cTunFile.General().SetScaleSP(true);
        cChannel->SetRange(RangeType::Instrument, dInstMin, dInstMax);
        cChannel->SetRange(RangeType::Engineering, dEngMin, dEngMax);
    }
    void StoreWait(int32_t lMs) {
        RegClass cReg(t.platform.registry);
        cReg.SetMainKey(platform::kHkeyCurrentUser);
        (void)cReg.WriteLong(kWaitKey, "TimeOut", lMs);
    }
    const ItemTestDisplay& Shown() const { return test->Display(); }
    bool Said(const std::string& sPart) const {
        return std::any_of(t.dialogs.Messages().begin(), t.dialogs.Messages().end(),
                           [&](const auto& m) { return m.text.find(sPart) != std::string::npos; });
    }
    size_t Reads() const {
        return static_cast<size_t>(std::count_if(
            t.trace.Entries().begin(), t.trace.Entries().end(),
            [](const auto& e) { return e.label.find("SyncRead") != std::string::npos; }));
    }

    void DisplayChanged() override {
        ++changes;
        if (!Shown().serverAnswer.empty() &&
            (answers.empty() || answers.back() != Shown().serverAnswer)) {
            answers.push_back(Shown().serverAnswer);
        }
    }
    void CloseRequested() override { ++closes; }
    void ValuesShown() override { ++refreshes; }
    void ValueRefused() override { refused.push_back(Shown().quality); }

    test::TestPlatform t;
    TunFile cTunFile{t.platform};
    Channel* cChannel = nullptr;
    std::unique_ptr<ItemTest> test;
    int changes = 0;
    int closes = 0;
    int refreshes = 0;
    // The server's answers shown while waiting, and the refused values' qualities.
    std::vector<std::string> answers;
    std::vector<std::string> refused;
};

TEST_F(ItemTestTest, AGoodValueIsShownScaledWithItsTimeStampAtTheSampleInterval) {
    SetValue("Types.Memory.R8", Variant::R8(12));
    SetScaling(4, 20, 0, 100);
    cTunFile.General().SetSIinSec(2);
    Begin(kPlant, "Types.Memory.R8");
    EXPECT_EQ(Shown().caption, "Trying to connect...");
    t.events.Advance(100);
    EXPECT_EQ(Shown().caption, "Testing Item: Types.Memory.R8");
    EXPECT_EQ(Shown().frameCaption, "OPC Item name: Types.Memory.R8");
    t.events.Advance(1000);
    ASSERT_EQ(test->State(), 6);
    EXPECT_EQ(test->RefreshIntervalMs(), 2000u) << "the sample interval after the first value";
    EXPECT_TRUE(Shown().showTestResult && Shown().showEngValue && Shown().showTimeStamp);
    EXPECT_FALSE(Shown().showModeSelect);
    EXPECT_EQ(Shown().testResult, "Test successful");
    EXPECT_EQ(Shown().instLabel, "Raw Instrument value :");
    EXPECT_EQ(Shown().decimalPlaces, "2");
    EXPECT_EQ(Shown().engColor, cChannel->LineColor());
    EXPECT_EQ(Shown().mousePointer, 0);
    t.events.Advance(2000);
    EXPECT_EQ(Shown().instValue, "12");
    EXPECT_EQ(Shown().engValue, "50.00");
    EXPECT_EQ(Shown().timeStamp, "12:00:00.000 AM  1/1/2025");
    EXPECT_EQ(Shown().sourceTimeStamp, "") << "a Data Access server sends one time stamp";
    EXPECT_EQ(Shown().quality, "good");
    EXPECT_FALSE(Shown().outOfRange);
    SetValue("Types.Memory.R8", Variant::R8(20));
    t.events.Advance(2000);
    EXPECT_EQ(Shown().engValue, "100.00");
    EXPECT_EQ(Shown().timeStamp, "12:00:03.100 AM  1/1/2025") << "to the millisecond";
    EXPECT_EQ(closes, 0);
    EXPECT_TRUE(t.dialogs.Messages().empty());
    test->Unload();
    EXPECT_TRUE(cTunFile.OpcClients().empty());
    EXPECT_FALSE(cChannel->IsOnline());
}

// An uncertain value asks once; No silences the warning for the run.
class ItemTestUncertain : public ItemTestTest, public testing::WithParamInterface<int32_t> {};

TEST_P(ItemTestUncertain, WarnsOnce) {
    t.dialogs.QueueAnswer(GetParam());
    Begin(kPlant, "Quality.Uncertain");
    t.events.Advance(5000);
    ASSERT_EQ(test->State(), 6);
    ASSERT_EQ(t.dialogs.Messages().size(), 1u);
    EXPECT_EQ(t.dialogs.Last().title, "Quality.Uncertain: Uncertain OPC Value");
    EXPECT_EQ(t.run.UncertainWarningOff, GetParam() == MsgBoxResult::No);
    EXPECT_EQ(Shown().instValue, "3");
    EXPECT_EQ(closes, 0);
}

INSTANTIATE_TEST_SUITE_P(Answer, ItemTestUncertain,
                         testing::Values(MsgBoxResult::Yes, MsgBoxResult::No));

// Failures, each ending in its diagnosis and the test closed: at the end of
// the wait while the server's answer might still change (it may be starting),
// at once when no retry can change it. Meanwhile the server's last answer is
// shown.
TEST_F(ItemTestTest, FailuresEndInTheirDiagnosis) {
    struct Case {
        std::string server;
        std::string item;
        bool atOnce;
        std::string title;
        std::string text;
        std::string answer;
    };
    const std::string kTrying = "; trying again until the wait ends";
    const Case cases[] = {
        {kPlant, "Quality.CommFailure", false, "Error trying to read Quality.CommFailure",
         "Communications failure", "The server answered: bad, communication failure" + kTrying},
        {kPlant, "No.Such.Item", false, "",
         "Either the Access Path or the Item Name are unknown to the OPC Server.",
         "The server answered: Either the Access Path or the Item Name are unknown to the OPC "
         "Server" +
             kTrying},
        {kPlant, "Bad..Item", true, "Error trying to read Bad..Item",
         "The Item name doesn't conform to the OPC Server's syntax.", ""},
        {"Sim.Nothing.1", "X", true, "Error trying to read X",
         "Server ID \"Sim.Nothing.1\" is not registered as an OPC Server in this computer.", ""},
        {"Sim.NotRunning.1", "X", false, "", "could not be started",
         "The server answered: The server process could not be started. (80080005)" + kTrying},
        {"Sim.NoSubscribe.1", "Signals.Ramp", false, "",
         "cannot subscribe to data change notifications",
         "The server answered: Problem with your OPC Server: \"Sim.NoSubscribe.1\"" + kTrying},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.item);
        t.dialogs.Clear();
        closes = 0;
        answers.clear();
        Begin(c.server, c.item);
        t.events.Advance(c.atOnce ? 100 : 5000);
        EXPECT_EQ(closes, c.atOnce ? 1 : 0);
        EXPECT_EQ(answers, c.answer.empty() ? std::vector<std::string>{}
                                            : std::vector<std::string>{c.answer});
        t.events.Advance(c.atOnce ? 0 : 5300);
        EXPECT_EQ(closes, 1);
        EXPECT_EQ(Shown().serverAnswer, c.answer) << "shown until the end";
        EXPECT_TRUE(test->Closed());
        ASSERT_FALSE(t.dialogs.Messages().empty());
        if (!c.title.empty()) {
            EXPECT_EQ(t.dialogs.Last().title, c.title);
        }
        EXPECT_TRUE(Said(c.text)) << t.dialogs.Last().text;
        EXPECT_TRUE(cTunFile.OpcClients().empty());
    }
}

// Beside "Test successful": the quality in words, as the server sent it
// (a last known value is shown, but as the bad value it is), in a colour
// that is green only for good.
TEST_F(ItemTestTest, EveryRefreshShowsTheQualityInWordsAndItsColour) {
    t.run.UncertainWarningOff = true;  // the warning answered No
    struct Case {
        std::string item;
        std::string quality;
        int32_t color;
    };
    const Case cases[] = {
        {"Quality.Good", "good", ItemTestDisplay::kGoodColor},
        {"Quality.SensorCal", "uncertain, sensor not accurate", ItemTestDisplay::kUncertainColor},
        {"Quality.LastKnown", "bad, last known value", ItemTestDisplay::kBadColor},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.item);
        Begin(kPlant, c.item);
        t.events.Advance(2000);
        ASSERT_EQ(test->State(), 6);
        EXPECT_EQ(Shown().testResult, "Test successful");
        EXPECT_EQ(Shown().quality, c.quality);
        EXPECT_EQ(Shown().qualityColor, c.color);
        test->Unload();
    }
    // A change of quality shows at the next refresh.
    Begin(kPlant, "Types.Memory.R8");
    t.events.Advance(2000);
    ASSERT_FALSE(t.plant.SetItemQuality("", kPlant, "Types.Memory.R8", 0x58));
    t.events.Advance(1000);
    EXPECT_EQ(Shown().quality, "uncertain, sub-normal");
    EXPECT_TRUE(t.dialogs.Messages().empty());
}

// Where the value is scaled, one outside the engineering range is marked
// (also when both ranges are the same and scaling changes nothing).
TEST_F(ItemTestTest, AnEngineeringValueOutsideItsRangeIsMarked) {
    SetScaling(0, 100, 0, 100);
    SetValue("Types.Memory.R8", Variant::R8(326.35));
    Begin(kPlant, "Types.Memory.R8");
    t.events.Advance(2000);
    EXPECT_EQ(Shown().engValue, "326.35");
    EXPECT_TRUE(Shown().outOfRange);
    EXPECT_EQ(Shown().rangeMark, "out of range 0.00 to 100.00");
    for (const auto& [raw, outside] : {std::pair(100.0, false), std::pair(-0.01, true),
                                       std::pair(0.0, false), std::pair(double{NAN}, false)}) {
        SetValue("Types.Memory.R8", Variant::R8(raw));
        t.events.Advance(1000);
        EXPECT_EQ(Shown().outOfRange, outside) << raw;
    }
    EXPECT_EQ(Shown().engValue, "NaN");
    test->Unload();
    // Unscaled, the engineering range says nothing about the value.
    cTunFile.General().SetScalePVandCO(false);
    SetValue("Types.Memory.R8", Variant::R8(326.35));
    Begin(kPlant, "Types.Memory.R8");
    t.events.Advance(2000);
    EXPECT_FALSE(Shown().outOfRange);
}

// A bad value is told with its time stamp and quality, whether it comes
// while the test waits or ends it.
TEST_F(ItemTestTest, ABadValueIsToldBeforeTheTestEnds) {
    Begin(kPlant, "Quality.CommFailure");
    t.events.Advance(1000);
    EXPECT_EQ(refused, std::vector<std::string>{"bad, communication failure"});
    EXPECT_EQ(closes, 0);
    test->Unload();
    refused.clear();
    Begin(kPlant, "Types.Memory.R8");
    t.events.Advance(2000);
    ASSERT_FALSE(t.plant.SetItemQuality("", kPlant, "Types.Memory.R8", 0x10));
    t.events.Advance(1000);
    EXPECT_EQ(refused, std::vector<std::string>{"bad, sensor failure"});
    EXPECT_EQ(closes, 1);
    EXPECT_TRUE(Said("Sensor failure"));
}

TEST_F(ItemTestTest, CreatingIsRetriedEachTickUntilTheRememberedWaitRunsOut) {
    StoreWait(3000);
    Begin(kPlant, "No.Such.Item");
    t.events.Advance(200);
    EXPECT_EQ(test->State(), 3);
    EXPECT_TRUE(test->Progress().Visible());
    EXPECT_EQ(Shown().mousePointer, 11);
    t.events.Advance(1400);
    EXPECT_EQ(test->Progress().BarValue(), 50) << "1.5 s of the wait that began at 100 ms";
    EXPECT_TRUE(t.dialogs.Messages().empty()) << "silent while the bar runs";
    // "Longer wait" gives the running wait 5 s more.
    test->Progress().ButtonPressed(WaitProgress::kLonger);
    t.events.Advance(2900);
    EXPECT_EQ(closes, 0);
    t.events.Advance(3600);
    EXPECT_EQ(closes, 1);
    EXPECT_EQ(t.dialogs.Messages().size(), 1u);
    // A stored wait of 0 waits the default instead of giving up at once.
    StoreWait(0);
    closes = 0;
    Begin(kPlant, "No.Such.Item");
    t.events.Advance(9000);
    EXPECT_EQ(closes, 0);
    t.events.Advance(1300);
    EXPECT_EQ(closes, 1);
}

TEST_F(ItemTestTest, TheSlowServerShowsItsBusyNoticeAndStillDelivers) {
    Begin("Sim.Slow.1", "Unit1.FIC101.PV");
    t.events.Advance(120000);
    EXPECT_FALSE(t.busy.Shown().empty());
    EXPECT_NE(t.busy.Shown().front().find("Sim.Slow.1"), std::string::npos);
    EXPECT_EQ(test->State(), 6);
    EXPECT_EQ(closes, 0);
    // Ticks that came while a call waited returned at once: one connection.
    std::vector<std::string> clients;
    ASSERT_FALSE(t.plant.ClientNames("", "Sim.Slow.1", clients));
    EXPECT_EQ(clients.size(), 1u);
    EXPECT_EQ(cTunFile.OpcClients().size(), 1u);
}

TEST_F(ItemTestTest, WithHotLinksOffEveryRefreshReadsOnce) {
    for (const bool hot : {true, false}) {
        cTunFile.General().SetUseHotLinks(hot);
        Begin(kPlant, "Signals.Ramp");
        t.events.Advance(2000);
        ASSERT_EQ(test->State(), 6);
        const size_t before = Reads();
        t.events.Advance(5000);
        EXPECT_EQ(Reads() - before, hot ? 0u : 5u) << hot;
        test->Unload();
    }
}

TEST_F(ItemTestTest, AControllerModeChannelOffersTheModeStrings) {
    SetValue("Types.Memory.BSTR", Variant::Str("manual"));
    cChannel->SetSpecificChannelType(4);
    cChannel->SetExpectANumber(false);
    Begin(kPlant, "Types.Memory.BSTR");
    t.events.Advance(2000);
    ASSERT_EQ(test->State(), 6);
    EXPECT_EQ(Shown().instLabel, "Current value :");
    EXPECT_TRUE(Shown().showModeSelect);
    EXPECT_FALSE(Shown().showEngValue);
    EXPECT_EQ(Shown().modes, (std::vector<std::string>{"Auto", "Manual"}));
    EXPECT_EQ(Shown().modeIndex, 1) << "matched ignoring case";
    // No changes nothing; Yes makes the string read the key of that mode.
    t.dialogs.QueueAnswer(MsgBoxResult::No);
    test->ApplyMode(0);
    EXPECT_EQ(t.dialogs.Last().text,
              "Please confirm that you wish Corvalent OPC Test Client to recognise the string "
              "\"manual\" as loop mode Auto.");
    EXPECT_EQ(t.dialogs.Last().style, MsgBoxStyle::YesNo + MsgBoxStyle::Question);
    EXPECT_FALSE(test->Changed());
    test->ApplyMode(0);
    EXPECT_EQ(cTunFile.General().ModeKey(1), "manual");
    EXPECT_TRUE(test->Changed());
}

TEST_F(ItemTestTest, DecimalPlacesAndColourChangeTheChannel) {
    SetValue("Types.Memory.R8", Variant::R8(12.3456));
    Begin(kPlant, "Types.Memory.R8");
    t.events.Advance(2000);
    ASSERT_EQ(test->State(), 6);
    struct Step {
        std::function<void()> act;
        int32_t places;
        std::string eng;
        size_t messages;
    };
    const Step steps[] = {
        {[&] { test->DecimalPlacesUp(); }, 3, "12.346", 0},
        {[&] { test->DecimalPlacesEntered("5"); }, 5, "12.34560", 0},
        {[&] { test->DecimalPlacesUp(); }, 5, "12.34560", 0},
        {[&] { test->DecimalPlacesEntered("6"); }, 5, "12.34560", 1},
        {[&] { test->DecimalPlacesEntered("0"); }, 0, "12", 1},
        {[&] { test->DecimalPlacesDown(); }, 0, "12", 1},
    };
    for (const Step& step : steps) {
        step.act();
        EXPECT_EQ(cChannel->DecimalPlaces(), step.places);
        EXPECT_EQ(Shown().engValue, step.eng);
        EXPECT_EQ(t.dialogs.Messages().size(), step.messages);
    }
    EXPECT_EQ(t.dialogs.Last().text, "Number of decimal places must be in range 0 to 5.");
    EXPECT_EQ(t.dialogs.Last().style, MsgBoxStyle::Information);
    EXPECT_FALSE(test->CanClose("9"));
    EXPECT_TRUE(test->CanClose("0"));
    EXPECT_TRUE(test->Changed());
    test->ColourChosen(0x0000FF);
    EXPECT_EQ(cChannel->LineColor(), 0x0000FF);
    EXPECT_EQ(Shown().engColor, 0x0000FF);
}

TEST_F(ItemTestTest, ADdeChannelGoesOnlineInThePreparingStep) {
    cChannel->SetComType(ComTypeCode::Dde);
    cChannel->SetDdeAppTopic("PLC5|LIC20");
    cChannel->SetItemName("PV");
    cChannel->SetDescription("PV");
    test = std::make_unique<ItemTest>(t.platform, cTunFile, *cChannel, *this);
    test->Start();
    t.events.Advance(100);
    EXPECT_EQ(Shown().frameCaption, "DDE Item name: PV");
    EXPECT_EQ(test->State(), 6) << "states 2 to 4 skipped";
    EXPECT_FALSE(Shown().showTimeStamp);
    EXPECT_FALSE(test->Progress().Visible());
    t.events.Advance(1000);
    EXPECT_EQ(Shown().instValue, "47.25");
    EXPECT_EQ(Shown().ddeLabel, "47.25");
    EXPECT_EQ(closes, 0);
}

}  // namespace
}  // namespace cv
