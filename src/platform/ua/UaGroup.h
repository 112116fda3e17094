#pragma once

#include <memory>

#include "platform/opc/OPCGroup.h"
#include "platform/ua/UaGroupState.h"
#include "platform/ua/UaItems.h"

namespace cv::uaopc {

// An OPCGroup of an OPC UA server: one subscription.
class UaGroup : public platform::OPCGroup {
  public:
    explicit UaGroup(std::shared_ptr<UaGroupState> state) : state_(state), items_(state) {}
    // Nobody can take notifications any more: the handler goes.
    ~UaGroup() override { state_->SetHandler(nullptr); }
    UaGroup(const UaGroup&) = delete;
    UaGroup& operator=(const UaGroup&) = delete;

    const std::string& Name() const override { return state_->Name(); }
    ErrorInfo IsActive(bool& bActive) const override;
    ErrorInfo SetIsActive(bool bActive) override;
    ErrorInfo IsSubscribed(bool& bSubscribed) const override;
    ErrorInfo SetIsSubscribed(bool bSubscribed) override;
    ErrorInfo UpdateRate(int32_t& lRate) const override;
    ErrorInfo SetUpdateRate(int32_t lRate) override;
    platform::OPCItems& OPCItems() override { return items_; }
    ErrorInfo SyncRead(int16_t iSource, int32_t lNumItems,
                       const platform::OneBased<int32_t>& ServerHandles,
                       platform::OneBased<Variant>& Values, platform::OneBased<int32_t>& Errors,
                       platform::OneBased<int32_t>& Qualities,
                       platform::OneBased<double>& TimeStamps,
                       platform::OneBased<platform::ValueDetail>& Details) override;
    ErrorInfo SyncWrite(int32_t lNumItems, const platform::OneBased<int32_t>& ServerHandles,
                        const platform::OneBased<Variant>& Values,
                        platform::OneBased<int32_t>& Errors) override;
    void SetDataChangeHandler(DataChangeHandler handler) override;

  private:
    std::shared_ptr<UaGroupState> state_;
    UaItems items_;
};

}  // namespace cv::uaopc
