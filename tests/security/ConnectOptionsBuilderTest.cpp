#include <gtest/gtest.h>

#include <filesystem>

#include "platform/fake/RecordingCertificateTrust.h"
#include "platform/fake/ScriptedPasswordPrompt.h"
#include "platform/posix/FilePki.h"
#include "platform/posix/FileRegistry.h"
#include "security/CertificateFacts.h"
#include "security/UaSecurity.h"
#include "support/TempFolder.h"
#include "ua/support/TestCredentials.h"

namespace cv::security {
namespace {

using platform::TrustAnswer;
using ua::MessageSecurityMode;
using ua::UserTokenType;

const std::string kUrl = "opc.tcp://plant-pc:4840";
const std::string kBasic256Sha256 = "http://opcfoundation.org/UA/SecurityPolicy#Basic256Sha256";

ua::EndpointDescription Endpoint(MessageSecurityMode mode, const std::string& policy,
                                 const std::string& certificate) {
    ua::EndpointDescription endpoint;
    endpoint.endpointUrl = kUrl;
    endpoint.securityMode = mode;
    endpoint.securityPolicyUri = policy;
    endpoint.serverCertificate.bytes = certificate;
    endpoint.transportProfileUri =
        "http://opcfoundation.org/UA-Profile/Transport/uatcp-uasc-uabinary";
    endpoint.userIdentityTokens = {{"anonymous", UserTokenType::Anonymous, "", "", ""},
                                   {"username", UserTokenType::UserName, "", "", ""}};
    return endpoint;
}

class ConnectOptionsBuilderTest : public ::testing::Test {
  protected:
    ConnectOptionsBuilderTest() {
        const std::string der(server_.certificate.LeafDer());
        endpoints_ = {Endpoint(MessageSecurityMode::None,
                               "http://opcfoundation.org/UA/SecurityPolicy#None", ""),
                      Endpoint(MessageSecurityMode::Sign, kBasic256Sha256, der),
                      Endpoint(MessageSecurityMode::SignAndEncrypt, kBasic256Sha256, der)};
    }

    ua::Result<ua::ConnectOptions> Build() { return builder_.Build(kUrl, endpoints_); }
    void ChooseUser(const std::string& user,
                    MessageSecurityMode mode = MessageSecurityMode::Invalid) {
        security_.Settings().Write(kUrl, {mode, "", UserTokenType::UserName, user});
    }
    size_t FilesIn(const char* folder) const {
        std::error_code ec;
        const auto it = std::filesystem::directory_iterator(folder_.Path() + "/pki/" + folder, ec);
        return ec ? 0 : static_cast<size_t>(std::distance(it, {}));
    }

