#include <algorithm>
#include <array>
#include <string>

#include "ua/client/Session.h"

namespace cv::ua {
namespace {

// Pauses between attempts to resume: the first attempt comes at once, the
// last pause repeats until the session time-out has passed.
constexpr std::array<uint32_t, 5> kResumePausesMs = {500, 1000, 2000, 4000, 5000};

std::string Duration(uint32_t ms) {
    return ms % 1000 == 0 ? std::to_string(ms / 1000) + " s" : std::to_string(ms) + " ms";
}

}  // namespace

bool Session::EndsTheSession(StatusCode status) {
    return IsSessionGone(status) || status == status::BadSecurityChecksFailed ||
           status == status::BadIdentityTokenInvalid;
}

void Session::StartResume(const Error& reason) {
    resuming_ = true;
    lostReason_ = reason;
    resumeAttempts_ = 0;
    resumeDeadline_ =
        std::chrono::steady_clock::now() + std::chrono::milliseconds(info_.revisedSessionTimeoutMs);
    if (events_) {
        events_(ConnectionEvent::Interrupted, reason);
    }
    TryResume();
}

void Session::TryResume() {
    if (!resuming_) {
        return;
    }
    ++resumeAttempts_;
    OpenChannel(info_.endpointUrl, [weak = weak_from_this()](Result<Done> opened) {
        auto self = weak.lock();
        if (!self || !self->resuming_) {
            return;
        }
        if (!opened) {
            self->OnResumeFailed(opened.Failure());
            return;
        }
        self->ActivateSession([weak](Result<SessionInfo> activated) {
            auto session = weak.lock();
            if (!session || !session->resuming_) {
                return;
            }
            if (activated) {
                session->OnResumed();
            } else {
                session->OnResumeFailed(activated.Failure());
            }
        });
    });
}

void Session::OnResumeFailed(const Error& failure) {
    if (EndsTheSession(failure.status)) {
        EndForGood(failure);
        return;
    }
    const auto now = std::chrono::steady_clock::now();
    if (now >= resumeDeadline_) {
        EndForGood(Error{lostReason_.status,
                         lostReason_.text + " The session could not be resumed within " +
                             Duration(info_.revisedSessionTimeoutMs) + " (" + failure.text + ")"});
        return;
    }
    const uint32_t pause =
        kResumePausesMs[std::min<size_t>(resumeAttempts_ - 1, kResumePausesMs.size() - 1)];
    resumeTimer_.expires_at(std::min(now + std::chrono::milliseconds(pause), resumeDeadline_));
    resumeTimer_.async_wait([weak = weak_from_this()](const asio::error_code& ec) {
        if (auto self = weak.lock(); self && !ec) {
            self->TryResume();
        }
    });
}

void Session::OnResumed() {
    resuming_ = false;
    ++resumes_;
    SendParked();
    if (events_) {
        events_(ConnectionEvent::Resumed, lostReason_);
    }
}

void Session::EndForGood(const Error& reason) {
    resuming_ = false;
    active_ = false;
    resumeTimer_.cancel();
    keepAliveTimer_.cancel();
    if (channel_) {
        channel_->Close();
    }
    FailParked(reason);
    if (events_) {
        events_(ConnectionEvent::ConnectionLost, reason);
    }
}

void Session::Park(std::function<void()> send, std::function<void(const Error&)> fail,
                   uint32_t timeoutMs, std::string_view service) {
    const uint64_t id = ++lastParked_;
    auto timer = std::make_unique<asio::steady_timer>(io_);
    timer->expires_after(std::chrono::milliseconds(timeoutMs));
    timer->async_wait([weak = weak_from_this(), id, timeoutMs,
                       service = std::string(service)](const asio::error_code& ec) {
        auto self = weak.lock();
        if (ec || !self) {
            return;
        }
        const auto found = self->parked_.find(id);
        if (found == self->parked_.end()) {
            return;
        }
        const auto failed = std::move(found->second.fail);
        self->parked_.erase(found);
        failed(Error{status::BadTimeout, "The " + service + " request waited " +
                                             std::to_string(timeoutMs) +
                                             " ms for the connection to come back, in vain."});
    });
    parked_.emplace(id, Parked{std::move(send), std::move(fail), std::move(timer)});
}

void Session::SendParked() {
    auto parked = std::move(parked_);
    parked_.clear();
    for (auto& [id, call] : parked) {
        call.timer->cancel();
        call.send();
    }
}

void Session::FailParked(const Error& reason) {
    auto parked = std::move(parked_);
    parked_.clear();
    for (auto& [id, call] : parked) {
        call.timer->cancel();
        call.fail(reason);
    }
}

}  // namespace cv::ua
