#include <gtest/gtest.h>

#include "app/Utility.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

TEST(ProgramRoutines, PutsTheHelpFileInTheProgramFolderOrSaysWhyNot) {
    test::TestPlatform t;
    t.run.HelpFile = "CvOpcTestClient.hlp";
    SetHelpPath(t.platform);
    EXPECT_EQ(t.run.HelpFile, "/opt/cvopctestclient/CvOpcTestClient.hlp");
    t.run.HelpFile = "x.hlp";
    t.program.folder = "C:\\prog\\";
    SetHelpPath(t.platform);
    EXPECT_EQ(t.run.HelpFile, "C:\\prog\\x.hlp");
    EXPECT_TRUE(t.dialogs.Messages().empty());

    t.run.HelpFile += ">StepsSub";
    int32_t context = 409;
    ShowHelpTopic(t.platform, context);
    ASSERT_EQ(t.help.requests.size(), 1U);
    EXPECT_EQ(t.help.requests[0].file, "C:\\prog\\x.hlp>StepsSub");
    EXPECT_EQ(t.help.requests[0].context, 409);

    // Without a program folder the path cannot be set, and the user is told.
    t.run.HelpFile = "CvOpcTestClient.hlp";
    t.program.folder = "";
    SetHelpPath(t.platform);
    ASSERT_EQ(t.dialogs.Messages().size(), 1U);
    EXPECT_EQ(t.dialogs.Last().text, "Error setting help path: The program's folder is unknown.");
    EXPECT_EQ(t.dialogs.Last().style, MsgBoxStyle::OKOnly);
    EXPECT_EQ(t.run.HelpFile, "CvOpcTestClient.hlp");
}

TEST(ProgramRoutines, AnswersTheProgramFactsAndSwitches) {
    test::TestPlatform t;
    EXPECT_EQ(ComputerName(t.platform), "TESTPC");
    t.computer.name = std::nullopt;
    EXPECT_EQ(ComputerName(t.platform), "");
    EXPECT_FALSE(UncertainWarningOff(t.platform, false));
    EXPECT_TRUE(UncertainWarningOff(t.platform, true));
    EXPECT_TRUE(UncertainWarningOff(t.platform, false));
}

}  // namespace
}  // namespace cv
