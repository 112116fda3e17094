#pragma once

#include <string>
#include <utility>

#include "platform/fake/ScriptedOpc.h"
#include "platform/opc/OPCItem.h"

namespace cv::fake {

// An item of a ScriptedOpcGroup.
class ScriptedOpcItem : public platform::OPCItem {
  public:
    ScriptedOpcItem(ScriptedOpc& script, int32_t serverHandle, std::string itemId)
        : script_(script), serverHandle_(serverHandle), itemId_(std::move(itemId)) {}

    int32_t ServerHandle() const override { return serverHandle_; }
    const std::string& ItemID() const override { return itemId_; }
    ErrorInfo IsActive(bool& bActive) const override {
        bActive = active_;
        return script_.Call("Item.IsActive");
    }
    ErrorInfo SetIsActive(bool bActive) override {
        const ErrorInfo error = script_.Call("Item.SetIsActive");
        active_ = error ? active_ : bActive;
        return error;
    }

  private:
    ScriptedOpc& script_;
    int32_t serverHandle_;
    std::string itemId_;
    bool active_ = true;
};

}  // namespace cv::fake
