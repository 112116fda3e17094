#include <gtest/gtest.h>

#include <string>

#include "itemtest/WaitProgress.h"
#include "stores/RegClass.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

const std::string kKey = "Software\\Corvalent\\Faceplate";
const std::string kText = "Initializing communications.  Please wait...";

class WaitProgressTest : public testing::Test {
  protected:
    RegClass Settings() {
        RegClass cReg(t.platform.registry);
        cReg.SetMainKey(platform::kHkeyCurrentUser);
        return cReg;
    }
    int32_t Stored() { return Settings().ReadLong(kKey, "TimeOut", -1, 0, 0); }
    void Start(bool bTimeOut = true) { progress.Initialise(kText, bTimeOut, kKey, "TimeOut"); }

    test::TestPlatform t;
    WaitProgress progress{t.platform};
};

TEST_F(WaitProgressTest, TheBarFollowsTheDefaultWaitAndStopsAtAHundred) {
    Start();
    EXPECT_EQ(progress.WaitTime(), 10000);
    EXPECT_EQ(progress.CompletionText(), "0");
    EXPECT_EQ(progress.ButtonCaption(1), "Shorter wait");
    EXPECT_EQ(progress.ButtonCaption(2), "Longer wait");
    EXPECT_TRUE(progress.ButtonVisible(1) && progress.ButtonVisible(2));
    struct Step {
        uint32_t advance;
        int32_t bar;
        std::string text;
        bool up;
    };
    for (const Step& step : {Step{2500, 25, "25 %", false}, Step{7500, 100, "100 %", true},
                             Step{2000, 100, "100 %", true}}) {
        t.events.Advance(step.advance);
        EXPECT_EQ(progress.TimeUp(), step.up);
        EXPECT_EQ(progress.BarValue(), step.bar);
        EXPECT_EQ(progress.CompletionText(), step.text);
    }
    progress.ReInitialize();
    EXPECT_FALSE(progress.TimeUp());
    EXPECT_EQ(progress.BarValue(), 0);
}

TEST_F(WaitProgressTest, ButtonsChangeTheWaitInStepsAndRememberIt) {
    Start();
    t.events.Advance(3000);
    EXPECT_FALSE(progress.TimeUp());
    EXPECT_EQ(progress.BarValue(), 30);
    struct Press {
        int button;
        int32_t wait;
    };
    for (const Press& press : {Press{2, 15000}, Press{1, 10000}, Press{1, 5000}, Press{1, 5000}}) {
        progress.ButtonPressed(press.button);
        EXPECT_EQ(progress.WaitTime(), press.wait);
        EXPECT_EQ(progress.BarValue(), 3000 * 100 / press.wait);
        EXPECT_EQ(Stored(), press.wait) << "written also when unchanged";
    }
    // The next wait starts from the remembered time-out.
    WaitProgress next(t.platform);
    next.Initialise(kText, true, kKey, "TimeOut");
    EXPECT_EQ(next.WaitTime(), 5000);
}

TEST_F(WaitProgressTest, AStoredTimeOutOfZeroOrBelowWaitsTheDefault) {
    for (const int32_t stored : {0, -1, -20000}) {
        (void)Settings().WriteLong(kKey, "TimeOut", stored);
        Start();
        EXPECT_EQ(progress.WaitTime(), 10000) << stored;
        t.events.Advance(5000);
        EXPECT_FALSE(progress.TimeUp());
        EXPECT_EQ(progress.BarValue(), 50);
    }
}

TEST_F(WaitProgressTest, WithoutATimeOutItIsUpAtOnceAndHasNoButtons) {
    Start(false);
    EXPECT_TRUE(progress.TimeUp());
    EXPECT_EQ(progress.WaitTime(), 0);
    EXPECT_FALSE(progress.ButtonVisible(1) || progress.ButtonVisible(2));
    progress.ButtonPressed(2);
    EXPECT_EQ(Stored(), -1) << "nothing written";
}

TEST_F(WaitProgressTest, ShowItAndUpdateCompletionSetTheTextsAndNotify) {
    int changes = 0;
    progress.SetOnChange([&] { ++changes; });
    EXPECT_TRUE(progress.ShowIt("Saving", "", "Stop"));
    EXPECT_EQ(progress.Text(), "Saving");
    EXPECT_FALSE(progress.ButtonVisible(1));
    EXPECT_TRUE(progress.ButtonVisible(2));
    EXPECT_EQ(progress.ButtonCaption(2), "Stop");
    progress.UpdateCompletion(40, "");
    EXPECT_EQ(progress.CompletionText(), "40 %");
    EXPECT_EQ(progress.Text(), "Saving");
    progress.UpdateCompletion(140, "Nearly");
    EXPECT_EQ(progress.BarValue(), 100);
    EXPECT_EQ(progress.Text(), "Nearly");
    progress.SetVisible(true);
    EXPECT_TRUE(progress.Visible());
    EXPECT_EQ(changes, 4);
}

}  // namespace
}  // namespace cv
