#include <gtest/gtest.h>

#include "ua/ScriptedServer.h"
#include "ua/client/Client.h"
#include "ua/secure/NoneSecurityPolicy.h"
#include "ua/secure/PolicyProfile.h"
#include "ua/support/DispatchQueue.h"
#include "ua/support/TestCredentials.h"

namespace cv::ua::test {
namespace {

using Request = ScriptedServer::Request;

// A server without security whose password policy encrypts to its
// certificate: the password goes to whichever certificate the client uses,
// so only the one the caller checked will do.
EndpointDescription PlainEndpoint(const std::string& url, const std::string& certificate) {
    EndpointDescription endpoint;
    endpoint.endpointUrl = url;
    endpoint.securityMode = MessageSecurityMode::None;
    endpoint.securityPolicyUri = NoneSecurityPolicy::kUri;
    endpoint.serverCertificate.bytes = certificate;
    endpoint.server.applicationUri = "urn:test:server";
    endpoint.userIdentityTokens = {
        {"rsa", UserTokenType::UserName, "", "", std::string(SupportedPolicies()[0].uri)}};
    return endpoint;
}

class ScriptedIdentity : public ::testing::Test {
  protected:
    // The server answers CreateSession with this certificate and nonce.
    void Serve(std::string certificate, size_t nonceSize) {
        server_ = std::make_unique<ScriptedServer>(
            [certificate, nonceSize](ScriptedServer& server, const Request& request) {
                if (request.typeId != CreateSessionRequest::kEncodingId) {
                    return false;
                }
                CreateSessionResponse response;
                response.sessionId = NodeId(1, 1u);
                response.authenticationToken = NodeId(1, std::string("token"));
                response.revisedSessionTimeout = 60'000;
                response.serverCertificate.bytes = certificate;
                response.serverNonce.bytes = std::string(nonceSize, 'N');
                response.serverEndpoints = {PlainEndpoint(server.Url(), certificate)};
                server.Reply(request, response);
                return true;
            });
    }
    Result<SessionInfo> Connect(ConnectOptions options) {
        return Await<SessionInfo>(
            queue_, [&](auto done) { client_->Connect(server_->Url(), options, done); });
    }
    ConnectOptions AsBob() const {
        ConnectOptions options;
        options.endpoint = PlainEndpoint(server_->Url(), checked_);
        options.identity = {UserTokenType::UserName, "bob", "secret"};
        return options;
    }

    const std::string checked_ = ServerCredentials().certificate.Der();
    const crypto::Credentials intruder_ = MakeCredentials("server", 2048);
    DispatchQueue queue_;
    std::unique_ptr<ScriptedServer> server_;
    std::unique_ptr<Client> client_ = std::make_unique<Client>(queue_.MakeDispatcher());
};

TEST_F(ScriptedIdentity, AnyoneButTheCheckedServerGetsNoPassword) {
    struct Case {
        const char* name;
        std::string answeredCertificate;
        size_t nonceSize;
        std::string describedUri;
        bool withEndpoint;
        StatusCode refusal;
    };
    const Case cases[] = {
        {"another certificate in CreateSession", intruder_.certificate.Der(), 32, "urn:test:server",
         true, status::BadCertificateInvalid},
        {"a short nonce", checked_, 16, "urn:test:server", true, status::BadNonceInvalid},
        {"an endpoint describing another application", checked_, 32, "urn:test:other", true,
         status::BadCertificateUriInvalid},
        {"no checked endpoint at all", checked_, 32, "urn:test:server", false,
         status::BadIdentityTokenRejected},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        Serve(c.answeredCertificate, c.nonceSize);
        ConnectOptions options = AsBob();
        options.endpoint->server.applicationUri = c.describedUri;
        if (!c.withEndpoint) {
            options.endpoint.reset();
        }
        auto session = Connect(options);
        ASSERT_FALSE(session);
        EXPECT_EQ(session.Failure().status, c.refusal) << session.Failure().text;
        EXPECT_TRUE(server_->Received(ActivateSessionRequest::kEncodingId).empty());
    }
}

TEST_F(ScriptedIdentity, ThePasswordIsEncryptedToTheCheckedCertificate) {
    Serve(checked_, 32);
    auto session = Connect(AsBob());
    ASSERT_TRUE(session) << session.Failure().text;
    const auto activates = server_->Received(ActivateSessionRequest::kEncodingId);
    ASSERT_EQ(activates.size(), 1u);
    auto token = DecodeExtension<UserNameIdentityToken>(
        activates[0].As<ActivateSessionRequest>().userIdentityToken);
    ASSERT_TRUE(token);
    EXPECT_EQ(token.Value().password.bytes.find("secret"), std::string::npos);
    auto plain = ServerCredentials().key.DecryptOaep(token.Value().password.bytes);
    ASSERT_TRUE(plain);
    EXPECT_EQ(plain.Value().substr(4, 6), "secret");
    EXPECT_FALSE(intruder_.key.DecryptOaep(token.Value().password.bytes));
}

}  // namespace
}  // namespace cv::ua::test
