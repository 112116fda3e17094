#include <gtest/gtest.h>

#include <algorithm>
#include <deque>
#include <map>
#include <optional>
#include <set>

#include "ua/ScriptedServer.h"
#include "ua/client/Client.h"
#include "ua/support/DispatchQueue.h"

namespace cv::ua::test {
namespace {

using Request = ScriptedServer::Request;

NotificationMessage DataMessage(uint32_t sequence, double value) {
    NotificationMessage message;
    message.sequenceNumber = sequence;
    DataChangeNotification change;
    change.monitoredItems.push_back({7, DataValue{value, {}, {}, {}, 0, 0}});
    message.dataChanges.push_back(change);
    return message;
}

NotificationMessage KeepAlive(uint32_t nextSequence) {
    NotificationMessage message;
    message.sequenceNumber = nextSequence;
    return message;
}

NotificationMessage Expired(uint32_t sequence) {
    NotificationMessage message;
    message.sequenceNumber = sequence;
    message.statusChanges.push_back({status::BadTimeout, {}});
    return message;
}

// A server whose Publish answers are the given messages in turn (then it
// holds the requests) and whose Republish answers come from the given map
// (Bad_MessageNotAvailable for others).
class PublishScript {
  public:
    PublishScript(std::vector<NotificationMessage> publishes,
                  std::map<uint32_t, NotificationMessage> kept)
        : publishes_(std::move(publishes)), kept_(std::move(kept)) {}

    bool operator()(ScriptedServer& server, const Request& request) {
        if (request.typeId == PublishRequest::kEncodingId) {
            if (next_ < publishes_.size()) {
                PublishResponse response;
                response.subscriptionId = 1;
                response.notificationMessage = publishes_[next_++];
                server.Reply(request, response);
            }
            return true;
        }
        if (request.typeId == RepublishRequest::kEncodingId) {
            const uint32_t sequence = request.As<RepublishRequest>().retransmitSequenceNumber;
            RepublishResponse response;
            if (kept_.count(sequence)) {
                response.notificationMessage = kept_[sequence];
            } else {
                response.header.serviceResult = status::BadMessageNotAvailable;
            }
            server.Reply(request, response);
            return true;
        }
        return false;
    }

  private:
    std::vector<NotificationMessage> publishes_;
    std::map<uint32_t, NotificationMessage> kept_;
    size_t next_ = 0;
};

// Answers the first count Publish requests as they come, each with a data
// message that says whether the server has more; holds the rest.
ScriptedServer::Script AnswerAtOnce(uint32_t count, bool more) {
    return [count, more, answered = 0u](ScriptedServer& server, const Request& request) mutable {
        if (request.typeId != PublishRequest::kEncodingId) {
            return false;
        }
        if (answered < count) {
            ++answered;
            PublishResponse response;
            response.subscriptionId = 1;
            response.moreNotifications = more;
            response.notificationMessage = DataMessage(answered, answered);
            server.Reply(request, response);
        }
        return true;
    };
}

PublishResponse Refusal(StatusCode status) {
    PublishResponse response;
    response.header.serviceResult = status;
    return response;
}

class ScriptedSubscription : public ::testing::Test {
  protected:
    void Start(ScriptedServer::Script script, SubscriptionSettings settings = {}) {
        server_ = std::make_unique<ScriptedServer>(std::move(script));
        client_ = std::make_unique<Client>(queue_.MakeDispatcher());
        ASSERT_TRUE(
            Await<SessionInfo>(queue_, [&](auto done) { client_->Connect(server_->Url(), done); }));
        SubscriptionHandlers handlers;
        handlers.dataChange = [this](std::vector<MonitoredItemNotification>& values) {
            for (const auto& value : values) {
                EXPECT_EQ(value.clientHandle, 7u);
                values_.push_back(*value.value.value.Get<double>());
            }
        };
        handlers.status = [this](uint32_t subscriptionId, const Error& status) {
            EXPECT_EQ(subscriptionId, 1u);
            statuses_.push_back(status);
        };
        ASSERT_TRUE(Await<SubscriptionInfo>(
            queue_, [&](auto done) { client_->CreateSubscription(settings, handlers, done); }));
    }

