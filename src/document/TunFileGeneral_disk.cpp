#include <string>

#include "document/TunFileGeneral.h"
#include "document/TunerType.h"
#include "platform/Platform.h"
#include "stores/IniFile.h"

namespace cv {

namespace {

constexpr const char* kDDE = "DDE";
// The user modes the file may hold: the table's rows beyond the two fixed ones.
constexpr int32_t kMaxUserModes = TunFileGeneral::kMaxModes - TunFileGeneral::kMinModes;

}  // namespace

void TunFileGeneral::ReadFromDisk(IniFile& cTunFile) {
    IniFile cShared(mPlatform.profiles);
    cShared.SetFileName("Corvalen.ini");
    mbWriteDisabled = cShared.ReadBoolean("Faceplate", "WriteDisabled", false);

    SetSIinSec(cTunFile.ReadDouble(kDDE, "DDE_sample_interval", 1.0));
    mbUseHotLinks = cTunFile.ReadBoolean(kDDE, "use_hot_links", true);
    mbUniqueWriteLocs = cTunFile.ReadBoolean(kDDE, "DDE_UniqueWriteLocs", false);
    mbScanMode = cTunFile.ReadBoolean(kDDE, "Scan_Mode", true);
    mbScalePVandCO = cTunFile.ReadBoolean(kDDE, "DDE_ScalePVandCO", false);
    mbScaleSP = cTunFile.ReadBoolean(kDDE, "DDE_ScaleSP", false);
    mbABIntegerFile = false;
    mlRovisysPidBlock = -1;
    SetAutoModeDetect(cTunFile.ReadString(kDDE, "DDE_Item_AutoModeDetect", "Auto"));
    SetManualModeDetect(cTunFile.ReadString(kDDE, "DDE_Item_ManualModeDetect", "Manual"));
    ReadModes(cTunFile);
    SetDDETimeout(cTunFile.ReadLong(kDDE, "DDE_Timeout", 50, 0, 0));

    mbUserSetDisplayRanges = cTunFile.ReadBoolean("TrendOptions", "UserSetDisplayRanges", false);
    mlComType = 0;
    mlMaxNumberOfPoints =
        cTunFile.ReadLong("Advanced", "MaxNumberOfPoints", mlMaxNumberOfPoints, 0, 0);
}

// User mode k is row k + 2; a missing key reads as the number k itself.
void TunFileGeneral::ReadModes(const IniFile& cTunFile) {
    const int32_t lUserModes = cTunFile.ReadLong(kDDE, "Modes", 0, 0, kMaxUserModes);
    SetModeCount(lUserModes + kMinModes);
    for (int32_t k = 1; k <= lUserModes; ++k) {
        const std::string s = std::to_string(k);
        const std::string sKey = cTunFile.ReadString(kDDE, "ModeKey" + s, s);
        const std::string sValue = cTunFile.ReadString(kDDE, "ModeValue" + s, "");
        SetMode(k + kMinModes, sKey, sValue);
        SetModeAuto(k + kMinModes, cTunFile.ReadBoolean(kDDE, "ModeAuto" + s, true));
    }
}

void TunFileGeneral::WriteToDisk(IniFile& cTunFile, cv::TunerType& cTunerType) {
    if (!cTunerType.HasFaceplate()) {
        return;
    }
    IniFile::Batch batch(cTunFile);
    cTunFile.WriteDouble(kDDE, "DDE_sample_interval", SIinSec());
    cTunFile.WriteBoolean(kDDE, "use_hot_links", mbUseHotLinks);
    if (cTunerType.FullEditScreen()) {
        cTunFile.WriteBoolean(kDDE, "DDE_UniqueWriteLocs", mbUniqueWriteLocs);
        cTunFile.WriteBoolean(kDDE, "Scan_Mode", mbScanMode);
        cTunFile.WriteBoolean(kDDE, "DDE_ScalePVandCO", mbScalePVandCO);
        cTunFile.WriteBoolean(kDDE, "DDE_ScaleSP", mbScaleSP);
        cTunFile.WriteBoolean(kDDE, "DDE_ABIntegerFile", mbABIntegerFile);
        cTunFile.WriteText(kDDE, "DDE_Item_AutoModeDetect", AutoModeDetect());
        cTunFile.WriteText(kDDE, "DDE_Item_ManualModeDetect", ManualModeDetect());
        WriteModes(cTunFile);
    }
    cTunFile.EraseItem("PIDTuningSelections", "Engineering_Units");
    WriteTimeoutToDisk(cTunFile);
    WriteUserSetDisplayRanges(cTunFile);
}

// Writes the user modes and erases the numbered keys of any further user
// modes the file held, so no stale rows come back on the next read.
void TunFileGeneral::WriteModes(IniFile& cTunFile) {
    const int32_t lStored = cTunFile.ReadLong(kDDE, "Modes", 0, 0, kMaxUserModes);
    const int32_t lUserModes = ModeCount() - kMinModes;
    if (lUserModes > 0) {
        cTunFile.WriteLong(kDDE, "Modes", lUserModes);
    } else {
        cTunFile.EraseItem(kDDE, "Modes");
    }
    for (int32_t k = 1; k <= lUserModes; ++k) {
        const std::string s = std::to_string(k);
        cTunFile.WriteText(kDDE, "ModeKey" + s, ModeKey(k + kMinModes));
        cTunFile.WriteText(kDDE, "ModeValue" + s, ModeValue(k + kMinModes));
        cTunFile.WriteBoolean(kDDE, "ModeAuto" + s, ModeAuto(k + kMinModes));
    }
    for (int32_t k = lUserModes + 1; k <= lStored; ++k) {
        const std::string s = std::to_string(k);
        cTunFile.EraseItem(kDDE, "ModeKey" + s);
        cTunFile.EraseItem(kDDE, "ModeValue" + s);
        cTunFile.EraseItem(kDDE, "ModeAuto" + s);
    }
}

void TunFileGeneral::WriteTimeoutToDisk(IniFile& cTunFile) {
    cTunFile.WriteLong(kDDE, "DDE_Timeout", mlDDETimeout);
}

void TunFileGeneral::WriteUserSetDisplayRanges(IniFile& cTunFile) {
    cTunFile.WriteBoolean("TrendOptions", "UserSetDisplayRanges", mbUserSetDisplayRanges);
}

}  // namespace cv
