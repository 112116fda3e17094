#pragma once

#include <functional>
#include <memory>
#include <optional>

#include "platform/ErrorInfo.h"
#include "platform/ServerCallWait.h"
#include "platform/opc/OpcResult.h"
#include "ua/types/Result.h"

namespace cv::uaopc {

inline ErrorInfo Disconnected(const std::string& why = "The connection to the server has ended.") {
    return {platform::OpcResult::RPC_E_DISCONNECTED, why};
}

// Starts an asynchronous client call and lets the window thread's events run
// until its answer has come, as a call into a server waits (busy notice,
// call limit). gone() is asked after every event: once it says the
// caller's objects went, the wait ends with RPC_E_DISCONNECTED and the late
// answer is dropped. start gets the completion to hand to the client.
template <class T, class Start>
ErrorInfo Await(platform::ServerCallWait& wait, const std::function<bool()>& gone, Start start,
                std::optional<ua::Result<T>>& result) {
    auto slot = std::make_shared<std::optional<ua::Result<T>>>();
    start([slot](ua::Result<T> answer) { slot->emplace(std::move(answer)); });
    if (const ErrorInfo error = wait.Wait([&] { return slot->has_value() || gone(); })) {
        return error;
    }
    if (gone() || !slot->has_value()) {
        return Disconnected();
    }
    result = std::move(*slot);
    return {};
}

}  // namespace cv::uaopc
