#include <gtest/gtest.h>

#include "ua/client/EndpointChoice.h"
#include "ua/client/IdentityToken.h"
#include "ua/encoding/Decoder.h"
#include "ua/secure/NoneSecurityPolicy.h"
#include "ua/secure/PolicyProfile.h"
#include "ua/secure/SessionSignature.h"
#include "ua/services/ServiceMessages.h"
#include "ua/support/TestCredentials.h"

namespace cv::ua::test {
namespace {

const std::string kNone(NoneSecurityPolicy::kUri);
const std::string kBasic(SupportedPolicies()[0].uri);
const std::string kAes(SupportedPolicies()[1].uri);

TEST(SessionSignature, EachSideSignsTheOthersCertificateAndNonce) {
    const crypto::Credentials& server = ServerCredentials();
    const std::string clientCertificate = ClientCredentials().certificate.Der();
    auto signature = SignSession(server.key, clientCertificate, "client nonce");
    ASSERT_TRUE(signature);
    EXPECT_EQ(signature.Value().algorithm, kRsaSha256Uri);
    EXPECT_TRUE(CheckSessionSignature(server.certificate, clientCertificate, "client nonce",
                                      signature.Value()));
    struct Case {
        const char* name;
        crypto::Certificate signer;
        std::string nonce;
        std::string algorithm;
    };
    const std::vector<Case> refused = {
        {"another nonce", server.certificate, "client noncE", std::string(kRsaSha256Uri)},
        {"another signer", ClientCredentials().certificate, "client nonce",
         std::string(kRsaSha256Uri)},
        {"another algorithm", server.certificate, "client nonce",
         "http://www.w3.org/2000/09/xmldsig#rsa-sha1"},
    };
    for (const Case& c : refused) {
        SignatureData data = signature.Value();
        data.algorithm = c.algorithm;
        auto checked = CheckSessionSignature(c.signer, clientCertificate, c.nonce, data);
        ASSERT_FALSE(checked) << c.name;
        EXPECT_EQ(checked.Failure().status, status::BadApplicationSignatureInvalid);
    }
}

EndpointDescription Endpoint(MessageSecurityMode mode, const std::string& policy,
                             std::vector<UserTokenPolicy> tokens, uint8_t level = 0) {
    EndpointDescription endpoint;
    endpoint.endpointUrl = "opc.tcp://plant:4840";
    endpoint.securityMode = mode;
    endpoint.securityPolicyUri = policy;
    endpoint.serverCertificate = ByteString{ServerCredentials().certificate.Der()};
    endpoint.userIdentityTokens = std::move(tokens);
    endpoint.transportProfileUri =
        "http://opcfoundation.org/UA-Profile/Transport/uatcp-uasc-uabinary";
    endpoint.securityLevel = level;
    return endpoint;
}

UserTokenPolicy Token(const std::string& id, UserTokenType type, const std::string& policy = "") {
    UserTokenPolicy token;
    token.policyId = id;
    token.tokenType = type;
    token.securityPolicyUri = policy;
    return token;
}

TEST(IdentityToken, EncryptsThePasswordWithTheLengthAndTheServerNonce) {
    const EndpointDescription endpoint =
        Endpoint(MessageSecurityMode::Sign, kBasic, {Token("pw", UserTokenType::UserName)});
    const ByteString nonce{std::string(32, 'N')};
    auto token = MakeIdentityToken({UserTokenType::UserName, "bob", "Grüße"}, endpoint,
                                   endpoint.serverCertificate, nonce);
    ASSERT_TRUE(token) << token.Failure().text;
    auto decoded = DecodeExtension<UserNameIdentityToken>(token.Value());
    ASSERT_TRUE(decoded);
    EXPECT_EQ(decoded.Value().policyId, "pw");
    EXPECT_EQ(decoded.Value().userName, "bob");
    EXPECT_EQ(decoded.Value().encryptionAlgorithm, kRsaOaepUri);
    auto plain = ServerCredentials().key.DecryptOaep(decoded.Value().password.bytes);
    ASSERT_TRUE(plain);
    // UInt32 length of what follows (7 UTF-8 bytes of password + 32 of nonce).
    EXPECT_EQ(Hex(plain.Value().substr(0, 4)), "27000000");
    EXPECT_EQ(plain.Value().substr(4), "Grüße" + nonce.bytes);
}

TEST(IdentityToken, PicksATokenPolicyThatKeepsThePasswordSecret) {
    struct Case {
        const char* name;
        EndpointDescription endpoint;
        std::string policyId;  // empty: refused
        bool encrypted;
    };
    const auto name = UserTokenType::UserName;
    const std::vector<Case> cases = {
        {"None endpoint, encrypting policy beside a clear one",
         Endpoint(MessageSecurityMode::None, kNone,
                  {Token("clear", name, kNone), Token("rsa", name, kAes)}),
         "rsa", true},
        {"None endpoint, clear text only",
         Endpoint(MessageSecurityMode::None, kNone, {Token("clear", name)}), "", false},
        {"encrypted channel, clear token",
         Endpoint(MessageSecurityMode::SignAndEncrypt, kBasic, {Token("clear", name, kNone)}),
         "clear", false},
        {"signed channel, clear token",
         Endpoint(MessageSecurityMode::Sign, kBasic, {Token("clear", name, kNone)}), "", false},
        {"a policy this client does not speak",
         Endpoint(MessageSecurityMode::None, kNone,
                  {Token("old", name, "http://opcfoundation.org/UA/SecurityPolicy#Basic128Rsa15")}),
         "", false},
        {"no user names",
         Endpoint(MessageSecurityMode::SignAndEncrypt, kBasic,
                  {Token("anonymous", UserTokenType::Anonymous)}),
         "", false},
    };
    for (const Case& c : cases) {
        auto token = MakeIdentityToken({name, "bob", "secret"}, c.endpoint,
                                       c.endpoint.serverCertificate, {std::string(32, 'N')});
        ASSERT_EQ(token.Ok(), !c.policyId.empty()) << c.name;
        if (!token) {
            EXPECT_EQ(token.Failure().status, status::BadIdentityTokenInvalid) << c.name;
            continue;
        }
        auto decoded = DecodeExtension<UserNameIdentityToken>(token.Value()).Value();
        EXPECT_EQ(decoded.policyId, c.policyId) << c.name;
        EXPECT_EQ(decoded.password.bytes == "secret", !c.encrypted) << c.name;
    }
}

TEST(IdentityToken, NeedsANonceToEncryptAndAnAnonymousPolicyForNobody) {
    const EndpointDescription endpoint =
        Endpoint(MessageSecurityMode::Sign, kBasic,
                 {Token("pw", UserTokenType::UserName), Token("nobody", UserTokenType::Anonymous)});
    auto noNonce = MakeIdentityToken({UserTokenType::UserName, "bob", "x"}, endpoint,
                                     endpoint.serverCertificate, {});
    ASSERT_FALSE(noNonce);
    EXPECT_EQ(noNonce.Failure().status, status::BadNonceInvalid);
    auto anonymous = MakeIdentityToken({}, endpoint, {}, {});
    ASSERT_TRUE(anonymous);
    EXPECT_EQ(DecodeExtension<AnonymousIdentityToken>(anonymous.Value()).Value().policyId,
              "nobody");
    const EndpointDescription named =
        Endpoint(MessageSecurityMode::Sign, kBasic, {Token("pw", UserTokenType::UserName)});
    EXPECT_FALSE(MakeIdentityToken({}, named, {}, {}));
}

TEST(EndpointChoice, TakesTheMostSecureThatFitsTheChoice) {
    const UserTokenPolicy anonymous = Token("a", UserTokenType::Anonymous);
    const UserTokenPolicy name = Token("n", UserTokenType::UserName);
    const std::vector<EndpointDescription> offered = {
        Endpoint(MessageSecurityMode::None, kNone, {anonymous, name}, 0),
        Endpoint(MessageSecurityMode::Sign, kAes, {anonymous}, 5),
        Endpoint(MessageSecurityMode::SignAndEncrypt, kAes, {anonymous}, 10),
        Endpoint(MessageSecurityMode::SignAndEncrypt, kBasic, {anonymous, name}, 10),
        Endpoint(MessageSecurityMode::Sign, kBasic, {anonymous, name}, 3),
        Endpoint(MessageSecurityMode::SignAndEncrypt,
                 "http://opcfoundation.org/UA/SecurityPolicy#Aes256_Sha256_RsaPss", {anonymous},
                 99),
    };
    struct Case {
        SecurityChoice choice;
        MessageSecurityMode mode;
        std::string policy;  // empty: none fits
    };
    const auto anyone = UserTokenType::Anonymous;
    const std::vector<Case> cases = {
        {{MessageSecurityMode::Invalid, "", anyone}, MessageSecurityMode::SignAndEncrypt, kBasic},
        {{MessageSecurityMode::Sign, "", anyone}, MessageSecurityMode::Sign, kAes},
        {{MessageSecurityMode::Invalid, kAes, anyone}, MessageSecurityMode::SignAndEncrypt, kAes},
        {{MessageSecurityMode::None, "", anyone}, MessageSecurityMode::None, kNone},
        {{MessageSecurityMode::Sign, kAes, UserTokenType::UserName},
         MessageSecurityMode::Invalid,
         ""},
        {{MessageSecurityMode::Invalid, "", UserTokenType::UserName},
         MessageSecurityMode::SignAndEncrypt,
         kBasic},
    };
    for (const Case& c : cases) {
        auto chosen = ChooseEndpoint(offered, c.choice);
        const std::string what = ModeName(c.choice.mode) + " " + PolicyName(c.choice.policyUri);
        ASSERT_EQ(chosen.Ok(), !c.policy.empty()) << what;
        if (!chosen) {
            EXPECT_NE(chosen.Failure().text.find("it offers None None, Aes128_Sha256_RsaOaep Sign"),
                      std::string::npos)
                << chosen.Failure().text;
            continue;
        }
        EXPECT_EQ(chosen.Value().securityMode, c.mode) << what;
        EXPECT_EQ(chosen.Value().securityPolicyUri, c.policy) << what;
    }
}

}  // namespace
}  // namespace cv::ua::test
