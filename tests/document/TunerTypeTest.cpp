#include "document/TunerType.h"

#include <gtest/gtest.h>

#include <string>

#include "support/TestPlatform.h"

namespace cv {
namespace {

// HasFaceplate, ReadWriteFilter, UsesCvIni, AutoFaceplateSetup,
// FullEditScreen, HasExtraTrends, WeReadControllerInfo as Y/N.
std::string Flags(const TunerType& kind) {
    const bool flags[] = {kind.HasFaceplate(),        kind.ReadWriteFilter(), kind.UsesCvIni(),
                          kind.AutoFaceplateSetup(),  kind.FullEditScreen(),  kind.HasExtraTrends(),
                          kind.WeReadControllerInfo()};
    std::string text;
    for (bool flag : flags) {
        text += flag ? 'Y' : 'N';
    }
    return text;
}

TEST(TunerType, EveryKindAnswersItsRowWithoutMessages) {
    const char* const expected[] = {"YYYNYYN", "YYYYNYY", "YYYYNYY", "YNYYNNN",
                                    "NNNNNYN", "NNNNNYN", "YNYYNNY", "YNYYNNN",
                                    "YYYYYYN", "YNNYNNY", "YNNYNNY", "NNNNNYN"};
    test::TestPlatform tp;
    TunerType kind(tp.platform);
    for (int32_t code = 1; code <= 12; ++code) {
        kind.SetTuner(code);
        EXPECT_EQ(Flags(kind), expected[code - 1]) << "kind " << code;
        EXPECT_NE(kind.Name(), "???");
        EXPECT_NE(kind.Interface(), "???");
        EXPECT_NE(kind.ProgramFileName(), "???");
        EXPECT_NE(kind.InstallDir(), "???");
    }
    EXPECT_TRUE(tp.dialogs.Messages().empty());
}

TEST(TunerType, OpcKindAndNamedRows) {
    test::TestPlatform tp;
    TunerType kind(tp.platform);
    kind.SetTuner(9);
    EXPECT_EQ(kind.Name(), "Corvalent OPC Tuner");
    EXPECT_EQ(kind.DefaultController(), "Corvalent Simulation");
    EXPECT_EQ(kind.Interface(), "OPC");

    for (int32_t code = 1; code <= 12; ++code) {
        kind.SetTuner(code);
        const bool wrong = code == 10 || code == 11;
        EXPECT_EQ(kind.DefaultController(), wrong ? "Wrong Simulation" : "Corvalent Simulation");
    }
    kind.SetTuner(2);
    EXPECT_EQ(kind.TitleBarName(), "Fenwarden");
    kind.SetTuner(3);
    EXPECT_EQ(kind.TitleBarName(), "Brindlemoor");
    kind.SetTuner(12);
    EXPECT_EQ(kind.TitleBarName(), "Sallowmere");
    EXPECT_EQ(kind.Name(), "Sallowmere");
    kind.SetTuner(4);
    EXPECT_EQ(kind.Interface(), "Wonderware");
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
            EXPECT_EQ(messages[i].style, 0);
            EXPECT_EQ(messages[i].title, "");
        }
    }
}

}  // namespace
}  // namespace cv
