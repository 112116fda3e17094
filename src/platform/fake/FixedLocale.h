#pragma once

#include <string>

#include "platform/Locale.h"

namespace cv::fake {

// Regional settings pinned for tests.
class FixedLocale : public platform::Locale {
  public:
    FixedLocale(std::string decimal, std::string grouping, std::string longTime,
                std::string shortDate)
        : decimal_(std::move(decimal)),
          grouping_(std::move(grouping)),
          longTime_(std::move(longTime)),
          shortDate_(std::move(shortDate)) {}

    // English (United States) style: 1,234.5 and 12/31/2026 1:02:03 PM.
    static FixedLocale Point() { return {".", ",", "h:mm:ss tt", "M/d/yyyy"}; }
    // German style: 1.234,5 and 31.12.2026 13:02:03.
    static FixedLocale Comma() { return {",", ".", "HH:mm:ss", "dd.MM.yyyy"}; }

    std::string DecimalSeparator() const override { return decimal_; }
    std::string GroupingSeparator() const override { return grouping_; }
    std::string LongTimeFormat() const override { return longTime_; }
    std::string ShortDateFormat() const override { return shortDate_; }

  private:
    std::string decimal_;
    std::string grouping_;
    std::string longTime_;
    std::string shortDate_;
};

}  // namespace cv::fake
