#pragma once

#include <memory>

#include "platform/opc/OPCItem.h"
#include "platform/sim/GroupState.h"

namespace cv::sim {

// An OPCItem of a simulated group.
class SimItem : public platform::OPCItem {
  public:
    SimItem(std::shared_ptr<GroupState> group, std::shared_ptr<GroupItemState> item)
        : group_(std::move(group)), item_(std::move(item)) {}

    int32_t ServerHandle() const override { return item_->serverHandle; }
    const std::string& ItemID() const override { return item_->itemId; }
    ErrorInfo IsActive(bool& bActive) const override;
    ErrorInfo SetIsActive(bool bActive) override;

  private:
    std::shared_ptr<GroupState> group_;
    std::shared_ptr<GroupItemState> item_;
};

}  // namespace cv::sim
