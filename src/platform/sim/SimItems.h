#pragma once

#include <memory>

#include "platform/opc/OPCItems.h"
#include "platform/sim/GroupState.h"

namespace cv::sim {

// The OPCItems of a simulated group.
class SimItems : public platform::OPCItems {
  public:
    explicit SimItems(std::shared_ptr<GroupState> group) : group_(std::move(group)) {}

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
    std::shared_ptr<GroupState> group_;
};

}  // namespace cv::sim
