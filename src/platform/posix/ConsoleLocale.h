#pragma once

#include "platform/Locale.h"

namespace cv::posix {

// Regional settings for output that scripts read: a point, no grouping,
// 24-hour time and year-first dates, whatever the user's settings.
class ConsoleLocale : public platform::Locale {
  public:
    std::string DecimalSeparator() const override { return "."; }
    std::string GroupingSeparator() const override { return ","; }
    std::string LongTimeFormat() const override { return "HH:mm:ss"; }
    std::string ShortDateFormat() const override { return "yyyy-MM-dd"; }
};

}  // namespace cv::posix
