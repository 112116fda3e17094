#include "document/TunFileGeneral.h"

#include <cmath>

#include "platform/Platform.h"

namespace cv {

namespace {

constexpr double kMinSI = 0.02;
constexpr double kMaxSI = 61.0;

// The nearest whole number, halves going to the even neighbour, whatever the
// floating-point rounding mode of the moment.
double RoundHalfEven(double dValue) {
    const double dFloor = std::floor(dValue);
    const double dFraction = dValue - dFloor;
    if (dFraction < 0.5) {
        return dFloor;
    }
    if (dFraction > 0.5) {
        return dFloor + 1.0;
    }
    return std::fmod(dFloor, 2.0) == 0.0 ? dFloor : dFloor + 1.0;
}

}  // namespace

TunFileGeneral::TunFileGeneral(Platform& platform)
    : mPlatform(platform), maModes{{"Auto", "Auto", true}, {"Manual", "Manual", false}} {}

bool TunFileGeneral::ValidateSI(double& si, std::string& message) const {
    const double dFactor = si < 1.0 ? 200.0 : 100.0;
    si = RoundHalfEven(si * dFactor) / dFactor;
    if (si >= kMinSI && si <= kMaxSI) {
        return true;
    }
    const std::string sSeparator = mPlatform.locale.DecimalSeparator();
    message = "Please enter a sample interval in the range 0" + sSeparator + "02 to 61 seconds.";
    return false;
}

double TunFileGeneral::SIinSec() const {
    return mlSIinMSec / 1000.0;
}

void TunFileGeneral::SetSIinSec(double dSeconds) {
    std::string sIgnored;
    if (ValidateSI(dSeconds, sIgnored)) {
        mlSIinMSec = static_cast<int32_t>(RoundHalfEven(dSeconds * 1000.0));
    }
}

void TunFileGeneral::SetDDETimeout(int32_t lValue) {
    if (lValue >= 50) {
        mlDDETimeout = lValue;
    }
}

int32_t TunFileGeneral::ModeCount() const {
    return static_cast<int32_t>(maModes.size());
}

void TunFileGeneral::SetModeCount(int32_t lCount) {
    if (lCount >= kMinModes && lCount <= kMaxModes) {
        maModes.resize(static_cast<size_t>(lCount));
    }
}

bool TunFileGeneral::IsRow(int32_t lIndex) const {
    return lIndex >= 1 && lIndex <= ModeCount();
}

std::string TunFileGeneral::ModeKey(int32_t lIndex) const {
    return IsRow(lIndex) ? maModes[static_cast<size_t>(lIndex - 1)].Key : "ModeKey?";
}

std::string TunFileGeneral::ModeValue(int32_t lIndex) const {
    return IsRow(lIndex) ? maModes[static_cast<size_t>(lIndex - 1)].Value : "ModeValue?";
}

bool TunFileGeneral::ModeAuto(int32_t lIndex) const {
    return IsRow(lIndex) && maModes[static_cast<size_t>(lIndex - 1)].Auto;
}

void TunFileGeneral::SetModeAuto(int32_t lIndex, bool bAuto) {
    if (lIndex >= 3 && IsRow(lIndex)) {
        maModes[static_cast<size_t>(lIndex - 1)].Auto = bAuto;
    }
}

void TunFileGeneral::SetMode(int32_t lIndex, const std::string& sKey, const std::string& sValue) {
    if (lIndex < 1 || lIndex > kMaxModes) {
        return;
    }
    if (lIndex > ModeCount()) {
        SetModeCount(lIndex);
    }
    ModeEntry& row = maModes[static_cast<size_t>(lIndex - 1)];
    row.Key = sKey;
    if (lIndex >= 3) {
        row.Value = sValue;
    }
}

ModeMapClass TunFileGeneral::FillModeMap() const {
    ModeMapClass map;
    map.ReInitializeModeMap();
    for (const ModeEntry& row : maModes) {
        map.AddModeMapItem(row.Key, row.Value);
    }
    return map;
}

}  // namespace cv
