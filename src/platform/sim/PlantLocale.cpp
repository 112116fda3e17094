#include "platform/sim/PlantLocale.h"

namespace cv::sim {

namespace {

class PointLocale : public platform::Locale {
  public:
    std::string DecimalSeparator() const override { return "."; }
    std::string GroupingSeparator() const override { return ","; }
    std::string LongTimeFormat() const override { return "HH:mm:ss"; }
    std::string ShortDateFormat() const override { return "yyyy-MM-dd"; }
};

}  // namespace

const platform::Locale& PlantLocale() {
    static const PointLocale locale;
    return locale;
}

}  // namespace cv::sim
