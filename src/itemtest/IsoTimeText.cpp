#include "itemtest/IsoTimeText.h"

#include <time.h>

#include <cstdio>
#include <cstdlib>

#include "platform/OleDate.h"

namespace cv {

std::string IsoTimeText(double dOleDate) {
    return IsoTimeText(dOleDate, LocalUtcOffsetMinutes(dOleDate));
}

std::string IsoTimeText(double dOleDate, std::optional<int32_t> lOffsetMinutes) {
    const std::optional<OleDateParts> parts = OleDateToParts(dOleDate);
    if (!parts) {
        return {};
    }
    char text[48];
    std::snprintf(text, sizeof text, "%04d-%02d-%02dT%02d:%02d:%02d.%03d", parts->year,
                  parts->month, parts->day, parts->hour, parts->minute, parts->second,
                  parts->millisecond);
    std::string sText = text;
    if (!lOffsetMinutes) {
        return sText;
    }
    if (*lOffsetMinutes == 0) {
        return sText + "Z";
    }
    const int32_t lAbsolute = std::abs(*lOffsetMinutes);
    std::snprintf(text, sizeof text, "%c%02d:%02d", *lOffsetMinutes < 0 ? '-' : '+', lAbsolute / 60,
                  lAbsolute % 60);
    return sText + text;
}

std::optional<int32_t> LocalUtcOffsetMinutes(double dOleDate) {
    const std::optional<OleDateParts> parts = OleDateToParts(dOleDate);
    if (!parts) {
        return std::nullopt;
    }
    tm local = LocalCalendarTime(*parts);
    local.tm_wday = -1;  // set by a mktime that succeeds, whatever it answers
    (void)mktime(&local);
    if (local.tm_wday < 0) {
        return std::nullopt;
    }
    return static_cast<int32_t>(local.tm_gmtoff / 60);
}

}  // namespace cv
