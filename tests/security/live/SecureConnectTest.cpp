#include <gtest/gtest.h>

#include <filesystem>

#include "platform/fake/RecordingCertificateTrust.h"
#include "platform/fake/ScriptedPasswordPrompt.h"
#include "platform/posix/FilePki.h"
#include "platform/posix/FileRegistry.h"
#include "security/RunPasswords.h"
#include "security/SecureConnect.h"
#include "support/TempFolder.h"
#include "ua/live/PeerSession.h"

namespace cv::security {
namespace {

using platform::CertificateProblem;
using platform::TrustAnswer;
using ua::test::Await;

// The program's way of connecting, against a peer started with --secure
// --users bob:secret. Each test has its own settings folder, so the peer's
// certificate is unknown at first.
class SecureConnectTest : public ::testing::Test {
  protected:
    void SetUp() override {
        url_ = ua::test::PeerUrl();
        ASSERT_FALSE(url_.empty());
        NewRun();
    }

    void TearDown() override { Close(); }

    // What lives for one run of the program; the folders stay.
    void NewRun() {
        if (client_) {
            Close();
        }
        ua::ClientOptions options;
        options.applicationUri = kIdentity.applicationUri;
        client_ = std::make_unique<ua::Client>(queue_.MakeDispatcher(), options);
        trust_ = std::make_unique<ServerTrust>(pki_);
        own_ = std::make_unique<OwnCertificate>(pki_, kIdentity);
        passwords_ = std::make_unique<RunPasswords>();
        connect_ = std::make_unique<SecureConnect>(
            *client_, ConnectServices{settings_, *own_, *trust_, *passwords_, question_, &prompt_});
    }

    ua::Result<ua::SessionInfo> Connect() {
        auto session = Await<ua::SessionInfo>(
            queue_, [&](auto done) { connect_->Connect(url_, std::move(done)); });
        if (session) {
            Close();
        }
        return session;
    }

    void Close() {
        bool closed = false;
        client_->Close([&closed] { closed = true; });
        queue_.RunUntil([&closed] { return closed; });
    }

    size_t FilesIn(const char* folder) const {
        std::error_code ec;
        const auto it = std::filesystem::directory_iterator(folder_.Path() + "/pki/" + folder, ec);
        return ec ? 0 : static_cast<size_t>(std::distance(it, {}));
    }

    static bool Lists(const platform::TrustQuestion& question, CertificateProblem problem) {
        return std::find(question.problems.begin(), question.problems.end(), problem) !=
               question.problems.end();
    }

