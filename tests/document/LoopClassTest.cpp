#include "document/LoopClass.h"

#include <gtest/gtest.h>

#include <fstream>
#include <limits>

#include "document/TunFile.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

struct LoopFile {
    test::TestPlatform tp;
    TunFile tunFile{tp.platform};
    std::string path = tp.folder.File("loop.tun");

    explicit LoopFile(int32_t lKind = 9, const std::string& sText = "") {
        tunFile.SetTunerType(lKind);
        tunFile.IniFileObject().SetFileName(path);
        std::ofstream(path, std::ios::binary) << sText;
    }
    bool Has(int32_t lLoop, const std::string& sItem) {
        return tunFile.IniFileObject().ReadString(LoopClass::SectionName(lLoop), sItem, "-") != "-";
    }
};

TEST(LoopClass, UnitRulesOrsiDetectionAndCopy) {
    test::TestPlatform tp;
    LoopClass loop(tp.platform);
    loop.SetResponseDirection(0);
    loop.SetPBorGain(3);
    loop.SetIntegralUnits(5);
    loop.SetControl(0);
    EXPECT_EQ(loop.UpOrDown() + loop.PBorGainStr() + loop.MinOrSecPerRep(), "uppbmin/rep");
    EXPECT_EQ(loop.IdealParallelSeries(), "ideal");
    loop.SetdUnits("Minutes");
    EXPECT_EQ(loop.DUnitsString(), "minutes");
    loop.SetdUnits("s");
    EXPECT_EQ(loop.FilterUnitsString(), "seconds");  // "Same As D"
    loop.SetFilterUnits("Hertz");
    EXPECT_EQ(loop.FilterUnitsLong(), 3);
    EXPECT_EQ(loop.FilterUnitsString(), "hertz");
    loop.SetFilterUnits("hertz");
    EXPECT_EQ(loop.FilterUnits(), "Same As D");
    loop.SetControllerString("orsi loop 12");
    EXPECT_FALSE(loop.OrsiLoop());
    loop.SetControllerString("Orsi LOOP");
    EXPECT_FALSE(loop.OrsiLoop());
    EXPECT_FALSE(loop.SamplingAffectsID());

    // A copy takes the settings but not the number, the control or the state.
    loop.SetNumber(4);
    loop.SetSPChannel(9);
    loop.SetControllerString("Orsi LOOP 3");
    loop.SetFilterUnits("Minutes");
    loop.SetControl(2);
    loop.SetCurrentP(40.0);
    loop.SetUnFilterPV(true);
    LoopClass copy(tp.platform);
    copy.CopyFrom(&loop);
    copy.CopyFrom(nullptr);
    EXPECT_EQ(copy.SPChannel(), 9);
    EXPECT_TRUE(copy.OrsiLoop());
    EXPECT_EQ(copy.FilterUnits(), "Minutes");
    EXPECT_EQ(copy.Number(), 1);
    EXPECT_EQ(copy.Control(), 1);
    EXPECT_EQ(copy.CurrentP(), 0.0);
    EXPECT_FALSE(copy.UnFilterPV());
    EXPECT_TRUE(tp.dialogs.Messages().empty());
}

TEST(LoopClass, FaceplateLoopKeepsItsChannelsAndSettings) {
    LoopFile f(9,
               "[PIDController Loop 1]\nPVChannel=7\nSPChannel=8\nCurrentP=3\nCurrentD=4\n"
               "Description=Boiler\nUnFilterPV=1\n");
    LoopClass loop(f.tp.platform);
    loop.SetCurrentD(2.0);
    loop.ReadFromDisk(f.tunFile);
    EXPECT_EQ(loop.PVChannel(), 1);
    EXPECT_EQ(loop.SPChannel(), 3);
    EXPECT_EQ(loop.CurrentP(), 0.0);
    EXPECT_EQ(loop.CurrentD(), 0.0);
    EXPECT_EQ(loop.Description(), "Boiler");
    EXPECT_TRUE(loop.UnFilterPV());

    LoopFile noFaceplate(5, "[PIDController Loop 1]\nPVChannel=7\nCurrentP=3\n");
    LoopClass other(noFaceplate.tp.platform);
    other.ReadFromDisk(noFaceplate.tunFile);
    EXPECT_EQ(other.PVChannel(), 7);
    EXPECT_EQ(other.SPChannel(), 0);
    EXPECT_EQ(other.CurrentP(), 3.0);
    EXPECT_EQ(other.Description(), "New Loop");
}