    test::TempFolder folder_;
    posix::FilePki pki_{folder_.Path() + "/pki"};
    posix::FileRegistry registry_{folder_.Path()};
    fake::RecordingCertificateTrust question_;
    fake::ScriptedPasswordPrompt prompt_;
    UaSecurity security_{
        registry_, pki_, {"urn:cvtest:builder", "Builder Test", "localhost"}, &question_, &prompt_};
    ConnectOptionsBuilder builder_{security_.Services()};
    const ua::crypto::Credentials server_ = ua::test::MakeCredentials("Plant", 2048, "plant-pc");
    std::vector<ua::EndpointDescription> endpoints_;
};

TEST_F(ConnectOptionsBuilderTest, AnonymousWithoutSecurityNeedsNothing) {
    security_.Settings().Write(kUrl, {MessageSecurityMode::None, "", UserTokenType::Anonymous, ""});
    EXPECT_FALSE(builder_.NeedsEndpoints(kUrl));
    auto options = Build();
    ASSERT_TRUE(options);
    EXPECT_FALSE(options.Value().endpoint);
    EXPECT_FALSE(options.Value().credentials);
    EXPECT_EQ(FilesIn("own/certs"), 0u);
}

// What each answer of the user does to an unknown server certificate.
TEST_F(ConnectOptionsBuilderTest, TheUsersAnswerDecidesAboutAnUnknownCertificate) {
    struct Case {
        TrustAnswer answer;
        bool connects;
        size_t trusted;
        size_t rejected;
    };
    const Case cases[] = {{TrustAnswer::Refuse, false, 0, 0},
                          {TrustAnswer::Reject, false, 0, 1},
                          {TrustAnswer::TrustForSession, true, 0, 0},
                          {TrustAnswer::TrustAlways, true, 1, 0}};
    for (const Case& c : cases) {
        SCOPED_TRACE(static_cast<int>(c.answer));
        std::filesystem::remove_all(folder_.Path() + "/pki/trusted");
        std::filesystem::remove_all(folder_.Path() + "/pki/rejected");
        UaSecurity run(registry_, pki_, {"urn:cvtest:builder", "Builder Test", "localhost"},
                       &question_, &prompt_);
        ConnectOptionsBuilder builder(run.Services());
        question_.answer = c.answer;
        question_.questions.clear();
        auto options = builder.Build(kUrl, endpoints_);
        ASSERT_EQ(question_.questions.size(), 1u);
        EXPECT_EQ(question_.questions[0].facts.host, "plant-pc");
        EXPECT_TRUE(question_.questions[0].facts.hostMatches);
        EXPECT_EQ(options.Ok(), c.connects);
        EXPECT_EQ(FilesIn("trusted/certs"), c.trusted);
        EXPECT_EQ(FilesIn("rejected/certs"), c.rejected);
        if (options) {
            EXPECT_EQ(options.Value().endpoint->securityMode, MessageSecurityMode::SignAndEncrypt)
                << "the most secure the server offers";
            ASSERT_TRUE(options.Value().credentials);
            EXPECT_EQ(options.Value().credentials->certificate.ApplicationUri(),
                      "urn:cvtest:builder");
        } else {
            EXPECT_EQ(options.Failure().status, ua::status::BadCertificateUntrusted);
        }
    }
}

TEST_F(ConnectOptionsBuilderTest, WithNobodyToAskAnUnknownCertificateIsRefusedWithADiagnosis) {
    UaSecurity unattended(registry_, pki_, {"urn:cvtest:builder", "Builder Test", "localhost"},
                          nullptr, nullptr);
    ConnectOptionsBuilder builder(unattended.Services());
    auto options = builder.Build(kUrl, endpoints_);
    ASSERT_FALSE(options);
    EXPECT_TRUE(options.Failure().text.starts_with(
        "The program did not connect to \"" + kUrl +
        "\": the server's certificate is not trusted.\r\n\r\n1. It is not trusted yet."))
        << options.Failure().text;
    EXPECT_EQ(FilesIn("rejected/certs"), 0u) << "nobody refused it";
}

TEST_F(ConnectOptionsBuilderTest, APasswordIsAskedForKeptWhenItWorksAndForgottenWhenRefused) {
    question_.answer = TrustAnswer::TrustForSession;
    ChooseUser("bob");
    prompt_.answers = {"wrong", "secret"};
    auto first = Build();
    ASSERT_TRUE(first) << first.Failure().text;
    EXPECT_EQ(first.Value().identity.password, "wrong");
    auto refused =
        builder_.Settle(kUrl, first.Value(), ua::Error{ua::status::BadUserAccessDenied, "Denied."});
    ASSERT_FALSE(refused);
    EXPECT_TRUE(refused.Failure().text.starts_with("The server at \"" + kUrl +
                                                   "\" refused the user name \"bob\". Denied."));
    auto second = Build();
    ASSERT_TRUE(second);
    EXPECT_EQ(second.Value().identity.password, "secret");
    ASSERT_TRUE(builder_.Settle(kUrl, second.Value(), ua::SessionInfo{}));
    auto third = Build();
    ASSERT_TRUE(third);
    EXPECT_EQ(third.Value().identity.password, "secret");
    ASSERT_EQ(prompt_.requests.size(), 2u) << "a password that worked is kept for the run";
    EXPECT_FALSE(prompt_.requests[0].refusedBefore);
    EXPECT_TRUE(prompt_.requests[1].refusedBefore);
}

TEST_F(ConnectOptionsBuilderTest, AMissingUserNameOrPasswordStopsBeforeConnecting) {
    question_.answer = TrustAnswer::TrustForSession;
    ChooseUser("");
    auto unnamed = Build();
    ASSERT_FALSE(unnamed);
    EXPECT_EQ(unnamed.Failure().status, ua::status::BadIdentityTokenInvalid);
    ChooseUser("bob");
    auto cancelled = Build();
    ASSERT_FALSE(cancelled);
    EXPECT_EQ(cancelled.Failure().status, ua::status::BadRequestCancelledByClient);
}

// A server that shows no security, or a certificate nobody checked, never
// gets a password: it is not even asked for.
TEST_F(ConnectOptionsBuilderTest, APasswordGoesOnlyToACheckedCertificateAndNeverInClear) {
    const std::string der(server_.certificate.LeafDer());
    const auto encrypting = [&](std::string certificate) {
        auto endpoint = Endpoint(MessageSecurityMode::None,
                                 "http://opcfoundation.org/UA/SecurityPolicy#None", certificate);
        endpoint.userIdentityTokens = {{"rsa", UserTokenType::UserName, "", "", kBasic256Sha256}};
        return endpoint;
    };
    struct Case {
        const char* name;
        MessageSecurityMode chosen;
        ua::EndpointDescription offered;
        TrustAnswer answer;
        ua::StatusCode refusal;  // Good: connects with the password
        size_t questions;
    };
    const Case cases[] = {
        {"the most secure choice, a server offering None only", MessageSecurityMode::Invalid,
         encrypting(der), TrustAnswer::TrustAlways, ua::status::BadSecurityModeRejected, 0},
        {"None on purpose, clear text only", MessageSecurityMode::None, endpoints_[0],
         TrustAnswer::TrustAlways, ua::status::BadIdentityTokenInvalid, 0},
        {"None on purpose, the certificate refused", MessageSecurityMode::None, encrypting(der),
         TrustAnswer::Refuse, ua::status::BadCertificateUntrusted, 1},
        {"None on purpose, an unreadable certificate", MessageSecurityMode::None,
         encrypting("junk"), TrustAnswer::TrustAlways, ua::status::BadCertificateInvalid, 0},
        {"None on purpose, the certificate trusted", MessageSecurityMode::None, encrypting(der),
         TrustAnswer::TrustForSession, ua::status::Good, 1},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        question_.questions.clear();
        question_.answer = c.answer;
        prompt_.requests.clear();
        prompt_.answers = {"secret"};
        ChooseUser("bob", c.chosen);
        auto options = builder_.Build(kUrl, {c.offered});
        EXPECT_EQ(question_.questions.size(), c.questions);
        if (c.refusal == ua::status::Good) {
            ASSERT_TRUE(options) << options.Failure().text;
            EXPECT_EQ(options.Value().identity.password, "secret");
            continue;
        }
        ASSERT_FALSE(options);
        EXPECT_EQ(options.Failure().status, c.refusal) << options.Failure().text;
        EXPECT_TRUE(prompt_.requests.empty()) << "no password was asked for";
    }
}

TEST_F(ConnectOptionsBuilderTest, TheMostSecureChoiceSaysWhyItSendsNoPasswordToAPlainServer) {
    ChooseUser("bob");
    auto options = builder_.Build(kUrl, {endpoints_[0]});
    ASSERT_FALSE(options);
    const std::string& text = options.Failure().text;
    EXPECT_TRUE(text.starts_with("The program did not send the password of \"bob\" to \"" + kUrl +
                                 "\": the server offers only connections without security"))
        << text;
    EXPECT_NE(text.find("--security-mode None"), std::string::npos) << text;
}

TEST_F(ConnectOptionsBuilderTest, AServerRefusingTheProgramIsToldWhichCertificateToTrust) {
    question_.answer = TrustAnswer::TrustForSession;
    auto options = Build();
    ASSERT_TRUE(options);
    auto refused = builder_.Settle(kUrl, options.Value(),
                                   ua::Error{ua::status::BadSecurityChecksFailed, "Refused."});
    ASSERT_FALSE(refused);
    const std::string& text = refused.Failure().text;
    EXPECT_NE(text.find(security_.Own().CertificatePath()), std::string::npos) << text;
    EXPECT_NE(text.find(ThumbprintText(options.Value().credentials->certificate)),
              std::string::npos)
        << text;
}

}  // namespace
}  // namespace cv::security
