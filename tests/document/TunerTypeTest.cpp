#include "document/TunerType.h"

#include <string>
#include <tuple>

#include <gtest/gtest.h>

#include "support/TestPlatform.h"

namespace cv {
namespace {

// HasFaceplate, ReadWriteFilter, UsesCvIni, AutoFaceplateSetup,
// FullEditScreen, HasExtraTrends, WeReadControllerInfo as Y/N.
std::string Flags(const TunerType& kind) {
    std::string text;
    for (bool flag :
         {kind.HasFaceplate(), kind.ReadWriteFilter(), kind.UsesCvIni(), kind.AutoFaceplateSetup(),
          kind.FullEditScreen(), kind.HasExtraTrends(), kind.WeReadControllerInfo()}) {
        text += flag ? 'Y' : 'N';
    }
    return text;
}

TEST(TunerType, KnownKindsAnswerWithoutMessages) {
    test::TestPlatform tp;
    TunerType kind(tp.platform);
    kind.SetTuner(9);
    EXPECT_EQ(Flags(kind), "YYYYYYN");
    EXPECT_EQ(std::tuple(kind.Name(), kind.DefaultController(), kind.Interface()),
              std::tuple("Corvalent OPC Tuner", "Corvalent Simulation", "OPC"));
    kind.SetTuner(5);
    EXPECT_EQ(Flags(kind), "NNNNNYN");
    kind.SetTuner(11);
    EXPECT_EQ(std::tuple(Flags(kind), kind.DefaultController()),
              std::tuple("YNNYNNY", "Wrong Simulation"));
    kind.SetTuner(12);
    EXPECT_EQ(std::tuple(kind.TitleBarName(), kind.Name()), std::tuple("Sallowmere", "Sallowmere"));
    EXPECT_TRUE(tp.dialogs.Messages().empty());
}

TEST(TunerType, CodesOutsideTheTableReportEachProperty) {
    for (int32_t code : {0, 13, -1}) {
        test::TestPlatform tp;
        TunerType kind(tp.platform);
        EXPECT_EQ(kind.Tuner(), 0);
        kind.SetTuner(code);
        EXPECT_EQ(Flags(kind), "NNNNNNN");
        EXPECT_EQ(kind.Name(), "???");
        EXPECT_EQ(kind.ProgramFileName(), "???");
        EXPECT_EQ(kind.InstallDir(), "???");
        EXPECT_EQ(kind.Interface(), "???");
        EXPECT_EQ(kind.TitleBarName(), "Corvalent");
        EXPECT_EQ(kind.DefaultController(), "Wrong Simulation");

        const char* const shown[] = {
            "HasFaceplate",   "ReadWriteFilter", "UsesCvIni", "AutoFaceplateSetup",
            "FullEditScreen", "HasExtraTrends",  "Name",      "ProgramFileName",
            "InstallDir",     "Interface"};
        const auto& messages = tp.dialogs.Messages();
        ASSERT_EQ(messages.size(), std::size(shown)) << "code " << code;
        for (size_t i = 0; i < messages.size(); ++i) {
            EXPECT_EQ(messages[i].text, std::string("Error: TunerType.") + shown[i]);
            EXPECT_EQ(std::tie(messages[i].style, messages[i].title), std::tuple(0, ""));
        }
    }
}

}  // namespace
}  // namespace cv
