#include "ua/client/IdentityToken.h"

#include <algorithm>

#include "ua/crypto/Certificate.h"
#include "ua/encoding/Encoder.h"
#include "ua/secure/NoneSecurityPolicy.h"
#include "ua/secure/PolicyProfile.h"
#include "ua/services/ServiceMessages.h"
#include "ua/services/SessionServices.h"

namespace cv::ua {
namespace {

std::string TokenPolicyUri(const UserTokenPolicy& policy, const EndpointDescription& endpoint) {
    return policy.securityPolicyUri.empty() ? endpoint.securityPolicyUri : policy.securityPolicyUri;
}

// A policy whose password this client can encrypt comes first; one that
// takes it in clear text only over an encrypted channel.
const UserTokenPolicy* PasswordPolicy(const EndpointDescription& endpoint) {
    const UserTokenPolicy* clear = nullptr;
    for (const UserTokenPolicy& policy : endpoint.userIdentityTokens) {
        if (policy.tokenType != UserTokenType::UserName) {
            continue;
        }
        const std::string uri = TokenPolicyUri(policy, endpoint);
        if (FindPolicy(uri)) {
            return &policy;
        }
        if ((uri.empty() || uri == NoneSecurityPolicy::kUri) && !clear) {
            clear = &policy;
        }
    }
    const bool encrypted = endpoint.securityMode == MessageSecurityMode::SignAndEncrypt;
    return encrypted ? clear : nullptr;
}

Result<ByteString> EncryptPassword(const std::string& password, const ByteString& certificate,
                                   const ByteString& nonce) {
    if (nonce.bytes.empty()) {
        return Error{status::BadNonceInvalid,
                     "The server sent no nonce, so the password cannot be encrypted."};
    }
    auto server = crypto::Certificate::FromDer(certificate.bytes);
    if (!server) {
        return Error{status::BadCertificateInvalid,
                     "The server's certificate cannot be read to encrypt the password: " +
                         server.Failure().text};
    }
    std::string secret;
    Encoder encoder(secret);
    encoder(static_cast<uint32_t>(password.size() + nonce.bytes.size()));
    secret += password;
    secret += nonce.bytes;
    auto encrypted = server.Value().EncryptOaep(secret);
    if (!encrypted) {
        return encrypted.Failure();
    }
    return ByteString{std::move(encrypted.Value())};
}

Result<ExtensionObject> Anonymous(const EndpointDescription& endpoint) {
    const auto found = std::find_if(
        endpoint.userIdentityTokens.begin(), endpoint.userIdentityTokens.end(),
        [](const UserTokenPolicy& policy) { return policy.tokenType == UserTokenType::Anonymous; });
    if (found == endpoint.userIdentityTokens.end()) {
        return Error{status::BadIdentityTokenInvalid,
                     "The server takes no anonymous user on this endpoint."};
    }
    return MakeExtension(AnonymousIdentityToken{found->policyId});
}

}  // namespace

PasswordRoute RouteOfPassword(const EndpointDescription& endpoint) {
    const UserTokenPolicy* policy = PasswordPolicy(endpoint);
    if (!policy) {
        return PasswordRoute::Refused;
    }
    return FindPolicy(TokenPolicyUri(*policy, endpoint)) ? PasswordRoute::EncryptedToCertificate
                                                         : PasswordRoute::InsideEncryptedChannel;
}

Result<ExtensionObject> MakeIdentityToken(const UserIdentity& identity,
                                          const EndpointDescription& endpoint,
                                          const ByteString& serverCertificate,
                                          const ByteString& serverNonce) {
    if (identity.type != UserTokenType::UserName) {
        return Anonymous(endpoint);
    }
    const UserTokenPolicy* policy = PasswordPolicy(endpoint);
    if (!policy) {
        return Error{status::BadIdentityTokenInvalid,
                     "The server takes no user name on this endpoint in a way that keeps the "
                     "password secret."};
    }
    UserNameIdentityToken token{policy->policyId, identity.userName, {identity.password}, ""};
    if (FindPolicy(TokenPolicyUri(*policy, endpoint))) {
        auto encrypted = EncryptPassword(identity.password, serverCertificate, serverNonce);
        if (!encrypted) {
            return encrypted.Failure();
        }
        token.password = std::move(encrypted.Value());
        token.encryptionAlgorithm = std::string(kRsaOaepUri);
    }
    return MakeExtension(token);
}

}  // namespace cv::ua
