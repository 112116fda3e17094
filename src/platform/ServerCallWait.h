#pragma once

#include <cstdint>
#include <functional>
#include <string>

#include "platform/BusyNotice.h"
#include "platform/ErrorInfo.h"
#include "platform/EventLoop.h"

namespace cv::platform {

// How the window thread waits for a call into a server: events keep running
// (notifications, repaints, input), the busy notice appears once the call has
// been pending for the busy time-out and stays until it returns, and a call
// that outlasts the call limit fails instead of waiting for ever. The busy
// time-out and text are application-wide settings, set before connecting.
class ServerCallWait {
  public:
    static constexpr uint32_t kDefaultBusyTimeoutMs = 5000;
    static constexpr uint32_t kDefaultCallLimitMs = 30000;

    ServerCallWait(EventLoop& events, BusyNotice& notice) : events_(events), notice_(notice) {}
    ServerCallWait(const ServerCallWait&) = delete;
    ServerCallWait& operator=(const ServerCallWait&) = delete;

    uint32_t BusyTimeout() const { return busyTimeoutMs_; }
    void SetBusyTimeout(uint32_t ms) { busyTimeoutMs_ = ms; }
    const std::string& BusyText() const { return busyText_; }
    void SetBusyText(std::string text) { busyText_ = std::move(text); }
    uint32_t CallLimit() const { return callLimitMs_; }
    void SetCallLimit(uint32_t ms) { callLimitMs_ = ms; }
    EventLoop& Events() { return events_; }

    // Waits until done() answers true. Fails with RPC_E_TIMEOUT at the call
    // limit. Waits may nest; the notice shows once for all of them.
    ErrorInfo Wait(const std::function<bool()>& done);

  private:
    void ShowNotice();
    void HideNotice();

    EventLoop& events_;
    BusyNotice& notice_;
    uint32_t busyTimeoutMs_ = kDefaultBusyTimeoutMs;
    uint32_t callLimitMs_ = kDefaultCallLimitMs;
    std::string busyText_;
    int32_t noticeUsers_ = 0;
};

}  // namespace cv::platform
