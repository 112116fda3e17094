#include "platform/ServerCallWait.h"

#include <algorithm>

#include "platform/opc/OpcResult.h"

namespace cv::platform {

ErrorInfo ServerCallWait::Wait(const std::function<bool()>& done) {
    const uint32_t quiet = std::min(busyTimeoutMs_, callLimitMs_);
    if (events_.WaitUntil(done, quiet)) {
        return {};
    }
    ShowNotice();
    const bool finished = events_.WaitUntil(done, callLimitMs_ - quiet);
    HideNotice();
    if (finished) {
        return {};
    }
    return {OpcResult::RPC_E_TIMEOUT, "The OPC Server did not answer within " +
                                          std::to_string(callLimitMs_ / 1000) + " seconds."};
}

void ServerCallWait::ShowNotice() {
    if (noticeUsers_++ == 0) {
        notice_.Show(busyText_.empty() ? "Please wait..." : busyText_);
    }
}

void ServerCallWait::HideNotice() {
    if (--noticeUsers_ == 0) {
        notice_.Hide();
    }
}

}  // namespace cv::platform
