#pragma once

#include <asio/io_context.hpp>
#include <asio/steady_timer.hpp>
#include <chrono>
#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <vector>

#include "ua/client/Session.h"
#include "ua/client/SubscriptionTypes.h"

namespace cv::ua {

// The subscriptions of a session and the Publish cycle that serves them:
// several Publish requests are kept at the server while any subscription
// exists, more while the server sends faster than they are asked for (up to
// what it takes), each answer is replaced before its notifications are
// handed on, each data message is acknowledged in a later request,
// keep-alives are noticed, and a gap in a subscription's sequence numbers is
// filled with Republish. Lives on the I/O thread; the handlers run through
// deliver.
class SubscriptionEngine : public std::enable_shared_from_this<SubscriptionEngine> {
  public:
    using Deliver = std::function<void(std::function<void()>)>;

    SubscriptionEngine(asio::io_context& io, std::shared_ptr<Session> session,
                       const ClientOptions& options, Deliver deliver);

    void Create(const SubscriptionSettings& settings, SubscriptionHandlers handlers,
                std::function<void(Result<SubscriptionInfo>)> done);
    void Modify(uint32_t subscriptionId, const SubscriptionSettings& settings,
                std::function<void(Result<SubscriptionInfo>)> done);
    void Delete(std::vector<uint32_t> subscriptionIds,
                std::function<void(Result<std::vector<StatusCode>>)> done);
    // Forgets every subscription and stops publishing.
    void Stop();
    // The session was resumed on a new connection: publishing goes on.
    void Resume() { Fill(); }

    uint32_t OutstandingPublishes() const { return outstanding_; }
    uint64_t Republished() const { return republished_; }

  private:
    struct Subscription {
        SubscriptionInfo info;
        SubscriptionHandlers handlers;
        // The last data message's number.
        std::optional<uint32_t> lastSequence;
    };

    using TimePoint = std::chrono::steady_clock::time_point;

    void Fill();
    void Publish();
    void OnPublish(Result<PublishResponse> response, TimePoint sent);
    void OnPublishFailed(StatusCode status);
    bool ServerWaitsForUs(const PublishResponse& publish, TimePoint sent) const;
    void Process(uint32_t subscriptionId, NotificationMessage message, bool republished);
    void FetchMissing(uint32_t subscriptionId, Subscription& subscription, uint32_t nextSequence);
    void Republish(uint32_t subscriptionId, uint32_t sequenceNumber);
    void Tell(const Subscription& subscription, uint32_t subscriptionId, Error status);
    uint32_t PublishTimeoutMs() const;
    void RetryLater();

    std::shared_ptr<Session> session_;
    ClientOptions options_;
    Deliver deliver_;
    asio::steady_timer retryTimer_;
    std::map<uint32_t, Subscription> subscriptions_;
    std::vector<SubscriptionAcknowledgement> acknowledgements_;
    uint32_t outstanding_ = 0;
    // Publish requests to keep at the server, never more than limit_: the
    // most it takes, as far as we know.
    uint32_t target_;
    uint32_t limit_;
    uint64_t republished_ = 0;
    bool stopped_ = false;
};

}  // namespace cv::ua
