#include "platform/ua/UaGroup.h"

namespace cv::uaopc {

// Calls that reach the server hold the group's state themselves: this
// object may go while the call waits.

ErrorInfo UaGroup::IsActive(bool& bActive) const {
    const ErrorInfo error = state_->Check();
    bActive = !error && state_->Active();
    return error;
}

ErrorInfo UaGroup::SetIsActive(bool bActive) {
    const auto state = state_;
    return state->SetActive(bActive);
}

ErrorInfo UaGroup::IsSubscribed(bool& bSubscribed) const {
    const ErrorInfo error = state_->Check();
    bSubscribed = !error && state_->Subscribed();
    return error;
}

ErrorInfo UaGroup::SetIsSubscribed(bool bSubscribed) {
    return state_->SetSubscribed(bSubscribed);
}

ErrorInfo UaGroup::UpdateRate(int32_t& lRate) const {
    const ErrorInfo error = state_->Check();
    lRate = state_->UpdateRate();
    return error;
}

ErrorInfo UaGroup::SetUpdateRate(int32_t lRate) {
    const auto state = state_;
    return state->SetUpdateRate(lRate);
}

ErrorInfo UaGroup::SyncRead(int16_t iSource, int32_t lNumItems,
                            const platform::OneBased<int32_t>& ServerHandles,
                            platform::OneBased<Variant>& Values,
                            platform::OneBased<int32_t>& Errors,
                            platform::OneBased<int32_t>& Qualities,
                            platform::OneBased<double>& TimeStamps,
                            platform::OneBased<platform::ValueDetail>& Details) {
    const auto state = state_;
    return state->SyncRead(iSource, lNumItems, ServerHandles, Values, Errors, Qualities, TimeStamps,
                           Details);
}

ErrorInfo UaGroup::SyncWrite(int32_t lNumItems, const platform::OneBased<int32_t>& ServerHandles,
                             const platform::OneBased<Variant>& Values,
                             platform::OneBased<int32_t>& Errors) {
    const auto state = state_;
    return state->SyncWrite(lNumItems, ServerHandles, Values, Errors);
}

void UaGroup::SetDataChangeHandler(DataChangeHandler handler) {
    state_->SetHandler(std::move(handler));
}

}  // namespace cv::uaopc
