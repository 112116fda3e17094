#include <gtest/gtest.h>

#include <fstream>
#include <sstream>

#include "document/TunFileGeneral.h"
#include "document/TunerType.h"
#include "stores/IniFile.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

void WriteText(const std::string& sPath, const std::string& sText) {
    std::ofstream(sPath, std::ios::binary) << sText;
}

std::string ReadText(const std::string& sPath) {
    std::ostringstream text;
    text << std::ifstream(sPath, std::ios::binary).rdbuf();
    return text.str();
}

struct GeneralFile {
    test::TestPlatform tp;
    IniFile ini{tp.platform.profiles};
    TunFileGeneral general{tp.platform};
    std::string path = tp.folder.File("general.tun");

    GeneralFile() { ini.SetFileName(path); }
    bool Has(const std::string& sSection, const std::string& sItem) const {
        return ini.ReadString(sSection, sItem, "<missing>") != "<missing>";
    }
};

TEST(TunFileGeneralDisk, ReadsEverySettingWithItsRules) {
    GeneralFile f;
    WriteText(f.tp.folder.File("Corvalen.ini"), "[Faceplate]\nWriteDisabled=-1\n");
    WriteText(f.path,
              "[DDE]\nDDE_sample_interval=0.0249\nuse_hot_links=0\nDDE_UniqueWriteLocs=1\n"
              "Scan_Mode=0\nDDE_ScalePVandCO=1\nDDE_ScaleSP=-1\nDDE_Item_AutoModeDetect=AUT\n"
              "Modes=3\nModeKey1=CAS\nModeValue1=Cascade\nModeAuto1=0\nModeValue2=Remote\n"
              "ModeKey3=LO\nDDE_Timeout=10\n"
              "[TrendOptions]\nUserSetDisplayRanges=1\n[Advanced]\nMaxNumberOfPoints=4096\n");
    f.general.SetDDETimeout(300);
    f.general.SetABIntegerFile(true);
    f.general.SetRovisysPidBlock(7);
    f.general.SetComType(4);
    f.general.ReadFromDisk(f.ini);

    EXPECT_TRUE(f.general.WriteDisabled());
    EXPECT_EQ(f.general.SIinMSec(), 25);
    EXPECT_FALSE(f.general.UseHotLinks());
    EXPECT_TRUE(f.general.UniqueWriteLocs());
    EXPECT_FALSE(f.general.ScanMode());
    EXPECT_TRUE(f.general.ScalePVandCO());
    EXPECT_TRUE(f.general.ScaleSP());
    EXPECT_FALSE(f.general.ABIntegerFile());
    EXPECT_EQ(f.general.RovisysPidBlock(), -1);
    EXPECT_EQ(f.general.AutoModeDetect(), "AUT");
    EXPECT_EQ(f.general.ManualModeDetect(), "Manual");
    ASSERT_EQ(f.general.ModeCount(), 5);
    EXPECT_EQ(f.general.ModeKey(3), "CAS");
    EXPECT_EQ(f.general.ModeValue(3), "Cascade");
    EXPECT_FALSE(f.general.ModeAuto(3));
    EXPECT_EQ(f.general.ModeKey(4), "2");  // a missing key reads as its number
    EXPECT_EQ(f.general.ModeValue(4), "Remote");
    EXPECT_TRUE(f.general.ModeAuto(4));
    EXPECT_EQ(f.general.ModeKey(5), "LO");
    EXPECT_EQ(f.general.ModeValue(5), "");
    EXPECT_EQ(f.general.DDETimeout(), 300);  // 10 is below 50 and ignored
    EXPECT_TRUE(f.general.UserSetDisplayRanges());
    EXPECT_EQ(f.general.ComType(), 0);
    EXPECT_EQ(f.general.MaxNumberOfPoints(), 4096);
    EXPECT_TRUE(f.tp.dialogs.Messages().empty());
}

TEST(TunFileGeneralDisk, ModeCountFollowsTheFileWithinItsLimits) {
    GeneralFile f;
    WriteText(f.path, "[DDE]\nModes=25\nModeKey3=\nDDE_sample_interval=99\n");
    f.general.SetSIinSec(2.0);
    f.general.ReadFromDisk(f.ini);
    EXPECT_EQ(f.general.ModeCount(), 20);
    EXPECT_EQ(f.general.ModeKey(5), "");  // present but empty is not missing
    EXPECT_EQ(f.general.ModeKey(6), "4");
    EXPECT_EQ(f.general.SIinMSec(), 2000);  // 99 s is out of range

    WriteText(f.path, "[DDE]\n");
    f.general.ReadFromDisk(f.ini);
    EXPECT_EQ(f.general.ModeCount(), 2);
    EXPECT_EQ(f.general.SIinMSec(), 1000);
    EXPECT_EQ(f.general.MaxNumberOfPoints(), 1024);
    EXPECT_FALSE(f.general.WriteDisabled());
}

