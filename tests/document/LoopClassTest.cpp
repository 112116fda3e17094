#include "document/LoopClass.h"

#include <fstream>
#include <limits>
#include <tuple>

#include <gtest/gtest.h>

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
    EXPECT_EQ(loop.UpOrDown() + loop.PBorGainStr() + loop.MinOrSecPerRep(), "uppbmin/rep");
    loop.SetdUnits("s");
    EXPECT_EQ(loop.FilterUnitsString(), "seconds");  // "Same As D"
    loop.SetFilterUnits("Hertz");
    EXPECT_EQ(std::tuple(loop.FilterUnitsLong(), loop.FilterUnitsString()), std::tuple(3, "hertz"));
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
    EXPECT_EQ(std::tuple(copy.SPChannel(), copy.OrsiLoop(), copy.FilterUnits()),
              std::tuple(9, true, "Minutes"));
    EXPECT_EQ(std::tuple(copy.Number(), copy.Control(), copy.CurrentP(), copy.UnFilterPV()),
              std::tuple(1, 1, 0.0, false));
    EXPECT_TRUE(tp.dialogs.Messages().empty());
}

TEST(LoopClass, ReadsALoopSectionWithItsDefaultsAndRules) {
    LoopFile f(9,
               "[PIDController Loop 1]\nPVChannel=7\nSPChannel=8\nCurrentP=3\nCurrentD=4\n"
               "Description=Boiler\nUnFilterPV=1\n"
               "[PIDController Loop 2]\nintegral_units=3\nresponse_direction=5\n"
               "pb_or_gain=2\nPB_multiplier=0.1\nDerivative_multiplier=1e300\n"
               "controller_type=2\nCurrentI=1.5\nInverseProcess=-1\n");
    LoopClass faceplate(f.tp.platform);  // keeps its channels and has no state
    faceplate.SetCurrentD(2.0);
    faceplate.ReadFromDisk(f.tunFile);
    EXPECT_EQ(std::tuple(faceplate.PVChannel(), faceplate.SPChannel(), faceplate.CurrentP(),
                         faceplate.CurrentD(), faceplate.Description(), faceplate.UnFilterPV()),
              std::tuple(1, 3, 0.0, 0.0, "Boiler", true));

    LoopClass loop(f.tp.platform);
    loop.SetNumber(2);
    loop.SetFilterUnits("Hertz");
    loop.ReadFromDisk(f.tunFile);
    EXPECT_EQ(std::tuple(loop.PVChannel(), loop.COChannel(), loop.SPChannel(), loop.IntegralUnits(),
                         loop.DUnitsString(), loop.ResponseDirection(), loop.PBorGain(),
                         loop.ControllerString()),
              std::tuple(1, 2, 0, 3, "seconds", 1, 2, "Parallel"));
    EXPECT_EQ(std::tuple(loop.PMultiplier(), loop.IMultiplier(), loop.DMultiplier()),
              std::tuple(static_cast<double>(0.1f), 1.0, std::numeric_limits<float>::max()));
    EXPECT_EQ(std::tuple(loop.CurrentI(), loop.InverseProcess(), loop.FilterUnits()),
              std::tuple(1.5, true, "Hertz"));  // a missing filter unit keeps its own

    LoopFile plain(10, "[PIDController Loop 2]\ncontroller_type=7\n");
    loop.ReadFromDisk(plain.tunFile);
    EXPECT_EQ(std::tuple(loop.ControllerString(), loop.dUnits()),
              std::tuple("Wrong Simulation", "min"));

    LoopFile noFaceplate(5, "[PIDController Loop 1]\nPVChannel=7\nCurrentP=3\n");
    LoopClass other(noFaceplate.tp.platform);
    other.ReadFromDisk(noFaceplate.tunFile);
    EXPECT_EQ(
        std::tuple(other.PVChannel(), other.SPChannel(), other.CurrentP(), other.Description()),
        std::tuple(7, 0, 3.0, "New Loop"));
}

TEST(LoopClass, WrittenLoopReadsBackWithTheStateOnlyFromWriteCurrentPIDF) {
    LoopFile f(9);
    LoopClass loop(f.tp.platform);
    loop.SetNumber(2);
    loop.SetDescription(" Steam flow ");  // texts a read would trim or unquote
    loop.SetControllerString("'Brand' PID");
    loop.SetCurrentP(12.5);
    loop.SetUnFilterPV(true);
    loop.WriteToDisk(f.tunFile);
    EXPECT_FALSE(f.Has(2, "CurrentP"));
    EXPECT_FALSE(f.Has(2, "UnFilterPV"));
    loop.WriteCurrentPIDF(f.tunFile);

    LoopClass back(f.tp.platform);
    back.SetNumber(2);
    back.ReadFromDisk(f.tunFile);
    EXPECT_EQ(
        std::tuple(back.Description(), back.CurrentP(), back.UnFilterPV(), back.ControllerString()),
        std::tuple(" Steam flow ", 12.5, true, "'Brand' PID"));
    loop.SetControllerString("Corvalent Simulation");
    loop.WriteToDisk(f.tunFile);
    back.ReadFromDisk(f.tunFile);
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
