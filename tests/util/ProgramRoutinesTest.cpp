#include <gtest/gtest.h>

#include "support/TestPlatform.h"
#include "util/ProgramRoutines.h"

namespace cv {
namespace {

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