TEST(TunFileGeneralDisk, WrittenSettingsReadBack) {
    GeneralFile f;
    WriteText(f.path, "[PIDTuningSelections]\nEngineering_Units=1\nKeep=yes\n");
    TunerType kind(f.tp.platform);
    kind.SetTuner(9);
    f.general.SetSIinSec(0.035);
    f.general.SetUseHotLinks(false);
    f.general.SetScanMode(false);
    f.general.SetScaleSP(true);
    f.general.SetABIntegerFile(true);
    f.general.SetManualModeDetect("MAN");
    f.general.SetMode(3, "CAS", "Cascade");
    f.general.SetMode(4, "RM", "Remote");
    f.general.SetModeAuto(3, true);
    f.general.SetDDETimeout(250);
    f.general.SetUserSetDisplayRanges(true);
    f.general.WriteToDisk(f.ini, kind);

    const std::string text = ReadText(f.path);
    EXPECT_NE(text.find("DDE_ABIntegerFile=1"), std::string::npos) << text;
    EXPECT_NE(text.find("Scan_Mode=0"), std::string::npos) << text;
    EXPECT_FALSE(f.Has("PIDTuningSelections", "Engineering_Units"));
    EXPECT_TRUE(f.Has("PIDTuningSelections", "Keep"));
    EXPECT_FALSE(f.Has("Advanced", "MaxNumberOfPoints"));

    TunFileGeneral back(f.tp.platform);
    back.ReadFromDisk(f.ini);
    EXPECT_EQ(back.SIinMSec(), 35);
    EXPECT_FALSE(back.UseHotLinks());
    EXPECT_FALSE(back.ScanMode());
    EXPECT_TRUE(back.ScaleSP());
    EXPECT_FALSE(back.ABIntegerFile());  // written, but never read
    EXPECT_EQ(back.ManualModeDetect(), "MAN");
    ASSERT_EQ(back.ModeCount(), 4);
    EXPECT_EQ(back.ModeKey(3), "CAS");
    EXPECT_TRUE(back.ModeAuto(3));
    EXPECT_EQ(back.ModeValue(4), "Remote");
    EXPECT_FALSE(back.ModeAuto(4));
    EXPECT_EQ(back.DDETimeout(), 250);
    EXPECT_TRUE(back.UserSetDisplayRanges());
}

TEST(TunFileGeneralDisk, ShorterModeTableErasesTheStaleKeys) {
    GeneralFile f;
    TunerType kind(f.tp.platform);
    kind.SetTuner(1);
    for (int32_t row = 3; row <= 6; ++row) {
        f.general.SetMode(row, "K" + std::to_string(row), "V");
    }
    f.general.WriteToDisk(f.ini, kind);
    ASSERT_TRUE(f.Has("DDE", "ModeAuto4"));

    f.general.SetModeCount(3);
    f.general.WriteToDisk(f.ini, kind);
    EXPECT_EQ(f.ini.ReadLong("DDE", "Modes", 0, 0, 0), 1);
    EXPECT_TRUE(f.Has("DDE", "ModeKey1"));
    for (const char* key : {"ModeKey2", "ModeValue3", "ModeAuto4", "ModeKey4"}) {
        EXPECT_FALSE(f.Has("DDE", key)) << key;
    }

    f.general.SetModeCount(2);
    f.general.WriteToDisk(f.ini, kind);
    for (const char* key : {"Modes", "ModeKey1", "ModeValue1", "ModeAuto1"}) {
        EXPECT_FALSE(f.Has("DDE", key)) << key;
    }
    EXPECT_EQ(f.ini.ReadString("DDE", "DDE_Item_AutoModeDetect", ""), "Auto");
}

TEST(TunFileGeneralDisk, KindDecidesWhatIsWritten) {
    GeneralFile f;
    const std::string original =
        "[DDE]\r\nModes=2\r\nModeKey2=X\r\nScan_Mode=1\r\n"
        "[PIDTuningSelections]\r\nEngineering_Units=1\r\n";
    WriteText(f.path, original);
    f.general.SetScanMode(false);
    TunerType kind(f.tp.platform);
    kind.SetTuner(5);  // no faceplate: the file stays as it is
    f.general.WriteToDisk(f.ini, kind);
    EXPECT_EQ(ReadText(f.path), original);

    kind.SetTuner(2);  // faceplate without the full edit screen
    f.general.SetDDETimeout(70);
    f.general.WriteToDisk(f.ini, kind);
    EXPECT_EQ(f.ini.ReadLong("DDE", "DDE_Timeout", 0, 0, 0), 70);
    EXPECT_TRUE(f.Has("DDE", "use_hot_links"));
    EXPECT_TRUE(f.ini.ReadBoolean("DDE", "Scan_Mode", false));
    EXPECT_TRUE(f.Has("DDE", "ModeKey2"));
    EXPECT_FALSE(f.Has("DDE", "DDE_Item_AutoModeDetect"));
    EXPECT_FALSE(f.Has("PIDTuningSelections", "Engineering_Units"));
    EXPECT_TRUE(f.tp.dialogs.Messages().empty());
}

}  // namespace
}  // namespace cv