    uint32_t OutstandingPublishes() {
        std::optional<Client::Statistics> statistics;
        client_->GetStatistics([&statistics](Client::Statistics s) { statistics = s; });
        queue_.RunUntil([&statistics] { return statistics.has_value(); });
        return statistics ? statistics->outstandingPublishes : 0;
    }

    static std::vector<SubscriptionAcknowledgement> AcknowledgedBy(const Request& request) {
        return request.As<PublishRequest>().subscriptionAcknowledgements;
    }

    static std::set<uint32_t> Acknowledged(const std::vector<Request>& requests) {
        std::set<uint32_t> sequences;
        for (const Request& request : requests) {
            if (request.typeId == PublishRequest::kEncodingId) {
                for (const auto& sent : request.As<PublishRequest>().subscriptionAcknowledgements) {
                    EXPECT_EQ(sent.subscriptionId, 1u);
                    sequences.insert(sent.sequenceNumber);
                }
            }
        }
        return sequences;
    }

    DispatchQueue queue_;
    std::unique_ptr<ScriptedServer> server_;
    std::unique_ptr<Client> client_;
    std::vector<double> values_;
    std::vector<Error> statuses_;
};

TEST_F(ScriptedSubscription, FetchesAMissedMessageAgainAndAcknowledgesEveryDataMessage) {
    std::vector<NotificationMessage> publishes = {DataMessage(1, 1.0), DataMessage(3, 3.0),
                                                  DataMessage(4, 4.0)};
    publishes.insert(publishes.end(), 20, KeepAlive(5));
    Start(PublishScript(publishes, {{2, DataMessage(2, 2.0)}}));
    ASSERT_TRUE(queue_.RunUntil([&] { return values_.size() >= 4; }));
    std::sort(values_.begin(), values_.end());
    EXPECT_EQ(values_, (std::vector<double>{1.0, 2.0, 3.0, 4.0}));
    const auto republish = server_->Received(RepublishRequest::kEncodingId);
    ASSERT_EQ(republish.size(), 1u);
    EXPECT_EQ(republish[0].As<RepublishRequest>().retransmitSequenceNumber, 2u);
    EXPECT_TRUE(server_->WaitUntil([](const std::vector<Request>& requests) {
        return Acknowledged(requests) == std::set<uint32_t>{1, 2, 3, 4};
    }));
    EXPECT_TRUE(statuses_.empty());
}

TEST_F(ScriptedSubscription, AKeepAliveRevealsAGapAndALostMessageIsReported) {
    Start(PublishScript({DataMessage(1, 1.0), KeepAlive(3), KeepAlive(3)}, {}));
    ASSERT_TRUE(queue_.RunUntil([&] { return !statuses_.empty(); }));
    EXPECT_EQ(statuses_[0].status, status::BadMessageNotAvailable);
    EXPECT_NE(statuses_[0].text.find("message 2"), std::string::npos) << statuses_[0].text;
    EXPECT_EQ(server_->Received(RepublishRequest::kEncodingId).size(), 1u);
    EXPECT_TRUE(server_->WaitUntil([](const std::vector<Request>& requests) {
        return Acknowledged(requests) == std::set<uint32_t>{1};
    }));
}

TEST_F(ScriptedSubscription, ReportsASubscriptionThatExpiredOnTheServer) {
    Start(PublishScript({DataMessage(1, 1.0), Expired(2)}, {}));
    ASSERT_TRUE(queue_.RunUntil([&] { return !statuses_.empty(); }));
    EXPECT_EQ(statuses_[0].status, status::BadTimeout);
    EXPECT_NE(statuses_[0].text.find("expired"), std::string::npos);
    EXPECT_EQ(values_, (std::vector<double>{1.0}));
}

// The client starts with four Publish requests at the server and keeps one
// more for each answer that shows the server sending faster than it is asked:
// it has more notifications, or it answered a data message within half a
// publishing interval. Five answers come at once here.
TEST_F(ScriptedSubscription, KeepsMorePublishRequestsWhileTheServerSendsFasterThanItIsAsked) {
    struct Case {
        const char* name;
        bool moreNotifications;
        double intervalMs;
        uint32_t held;
    };
    // At once is never within half of a microsecond, always within half an hour.
    const Case cases[] = {
        {"more notifications", true, 0.001, 9},
        {"answered within half an interval", false, 3'600'000, 9},
        {"neither", false, 0.001, 4},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        values_.clear();
        SubscriptionSettings settings;
        settings.publishingIntervalMs = c.intervalMs;
        Start(AnswerAtOnce(5, c.moreNotifications), settings);
        ASSERT_TRUE(queue_.RunUntil([&] { return values_.size() == 5; }));
        EXPECT_EQ(OutstandingPublishes(), c.held);
        ASSERT_TRUE(server_->WaitForRequests(PublishRequest::kEncodingId, 5 + c.held));
        EXPECT_EQ(server_->Received(PublishRequest::kEncodingId).size(), 5 + c.held);
        client_.reset();
    }
}

// A server that holds three requests at most answers the oldest with
// Bad_TooManyPublishRequests when a fourth comes. The client keeps three from
// then on, also when the server has more notifications.
TEST_F(ScriptedSubscription, KeepsNoMorePublishRequestsThanTheServerTakes) {
    Start([held = std::deque<Request>()](ScriptedServer& server, const Request& request) mutable {
        if (request.typeId != PublishRequest::kEncodingId) {
            return false;
        }
        held.push_back(request);
        if (held.size() == 4) {
            server.Reply(held.front(), Refusal(status::BadTooManyPublishRequests));
            held.pop_front();
            PublishResponse response;
            response.subscriptionId = 1;
            response.moreNotifications = true;
            response.notificationMessage = DataMessage(1, 1.0);
            server.Reply(held.front(), response);
            held.pop_front();
        }
        return true;
    });
    ASSERT_TRUE(queue_.RunUntil([&] { return values_.size() == 1; }));
    EXPECT_EQ(OutstandingPublishes(), 3u);
    ASSERT_TRUE(server_->WaitForRequests(PublishRequest::kEncodingId, 5));
    EXPECT_EQ(server_->Received(PublishRequest::kEncodingId).size(), 5u);
    EXPECT_TRUE(statuses_.empty());
}

// The request that replaces an answered one leaves before the answer's
// notifications are handed on: it cannot acknowledge them yet; the next one
// does.
TEST_F(ScriptedSubscription, SendsTheNextPublishBeforeHandingOnTheNotifications) {
    SubscriptionSettings settings;
    settings.publishingIntervalMs = 0.001;
    Start(
        [held = std::vector<Request>()](ScriptedServer& server, const Request& request) mutable {
            if (request.typeId != PublishRequest::kEncodingId) {
                return false;
            }
            held.push_back(request);
            if (held.size() == 1) {
                PublishResponse response;
                response.subscriptionId = 1;
                response.notificationMessage = DataMessage(1, 1.0);
                server.Reply(request, response);
            } else if (held.size() == 5) {
                PublishResponse response;
                response.subscriptionId = 1;
                response.notificationMessage = KeepAlive(2);
                server.Reply(held[1], response);
            }
            return true;
        },
        settings);
    ASSERT_TRUE(server_->WaitForRequests(PublishRequest::kEncodingId, 6));
    const auto requests = server_->Received(PublishRequest::kEncodingId);
    EXPECT_TRUE(AcknowledgedBy(requests[4]).empty());
    ASSERT_EQ(AcknowledgedBy(requests[5]).size(), 1u);
    EXPECT_EQ(AcknowledgedBy(requests[5])[0].sequenceNumber, 1u);
    ASSERT_TRUE(queue_.RunUntil([&] { return values_.size() == 1; }));
}

}  // namespace
}  // namespace cv::ua::test
