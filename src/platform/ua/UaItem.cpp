#include "platform/ua/UaItem.h"

#include "platform/opc/OpcResult.h"
#include "platform/ua/UaStatusMap.h"

namespace cv::uaopc {

ErrorInfo UaItem::IsActive(bool& bActive) const {
    if (const ErrorInfo error = group_->Check()) {
        return error;
    }
    if (item_->removed) {
        const int32_t code = platform::OpcResult::OPC_E_INVALIDHANDLE;
        return {code, *OwnErrorText(code)};
    }
    bActive = item_->active;
    return {};
}

ErrorInfo UaItem::SetIsActive(bool bActive) {
    // This object may go while the call waits: work on shared state only.
    const auto group = group_;
    const auto item = item_;
    return group->SetItemActive(*item, bActive);
}

}  // namespace cv::uaopc
