#include "document/TunFileGeneral.h"

#include <tuple>

#include <gtest/gtest.h>

#include "document/TunerType.h"
#include "stores/IniFile.h"
#include "support/TestFiles.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

// The mode rows as key=value followed by + for auto, - for not.
std::string Modes(const TunFileGeneral& general) {
    std::string text;
    for (int32_t i = 1; i <= general.ModeCount(); ++i) {
        text += (i > 1 ? " " : "") + general.ModeKey(i) + "=" + general.ModeValue(i) +
                (general.ModeAuto(i) ? "+" : "-");
    }
    return text;
}

TEST(TunFileGeneral, SampleIntervalIsQuantisedHalvesToEven) {
    test::TestPlatform tp;
    TunFileGeneral general(tp.platform);
    // Each assignment starts from 5000 ms so a refusal shows as 5000.
    const std::pair<double, int32_t> cases[] = {
        {0.0249, 25},   {0.0174, 5000}, {0.02, 20},     {61.004, 61000}, {61.006, 5000},
        {1.125, 1120},  {1.375, 1380},  {0.0125, 5000}, {0.0375, 40},    {0.0625, 60},
        {0.9975, 1000}, {0.9999, 1000}, {-0.5, 5000},   {1e300, 5000}};
    for (const auto& [typed, milliseconds] : cases) {
        general.SetSIinSec(5.0);
        general.SetSIinSec(typed);
        EXPECT_EQ(general.SIinMSec(), milliseconds) << "typed " << typed;
    }
    general.SetSIinSec(0.035);
    EXPECT_DOUBLE_EQ(general.SIinSec(), 0.035);
    EXPECT_TRUE(tp.dialogs.Messages().empty());

    // ValidateSI hands back the quantised value.
    std::string message = "untouched";
    double si = 61.0;
    EXPECT_TRUE(general.ValidateSI(si, message));
    EXPECT_EQ(message, "untouched");
    si = 0.0174;
    EXPECT_FALSE(general.ValidateSI(si, message));
    EXPECT_DOUBLE_EQ(si, 0.015);
    EXPECT_EQ(message, "Please enter a sample interval in the range 0.02 to 61 seconds.");
    si = 1.005;  // just below 100.5 steps in binary
    EXPECT_TRUE(general.ValidateSI(si, message));
    EXPECT_DOUBLE_EQ(si, 1.0);
    test::TestPlatform comma(fake::FixedLocale::Comma());
    si = 100.0;
    EXPECT_FALSE(TunFileGeneral(comma.platform).ValidateSI(si, message));
    EXPECT_EQ(message, "Please enter a sample interval in the range 0,02 to 61 seconds.");
}

TEST(TunFileGeneral, ModeTableGrowsAndShrinksWithinBounds) {
    test::TestPlatform tp;
    TunFileGeneral general(tp.platform);
    general.SetMode(4, "CAS", "Cascade");
    general.SetModeAuto(4, true);
    const std::string sFour = "Auto=Auto+ Manual=Manual- =- CAS=Cascade+";
    EXPECT_EQ(Modes(general), sFour);
    for (int32_t ignored : {1, 21, 0, -3}) {
        general.SetModeCount(ignored);
    }
    general.SetMode(21, "X", "Y");
    general.SetMode(0, "X", "Y");
    EXPECT_EQ(Modes(general), sFour);
    general.SetModeCount(20);
    general.SetModeCount(4);
    EXPECT_EQ(Modes(general), sFour);
    general.SetModeCount(3);
    EXPECT_EQ(std::tuple(general.ModeKey(4), general.ModeValue(4), general.ModeAuto(4)),
              std::tuple("ModeKey?", "ModeValue?", false));
    EXPECT_EQ(general.ModeKey(0), "ModeKey?");
    general.SetModeCount(4);
    EXPECT_EQ(Modes(general), "Auto=Auto+ Manual=Manual- =- =-");

    general.SetDDETimeout(49);
    EXPECT_EQ(general.DDETimeout(), 50);  // never below 50
    general.SetDDETimeout(200);
    general.SetDDETimeout(-5);
    EXPECT_EQ(general.DDETimeout(), 200);
}

