#include "platform/fake/ScriptedOpcGroup.h"

#include <algorithm>

#include "platform/fake/ScriptedOpc.h"
#include "platform/fake/ScriptedOpcItem.h"

namespace cv::fake {

using platform::OneBased;

ErrorInfo ScriptedOpcGroup::IsActive(bool& bActive) const {
    bActive = active_;
    return script_.Call("IsActive");
}

ErrorInfo ScriptedOpcGroup::SetIsActive(bool bActive) {
    const ErrorInfo error = script_.Call("SetIsActive");
    active_ = error ? active_ : bActive;
    return error;
}

ErrorInfo ScriptedOpcGroup::IsSubscribed(bool& bSubscribed) const {
    bSubscribed = subscribed_;
    return script_.Call("IsSubscribed");
}

ErrorInfo ScriptedOpcGroup::SetIsSubscribed(bool bSubscribed) {
    const ErrorInfo error = script_.Call("SetIsSubscribed");
    subscribed_ = error ? subscribed_ : bSubscribed;
    return error;
}

ErrorInfo ScriptedOpcGroup::UpdateRate(int32_t& lRate) const {
    lRate = rate_;
    return script_.Call("UpdateRate");
}

ErrorInfo ScriptedOpcGroup::SetUpdateRate(int32_t lRate) {
    const ErrorInfo error = script_.Call("SetUpdateRate");
    rate_ = error ? rate_ : lRate;
    return error;
}

int32_t ScriptedOpcGroup::ItemError(int32_t lServerHandle) const {
    const auto found = script_.itemErrors.find(lServerHandle);
    return found == script_.itemErrors.end() ? 0 : found->second;
}

ErrorInfo ScriptedOpcGroup::SyncRead(int16_t, int32_t lNumItems,
                                     const OneBased<int32_t>& ServerHandles,
                                     OneBased<Variant>& Values, OneBased<int32_t>& Errors,
                                     OneBased<int32_t>& Qualities, OneBased<double>& TimeStamps,
                                     OneBased<platform::ValueDetail>& Details) {
    if (ErrorInfo error = script_.Call("SyncRead")) {
        return error;
    }
    const int32_t lAnswered = script_.answeredItems >= 0
                                  ? std::min(script_.answeredItems, lNumItems)
                                  : std::min(lNumItems, ServerHandles.Count());
    Values = OneBased<Variant>::Sized(lAnswered);
    Errors = OneBased<int32_t>::Sized(lAnswered);
    Qualities = OneBased<int32_t>::Sized(lAnswered);
    TimeStamps = OneBased<double>::Sized(lAnswered);
    Details.Clear();
    for (int32_t i = 1; i <= lAnswered; ++i) {
        Errors(i) = ItemError(ServerHandles(i));
        Values(i) = Errors(i) == 0 ? script_.readValue : Variant();
        Qualities(i) = script_.readQuality;
    }
    return {};
}

ErrorInfo ScriptedOpcGroup::SyncWrite(int32_t lNumItems, const OneBased<int32_t>& ServerHandles,
                                      const OneBased<Variant>& Values, OneBased<int32_t>& Errors) {
    if (ErrorInfo error = script_.Call("SyncWrite")) {
        return error;
    }
    Errors = OneBased<int32_t>::Sized(lNumItems);
    for (int32_t i = 1; i <= lNumItems; ++i) {
        script_.written.push_back(Values(i));
        Errors(i) = ItemError(ServerHandles(i));
    }
    return {};
}

ErrorInfo ScriptedOpcGroup::AddItems(int32_t lNumItems, const OneBased<std::string>& ItemIDs,
                                     const OneBased<int32_t>&, const OneBased<std::string>&,
                                     OneBased<int32_t>& ServerHandles, OneBased<int32_t>& Errors) {
    if (ErrorInfo error = script_.Call("AddItems")) {
        return error;
    }
    ServerHandles = OneBased<int32_t>::Sized(lNumItems);
    Errors = OneBased<int32_t>::Sized(lNumItems);
    for (int32_t i = 1; i <= lNumItems; ++i) {
        ServerHandles(i) = script_.nextServerHandle++;
        items_[ServerHandles(i)] = ItemIDs(i);
    }
    return {};
}

ErrorInfo ScriptedOpcGroup::GetOPCItem(int32_t lServerHandle,
                                       std::shared_ptr<platform::OPCItem>& cItem) {
    if (ErrorInfo error = script_.Call("GetOPCItem")) {
        return error;
    }
    cItem = std::make_shared<ScriptedOpcItem>(script_, lServerHandle, items_[lServerHandle]);
    return {};
}

ErrorInfo ScriptedOpcGroup::Remove(int32_t lNumItems, const OneBased<int32_t>& ServerHandles,
                                   OneBased<int32_t>& Errors) {
    if (ErrorInfo error = script_.Call("RemoveItems")) {
        return error;
    }
    Errors = OneBased<int32_t>::Sized(lNumItems);
    for (int32_t i = 1; i <= lNumItems; ++i) {
        items_.erase(ServerHandles(i));
    }
    return {};
}

}  // namespace cv::fake
