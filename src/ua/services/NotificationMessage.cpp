#include <algorithm>

#include "ua/encoding/Decoder.h"
#include "ua/encoding/Encoder.h"
#include "ua/services/SubscriptionServices.h"

namespace cv::ua {

void NotificationMessage::Visit(const NotificationMessage& s, Encoder& v) {
    v(s.sequenceNumber);
    v(s.publishTime);
    v(static_cast<int32_t>(s.dataChanges.size() + s.statusChanges.size() +
                           s.otherNotifications.size()));
    for (const DataChangeNotification& change : s.dataChanges) {
        v.Extension(change);
    }
    for (const StatusChangeNotification& change : s.statusChanges) {
        v.Extension(change);
    }
    for (const ExtensionObject& other : s.otherNotifications) {
        v(other);
    }
}

void NotificationMessage::Visit(NotificationMessage& s, Decoder& v) {
    v(s.sequenceNumber);
    v(s.publishTime);
    s.dataChanges.clear();
    s.statusChanges.clear();
    s.otherNotifications.clear();
    // Each notification lands in one of three lists, which grow as they fill.
    constexpr size_t kLargest =
        std::max({sizeof(DataChangeNotification), sizeof(StatusChangeNotification),
                  sizeof(ExtensionObject)});
    const uint32_t count = v.ArrayLength(2 * kLargest);
    for (uint32_t i = 0; i < count && v.Ok(); ++i) {
        ExtensionObject object;
        v(object.typeId);
        const uint8_t encoding = v.Byte();
        const bool binary = encoding == 1 && object.typeId.namespaceIndex == 0;
        const uint32_t typeId = object.typeId.Numeric();
        if (binary && typeId == DataChangeNotification::kEncodingId) {
            v.Embedded(s.dataChanges.emplace_back());
        } else if (binary && typeId == StatusChangeNotification::kEncodingId) {
            v.Embedded(s.statusChanges.emplace_back());
        } else if (encoding > 2) {
            v.Fail("a notification has the unknown encoding " + std::to_string(encoding));
        } else {
            object.encoding = static_cast<ExtensionObject::Encoding>(encoding);
            if (encoding != 0) {
                v(object.body);
            }
            s.otherNotifications.push_back(std::move(object));
        }
    }
}

}  // namespace cv::ua
