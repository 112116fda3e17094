#pragma once

#include <string>

namespace cv::platform {

// The user's regional settings. Formats use the day/month/year and
// hour/minute/second letters of the Windows control panel: "dd/MM/yyyy",
// "HH:mm:ss", "h:mm:ss tt".
class Locale {
  public:
    virtual ~Locale() = default;
    virtual std::string DecimalSeparator() const = 0;
    virtual std::string GroupingSeparator() const = 0;
    virtual std::string LongTimeFormat() const = 0;
    virtual std::string ShortDateFormat() const = 0;
};

}  // namespace cv::platform
