#include <algorithm>
#include <cmath>

#include "channel/Channel.h"
#include "channel/FixedPoint.h"
#include "platform/Platform.h"

namespace cv {

void Channel::SetDecimalPlaces(int32_t lPlaces) {
    std::string sMessage;
    if (ValidateDecimalPlaces(lPlaces, sMessage)) {
        miDecimalPlaces = lPlaces;
    }
}

bool Channel::ValidateDecimalPlaces(int32_t lPlaces, std::string& sMessage) const {
    if (lPlaces >= 0 && lPlaces <= 5) {
        return true;
    }
    sMessage = "Number of decimal places must be in range 0 to 5.";
    return false;
}

// More decimals for smaller engineering ranges.
void Channel::DefaultDecPt() {
    const double m = std::max(std::fabs(mdEngMin), std::fabs(mdEngMax));
    int32_t lPlaces = 4;
    if (m > 1000) {
        lPlaces = 0;
    } else if (m > 100) {
        lPlaces = 1;
    } else if (m > 10) {
        lPlaces = 2;
    } else if (m > 1) {
        lPlaces = 3;
    }
    SetDecimalPlaces(lPlaces);
}

std::string Channel::FormatDecPt(double dValue) const {
    return FormatFixedPoint(dValue, miDecimalPlaces, mPlatform.locale.DecimalSeparator());
}

std::string Channel::EngUnitsBrackets() const {
    return msEngUnits.empty() ? std::string() : "(" + msEngUnits + ")";
}

// Only solid lines are drawn.
std::string Channel::LineStyle() const {
    return "Solid";
}

void Channel::SetLineStyle(const std::string&) {
    miLineStyle = 0;
}

void Channel::SetLineWidth(int32_t lWidth) {
    std::string sMessage;
    if (ValidateLineWidth(lWidth, sMessage)) {
        miLineWidth = lWidth;
    }
}

bool Channel::ValidateLineWidth(int32_t lWidth, std::string& sMessage) const {
    if (lWidth >= 1 && lWidth <= 4) {
        return true;
    }
    sMessage = "Line width must be in range 1 to 4.";
    return false;
}

}  // namespace cv
