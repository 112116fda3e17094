#pragma once

#include <memory>

#include "platform/opc/OPCItem.h"
#include "platform/ua/UaGroupState.h"

namespace cv::uaopc {

// An OPCItem of an OPC UA group: one monitored item.
class UaItem : public platform::OPCItem {
  public:
    UaItem(std::shared_ptr<UaGroupState> group, std::shared_ptr<UaItemState> item)
        : group_(std::move(group)), item_(std::move(item)) {}

    int32_t ServerHandle() const override { return item_->serverHandle; }
    const std::string& ItemID() const override { return item_->itemId; }
    ErrorInfo IsActive(bool& bActive) const override;
    ErrorInfo SetIsActive(bool bActive) override;

  private:
    std::shared_ptr<UaGroupState> group_;
    std::shared_ptr<UaItemState> item_;
};

}  // namespace cv::uaopc
