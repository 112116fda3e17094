#include <cmath>

#include "channel/Channel.h"
#include "document/TunFile.h"
#include "platform/Platform.h"
#include "util/TextToNumber.h"

namespace cv {

namespace {

constexpr int32_t kFirstExtraChannel = 4;
constexpr int32_t kCoChannel = 2;
constexpr int32_t kSpChannel = 3;
constexpr int32_t kErrDivisionByZero = 11;

ErrorInfo CheckFinite(double dResult) {
    return std::isfinite(dResult) ? ErrorInfo{} : ErrorInfo{kErrOverflow, "Overflow"};
}

}  // namespace

bool Channel::NeedsScaling(TunFile& cTunFile) {
    UpdateScalingFlags(cTunFile);
    return mbNeedsScaling;
}

// Scaling applies when the ranges differ, except where the tuning
// document's faceplate settings switch it off for PV, CO or SP.
void Channel::UpdateScalingFlags(TunFile& cTunFile) {
    const bool bNeeds = mdScaleFactor != 1 || mdScaleOffset != 0;
    mbNeedsScaling = bNeeds;
    mbScalePriorToOutput = bNeeds;
    if (miNumber >= kFirstExtraChannel || !bNeeds || !cTunFile.TunerTypeObj().HasFaceplate()) {
        return;
    }
    const TunFileGeneral& cGeneral = cTunFile.General();
    if (!cGeneral.ScalePVandCO() || (miNumber == kSpChannel && !cGeneral.ScaleSP())) {
        mbNeedsScaling = false;
        mbScalePriorToOutput = false;
    }
    if (miNumber == kCoChannel && mbNeedsScaling && cGeneral.ABIntegerFile()) {
        mbScalePriorToOutput = false;
    }
}

double Channel::ScalePriorToOutput(double dValue) const {
    if (!mbScalePriorToOutput) {
        return dValue;
    }
    return (dValue - mdScaleOffset) / mdScaleFactor;
}

ErrorInfo Channel::ConvertToPercent(double dValue, double& dPercent) const {
    double dSpan = 0;
    if (ErrorInfo error = SpanValue(RangeType::Engineering, dSpan)) {
        return error;
    }
    if (dSpan == 0) {
        return {kErrDivisionByZero, "Division by zero"};
    }
    dPercent = (dValue - mdEngMin) * 100 / dSpan;
    return CheckFinite(dPercent);
}

ErrorInfo Channel::ConvertFromPercent(double dPercent, double& dValue) const {
    double dSpan = 0;
    if (ErrorInfo error = SpanValue(RangeType::Engineering, dSpan)) {
        return error;
    }
    dValue = dSpan * dPercent / 100 + mdEngMin;
    return CheckFinite(dValue);
}

// A raw value that is no number is read as well as possible from its text,
// unscaled. A number that is not finite (NaN, an infinity, or one that
// scaling takes beyond the largest) stays what it is.
double Channel::CurrentValue() {
    const Variant vRaw = RawValue();
    Variant vNumber;
    if (ChangeType(vNumber, vRaw, VT_R8, mPlatform.locale)) {
        return TextToSingle(mPlatform, VariantText(vRaw), false);
    }
    const double dValue = vNumber.AsR8();
    return mbNeedsScaling ? dValue * mdScaleFactor + mdScaleOffset : dValue;
}

std::string Channel::FormatCurrentValue() {
    return FormatDecPt(CurrentValue());
}

}  // namespace cv