TEST(TunFileGeneral, RowsOneAndTwoChangeOnlyTheirKeysAndFillTheModeMap) {
    test::TestPlatform tp;
    TunFileGeneral general(tp.platform);
    general.SetMode(2, "MAN", "Hand");
    general.SetMode(1, "AUT", "Automatic");
    general.SetModeAuto(1, false);
    general.SetModeAuto(2, true);
    EXPECT_EQ(Modes(general), "AUT=Auto+ MAN=Manual-");
    EXPECT_EQ(general.AutoModeDetect() + general.ManualModeDetect(), "AUTMAN");
    general.SetAutoModeDetect("Auto");
    general.SetManualModeDetect("M");
    EXPECT_EQ(Modes(general), "Auto=Auto+ M=Manual-");

    general.SetMode(3, "CAS\r\n", "Cascade");
    general.SetMode(4, "", "");
    general.SetMode(5, "", "");
    ModeMapClass map = general.FillModeMap();
    ASSERT_EQ(map.GetModeMapSize(), 4);
    EXPECT_EQ(map.GetModeMapKeyByPos(1), "Auto");
    EXPECT_EQ(map.GetModeMapValue("M"), "Manual");
    EXPECT_EQ(map.GetModeMapKeyByPos(4), "");
}

using test::Slurp;
using test::Spill;

struct GeneralFile : testing::Test {
    GeneralFile() { ini.SetFileName(path); }
    bool Has(const std::string& sSection, const std::string& sItem) const {
        return ini.ReadString(sSection, sItem, "<missing>") != "<missing>";
    }
    test::TestPlatform tp;
    IniFile ini{tp.platform.profiles};
    TunFileGeneral general{tp.platform};
    std::string path = tp.folder.File("general.tun");
    TunerType kind{tp.platform};
};

TEST_F(GeneralFile, ReadsEverySettingWithItsRules) {
    Spill(tp.folder.File("Corvalen.ini"), "[Faceplate]\nWriteDisabled=-1\n");
    Spill(path,
          "[DDE]\nDDE_sample_interval=0.0249\nuse_hot_links=0\nDDE_UniqueWriteLocs=1\n"
          "Scan_Mode=0\nDDE_ScalePVandCO=1\nDDE_ScaleSP=-1\nDDE_Item_AutoModeDetect=AUT\n"
          "Modes=3\nModeKey1=CAS\nModeValue1=Cascade\nModeAuto1=0\nModeValue2=Remote\n"
          "ModeKey3=LO\nDDE_Timeout=10\n"
          "[TrendOptions]\nUserSetDisplayRanges=1\n[Advanced]\nMaxNumberOfPoints=4096\n");
    general.SetDDETimeout(300);
    general.SetABIntegerFile(true);
    general.SetRovisysPidBlock(7);
    general.SetComType(4);
    general.ReadFromDisk(ini);

    EXPECT_EQ(std::tuple(general.WriteDisabled(), general.SIinMSec(), general.UseHotLinks(),
                         general.UniqueWriteLocs(), general.ScanMode(), general.ScalePVandCO(),
                         general.ScaleSP(), general.UserSetDisplayRanges()),
              std::tuple(true, 25, false, true, false, true, true, true));
    // Not read: reset. Timeout 10 is below 50 and ignored.
    EXPECT_EQ(std::tuple(general.ABIntegerFile(), general.RovisysPidBlock(), general.ComType(),
                         general.DDETimeout(), general.MaxNumberOfPoints()),
              std::tuple(false, -1, 0, 300, 4096));
    EXPECT_EQ(Modes(general), "AUT=Auto+ Manual=Manual- CAS=Cascade- 2=Remote+ LO=+");
    EXPECT_TRUE(tp.dialogs.Messages().empty());

    Spill(path, "[DDE]\nModes=25\nModeKey3=\nDDE_sample_interval=99\n");
    general.SetSIinSec(2.0);
    general.ReadFromDisk(ini);
    ASSERT_EQ(general.ModeCount(), 20);
    EXPECT_EQ(general.ModeKey(5), "");    // present but empty is not missing
    EXPECT_EQ(general.ModeKey(6), "4");   // a missing key reads as its number
    EXPECT_EQ(general.SIinMSec(), 2000);  // 99 s is out of range

    Spill(path, "[DDE]\n");
    general.ReadFromDisk(ini);
    EXPECT_EQ(general.ModeCount(), 2);
    EXPECT_EQ(general.SIinMSec(), 1000);
}

