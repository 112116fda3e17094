#pragma once

#include <array>
#include <cstdint>
#include <string>

namespace cv {

class TunFile;
struct Platform;

// One PID loop of a tuning document: its name, the archive channels of its
// PV, CO and SP, the controller's algorithm text and unit conventions, and
// the current P, I, D and filter settings. Stored in the tuning file's
// section "PIDController Loop <Number>". Writes of codes outside their
// allowed set are ignored and the old value stays.
class LoopClass {
  public:
    // The filter-unit names by code, 0 to 3.
    static constexpr std::array<const char*, 4> kFilterUnitNames = {"Same As D", "Seconds",
                                                                    "Minutes", "Hertz"};

    // The controller string of a new loop is the default controller of this
    // program's own tuner kind.
    explicit LoopClass(Platform& platform);

    // Position in the collection, 1 to Count; the collection keeps it.
    int32_t Number() const { return mlNumber; }
    void SetNumber(int32_t lNumber) { mlNumber = lNumber; }

    const std::string& Description() const { return msDescription; }
    void SetDescription(const std::string& sDescription) { msDescription = sDescription; }

    // Archive channel numbers of the loop's PV, CO and SP.
    int32_t PVChannel() const { return mlPVChannel; }
    void SetPVChannel(int32_t lChannel) { mlPVChannel = lChannel; }
    int32_t COChannel() const { return mlCOChannel; }
    void SetCOChannel(int32_t lChannel) { mlCOChannel = lChannel; }
    int32_t SPChannel() const { return mlSPChannel; }
    void SetSPChannel(int32_t lChannel) { mlSPChannel = lChannel; }

    // Setting the controller text recomputes OrsiLoop (it begins with
    // "Orsi LOOP ", case-sensitive) and clears SamplingAffectsID.
    const std::string& ControllerString() const { return msControllerString; }
    void SetControllerString(const std::string& sController);
    bool SamplingAffectsID() const { return mbSamplingAffectsID; }
    bool OrsiLoop() const { return mbOrsiLoop; }

    // 1 up, -1 down.
    int32_t ResponseDirection() const { return mlResponseDirection; }
    void SetResponseDirection(int32_t lDirection);
    std::string UpOrDown() const;

    // 1 proportional band, 2 gain.
    int32_t PBorGain() const { return mlPBorGain; }
    void SetPBorGain(int32_t lPBorGain);
    std::string PUnitsString() const;
    std::string PBorGainStr() const;

    // 1 minutes/repeat, 2 repeats/minute, 3 seconds/repeat, 4 repeats/second.
    int32_t IntegralUnits() const { return mlIntegralUnits; }
    void SetIntegralUnits(int32_t lUnits);
    std::string IUnitsString() const;
    std::string MinOrSecPerRep() const;

    // Derivative time unit text; "minutes" when it holds "min" in any case.
    const std::string& dUnits() const { return msdUnits; }
    void SetdUnits(const std::string& sUnits) { msdUnits = sUnits; }
    std::string DUnitsString() const;

    double PMultiplier() const { return mdPMultiplier; }
    void SetPMultiplier(double dValue) { mdPMultiplier = dValue; }
    double IMultiplier() const { return mdIMultiplier; }
    void SetIMultiplier(double dValue) { mdIMultiplier = dValue; }
    double DMultiplier() const { return mdDMultiplier; }
    void SetDMultiplier(double dValue) { mdDMultiplier = dValue; }
    double ControllerSI() const { return mdControllerSI; }
    void SetControllerSI(double dValue) { mdControllerSI = dValue; }

    bool InverseProcess() const { return mbInverseProcess; }
    void SetInverseProcess(bool bValue) { mbInverseProcess = bValue; }
    bool UnFilterPV() const { return mbUnFilterPV; }
    void SetUnFilterPV(bool bValue) { mbUnFilterPV = bValue; }

    // Filter units by name: "Same As D" 0, "Seconds" 1, "Minutes" 2,
    // "Hertz" 3 (exact case); any other name sets 0.
    std::string FilterUnits() const;
    void SetFilterUnits(const std::string& sUnits);
    int32_t FilterUnitsLong() const { return mlFilterUnits; }
    std::string FilterUnitsString() const;

    // 1 ideal, 2 parallel, 3 series.
    int32_t Control() const { return mlControl; }
    void SetControl(int32_t lControl);
    std::string IdealParallelSeries() const;

    double CurrentP() const { return mdCurrentP; }
    void SetCurrentP(double dValue) { mdCurrentP = dValue; }
    double CurrentI() const { return mdCurrentI; }
    void SetCurrentI(double dValue) { mdCurrentI = dValue; }
    double CurrentD() const { return mdCurrentD; }
    void SetCurrentD(double dValue) { mdCurrentD = dValue; }
    double CurrentF() const { return mdCurrentF; }
    void SetCurrentF(double dValue) { mdCurrentF = dValue; }

    // Copies the loop's description, channels, controller and units; not its
    // Number, Control, current values, UnFilterPV or SamplingAffectsID.
    // Nothing happens for no loop.
    void CopyFrom(const LoopClass* cLoop);

    // The loop's section of the document's tuning file. Loop 1 of a tuner
    // kind with a faceplate is the faceplate loop: its channels and current
    // values are fixed, never read or written.
    void ReadFromDisk(TunFile& cTunFile);
    void WriteToDisk(TunFile& cTunFile);
    void WriteCurrentPIDF(TunFile& cTunFile);

    // "PIDController Loop <lNumber>".
    static std::string SectionName(int32_t lNumber);

  private:
    void ReadChannelsAndCurrent(const TunFile& cTunFile, const std::string& sSection);
    void ReadUnits(const TunFile& cTunFile, const std::string& sSection);
    std::string ReadController(const TunFile& cTunFile, const std::string& sSection) const;

    Platform& mPlatform;
    int32_t mlNumber = 1;
    std::string msDescription = "New Loop";
    int32_t mlPVChannel = 1;
    int32_t mlCOChannel = 2;
    int32_t mlSPChannel = 3;
    std::string msControllerString;
    bool mbSamplingAffectsID = false;
    int32_t mlResponseDirection = 1;
    int32_t mlPBorGain = 1;
    int32_t mlIntegralUnits = 1;
    std::string msdUnits = "min";
    double mdPMultiplier = 1.0;
    double mdIMultiplier = 1.0;
    double mdDMultiplier = 1.0;
    double mdControllerSI = 0.0;
    bool mbInverseProcess = false;
    double mdCurrentP = 0.0;
    double mdCurrentI = 0.0;
    double mdCurrentD = 0.0;
    double mdCurrentF = 0.0;
    bool mbUnFilterPV = false;
    int32_t mlFilterUnits = 0;
    int32_t mlControl = 1;
    bool mbOrsiLoop = false;
};

}  // namespace cv
