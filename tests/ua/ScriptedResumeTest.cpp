#include <gtest/gtest.h>

#include "ua/ScriptedServer.h"
#include "ua/client/Client.h"
#include "ua/secure/NoneSecurityPolicy.h"
#include "ua/support/DispatchQueue.h"

namespace cv::ua::test {
namespace {

using Request = ScriptedServer::Request;
using Event = std::pair<ConnectionEvent, Error>;

// The script's answer to a request: true when it dealt with it. Each rule
// counts the requests of its kind, so a test can treat the second Hello
// unlike the first.
struct Rules {
    std::function<bool(ScriptedServer&, const Request&, int)> onRead;
    std::function<bool(ScriptedServer&, const Request&, int)> onHello;
    std::function<bool(ScriptedServer&, const Request&, int)> onActivate;
    std::function<bool(ScriptedServer&, const Request&, int)> onCreate;
};

ScriptedServer::Script Following(Rules rules) {
    return [rules, reads = 0, hellos = 0, activates = 0, creates = 0](
               ScriptedServer& server, const Request& request) mutable {
        if (request.kind == MessageKind::Hello) {
            return rules.onHello && rules.onHello(server, request, ++hellos);
        }
        switch (request.typeId) {
            case ReadRequest::kEncodingId:
                return rules.onRead && rules.onRead(server, request, ++reads);
            case ActivateSessionRequest::kEncodingId:
                return rules.onActivate && rules.onActivate(server, request, ++activates);
            case CreateSessionRequest::kEncodingId:
                return rules.onCreate && rules.onCreate(server, request, ++creates);
            default:
                return false;
        }
    };
}

// The first Read breaks the connection.
bool CloseOnFirstRead(ScriptedServer& server, const Request&, int count) {
    if (count != 1) {
        return false;
    }
    server.CloseConnection();
    return true;
}

class ScriptedResume : public ::testing::Test {
  protected:
    void Start(Rules rules, uint32_t requestTimeoutMs = 200) {
        server_ = std::make_unique<ScriptedServer>(Following(std::move(rules)));
        ClientOptions options;
        options.requestTimeoutMs = requestTimeoutMs;
        options.channel.connectTimeoutMs = 200;
        client_ = std::make_unique<Client>(queue_.MakeDispatcher(), options);
        client_->SetEventHandler([this](ConnectionEvent event, const Error& reason) {
            events_.emplace_back(event, reason);
        });
        auto session =
            Await<SessionInfo>(queue_, [&](auto done) { client_->Connect(server_->Url(), done); });
        ASSERT_TRUE(session) << session.Failure().text;
    }
    Result<std::vector<DataValue>> Read() {
        return Await<std::vector<DataValue>>(queue_, [&](auto done) {
            client_->Read({{NodeId(1, 5u), attribute::Value, "", {}}}, 0, TimestampsToReturn::Both,
                          done);
        });
    }
    bool WaitForEvents(size_t count) {
        return queue_.RunUntil([&] { return events_.size() >= count; });
    }
    std::vector<ConnectionEvent> Kinds() const {
        std::vector<ConnectionEvent> kinds;
        for (const Event& event : events_) {
            kinds.push_back(event.first);
        }
        return kinds;
    }

