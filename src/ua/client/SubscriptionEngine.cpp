#include "ua/client/SubscriptionEngine.h"

#include <algorithm>
#include <limits>

namespace cv::ua {
namespace {

constexpr uint32_t kRetryDelayMs = 1000;
// Missing messages asked for again at one gap; older ones count as lost.
constexpr uint32_t kMaxRepublishPerGap = 64;

SubscriptionInfo Revised(uint32_t subscriptionId, double interval, uint32_t lifetime,
                         uint32_t keepAlive) {
    return {subscriptionId, interval, lifetime, keepAlive};
}

}  // namespace

SubscriptionEngine::SubscriptionEngine(asio::io_context& io, std::shared_ptr<Session> session,
                                       const ClientOptions& options, Deliver deliver)
    : session_(std::move(session)),
      options_(options),
      deliver_(std::move(deliver)),
      retryTimer_(io),
      limit_(std::max(1u, options.maxPublishRequests)) {
    target_ = std::clamp(options.publishRequests, 1u, limit_);
}

void SubscriptionEngine::Create(const SubscriptionSettings& settings, SubscriptionHandlers handlers,
                                std::function<void(Result<SubscriptionInfo>)> done) {
    CreateSubscriptionRequest request;
    request.requestedPublishingInterval = settings.publishingIntervalMs;
    request.requestedLifetimeCount = settings.lifetimeCount;
    request.requestedMaxKeepAliveCount = settings.maxKeepAliveCount;
    request.maxNotificationsPerPublish = settings.maxNotificationsPerPublish;
    request.publishingEnabled = settings.publishingEnabled;
    request.priority = settings.priority;
    session_->Call<CreateSubscriptionRequest, CreateSubscriptionResponse>(
        std::move(request),
        [weak = weak_from_this(), handlers = std::move(handlers),
         done = std::move(done)](Result<CreateSubscriptionResponse> created) mutable {
            auto self = weak.lock();
            if (!self || !created) {
                done(created ? Result<SubscriptionInfo>(
                                   Error{status::BadInvalidState, "The client was closed."})
                             : Result<SubscriptionInfo>(created.Failure()));
                return;
            }
            const auto& r = created.Value();
            const SubscriptionInfo info =
                Revised(r.subscriptionId, r.revisedPublishingInterval, r.revisedLifetimeCount,
                        r.revisedMaxKeepAliveCount);
            self->subscriptions_[info.subscriptionId] = Subscription{info, std::move(handlers), {}};
            self->stopped_ = false;
            self->Fill();
            done(info);
        });
}

void SubscriptionEngine::Modify(uint32_t subscriptionId, const SubscriptionSettings& settings,
                                std::function<void(Result<SubscriptionInfo>)> done) {
    ModifySubscriptionRequest request;
    request.subscriptionId = subscriptionId;
    request.requestedPublishingInterval = settings.publishingIntervalMs;
    request.requestedLifetimeCount = settings.lifetimeCount;
    request.requestedMaxKeepAliveCount = settings.maxKeepAliveCount;
    request.maxNotificationsPerPublish = settings.maxNotificationsPerPublish;
    request.priority = settings.priority;
    session_->Call<ModifySubscriptionRequest, ModifySubscriptionResponse>(
        std::move(request), [weak = weak_from_this(), subscriptionId,
                             done = std::move(done)](Result<ModifySubscriptionResponse> modified) {
            if (!modified) {
                done(modified.Failure());
                return;
            }
            const auto& r = modified.Value();
            const SubscriptionInfo info =
                Revised(subscriptionId, r.revisedPublishingInterval, r.revisedLifetimeCount,
                        r.revisedMaxKeepAliveCount);
            auto self = weak.lock();
            if (self && self->subscriptions_.count(subscriptionId)) {
                self->subscriptions_[subscriptionId].info = info;
            }
            done(info);
        });
}

void SubscriptionEngine::Delete(std::vector<uint32_t> subscriptionIds,
                                std::function<void(Result<std::vector<StatusCode>>)> done) {
    DeleteSubscriptionsRequest request;
    request.subscriptionIds = subscriptionIds;
    session_->Call<DeleteSubscriptionsRequest, DeleteSubscriptionsResponse>(
        std::move(request), [weak = weak_from_this(), ids = std::move(subscriptionIds),
                             done = std::move(done)](Result<DeleteSubscriptionsResponse> deleted) {
            auto self = weak.lock();
            if (self && deleted) {
                for (const uint32_t id : ids) {
                    self->subscriptions_.erase(id);
                }
            }
            if (!deleted) {
                done(deleted.Failure());
                return;
            }
            done(std::move(deleted.Value().results));
        });
}

void SubscriptionEngine::Stop() {
    stopped_ = true;
    subscriptions_.clear();
    acknowledgements_.clear();
    retryTimer_.cancel();
}

uint32_t SubscriptionEngine::PublishTimeoutMs() const {
    double longest = 0;
    for (const auto& [id, subscription] : subscriptions_) {
        longest = std::max(longest, subscription.info.revisedPublishingIntervalMs *
                                        subscription.info.revisedMaxKeepAliveCount);
    }
    // The server answers one queued request per keep-alive period at least.
    const double wait = longest * target_ + options_.requestTimeoutMs;
    return static_cast<uint32_t>(std::min(wait, 3'600'000.0));
}

void SubscriptionEngine::Fill() {
    while (!stopped_ && !subscriptions_.empty() && outstanding_ < target_ && session_->IsActive()) {
        Publish();
    }
}

void SubscriptionEngine::Publish() {
    PublishRequest request;
    request.subscriptionAcknowledgements = std::move(acknowledgements_);
    acknowledgements_.clear();
    ++outstanding_;
    // A request that fails took its acknowledgements nowhere: they go with
    // the next one.
    session_->Call<PublishRequest, PublishResponse>(
        request,
        [weak = weak_from_this(), acknowledged = request.subscriptionAcknowledgements,
         sent = std::chrono::steady_clock::now()](Result<PublishResponse> response) {
            auto self = weak.lock();
            if (!self) {
                return;
            }
            if (!response && !self->stopped_) {
                self->acknowledgements_.insert(self->acknowledgements_.end(), acknowledged.begin(),
                                               acknowledged.end());
            }
            self->OnPublish(std::move(response), sent);
        },
        PublishTimeoutMs());
}

void SubscriptionEngine::RetryLater() {
    retryTimer_.expires_after(std::chrono::milliseconds(kRetryDelayMs));
    retryTimer_.async_wait([weak = weak_from_this()](const asio::error_code& ec) {
        if (auto self = weak.lock(); self && !ec) {
            self->Fill();
        }
    });
}

void SubscriptionEngine::OnPublish(Result<PublishResponse> response, TimePoint sent) {
    --outstanding_;
    if (stopped_) {
        return;
    }
    if (!response) {
        OnPublishFailed(response.Failure().status);
        return;
    }
    PublishResponse& publish = response.Value();
    if (ServerWaitsForUs(publish, sent)) {
        target_ = std::min(limit_, target_ + 1);
    }
    // The server gets its next request before the notifications are handed
    // on; it acknowledges nothing yet, the acknowledgement goes with the
    // request after.
    Fill();
    Process(publish.subscriptionId, std::move(publish.notificationMessage), false);
}

void SubscriptionEngine::OnPublishFailed(StatusCode status) {
    if (status == status::BadTooManyPublishRequests) {
        // The server holds as many as it takes.
        limit_ = std::max(1u, outstanding_);
        target_ = std::min(target_, limit_);
    } else if (status == status::BadTimeout) {
        Fill();
    } else if (session_->IsActive() && outstanding_ == 0) {
        RetryLater();
    }
}

// The server has more notifications than it could send in this answer, or
// answered a data message within half a publishing interval of the request:
// it sends faster than one message per interval and is kept waiting unless
// more requests are at hand.
bool SubscriptionEngine::ServerWaitsForUs(const PublishResponse& publish, TimePoint sent) const {
    if (publish.moreNotifications) {
        return true;
    }
    if (publish.notificationMessage.IsKeepAlive() || subscriptions_.empty()) {
        return false;
    }
    double shortest = std::numeric_limits<double>::max();
    for (const auto& [id, subscription] : subscriptions_) {
        shortest = std::min(shortest, subscription.info.revisedPublishingIntervalMs);
    }
    const std::chrono::duration<double, std::milli> waited =
        std::chrono::steady_clock::now() - sent;
    return waited.count() < shortest / 2;
}

void SubscriptionEngine::Process(uint32_t subscriptionId, NotificationMessage message,
                                 bool republished) {
    const auto found = subscriptions_.find(subscriptionId);
    if (found == subscriptions_.end()) {
        return;
    }
    Subscription& subscription = found->second;
    if (!republished) {
        FetchMissing(subscriptionId, subscription, message.sequenceNumber);
    }
    if (message.IsKeepAlive()) {
        return;
    }
    acknowledgements_.push_back({subscriptionId, message.sequenceNumber});
    if (!republished) {
        subscription.lastSequence = message.sequenceNumber;
    }
    for (StatusChangeNotification& change : message.statusChanges) {
        Tell(subscription, subscriptionId,
             Error{change.status, change.status == status::BadTimeout
                                      ? "The subscription expired on the server."
                                      : "The server changed the subscription's status."});
    }
    if (subscription.handlers.dataChange) {
        for (DataChangeNotification& change : message.dataChanges) {
            deliver_([handler = subscription.handlers.dataChange,
                      values = std::move(change.monitoredItems)]() mutable { handler(values); });
        }
    }
    for (const StatusChangeNotification& change : message.statusChanges) {
        if (change.status == status::BadTimeout) {
            subscriptions_.erase(subscriptionId);
            return;
        }
    }
}

// nextSequence is a data message's own number or the number a keep-alive
// announces; every number between the last one seen and it is missing.
void SubscriptionEngine::FetchMissing(uint32_t subscriptionId, Subscription& subscription,
                                      uint32_t nextSequence) {
    if (!subscription.lastSequence) {
        subscription.lastSequence = nextSequence - 1;
        return;
    }
    const uint32_t first = *subscription.lastSequence + 1;
    if (nextSequence <= first) {
        return;
    }
    const uint32_t missing = nextSequence - first;
    if (missing > kMaxRepublishPerGap) {
        Tell(subscription, subscriptionId,
             Error{status::BadMessageNotAvailable,
                   std::to_string(missing) + " notification messages were missed."});
    }
    for (uint32_t sequence = nextSequence - std::min(missing, kMaxRepublishPerGap);
         sequence < nextSequence; ++sequence) {
        Republish(subscriptionId, sequence);
    }
    subscription.lastSequence = nextSequence - 1;
}

void SubscriptionEngine::Republish(uint32_t subscriptionId, uint32_t sequenceNumber) {
    RepublishRequest request;
    request.subscriptionId = subscriptionId;
    request.retransmitSequenceNumber = sequenceNumber;
    session_->Call<RepublishRequest, RepublishResponse>(
        std::move(request), [weak = weak_from_this(), subscriptionId,
                             sequenceNumber](Result<RepublishResponse> response) {
            auto self = weak.lock();
            if (!self || self->stopped_) {
                return;
            }
            const auto found = self->subscriptions_.find(subscriptionId);
            if (!response) {
                if (found != self->subscriptions_.end()) {
                    self->Tell(
                        found->second, subscriptionId,
                        Error{response.Failure().status,
                              "Notification message " + std::to_string(sequenceNumber) +
                                  " could not be fetched again: " + response.Failure().text});
                }
                return;
            }
            ++self->republished_;
            self->Process(subscriptionId, std::move(response.Value().notificationMessage), true);
        });
}

void SubscriptionEngine::Tell(const Subscription& subscription, uint32_t subscriptionId,
                              Error status) {
    if (subscription.handlers.status) {
        deliver_([handler = subscription.handlers.status, subscriptionId,
                  status = std::move(status)] { handler(subscriptionId, status); });
    }
}

}  // namespace cv::ua
