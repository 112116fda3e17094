#include <gtest/gtest.h>

#include "ua/ScriptedServer.h"
#include "ua/client/Client.h"
#include "ua/support/DispatchQueue.h"

namespace cv::ua::test {
namespace {

using Request = ScriptedServer::Request;

ClientOptions ShortTimeouts() {
    ClientOptions options;
    options.requestTimeoutMs = 200;
    options.channel.connectTimeoutMs = 200;
    return options;
}

class ScriptedSession : public ::testing::Test {
  protected:
    void Start(ScriptedServer::Script script, ClientOptions options = ShortTimeouts()) {
        server_ = std::make_unique<ScriptedServer>(std::move(script));
        client_ = std::make_unique<Client>(queue_.MakeDispatcher(), options);
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

    DispatchQueue queue_;
    std::unique_ptr<ScriptedServer> server_;
    std::unique_ptr<Client> client_;
};

TEST_F(ScriptedSession, JoinsAResponseSentInSeveralChunks) {
    const std::string text(30'000, 'x');
    Start([text](ScriptedServer& server, const Request& request) {
        if (request.typeId != ReadRequest::kEncodingId) {
            return false;
        }
        ReadResponse response;
        response.header.requestHandle = request.requestHandle;
        response.results.resize(1);
        response.results[0].value = text;
        const std::string body = EncodeMessage(response);
        server.SendChunk(MessageKind::Message, 'C', request.requestId, body.substr(0, 10'000));
        server.SendChunk(MessageKind::Message, 'C', request.requestId, body.substr(10'000, 10'000));
        server.SendChunk(MessageKind::Message, 'F', request.requestId, body.substr(20'000));
        return true;
    });
    auto values = Read();
    ASSERT_TRUE(values) << values.Failure().text;
    EXPECT_EQ(values.Value()[0].value, Variant(text));
}

TEST_F(ScriptedSession, RefusesAMessageOverItsOwnChunkLimit) {
    ClientOptions options = ShortTimeouts();
    options.channel.limits.maxChunkCount = 2;
    Start(
        [](ScriptedServer& server, const Request& request) {
            if (request.typeId != ReadRequest::kEncodingId) {
                return false;
            }
            for (int i = 0; i < 3; ++i) {
                server.SendChunk(MessageKind::Message, 'C', request.requestId, "abc");
            }
            return true;
        },
        options);
    auto values = Read();
    ASSERT_FALSE(values);
    EXPECT_EQ(values.Failure().status, status::BadTcpMessageTooLarge);
    EXPECT_NE(values.Failure().text.find("more than 2 chunks"), std::string::npos);
}

TEST_F(ScriptedSession, KeepsARequestTheServerCannotTakeToItself) {
    server_ = std::make_unique<ScriptedServer>();
    server_->acknowledge = {0, 8192, 8192, 8192, 1};
    client_ = std::make_unique<Client>(queue_.MakeDispatcher(), ShortTimeouts());
    ASSERT_TRUE(
        Await<SessionInfo>(queue_, [&](auto done) { client_->Connect(server_->Url(), done); }));
    DataValue big;
    big.value = std::string(20'000, 'y');
    auto written = Await<std::vector<StatusCode>>(queue_, [&](auto done) {
        client_->Write({{NodeId(1, 5u), attribute::Value, "", big}}, done);
    });
    ASSERT_FALSE(written);
    EXPECT_EQ(written.Failure().status, status::BadRequestTooLarge);
    EXPECT_TRUE(Read()) << "the connection should have stayed";
}

TEST_F(ScriptedSession, RenewsTheSecurityTokenAtThreeQuartersOfItsLifetime) {
    server_ = std::make_unique<ScriptedServer>();
    server_->tokenLifetimeMs = 400;
    client_ = std::make_unique<Client>(queue_.MakeDispatcher(), ShortTimeouts());
    ASSERT_TRUE(
        Await<SessionInfo>(queue_, [&](auto done) { client_->Connect(server_->Url(), done); }));
    ASSERT_TRUE(server_->WaitForRequests(OpenSecureChannelRequest::kEncodingId, 3));
    const auto opens = server_->Received(OpenSecureChannelRequest::kEncodingId);
    EXPECT_EQ(opens[0].As<OpenSecureChannelRequest>().requestType, SecurityTokenRequestType::Issue);
    EXPECT_EQ(opens[1].As<OpenSecureChannelRequest>().requestType, SecurityTokenRequestType::Renew);
    EXPECT_EQ(opens[2].As<OpenSecureChannelRequest>().requestType, SecurityTokenRequestType::Renew);
    EXPECT_TRUE(Read());
}

TEST_F(ScriptedSession, SendsAFreshNonceAndTheEndpointsAnonymousPolicy) {
    Start(nullptr);
    client_->Close([] {});
    ASSERT_TRUE(server_->WaitForRequests(CloseSessionRequest::kEncodingId, 1));
    ASSERT_TRUE(
        Await<SessionInfo>(queue_, [&](auto done) { client_->Connect(server_->Url(), done); }));
    const auto creates = server_->Received(CreateSessionRequest::kEncodingId);
    ASSERT_EQ(creates.size(), 2u);
    const ByteString first = creates[0].As<CreateSessionRequest>().clientNonce;
    EXPECT_EQ(first.bytes.size(), 32u);
    EXPECT_NE(first, creates[1].As<CreateSessionRequest>().clientNonce);
    const auto activate = server_->Received(ActivateSessionRequest::kEncodingId)[0];
    auto token = DecodeExtension<AnonymousIdentityToken>(
        activate.As<ActivateSessionRequest>().userIdentityToken);
    ASSERT_TRUE(token);
    EXPECT_EQ(token.Value().policyId, "anon");
}

TEST_F(ScriptedSession, RefusesASecondConnectUntilClosed) {
    Start(nullptr);
    auto again =
        Await<SessionInfo>(queue_, [&](auto done) { client_->Connect(server_->Url(), done); });
    ASSERT_FALSE(again);
    EXPECT_EQ(again.Failure().status, status::BadInvalidState);
    EXPECT_TRUE(Read());
}

TEST_F(ScriptedSession, DestroyingTheClientWithRequestsPendingCallsNothingBack) {
    Start([](ScriptedServer&, const Request& request) {
        return request.typeId == ReadRequest::kEncodingId;
    });
    int calls = 0;
    for (int i = 0; i < 5; ++i) {
        client_->Read({{NodeId(1, 5u), attribute::Value, "", {}}}, 0, TimestampsToReturn::Both,
                      [&calls](Result<std::vector<DataValue>>) { ++calls; });
    }
    ASSERT_TRUE(server_->WaitForRequests(ReadRequest::kEncodingId, 5));
    client_.reset();
    queue_.RunPending();
    EXPECT_EQ(calls, 0);
}

TEST_F(ScriptedSession, ClosingEndsPendingRequestsAndTheSession) {
    Start([](ScriptedServer&, const Request& request) {
        return request.typeId == ReadRequest::kEncodingId;
    });
    std::optional<Result<std::vector<DataValue>>> pending;
    client_->Read({{NodeId(1, 5u), attribute::Value, "", {}}}, 0, TimestampsToReturn::Both,
                  [&pending](Result<std::vector<DataValue>> r) { pending.emplace(std::move(r)); });
    ASSERT_TRUE(server_->WaitForRequests(ReadRequest::kEncodingId, 1));
    bool closed = false;
    client_->Close([&closed] { closed = true; });
    ASSERT_TRUE(queue_.RunUntil([&] { return closed && pending.has_value(); }));
    EXPECT_FALSE(*pending);
    EXPECT_TRUE(server_->WaitForRequests(CloseSessionRequest::kEncodingId, 1));
    EXPECT_TRUE(server_->WaitForRequests(CloseSecureChannelRequest::kEncodingId, 1));
    auto after = Read();
    ASSERT_FALSE(after);
    EXPECT_EQ(after.Failure().status, status::BadSessionClosed);
}

}  // namespace
}  // namespace cv::ua::test
