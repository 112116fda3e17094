#include "platform/sim/SimGroup.h"

namespace cv::sim {

// Calls that reach the server hold the group's state themselves: this
// object may go while the call waits.

ErrorInfo SimGroup::IsActive(bool& bActive) const {
    const ErrorInfo error = state_->Check();
    bActive = !error && state_->Active();
    return error;
}

ErrorInfo SimGroup::SetIsActive(bool bActive) {
    const auto state = state_;
    return state->SetActive(bActive);
}

ErrorInfo SimGroup::IsSubscribed(bool& bSubscribed) const {
    const ErrorInfo error = state_->Check();
    bSubscribed = !error && state_->Subscribed();
    return error;
}

ErrorInfo SimGroup::SetIsSubscribed(bool bSubscribed) {
    const auto state = state_;
    return state->SetSubscribed(bSubscribed);
}

ErrorInfo SimGroup::UpdateRate(int32_t& lRate) const {
    const ErrorInfo error = state_->Check();
    lRate = state_->UpdateRate();
    return error;
}

ErrorInfo SimGroup::SetUpdateRate(int32_t lRate) {
    const auto state = state_;
    return state->SetUpdateRate(lRate);
}

ErrorInfo SimGroup::SyncRead(int16_t iSource, int32_t lNumItems,
                             const platform::OneBased<int32_t>& ServerHandles,
                             platform::OneBased<Variant>& Values,
                             platform::OneBased<int32_t>& Errors,
                             platform::OneBased<int32_t>& Qualities,
                             platform::OneBased<double>& TimeStamps,
                             platform::OneBased<platform::ValueDetail>& Details) {
    // A Data Access server gives one time stamp and no status of its own.
    Details.Clear();
    const auto state = state_;
    return state->SyncRead(iSource, lNumItems, ServerHandles, Values, Errors, Qualities,
                           TimeStamps);
}

ErrorInfo SimGroup::SyncWrite(int32_t lNumItems, const platform::OneBased<int32_t>& ServerHandles,
                              const platform::OneBased<Variant>& Values,
                              platform::OneBased<int32_t>& Errors) {
    const auto state = state_;
    return state->SyncWrite(lNumItems, ServerHandles, Values, Errors);
}

void SimGroup::SetDataChangeHandler(DataChangeHandler handler) {
    state_->SetHandler(std::move(handler));
}

}  // namespace cv::sim
