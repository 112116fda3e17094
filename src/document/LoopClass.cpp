#include "document/LoopClass.h"

#include <algorithm>
#include <array>

#include "document/TunerType.h"
#include "platform/AsciiCase.h"
#include "platform/Platform.h"

namespace cv {

namespace {

constexpr const char* kOrsiPrefix = "Orsi LOOP ";

// The text for code lCode among codes 1 to N, else sOther.
template <size_t N>
std::string CodeText(int32_t lCode, const std::array<const char*, N>& aTexts, const char* sOther) {
    return lCode >= 1 && lCode <= static_cast<int32_t>(N) ? aTexts[static_cast<size_t>(lCode - 1)]
                                                          : sOther;
}

std::string DefaultController(Platform& platform) {
    TunerType cTunerType(platform);
    cTunerType.SetTuner(9);
    return cTunerType.DefaultController();
}

}  // namespace

LoopClass::LoopClass(Platform& platform)
    : mPlatform(platform), msControllerString(DefaultController(platform)) {}

void LoopClass::SetControllerString(const std::string& sController) {
    msControllerString = sController;
    mbOrsiLoop = sController.starts_with(kOrsiPrefix);
    mbSamplingAffectsID = false;
}

void LoopClass::SetResponseDirection(int32_t lDirection) {
    if (lDirection == -1 || lDirection == 1) {
        mlResponseDirection = lDirection;
    }
}

std::string LoopClass::UpOrDown() const {
    switch (mlResponseDirection) {
        case -1:
            return "down";
        case 1:
            return "up";
        default:
            return "unknown";
    }
}

void LoopClass::SetPBorGain(int32_t lPBorGain) {
    if (lPBorGain == 1 || lPBorGain == 2) {
        mlPBorGain = lPBorGain;
    }
}

std::string LoopClass::PUnitsString() const {
    return CodeText(mlPBorGain, std::array{"Proportional Band", "Gain"}, "");
}

std::string LoopClass::PBorGainStr() const {
    return CodeText(mlPBorGain, std::array{"pb", "gain"}, "unknown");
}

void LoopClass::SetIntegralUnits(int32_t lUnits) {
    if (lUnits >= 1 && lUnits <= 4) {
        mlIntegralUnits = lUnits;
    }
}

std::string LoopClass::IUnitsString() const {
    return CodeText(
        mlIntegralUnits,
        std::array{"minutes/repeat", "repeats/minute", "seconds/repeat", "repeats/second"}, "");
}

std::string LoopClass::MinOrSecPerRep() const {
    return CodeText(mlIntegralUnits, std::array{"min/rep", "rep/min", "sec/rep", "rep/sec"},
                    "unknown");
}

std::string LoopClass::DUnitsString() const {
    return AsciiLower(msdUnits).find("min") != std::string::npos ? "minutes" : "seconds";
}

std::string LoopClass::FilterUnits() const {
    if (mlFilterUnits < 0 || mlFilterUnits > 3) {
        mPlatform.dialogs.MsgBox("Error: LoopClass.FilterUnits", MsgBoxStyle::OKOnly, "");
        return "";
    }
    return kFilterUnitNames[static_cast<size_t>(mlFilterUnits)];
}

void LoopClass::SetFilterUnits(const std::string& sUnits) {
    const auto found = std::find(kFilterUnitNames.begin(), kFilterUnitNames.end(), sUnits);
    mlFilterUnits = found == kFilterUnitNames.end()
                        ? 0
                        : static_cast<int32_t>(found - kFilterUnitNames.begin());
}

std::string LoopClass::FilterUnitsString() const {
    if (mlFilterUnits == 0) {
        return DUnitsString();
    }
    return CodeText(mlFilterUnits, std::array{"seconds", "minutes", "hertz"}, "");
}

void LoopClass::SetControl(int32_t lControl) {
    if (lControl >= 1 && lControl <= 3) {
        mlControl = lControl;
    }
}

std::string LoopClass::IdealParallelSeries() const {
    return CodeText(mlControl, std::array{"ideal", "parallel", "series"}, "unknown");
}

void LoopClass::CopyFrom(const LoopClass* cLoop) {
    if (cLoop == nullptr) {
        return;
    }
    msDescription = cLoop->msDescription;
    mlPVChannel = cLoop->mlPVChannel;
    mlCOChannel = cLoop->mlCOChannel;
    mlSPChannel = cLoop->mlSPChannel;
    SetControllerString(cLoop->msControllerString);
    mlResponseDirection = cLoop->mlResponseDirection;
    mlPBorGain = cLoop->mlPBorGain;
    mlIntegralUnits = cLoop->mlIntegralUnits;
    msdUnits = cLoop->msdUnits;
    mdPMultiplier = cLoop->mdPMultiplier;
    mdIMultiplier = cLoop->mdIMultiplier;
    mdDMultiplier = cLoop->mdDMultiplier;
    mdControllerSI = cLoop->mdControllerSI;
    mbOrsiLoop = cLoop->mbOrsiLoop;
    mbInverseProcess = cLoop->mbInverseProcess;
    SetFilterUnits(cLoop->FilterUnits());
}

std::string LoopClass::SectionName(int32_t lNumber) {
    return "PIDController Loop " + std::to_string(lNumber);
}

}  // namespace cv
