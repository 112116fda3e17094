#include "document/TunFile.h"

#include <gtest/gtest.h>

#include "support/TestPlatform.h"

namespace cv {
namespace {

TEST(TunFile, ForwardsTheTunerKindAndKeepsItsSettings) {
    test::TestPlatform tp;
    TunFile tunFile(tp.platform);
    tunFile.SetTunerType(9);
    EXPECT_TRUE(tunFile.TunerTypeObj().HasFaceplate());
    tunFile.TunerTypeObj().SetTuner(5);
    EXPECT_EQ(tunFile.TunerType(), 5);

    tunFile.General().SetSIinSec(2.5);
    EXPECT_EQ(tunFile.General().SIinMSec(), 2500);
    EXPECT_TRUE(tp.dialogs.Messages().empty());
}

}  // namespace
}  // namespace cv
