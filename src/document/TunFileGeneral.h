#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "document/ModeEntry.h"
#include "document/ModeMapClass.h"

namespace cv {

class IniFile;
class TunerType;
struct Platform;

// The settings of a tuning document that belong to no single loop or
// channel: sample interval, DDE link behaviour and time-out, scaling
// switches, the controller-mode table and chart options. Writes outside a
// setting's allowed values are ignored and the old value stays.
class TunFileGeneral {
  public:
    explicit TunFileGeneral(Platform& platform);

    // Rounds si (seconds) in place to 5 ms steps below 1 s and 10 ms steps
    // from 1 s, halves to even; true when 0.02 <= si <= 61, otherwise false
    // with the range message for the user.
    bool ValidateSI(double& si, std::string& message) const;

    double SIinSec() const;
    void SetSIinSec(double dSeconds);
    int32_t SIinMSec() const { return mlSIinMSec; }

    bool UseHotLinks() const { return mbUseHotLinks; }
    void SetUseHotLinks(bool bValue) { mbUseHotLinks = bValue; }
    bool UniqueWriteLocs() const { return mbUniqueWriteLocs; }
    void SetUniqueWriteLocs(bool bValue) { mbUniqueWriteLocs = bValue; }
    bool ScanMode() const { return mbScanMode; }
    void SetScanMode(bool bValue) { mbScanMode = bValue; }
    bool ScalePVandCO() const { return mbScalePVandCO; }
    void SetScalePVandCO(bool bValue) { mbScalePVandCO = bValue; }
    bool ScaleSP() const { return mbScaleSP; }
    void SetScaleSP(bool bValue) { mbScaleSP = bValue; }
    bool WriteDisabled() const { return mbWriteDisabled; }
    bool ABIntegerFile() const { return mbABIntegerFile; }
    void SetABIntegerFile(bool bValue) { mbABIntegerFile = bValue; }
    bool UserSetDisplayRanges() const { return mbUserSetDisplayRanges; }
    void SetUserSetDisplayRanges(bool bValue) { mbUserSetDisplayRanges = bValue; }

    int32_t RovisysPidBlock() const { return mlRovisysPidBlock; }
    void SetRovisysPidBlock(int32_t lValue) { mlRovisysPidBlock = lValue; }
    int32_t ComType() const { return mlComType; }
    void SetComType(int32_t lValue) { mlComType = lValue; }
    int32_t MaxNumberOfPoints() const { return mlMaxNumberOfPoints; }
    void SetMaxNumberOfPoints(int32_t lValue) { mlMaxNumberOfPoints = lValue; }

    // Never below 50 ms: smaller values are ignored.
    int32_t DDETimeout() const { return mlDDETimeout; }
    void SetDDETimeout(int32_t lValue);

    // The mode table, rows 1 to ModeCount (2 to 20). Row 1 is automatic and
    // row 2 manual; of those two only the keys can change.
    std::string AutoModeDetect() const { return maModes[0].Key; }
    void SetAutoModeDetect(const std::string& sKey) { maModes[0].Key = sKey; }
    std::string ManualModeDetect() const { return maModes[1].Key; }
    void SetManualModeDetect(const std::string& sKey) { maModes[1].Key = sKey; }
    int32_t ModeCount() const;
    void SetModeCount(int32_t lCount);
    std::string ModeKey(int32_t lIndex) const;
    std::string ModeValue(int32_t lIndex) const;
    bool ModeAuto(int32_t lIndex) const;
    void SetModeAuto(int32_t lIndex, bool bAuto);
    void SetMode(int32_t lIndex, const std::string& sKey, const std::string& sValue);

    // A new mode map holding the rows in order (repeated keys or values are
    // dropped by the map).
    ModeMapClass FillModeMap() const;

    // The settings in the tuning file's sections "DDE", "TrendOptions" and
    // "Advanced"; WriteDisabled comes from the shared settings file
    // "Corvalen.ini". Values outside their allowed set are ignored.
    void ReadFromDisk(IniFile& cTunFile);
    // Writes nothing for a tuner kind without faceplate; the scan, scaling
    // and mode-table keys only for a kind with the full edit screen, then
    // erasing the numbered mode keys of a longer table the file held.
    void WriteToDisk(IniFile& cTunFile, cv::TunerType& cTunerType);
    void WriteTimeoutToDisk(IniFile& cTunFile);
    void WriteUserSetDisplayRanges(IniFile& cTunFile);

    static constexpr int32_t kMinModes = 2;
    static constexpr int32_t kMaxModes = 20;

  private:
    bool IsRow(int32_t lIndex) const;
    void ReadModes(const IniFile& cTunFile);
    void WriteModes(IniFile& cTunFile);

    Platform& mPlatform;
    int32_t mlSIinMSec = 1000;
    bool mbUseHotLinks = true;
    bool mbUniqueWriteLocs = false;
    bool mbScanMode = true;
    bool mbScalePVandCO = false;
    bool mbScaleSP = false;
    bool mbWriteDisabled = false;
    bool mbABIntegerFile = false;
    int32_t mlRovisysPidBlock = -1;
    int32_t mlDDETimeout = 50;
    bool mbUserSetDisplayRanges = false;
    int32_t mlComType = 0;
    std::vector<ModeEntry> maModes;
    int32_t mlMaxNumberOfPoints = 1024;
};

}  // namespace cv
