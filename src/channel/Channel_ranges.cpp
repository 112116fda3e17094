#include <algorithm>
#include <cfloat>
#include <cmath>

#include "channel/Channel.h"
#include "platform/Platform.h"

namespace cv {

namespace {

constexpr double kPercentStep = 5;
constexpr double kMinDisplayPercentSpan = 25;
constexpr double kFarPercent = 1e6;

ErrorInfo OverflowError() {
    return {kErrOverflow, "Overflow"};
}

// Rounds a percentage of span down to the 5 percent step, after adding
// dExtraSteps steps.
double PercentStep(double dPercent, double dExtraSteps) {
    return std::floor(dPercent / kPercentStep + dExtraSteps) * kPercentStep;
}

}  // namespace

Channel::Channel(Platform& platform) : mPlatform(platform) {
    SetRange(RangeType::Instrument, 0, 100);
    SetRange(RangeType::Display, 0, 100);
    SetLineStyle("Solid");
}

void Channel::SetRange(RangeType eRange, double dMin, double dMax) {
    if (dMin == dMax || !std::isfinite(dMin) || !std::isfinite(dMax)) {
        dMin = 0;
        dMax = 100;
    }
    switch (eRange) {
        case RangeType::Engineering:
            mdEngMin = dMin;
            mdEngMax = dMax;
            CalcScaleFactors();
            break;
        case RangeType::Instrument:
            mdInstMin = dMin;
            mdInstMax = dMax;
            CalcScaleFactors();
            break;
        case RangeType::Display:
            mdDisplayMin = dMin;
            mdDisplayMax = dMax;
            break;
    }
}

bool Channel::ValidateRange(RangeType eRange, double dMin, double dMax,
                            std::string& sMessage) const {
    if (dMin == dMax) {
        switch (eRange) {
            case RangeType::Engineering:
                sMessage = "Engineering";
                break;
            case RangeType::Instrument:
                sMessage = "Instrument";
                break;
            case RangeType::Display:
                sMessage = "Display";
                break;
        }
        sMessage += " range values cannot be equal.";
        return false;
    }
    if (eRange == RangeType::Display && dMin >= dMax) {
        sMessage = "Display minimum must be less than display maximum.";
        return false;
    }
    return true;
}

double Channel::GetRangeValue(RangeType eRange, int32_t lWhich) const {
    if (lWhich != 0 && lWhich != 1) {
        return 0;
    }
    switch (eRange) {
        case RangeType::Engineering:
            return lWhich == 0 ? mdEngMin : mdEngMax;
        case RangeType::Instrument:
            return lWhich == 0 ? mdInstMin : mdInstMax;
        case RangeType::Display:
            return lWhich == 0 ? mdDisplayMin : mdDisplayMax;
    }
    return 0;
}

ErrorInfo Channel::SpanValue(RangeType eRange, double& dSpan) const {
    switch (eRange) {
        case RangeType::Engineering:
            dSpan = mdEngMax - mdEngMin;
            break;
        case RangeType::Instrument:
            dSpan = mdInstMax - mdInstMin;
            break;
        case RangeType::Display:
            dSpan = mdDisplayMax - mdDisplayMin;
            break;
        default:
            dSpan = 100;
            break;
    }
    return std::isfinite(dSpan) ? ErrorInfo{} : OverflowError();
}

void Channel::CopyRangeValuesFrom(const Channel& cSource) {
    SetRange(RangeType::Engineering, cSource.EngMin(), cSource.EngMax());
    SetRange(RangeType::Instrument, cSource.InstMin(), cSource.InstMax());
}

void Channel::CopyEngRangeToInstRange() {
    SetRange(RangeType::Instrument, mdEngMin, mdEngMax);
}

void Channel::CalcScaleFactors() {
    mdScaleFactor = (mdEngMax - mdEngMin) / (mdInstMax - mdInstMin);
    mdScaleOffset = mdEngMin - mdScaleFactor * mdInstMin;
}

// Frames the given values (or the current value) with a display range on
// 5 percent steps of the engineering span, at least 25 percent wide.
ErrorInfo Channel::SetDefaultDisplaySpan(bool bUseCurrent, float sngLow, float sngHigh) {
    double dSpan = 0;
    if (ErrorInfo error = SpanValue(RangeType::Engineering, dSpan)) {
        return error;
    }
    const double dCurrent = CurrentValue();
    if (bUseCurrent) {
        if (!(std::fabs(dCurrent) <= FLT_MAX)) {
            return OverflowError();
        }
        sngLow = static_cast<float>(dCurrent);
        sngHigh = sngLow;
    }
    auto percent = [&](double dValue) { return (dValue - mdEngMin) / dSpan * 100; };
    const double dCentre = PercentStep(percent(dCurrent), 0.5);
    double lo = std::max(PercentStep(percent(sngLow), 0), 0.0);
    double hi = std::min(PercentStep(percent(sngHigh), 1), 100.0);
    if (!std::isfinite(dCentre) || !std::isfinite(lo) || !std::isfinite(hi)) {
        return OverflowError();
    }
    // Limits thousands of spans away would make the walk below endless; any
    // sensible input stays far inside this bound.
    lo = std::min(lo, kFarPercent);
    hi = std::max(hi, -kFarPercent);
    bool bDownFirst = dCentre > 50;
    while (hi - lo < kMinDisplayPercentSpan) {
        if (bDownFirst) {
            lo = std::max(lo - kPercentStep, 0.0);
        } else {
            hi = std::min(hi + kPercentStep, 100.0);
        }
        bDownFirst = !bDownFirst;
    }
    SetRange(RangeType::Display, lo / 100 * dSpan + mdEngMin, hi / 100 * dSpan + mdEngMin);
    return {};
}

}  // namespace cv
