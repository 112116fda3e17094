#include "ua/live/SecurePeer.h"

namespace cv::ua::test {
namespace {

// Runs against a peer with --secure --users bob:secret --token-lifetime 1000.
class PeerSecure : public SecurePeer {};

TEST_F(PeerSecure, ReadsThroughEveryPolicyAndMode) {
    for (const PolicyProfile& profile : SupportedPolicies()) {
        for (const auto mode : {MessageSecurityMode::Sign, MessageSecurityMode::SignAndEncrypt}) {
            SCOPED_TRACE(std::string(profile.name) + " " + ModeName(mode));
            auto session = Connect({mode, std::string(profile.uri), UserTokenType::Anonymous});
            ASSERT_TRUE(session) << session.Failure().text;
            EXPECT_EQ(session.Value().endpoint.securityPolicyUri, profile.uri);
            EXPECT_EQ(session.Value().endpoint.securityMode, mode);
            // 3,000 values: a response of many chunks.
            std::vector<ReadValueId> nodes = {ValueOf("Static.String")};
            for (int i = 0; i < 3000; ++i) {
                nodes.push_back(ValueOf("Large.V" + std::to_string(i)));
            }
            auto values = Read(nodes);
            ASSERT_TRUE(values) << values.Failure().text;
            EXPECT_EQ(*values.Value()[0].value.Get<std::string>(), "Flow ≥ 10 m³/h");
            EXPECT_EQ(*values.Value()[3000].value.Get<int32_t>(), 2999);
            Close();
        }
    }
}

TEST_F(PeerSecure, TheMostSecureEndpointSignsAndEncrypts) {
    auto session = Connect({});
    ASSERT_TRUE(session) << session.Failure().text;
    EXPECT_EQ(session.Value().endpoint.securityMode, MessageSecurityMode::SignAndEncrypt);
}

TEST_F(PeerSecure, TakesTheRightPasswordAndRefusesAWrongOne) {
    struct Case {
        MessageSecurityMode mode;
        const char* password;
        bool accepted;
    };
    // Over None the password is encrypted with the server's key all the same.
    const std::vector<Case> cases = {
        {MessageSecurityMode::SignAndEncrypt, "secret", true},
        {MessageSecurityMode::Sign, "secret", true},
        {MessageSecurityMode::None, "secret", true},
        {MessageSecurityMode::SignAndEncrypt, "wrong", false},
        {MessageSecurityMode::None, "", false},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(ModeName(c.mode) + " " + c.password);
        auto session = Connect({c.mode, "", UserTokenType::UserName},
                               {UserTokenType::UserName, "bob", c.password});
        EXPECT_EQ(session.Ok(), c.accepted) << (session ? "" : session.Failure().text);
        if (!c.accepted && !session) {
            EXPECT_TRUE(session.Failure().status == status::BadUserAccessDenied ||
                        session.Failure().status == status::BadIdentityTokenRejected)
                << session.Failure().text;
        }
        Close();
    }
}

TEST_F(PeerSecure, RenewsItsKeysWhileEncryptedValuesKeepComing) {
    ASSERT_TRUE(Connect({MessageSecurityMode::SignAndEncrypt, "", UserTokenType::Anonymous}));
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
    item.itemToMonitor = ValueOf("Dynamic.Counter");
    item.requestedParameters.samplingInterval = 100;
    ASSERT_TRUE(Await<std::vector<MonitoredItemCreateResult>>(queue_, [&](auto done) {
        client_->CreateMonitoredItems(subscription.Value().subscriptionId, TimestampsToReturn::Both,
                                      {item}, std::move(done));
    }));
    Client::Statistics statistics;
    for (int round = 0; round < 100 && statistics.securityTokens < 4; ++round) {
        const size_t before = values;
        ASSERT_TRUE(queue_.RunUntil([&] { return values >= before + 3; }));
        bool answered = false;
        client_->GetStatistics([&](Client::Statistics s) {
            statistics = s;
            answered = true;
        });
        ASSERT_TRUE(queue_.RunUntil([&] { return answered; }));
    }
    EXPECT_GE(statistics.securityTokens, 4u);
    EXPECT_TRUE(Read({ValueOf("Static.Double")}));
}

// Runs against a peer with --secure --reject-unknown.
class PeerUntrusting : public SecurePeer {};

TEST_F(PeerUntrusting, RefusesTheProgramUntilItTrustsItsCertificate) {
    auto refused = Connect({MessageSecurityMode::SignAndEncrypt, "", UserTokenType::Anonymous});
    ASSERT_FALSE(refused);
    EXPECT_EQ(refused.Failure().status, status::BadSecurityChecksFailed) << refused.Failure().text;
    ASSERT_TRUE(Connect({MessageSecurityMode::None, "", UserTokenType::Anonymous}));
    WriteValue trust{NodeId(1, "Control.TrustRejected"), attribute::Value, "", {}};
    trust.value.value = true;
    auto written = Await<std::vector<StatusCode>>(
        queue_, [&](auto done) { client_->Write({trust}, std::move(done)); });
    ASSERT_TRUE(written);
    ASSERT_TRUE(written.Value()[0].IsGood());
    Close();
    auto trusted = Connect({MessageSecurityMode::SignAndEncrypt, "", UserTokenType::Anonymous});
    EXPECT_TRUE(trusted) << trusted.Failure().text;
}

}  // namespace
}  // namespace cv::ua::test