    const ApplicationIdentity kIdentity{"urn:cvtest:security", "Security Test", "localhost"};
    test::TempFolder folder_;
    posix::FilePki pki_{folder_.Path() + "/pki"};
    posix::FileRegistry registry_{folder_.Path()};
    ServerSettings settings_{registry_};
    fake::RecordingCertificateTrust trust_answers_;
    platform::CertificateTrust* question_ = &trust_answers_;
    fake::ScriptedPasswordPrompt prompt_;
    ua::test::DispatchQueue queue_;
    std::string url_;
    std::unique_ptr<ua::Client> client_;
    std::unique_ptr<ServerTrust> trust_;
    std::unique_ptr<OwnCertificate> own_;
    std::unique_ptr<RunPasswords> passwords_;
    std::unique_ptr<SecureConnect> connect_;
};

TEST_F(SecureConnectTest, AsksAboutAnUnknownServerOnceAndRemembersTrustAlways) {
    trust_answers_.answer = TrustAnswer::TrustAlways;
    auto session = Connect();
    ASSERT_TRUE(session) << session.Failure().text;
    EXPECT_EQ(session.Value().endpoint.securityMode, ua::MessageSecurityMode::SignAndEncrypt);
    ASSERT_EQ(trust_answers_.questions.size(), 1u);
    const platform::TrustQuestion& first = trust_answers_.questions[0];
    EXPECT_TRUE(Lists(first, CertificateProblem::Untrusted));
    EXPECT_EQ(first.facts.applicationUri, "urn:127.0.0.1:ua-test-peer");
    EXPECT_EQ(first.facts.host, "127.0.0.1");
    EXPECT_EQ(FilesIn("trusted/certs"), 1u);
    EXPECT_EQ(FilesIn("own/certs"), 1u);
    ASSERT_TRUE(Connect()) << "trusted for this run";
    EXPECT_EQ(trust_answers_.questions.size(), 1u);
    NewRun();
    ASSERT_TRUE(Connect());
    for (size_t i = 1; i < trust_answers_.questions.size(); ++i) {
        EXPECT_FALSE(Lists(trust_answers_.questions[i], CertificateProblem::Untrusted))
            << "the next run knows the certificate";
    }
}

TEST_F(SecureConnectTest, WithoutTheUsersWordTheConnectionFailsWithADiagnosis) {
    question_ = nullptr;
    NewRun();
    auto refused = Connect();
    ASSERT_FALSE(refused);
    EXPECT_EQ(refused.Failure().status, ua::status::BadCertificateUntrusted);
    EXPECT_TRUE(refused.Failure().text.starts_with(
        "The program did not connect to \"" + url_ +
        "\": the server's certificate is not trusted.\r\n\r\n1. It is not trusted yet."))
        << refused.Failure().text;
}

TEST_F(SecureConnectTest, ARejectedCertificateIsRefusedWithoutAskingAgain) {
    trust_answers_.answer = TrustAnswer::Reject;
    ASSERT_FALSE(Connect());
    EXPECT_EQ(FilesIn("rejected/certs"), 1u);
    NewRun();
    auto again = Connect();
    ASSERT_FALSE(again);
    EXPECT_EQ(trust_answers_.questions.size(), 1u);
    EXPECT_NE(again.Failure().text.find("certificate was rejected"), std::string::npos)
        << again.Failure().text;
}

TEST_F(SecureConnectTest, AsksForThePasswordAgainAfterTheServerRefusedIt) {
    settings_.Write(
        url_, {ua::MessageSecurityMode::SignAndEncrypt, "", ua::UserTokenType::UserName, "bob"});
    trust_answers_.answer = TrustAnswer::TrustForSession;
    prompt_.answers = {"wrong", "secret"};
    auto refused = Connect();
    ASSERT_FALSE(refused);
    EXPECT_EQ(refused.Failure().status, ua::status::BadUserAccessDenied);
    EXPECT_TRUE(refused.Failure().text.starts_with("The server at \"" + url_ +
                                                   "\" refused the user name \"bob\"."))
        << refused.Failure().text;
    auto accepted = Connect();
    ASSERT_TRUE(accepted) << accepted.Failure().text;
    ASSERT_EQ(prompt_.requests.size(), 2u);
    EXPECT_FALSE(prompt_.requests[0].refusedBefore);
    EXPECT_TRUE(prompt_.requests[1].refusedBefore);
    EXPECT_EQ(prompt_.requests[1].userName, "bob");
    ASSERT_TRUE(Connect());
    EXPECT_EQ(prompt_.requests.size(), 2u) << "the password is kept for the run";
    const auto registry = folder_.File(posix::FileRegistry::kCurrentUserFile);
    std::ifstream file(registry);
    const std::string text((std::istreambuf_iterator<char>(file)), {});
    EXPECT_EQ(text.find("secret"), std::string::npos) << "no password in the settings";
}

TEST_F(SecureConnectTest, AnonymousWithoutSecurityConnectsAsBefore) {
    settings_.Write(url_, {ua::MessageSecurityMode::None, "", ua::UserTokenType::Anonymous, ""});
    auto session = Connect();
    ASSERT_TRUE(session) << session.Failure().text;
    EXPECT_EQ(session.Value().endpoint.securityMode, ua::MessageSecurityMode::None);
    EXPECT_TRUE(trust_answers_.questions.empty());
    EXPECT_EQ(FilesIn("own/certs"), 0u) << "no certificate is made for it";
}

}  // namespace
}  // namespace cv::security