    DispatchQueue queue_;
    std::unique_ptr<ScriptedServer> server_;
    std::unique_ptr<Client> client_;
    std::vector<Event> events_;
};

TEST_F(ScriptedResume, ActivatesTheSameSessionOnANewConnection) {
    Start({CloseOnFirstRead, nullptr, nullptr, nullptr});
    EXPECT_FALSE(Read()) << "the Read under way when the connection broke";
    ASSERT_TRUE(WaitForEvents(2));
    EXPECT_EQ(Kinds(), (std::vector{ConnectionEvent::Interrupted, ConnectionEvent::Resumed}));
    EXPECT_EQ(events_[0].second.status, status::BadConnectionClosed);

    EXPECT_TRUE(Read());
    EXPECT_EQ(server_->Received(CreateSessionRequest::kEncodingId).size(), 1u);
    const auto activations = server_->Received(ActivateSessionRequest::kEncodingId);
    ASSERT_EQ(activations.size(), 2u);
    EXPECT_EQ(activations[1].As<ActivateSessionRequest>().header.authenticationToken,
              NodeId(1, std::string("token")));
    Client::Statistics statistics;
    client_->GetStatistics([&statistics](Client::Statistics s) { statistics = s; });
    queue_.RunUntil([&statistics] { return statistics.resumes > 0; });
    EXPECT_EQ(statistics.resumes, 1u);
}

TEST_F(ScriptedResume, ACallMadeWhileTheConnectionIsDownIsSentOnceItIsBack) {
    // The first attempt to reconnect finds no answer to its Hello.
    const auto silentOnce = [](ScriptedServer&, const Request&, int count) { return count == 2; };
    Start({CloseOnFirstRead, silentOnce, nullptr, nullptr}, 5000);
    EXPECT_FALSE(Read());
    ASSERT_TRUE(WaitForEvents(1));
    ASSERT_EQ(events_[0].first, ConnectionEvent::Interrupted);

    auto values = Read();
    ASSERT_TRUE(values) << values.Failure().text;
    EXPECT_EQ(Kinds(), (std::vector{ConnectionEvent::Interrupted, ConnectionEvent::Resumed}));
    EXPECT_EQ(server_->Received(0).size(), 3u) << "three Hello messages";
}

TEST_F(ScriptedResume, ASessionTheServerNoLongerKnowsEndsTheConnection) {
    const auto forgotten = [](ScriptedServer& server, const Request& request, int count) {
        if (count != 2) {
            return false;
        }
        ServiceFault fault;
        fault.header.serviceResult = status::BadSessionIdInvalid;
        server.Reply(request, fault);
        return true;
    };
    Start({CloseOnFirstRead, nullptr, forgotten, nullptr});
    EXPECT_FALSE(Read());
    ASSERT_TRUE(WaitForEvents(2));
    EXPECT_EQ(Kinds(),
              (std::vector{ConnectionEvent::Interrupted, ConnectionEvent::ConnectionLost}));
    EXPECT_EQ(events_[1].second.status, status::BadSessionIdInvalid);
    auto after = Read();
    ASSERT_FALSE(after);
    EXPECT_EQ(after.Failure().status, status::BadSessionClosed);
}

TEST_F(ScriptedResume, GivesUpOnceTheSessionTimeOutHasPassed) {
    // A session the server keeps for a second, and a server that stops
    // answering once the connection broke.
    const auto shortSession = [](ScriptedServer& server, const Request& request, int) {
        CreateSessionResponse response;
        response.sessionId = NodeId(1, 1u);
        response.authenticationToken = NodeId(1, std::string("token"));
        response.revisedSessionTimeout = 1000;
        EndpointDescription endpoint;
        endpoint.endpointUrl = server.Url();
        endpoint.securityPolicyUri = NoneSecurityPolicy::kUri;
        endpoint.userIdentityTokens = {{"anon", UserTokenType::Anonymous, "", "", ""}};
        response.serverEndpoints = {endpoint};
        server.Reply(request, response);
        return true;
    };
    const auto silentLater = [](ScriptedServer&, const Request&, int count) { return count > 1; };
    Start({CloseOnFirstRead, silentLater, nullptr, shortSession}, 5000);
    EXPECT_FALSE(Read());
    ASSERT_TRUE(WaitForEvents(1));

    auto parked = Read();
    ASSERT_FALSE(parked);
    EXPECT_EQ(parked.Failure().status, status::BadConnectionClosed);
    EXPECT_NE(parked.Failure().text.find("could not be resumed within 1 s"), std::string::npos)
        << parked.Failure().text;
    ASSERT_TRUE(WaitForEvents(2));
    EXPECT_EQ(events_[1].first, ConnectionEvent::ConnectionLost);
    EXPECT_EQ(events_[1].second, parked.Failure());
}

}  // namespace
}  // namespace cv::ua::test
