#include <map>

#include "ua/live/PeerSession.h"

namespace cv::ua::test {
namespace {

class PeerSubscription : public PeerSession {
  protected:
    uint32_t Subscribe(double intervalMs) {
        SubscriptionSettings settings;
        settings.publishingIntervalMs = intervalMs;
        SubscriptionHandlers handlers;
        handlers.dataChange = [this](std::vector<MonitoredItemNotification>& values) {
            for (auto& value : values) {
                received_[value.clientHandle].push_back(std::move(value.value));
            }
        };
        auto info = Await<SubscriptionInfo>(queue_, [&](auto done) {
            client_->CreateSubscription(settings, handlers, std::move(done));
        });
        EXPECT_TRUE(info) << info.Failure().text;
        return info ? info.Value().subscriptionId : 0;
    }

    Result<std::vector<MonitoredItemCreateResult>> Monitor(uint32_t subscription,
                                                           std::vector<std::string> paths) {
        std::vector<MonitoredItemCreateRequest> items;
        for (size_t i = 0; i < paths.size(); ++i) {
            MonitoredItemCreateRequest item;
            item.itemToMonitor = ValueOf(Node(paths[i]));
            item.requestedParameters.clientHandle = static_cast<uint32_t>(i + 1);
            item.requestedParameters.samplingInterval = 100;
            items.push_back(item);
        }
        return Await<std::vector<MonitoredItemCreateResult>>(queue_, [&](auto done) {
            client_->CreateMonitoredItems(subscription, TimestampsToReturn::Both, std::move(items),
                                          std::move(done));
        });
    }

    bool WaitForValues(uint32_t clientHandle, size_t count) {
        return queue_.RunUntil([&] { return received_[clientHandle].size() >= count; });
    }

    std::map<uint32_t, std::vector<DataValue>> received_;
};

TEST_F(PeerSubscription, DeliversChangesEvery100MsWithTheirClientHandles) {
    const uint32_t subscription = Subscribe(100);
    auto created = Monitor(subscription, {"Dynamic.Counter", "Static.Double", "No.Such.Node"});
    ASSERT_TRUE(created) << created.Failure().text;
    EXPECT_TRUE(created.Value()[0].statusCode.IsGood());
    EXPECT_EQ(created.Value()[2].statusCode, status::BadNodeIdUnknown);
    ASSERT_TRUE(WaitForValues(1, 6));
    const auto& counter = received_[1];
    for (size_t i = 1; i < counter.size(); ++i) {
        EXPECT_GT(*counter[i].value.Get<int32_t>(), *counter[i - 1].value.Get<int32_t>());
    }
    ASSERT_FALSE(received_[2].empty());
    EXPECT_EQ(received_[2][0].value, Variant(2.718281828459045));
}

TEST_F(PeerSubscription, ReportingAgainSendsTheCurrentValueAtOnce) {
    const uint32_t subscription = Subscribe(100);
    auto created = Monitor(subscription, {"Static.Int32"});
    ASSERT_TRUE(created);
    ASSERT_TRUE(WaitForValues(1, 1));
    const uint32_t item = created.Value()[0].monitoredItemId;
    const auto setMode = [&](MonitoringMode mode) {
        return Await<std::vector<StatusCode>>(queue_, [&](auto done) {
            client_->SetMonitoringMode(subscription, mode, {item}, std::move(done));
        });
    };
    ASSERT_TRUE(setMode(MonitoringMode::Disabled));
    ASSERT_TRUE(setMode(MonitoringMode::Reporting));
    ASSERT_TRUE(WaitForValues(1, 2));
    EXPECT_EQ(received_[1][1].value, Variant(int32_t{-123456789}));

    auto deleted = Await<std::vector<StatusCode>>(queue_, [&](auto done) {
        client_->DeleteMonitoredItems(subscription, {item, 999}, std::move(done));
    });
    ASSERT_TRUE(deleted);
    EXPECT_EQ(deleted.Value()[0], status::Good);
    EXPECT_EQ(deleted.Value()[1].code, 0x80420000u);
    auto gone = Await<std::vector<StatusCode>>(queue_, [&](auto done) {
        client_->DeleteSubscriptions({subscription, subscription + 1000}, std::move(done));
    });
    ASSERT_TRUE(gone);
    EXPECT_EQ(gone.Value()[0], status::Good);
    EXPECT_EQ(gone.Value()[1], status::BadSubscriptionIdInvalid);
}

TEST_F(PeerSubscription, KeepsSeveralPublishRequestsAtTheServer) {
    const uint32_t subscription = Subscribe(100);
    ASSERT_TRUE(Monitor(subscription, {"Dynamic.Sine"}));
    ASSERT_TRUE(WaitForValues(1, 3));
    std::optional<Client::Statistics> statistics;
    client_->GetStatistics([&](Client::Statistics s) { statistics = s; });
    ASSERT_TRUE(queue_.RunUntil([&] { return statistics.has_value(); }));
    EXPECT_GE(statistics->outstandingPublishes, 2u);
    EXPECT_EQ(statistics->republished, 0u);
}

}  // namespace
}  // namespace cv::ua::test