TEST(LoopClass, ReadsALoopSectionWithItsDefaultsAndRules) {
    LoopFile f(9,
               "[PIDController Loop 2]\nintegral_units=3\nresponse_direction=5\n"
               "pb_or_gain=2\nPB_multiplier=0.1\nDerivative_multiplier=1e300\n"
               "controller_type=2\nCurrentI=1.5\nInverseProcess=-1\n");
    LoopClass loop(f.tp.platform);
    loop.SetNumber(2);
    loop.SetFilterUnits("Hertz");
    loop.ReadFromDisk(f.tunFile);
    EXPECT_EQ(loop.PVChannel(), 1);
    EXPECT_EQ(loop.COChannel(), 2);
    EXPECT_EQ(loop.SPChannel(), 0);
    EXPECT_EQ(loop.IntegralUnits(), 3);
    EXPECT_EQ(loop.DUnitsString(), "seconds");
    EXPECT_EQ(loop.ResponseDirection(), 1);
    EXPECT_EQ(loop.PBorGain(), 2);
    EXPECT_EQ(loop.PMultiplier(), static_cast<double>(0.1f));
    EXPECT_EQ(loop.IMultiplier(), 1.0);
    EXPECT_EQ(loop.DMultiplier(), std::numeric_limits<float>::max());
    EXPECT_EQ(loop.ControllerString(), "Parallel");
    EXPECT_EQ(loop.CurrentI(), 1.5);
    EXPECT_TRUE(loop.InverseProcess());
    EXPECT_EQ(loop.FilterUnits(), "Hertz");  // missing: keeps its own

    LoopFile plain(9, "[PIDController Loop 2]\ncontroller_type=7\n");
    plain.tunFile.SetTunerType(10);
    loop.ReadFromDisk(plain.tunFile);
    EXPECT_EQ(loop.ControllerString(), "Wrong Simulation");
    EXPECT_EQ(loop.dUnits(), "min");
}

TEST(LoopClass, WrittenLoopReadsBackWithTheStateOnlyFromWriteCurrentPIDF) {
    LoopFile f(9);
    LoopClass loop(f.tp.platform);
    loop.SetNumber(2);
    loop.SetDescription("Steam flow");
    loop.SetSPChannel(6);
    loop.SetResponseDirection(-1);
    loop.SetIntegralUnits(4);
    loop.SetControllerSI(0.2);
    loop.SetFilterUnits("Seconds");
    loop.SetCurrentP(12.5);
    loop.SetUnFilterPV(true);
    loop.WriteToDisk(f.tunFile);
    EXPECT_FALSE(f.Has(2, "CurrentP"));
    EXPECT_FALSE(f.Has(2, "UnFilterPV"));
    loop.WriteCurrentPIDF(f.tunFile);

    LoopClass back(f.tp.platform);
    back.SetNumber(2);
    back.ReadFromDisk(f.tunFile);
    EXPECT_EQ(back.Description(), "Steam flow");
    EXPECT_EQ(back.SPChannel(), 6);
    EXPECT_EQ(back.ResponseDirection(), -1);
    EXPECT_EQ(back.dUnits(), "sec");
    EXPECT_EQ(back.ControllerSI(), 0.2);
    EXPECT_EQ(back.FilterUnits(), "Seconds");
    EXPECT_EQ(back.CurrentP(), 12.5);
    EXPECT_TRUE(back.UnFilterPV());
    EXPECT_EQ(back.ControllerString(), "Corvalent Simulation");

    // Another kind's simulation controller; the faceplate loop keeps no state.
    LoopFile wrong(11);
    LoopClass faceplate(wrong.tp.platform);
    faceplate.SetCurrentP(5.0);
    faceplate.WriteToDisk(wrong.tunFile);
    faceplate.WriteCurrentPIDF(wrong.tunFile);
    EXPECT_EQ(
        wrong.tunFile.IniFileObject().ReadString(LoopClass::SectionName(1), "ControllerString", ""),
        "Wrong Simulation");
    EXPECT_FALSE(wrong.Has(1, "CurrentP"));
    EXPECT_TRUE(wrong.Has(1, "UnFilterPV"));
}

}  // namespace
}  // namespace cv