TEST_F(GeneralFile, WrittenSettingsReadBack) {
    Spill(path, "[PIDTuningSelections]\nEngineering_Units=1\nKeep=yes\n");
    kind.SetTuner(9);
    general.SetSIinSec(0.035);
    general.SetScanMode(false);
    general.SetABIntegerFile(true);
    // Texts a read would trim or unquote.
    general.SetAutoModeDetect(" AUTO ");
    general.SetModeCount(3);
    general.SetMode(3, "'CAS'", "\"Cascade\" ");
    general.WriteToDisk(ini, kind);

    const std::string text = Slurp(path);
    EXPECT_NE(text.find("DDE_ABIntegerFile=1"), std::string::npos) << text;
    EXPECT_NE(text.find("Scan_Mode=0"), std::string::npos) << text;
    EXPECT_FALSE(Has("PIDTuningSelections", "Engineering_Units"));
    EXPECT_TRUE(Has("PIDTuningSelections", "Keep"));
    EXPECT_FALSE(Has("Advanced", "MaxNumberOfPoints"));

    TunFileGeneral back(tp.platform);
    back.ReadFromDisk(ini);
    EXPECT_EQ(std::tuple(back.SIinMSec(), back.ScanMode(), back.ABIntegerFile()),
              std::tuple(35, false, false));  // ABIntegerFile is never read
    EXPECT_EQ(std::tuple(back.AutoModeDetect(), back.ModeKey(3), back.ModeValue(3)),
              std::tuple(" AUTO ", "'CAS'", "\"Cascade\" "));
}

TEST_F(GeneralFile, ShorterModeTableErasesTheStaleKeys) {
    kind.SetTuner(1);
    for (int32_t row = 3; row <= 6; ++row) {
        general.SetMode(row, "K" + std::to_string(row), "V");
    }
    general.WriteToDisk(ini, kind);
    ASSERT_TRUE(Has("DDE", "ModeAuto4"));

    general.SetModeCount(3);
    general.WriteToDisk(ini, kind);
    EXPECT_EQ(ini.ReadLong("DDE", "Modes", 0, 0, 0), 1);
    EXPECT_TRUE(Has("DDE", "ModeKey1"));
    for (const char* key : {"ModeKey2", "ModeValue3", "ModeAuto4", "ModeKey4"}) {
        EXPECT_FALSE(Has("DDE", key)) << key;
    }

    general.SetModeCount(2);
    general.WriteToDisk(ini, kind);
    for (const char* key : {"Modes", "ModeKey1", "ModeValue1", "ModeAuto1"}) {
        EXPECT_FALSE(Has("DDE", key)) << key;
    }
    EXPECT_EQ(ini.ReadString("DDE", "DDE_Item_AutoModeDetect", ""), "Auto");
}

TEST_F(GeneralFile, KindDecidesWhatIsWritten) {
    const std::string original =
        "[DDE]\r\nModes=2\r\nModeKey2=X\r\nScan_Mode=1\r\n"
        "[PIDTuningSelections]\r\nEngineering_Units=1\r\n";
    Spill(path, original);
    general.SetScanMode(false);
    kind.SetTuner(5);  // no faceplate: the file stays as it is
    general.WriteToDisk(ini, kind);
    EXPECT_EQ(Slurp(path), original);

    kind.SetTuner(2);  // faceplate without the full edit screen
    general.SetDDETimeout(70);
    general.WriteToDisk(ini, kind);
    EXPECT_EQ(ini.ReadLong("DDE", "DDE_Timeout", 0, 0, 0), 70);
    EXPECT_TRUE(Has("DDE", "use_hot_links"));
    EXPECT_TRUE(ini.ReadBoolean("DDE", "Scan_Mode", false));
    EXPECT_TRUE(Has("DDE", "ModeKey2"));
    EXPECT_FALSE(Has("DDE", "DDE_Item_AutoModeDetect"));
    EXPECT_FALSE(Has("PIDTuningSelections", "Engineering_Units"));
    EXPECT_TRUE(tp.dialogs.Messages().empty());
}

}  // namespace
}  // namespace cv
