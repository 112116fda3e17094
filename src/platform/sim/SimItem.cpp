#include "platform/sim/SimItem.h"

#include "platform/opc/OpcResult.h"
#include "platform/sim/ErrorTexts.h"

namespace cv::sim {

ErrorInfo SimItem::IsActive(bool& bActive) const {
    if (const ErrorInfo error = group_->Check()) {
        return error;
    }
    if (item_->removed) {
        return ServerError(platform::OpcResult::OPC_E_INVALIDHANDLE);
    }
    bActive = item_->active;
    return {};
}

ErrorInfo SimItem::SetIsActive(bool bActive) {
    // This object may go while the call waits: work on shared state only.
    const auto group = group_;
    const auto item = item_;
    return group->SetItemActive(*item, bActive);
}

}  // namespace cv::sim
