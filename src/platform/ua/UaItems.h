#pragma once

#include <memory>

#include "platform/opc/OPCItems.h"
#include "platform/ua/UaGroupState.h"

namespace cv::uaopc {

// The OPCItems of an OPC UA group: its monitored items.
class UaItems : public platform::OPCItems {
  public:
    explicit UaItems(std::shared_ptr<UaGroupState> group) : group_(std::move(group)) {}

    int32_t Count() const override { return group_->ItemCount(); }
    ErrorInfo AddItems(int32_t lNumItems, const platform::OneBased<std::string>& ItemIDs,
                       const platform::OneBased<int32_t>& ClientHandles,
                       const platform::OneBased<std::string>& AccessPaths,
                       platform::OneBased<int32_t>& ServerHandles,
                       platform::OneBased<int32_t>& Errors) override;
    ErrorInfo GetOPCItem(int32_t lServerHandle, std::shared_ptr<platform::OPCItem>& cItem) override;
    ErrorInfo Remove(int32_t lNumItems, const platform::OneBased<int32_t>& ServerHandles,
                     platform::OneBased<int32_t>& Errors) override;

  private:
    std::shared_ptr<UaGroupState> group_;
};

}  // namespace cv::uaopc
