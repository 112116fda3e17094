#include "ua/types/BuiltinTypes.h"

#include <chrono>
#include <tuple>

namespace cv::ua {

DateTime DateTime::Now() {
    const auto sinceEpoch = std::chrono::system_clock::now().time_since_epoch();
    return {kUnixEpochTicks +
            std::chrono::duration_cast<std::chrono::nanoseconds>(sinceEpoch).count() / 100};
}

bool DiagnosticInfo::operator==(const DiagnosticInfo& other) const {
    const auto fields = [](const DiagnosticInfo& d) {
        return std::tie(d.symbolicId, d.namespaceUri, d.locale, d.localizedText, d.additionalInfo,
                        d.innerStatusCode);
    };
    if (fields(*this) != fields(other) || !inner != !other.inner) {
        return false;
    }
    return !inner || *inner == *other.inner;
}

}  // namespace cv::ua
