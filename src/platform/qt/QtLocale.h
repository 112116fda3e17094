#pragma once

#include <string>

#include <QLocale>
#include <QString>

#include "platform/Locale.h"

namespace cv::qtui {

// The user's regional settings as Qt reads them from the environment.
// Formats are given in the Windows letters that platform::Locale documents.
class QtLocale : public platform::Locale {
  public:
    explicit QtLocale(QLocale locale = QLocale::system()) : locale_(std::move(locale)) {}

    std::string DecimalSeparator() const override;
    std::string GroupingSeparator() const override;
    std::string LongTimeFormat() const override;
    std::string ShortDateFormat() const override;

    // A Qt date or time format in Windows letters: hours follow the 12-hour
    // clock (h) only when an AM/PM marker is present, otherwise the 24-hour
    // clock (H); the marker becomes "tt"; time zones and milliseconds, which
    // the Windows formats lack, are dropped with their separating blanks.
    static std::string ToWindowsFormat(const QString& qtFormat);

  private:
    QLocale locale_;
};

}  // namespace cv::qtui
