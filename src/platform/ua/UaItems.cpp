#include "platform/ua/UaItems.h"

#include "platform/ua/UaItem.h"

namespace cv::uaopc {

// Each call holds the group's state itself: this object may go while the
// call waits.

ErrorInfo UaItems::AddItems(int32_t lNumItems, const platform::OneBased<std::string>& ItemIDs,
                            const platform::OneBased<int32_t>& ClientHandles,
                            const platform::OneBased<std::string>& AccessPaths,
                            platform::OneBased<int32_t>& ServerHandles,
                            platform::OneBased<int32_t>& Errors) {
    const auto group = group_;
    return group->AddItems(lNumItems, ItemIDs, ClientHandles, AccessPaths, ServerHandles, Errors);
}

ErrorInfo UaItems::GetOPCItem(int32_t lServerHandle, std::shared_ptr<platform::OPCItem>& cItem) {
    std::shared_ptr<UaItemState> item;
    if (const ErrorInfo error = group_->FindItem(lServerHandle, item)) {
        return error;
    }
    cItem = std::make_shared<UaItem>(group_, std::move(item));
    return {};
}

ErrorInfo UaItems::Remove(int32_t lNumItems, const platform::OneBased<int32_t>& ServerHandles,
                          platform::OneBased<int32_t>& Errors) {
    const auto group = group_;
    return group->RemoveItems(lNumItems, ServerHandles, Errors);
}

}  // namespace cv::uaopc
