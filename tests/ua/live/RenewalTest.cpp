#include "ua/live/PeerSession.h"

namespace cv::ua::test {
namespace {

// Runs against a peer that grants security tokens of one second.
class PeerRenewal : public PeerSession {};

TEST_F(PeerRenewal, RenewsTheTokenWhileValuesKeepComing) {
    SubscriptionSettings settings;
    settings.publishingIntervalMs = 100;
    size_t values = 0;
    SubscriptionHandlers handlers;
    handlers.dataChange = [&values](std::vector<MonitoredItemNotification>& changes) {
        values += changes.size();
    };
    auto subscription = Await<SubscriptionInfo>(queue_, [&](auto done) {
        client_->CreateSubscription(settings, handlers, std::move(done));
    });
    ASSERT_TRUE(subscription);
    MonitoredItemCreateRequest item;
    item.itemToMonitor = ValueOf(Node("Dynamic.Counter"));
    item.requestedParameters.samplingInterval = 100;
    ASSERT_TRUE(Await<std::vector<MonitoredItemCreateResult>>(queue_, [&](auto done) {
        client_->CreateMonitoredItems(subscription.Value().subscriptionId, TimestampsToReturn::Both,
                                      {item}, std::move(done));
    }));
    Client::Statistics statistics;
    for (int round = 0; round < 100 && statistics.securityTokens < 3; ++round) {
        const size_t before = values;
        ASSERT_TRUE(queue_.RunUntil([&] { return values >= before + 3; }));
        bool answered = false;
        client_->GetStatistics([&](Client::Statistics s) {
            statistics = s;
            answered = true;
        });
        ASSERT_TRUE(queue_.RunUntil([&] { return answered; }));
    }
    EXPECT_GE(statistics.securityTokens, 3u);
    EXPECT_TRUE(ReadOne(NodeId(0, ids::ServerStatusState)).status.IsGood());
}

}  // namespace
}  // namespace cv::ua::test
