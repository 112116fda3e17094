#include <algorithm>
#include <cmath>
#include <limits>

#include "document/LoopClass.h"
#include "document/TunFile.h"

namespace cv {

namespace {

// The value rounded to single precision; values beyond the single range
// become the largest single of their sign instead of overflowing.
double ThroughSingle(double dValue) {
    constexpr double dMax = std::numeric_limits<float>::max();
    if (std::isnan(dValue)) {
        return dValue;
    }
    return static_cast<double>(static_cast<float>(std::clamp(dValue, -dMax, dMax)));
}

bool IsFaceplateLoop(int32_t lNumber, const TunFile& cTunFile) {
    return lNumber == 1 && cTunFile.TunerTypeObj().HasFaceplate();
}

}  // namespace

void LoopClass::ReadFromDisk(TunFile& cTunFile) {
    const IniFile& ini = cTunFile.IniFileObject();
    const std::string sSection = SectionName(mlNumber);
    ReadChannelsAndCurrent(cTunFile, sSection);
    mbUnFilterPV = ini.ReadBoolean(sSection, "UnFilterPV", false);
    msDescription = ini.ReadString(sSection, "Description", msDescription);
    ReadUnits(cTunFile, sSection);
    mbInverseProcess = ini.ReadBoolean(sSection, "InverseProcess", false);
    SetFilterUnits(ini.ReadString(sSection, "FilterUnits", FilterUnits()));
}

// The faceplate loop always charts channels 1, 2, 3 and starts from zero
// settings; any other loop reads them.
void LoopClass::ReadChannelsAndCurrent(const TunFile& cTunFile, const std::string& sSection) {
    if (IsFaceplateLoop(mlNumber, cTunFile)) {
        msDescription = "Faceplate";
        mlPVChannel = 1;
        mlCOChannel = 2;
        mlSPChannel = 3;
        mdCurrentP = mdCurrentI = mdCurrentD = mdCurrentF = 0.0;
        return;
    }
    const IniFile& ini = cTunFile.IniFileObject();
    msDescription = "New Loop";
    mlPVChannel = ini.ReadLong(sSection, "PVChannel", 1, 0, 0);
    mlCOChannel = ini.ReadLong(sSection, "COChannel", 2, 0, 0);
    mlSPChannel = ini.ReadLong(sSection, "SPChannel", 0, 0, 0);
    mdCurrentP = ini.ReadDouble(sSection, "CurrentP", 0.0);
    mdCurrentI = ini.ReadDouble(sSection, "CurrentI", 0.0);
    mdCurrentD = ini.ReadDouble(sSection, "CurrentD", 0.0);
    mdCurrentF = ini.ReadDouble(sSection, "CurrentF", 0.0);
}

// Unit codes and multipliers go through the write rules, so a code outside
// its set leaves the old one.
void LoopClass::ReadUnits(const TunFile& cTunFile, const std::string& sSection) {
    const IniFile& ini = cTunFile.IniFileObject();
    const int32_t lDirection = ini.ReadLong(sSection, "response_direction", 1, 0, 0);
    const int32_t lPBorGain = ini.ReadLong(sSection, "pb_or_gain", 1, 0, 0);
    const int32_t lIntegralUnits = ini.ReadLong(sSection, "integral_units", 1, 0, 0);
    const double dP = ThroughSingle(ini.ReadDouble(sSection, "PB_multiplier", 1.0));
    const double dI = ThroughSingle(ini.ReadDouble(sSection, "Integral_multiplier", 1.0));
    const double dD = ThroughSingle(ini.ReadDouble(sSection, "Derivative_multiplier", 1.0));
    mdControllerSI = ini.ReadDouble(sSection, "ControllerSampleInterval", 0.0);
    const std::string sController = ReadController(cTunFile, sSection);

    SetResponseDirection(lDirection);
    SetPBorGain(lPBorGain);
    SetIntegralUnits(lIntegralUnits);
    SetdUnits(lIntegralUnits < 3 ? "min" : "sec");
    SetPMultiplier(dP);
    SetIMultiplier(dI);
    SetDMultiplier(dD);
    SetControllerString(sController);
}

// Older files name only the algorithm, by code.
std::string LoopClass::ReadController(const TunFile& cTunFile, const std::string& sSection) const {
    const IniFile& ini = cTunFile.IniFileObject();
    const std::string sController = ini.ReadString(sSection, "ControllerString", "");
    if (!sController.empty()) {
        return sController;
    }
    switch (ini.ReadLong(sSection, "controller_type", 0, 0, 0)) {
        case 1:
            return "Ideal";
        case 2:
            return "Parallel";
        case 3:
            return "Series";
        default:
            return cTunFile.TunerTypeObj().DefaultController();
    }
}

void LoopClass::WriteToDisk(TunFile& cTunFile) {
    IniFile& ini = cTunFile.IniFileObject();
    IniFile::Batch batch(ini);
    const std::string sSection = SectionName(mlNumber);
    ini.WriteText(sSection, "Description", msDescription);
    ini.WriteLong(sSection, "PVChannel", mlPVChannel);
    ini.WriteLong(sSection, "COChannel", mlCOChannel);
    ini.WriteLong(sSection, "SPChannel", mlSPChannel);
    // The simulation controller of this program stands for the tuner kind's
    // own default.
    ini.WriteText(sSection, "ControllerString",
                  msControllerString == "Corvalent Simulation"
                      ? cTunFile.TunerTypeObj().DefaultController()
                      : msControllerString);
    ini.WriteLong(sSection, "response_direction", mlResponseDirection);
    ini.WriteLong(sSection, "pb_or_gain", mlPBorGain);
    ini.WriteLong(sSection, "integral_units", mlIntegralUnits);
    ini.WriteDouble(sSection, "PB_multiplier", mdPMultiplier);
    ini.WriteDouble(sSection, "Integral_multiplier", mdIMultiplier);
    ini.WriteDouble(sSection, "Derivative_multiplier", mdDMultiplier);
    ini.WriteDouble(sSection, "ControllerSampleInterval", mdControllerSI);
    ini.WriteBoolean(sSection, "InverseProcess", mbInverseProcess);
    ini.WriteString(sSection, "FilterUnits", FilterUnits());
}

void LoopClass::WriteCurrentPIDF(TunFile& cTunFile) {
    IniFile& ini = cTunFile.IniFileObject();
    const std::string sSection = SectionName(mlNumber);
    if (!IsFaceplateLoop(mlNumber, cTunFile)) {
        ini.WriteDouble(sSection, "CurrentP", mdCurrentP);
        ini.WriteDouble(sSection, "CurrentI", mdCurrentI);
        ini.WriteDouble(sSection, "CurrentD", mdCurrentD);
        ini.WriteDouble(sSection, "CurrentF", mdCurrentF);
    }
    ini.WriteBoolean(sSection, "UnFilterPV", mbUnFilterPV);
}

}  // namespace cv
