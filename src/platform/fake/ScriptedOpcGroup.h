#pragma once

#include <map>
#include <memory>
#include <string>
#include <utility>

#include "platform/opc/OPCGroup.h"

namespace cv::fake {

class ScriptedOpc;

// A group of ScriptedOpc, with its item collection.
class ScriptedOpcGroup : public platform::OPCGroup, public platform::OPCItems {
  public:
    ScriptedOpcGroup(ScriptedOpc& script, std::string name)
        : script_(script), name_(std::move(name)) {}

    const std::string& Name() const override { return name_; }
    ErrorInfo IsActive(bool& bActive) const override;
    ErrorInfo SetIsActive(bool bActive) override;
    ErrorInfo IsSubscribed(bool& bSubscribed) const override;
    ErrorInfo SetIsSubscribed(bool bSubscribed) override;
    ErrorInfo UpdateRate(int32_t& lRate) const override;
    ErrorInfo SetUpdateRate(int32_t lRate) override;
    platform::OPCItems& OPCItems() override { return *this; }
    ErrorInfo SyncRead(int16_t iSource, int32_t lNumItems,
                       const platform::OneBased<int32_t>& ServerHandles,
                       platform::OneBased<Variant>& Values, platform::OneBased<int32_t>& Errors,
                       platform::OneBased<int32_t>& Qualities,
                       platform::OneBased<double>& TimeStamps,
                       platform::OneBased<platform::ValueDetail>& Details) override;
    ErrorInfo SyncWrite(int32_t lNumItems, const platform::OneBased<int32_t>& ServerHandles,
                        const platform::OneBased<Variant>& Values,
                        platform::OneBased<int32_t>& Errors) override;
    void SetDataChangeHandler(DataChangeHandler handler) override { handler_ = std::move(handler); }

    int32_t Count() const override { return static_cast<int32_t>(items_.size()); }
    ErrorInfo AddItems(int32_t lNumItems, const platform::OneBased<std::string>& ItemIDs,
                       const platform::OneBased<int32_t>& ClientHandles,
                       const platform::OneBased<std::string>& AccessPaths,
                       platform::OneBased<int32_t>& ServerHandles,
                       platform::OneBased<int32_t>& Errors) override;
    ErrorInfo GetOPCItem(int32_t lServerHandle, std::shared_ptr<platform::OPCItem>& cItem) override;
    ErrorInfo Remove(int32_t lNumItems, const platform::OneBased<int32_t>& ServerHandles,
                     platform::OneBased<int32_t>& Errors) override;

  private:
    int32_t ItemError(int32_t lServerHandle) const;

    ScriptedOpc& script_;
    std::string name_;
    bool active_ = true;
    bool subscribed_ = false;
    int32_t rate_ = 1000;
    std::map<int32_t, std::string> items_;  // item IDs by server handle
    DataChangeHandler handler_;
};

}  // namespace cv::fake
