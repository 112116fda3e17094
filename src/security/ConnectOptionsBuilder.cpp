#include "security/ConnectOptionsBuilder.h"

#include <algorithm>

#include "security/CertificateFacts.h"
#include "security/ConnectDiagnosis.h"
#include "security/TrustDiagnosis.h"
#include "ua/client/EndpointChoice.h"
#include "ua/client/IdentityToken.h"

namespace cv::security {
namespace {

using platform::CertificateProblem;

ua::StatusCode StatusOf(const platform::TrustQuestion& question) {
    switch (question.problems.front()) {
        case CertificateProblem::Invalid:
            return ua::status::BadCertificateInvalid;
        case CertificateProblem::Expired:
        case CertificateProblem::NotYetValid:
            return ua::status::BadCertificateTimeInvalid;
        case CertificateProblem::HostMismatch:
            return ua::status::BadCertificateHostNameInvalid;
        case CertificateProblem::Untrusted:
        case CertificateProblem::Rejected:
            break;
    }
    return ua::status::BadCertificateUntrusted;
}

bool Askable(const platform::TrustQuestion& question) {
    return std::none_of(question.problems.begin(), question.problems.end(), [](auto problem) {
        return problem == CertificateProblem::Invalid || problem == CertificateProblem::Rejected;
    });
}

// How a server refuses a client whose certificate it does not accept.
bool IsSecurityRefusal(ua::StatusCode status) {
    return status == ua::status::BadSecurityChecksFailed ||
           status == ua::status::BadCertificateUntrusted ||
           status == ua::status::BadCertificateTimeInvalid ||
           status == ua::status::BadCertificateUseNotAllowed;
}

// How the client finds that the server answering is not the one checked.
bool IsDoubtfulServer(ua::StatusCode status) {
    return status == ua::status::BadCertificateInvalid ||
           status == ua::status::BadCertificateUriInvalid || status == ua::status::BadNonceInvalid;
}

// Anonymous without security: the client connects as it always did.
bool IsPlain(const ServerSecurity& security) {
    return security.mode == ua::MessageSecurityMode::None &&
           security.identity == ua::UserTokenType::Anonymous;
}

bool IsUserRefusal(ua::StatusCode status) {
    return status == ua::status::BadUserAccessDenied ||
           status == ua::status::BadIdentityTokenRejected;
}

}  // namespace

ConnectOptionsBuilder::ConnectOptionsBuilder(ConnectServices services) : services_(services) {}

bool ConnectOptionsBuilder::NeedsEndpoints(const std::string& endpointUrl) const {
    return !IsPlain(services_.settings.Read(endpointUrl));
}

ua::Result<ua::ConnectOptions> ConnectOptionsBuilder::Build(
    const std::string& endpointUrl, const std::vector<ua::EndpointDescription>& endpoints) {
    const ServerSecurity security = services_.settings.Read(endpointUrl);
    if (IsPlain(security)) {
        return ua::ConnectOptions{};
    }
    if (security.identity == ua::UserTokenType::UserName && security.userName.empty()) {
        return ua::Error{ua::status::BadIdentityTokenInvalid, DescribeNoUserName(endpointUrl)};
    }
    auto endpoint =
        ua::ChooseEndpoint(endpoints, {security.mode, security.policyUri, security.identity});
    if (!endpoint) {
        return ua::Error{endpoint.Failure().status,
                         DescribeUnoffered(endpointUrl, endpoint.Failure().text)};
    }
    ua::ConnectOptions connect;
    connect.endpoint = endpoint.Value();
    auto guarded = GuardPassword(endpointUrl, security, *connect.endpoint);
    if (!guarded) {
        return guarded.Failure();
    }
    if (connect.endpoint->securityMode != ua::MessageSecurityMode::None) {
        auto own = services_.own.Get();
        if (!own) {
            return ua::Error{
                own.Failure().status,
                DescribeOwnCertificateFailure(own.Failure().text, services_.own.CertificatePath())};
        }
        connect.credentials = own.Value();
    }
    auto identity = Identity(endpointUrl, security);
    if (!identity) {
        return identity.Failure();
    }
    connect.identity = std::move(identity.Value());
    return connect;
}

// The server's certificate is checked before anything secret is made for
// it: the channel's keys on a secured endpoint, or a password encrypted to
// it on any endpoint. A password never goes to a server that shows no
// security unless the user chose that for it, and never in clear text.
ua::Result<ua::Done> ConnectOptionsBuilder::GuardPassword(const std::string& endpointUrl,
                                                          const ServerSecurity& security,
                                                          const ua::EndpointDescription& endpoint) {
    const bool secured = endpoint.securityMode != ua::MessageSecurityMode::None;
    if (security.identity != ua::UserTokenType::UserName) {
        return secured ? Approve(endpointUrl, endpoint) : ua::Result<ua::Done>(ua::Done{});
    }
    if (!secured && security.mode == ua::MessageSecurityMode::Invalid) {
        return ua::Error{ua::status::BadSecurityModeRejected,
                         DescribeUnsecuredServer(endpointUrl, security.userName)};
    }
    if (ua::RouteOfPassword(endpoint) == ua::PasswordRoute::Refused) {
        return ua::Error{ua::status::BadIdentityTokenInvalid,
                         DescribeClearPassword(endpointUrl, security.userName)};
    }
    return Approve(endpointUrl, endpoint);
}

ua::Result<ua::Done> ConnectOptionsBuilder::Approve(const std::string& endpointUrl,
                                                    const ua::EndpointDescription& endpoint) {
    auto certificate = ua::crypto::Certificate::FromDer(endpoint.serverCertificate.bytes);
    if (!certificate) {
        return ua::Error{ua::status::BadCertificateInvalid,
                         "The program did not connect to \"" + endpointUrl +
                             "\": the server's certificate cannot be read. " +
                             certificate.Failure().text};
    }
    ServerTrust& trust = services_.trust;
    const platform::TrustQuestion question =
        trust.Examine(certificate.Value(), endpointUrl, ua::DateTime::Now());
    if (question.problems.empty()) {
        return ua::Done{};
    }
    const platform::TrustAnswer answer = services_.question && Askable(question)
                                             ? services_.question->Ask(question)
                                             : platform::TrustAnswer::Refuse;
    switch (answer) {
        case platform::TrustAnswer::TrustForSession:
            trust.TrustForSession(certificate.Value());
            return ua::Done{};
        case platform::TrustAnswer::TrustAlways:
            // A store that cannot be written leaves the session's trust.
            trust.TrustAlways(certificate.Value());
            return ua::Done{};
        case platform::TrustAnswer::Reject:
            trust.Reject(certificate.Value());
            break;
        case platform::TrustAnswer::Refuse:
            break;
    }
    return ua::Error{StatusOf(question), DescribeRefusal(question, trust.Folders())};
}

ua::Result<ua::UserIdentity> ConnectOptionsBuilder::Identity(const std::string& endpointUrl,
                                                             const ServerSecurity& security) {
    if (security.identity != ua::UserTokenType::UserName) {
        return ua::UserIdentity{};
    }
    const std::string& user = security.userName;
    auto password = services_.passwords.Find(endpointUrl, user);
    if (!password && services_.prompt) {
        password = services_.prompt->AskPassword(
            {endpointUrl, user, refused_.contains({endpointUrl, user})});
    }
    if (!password) {
        return ua::Error{ua::status::BadRequestCancelledByClient,
                         DescribeNoPassword(endpointUrl, user)};
    }
    return ua::UserIdentity{ua::UserTokenType::UserName, user, *password};
}

ua::Result<ua::SessionInfo> ConnectOptionsBuilder::Settle(const std::string& endpointUrl,
                                                          const ua::ConnectOptions& connect,
                                                          ua::Result<ua::SessionInfo> session) {
    const ua::UserIdentity& identity = connect.identity;
    const bool named = identity.type == ua::UserTokenType::UserName;
    if (session) {
        if (named) {
            services_.passwords.Remember(endpointUrl, identity.userName, identity.password);
            refused_.erase({endpointUrl, identity.userName});
        }
        return session;
    }
    const ua::Error& failure = session.Failure();
    if (named && IsUserRefusal(failure.status)) {
        services_.passwords.Forget(endpointUrl, identity.userName);
        refused_.insert({endpointUrl, identity.userName});
        return ua::Error{failure.status,
                         DescribeUserRefusal(endpointUrl, identity.userName, failure.text)};
    }
    if (connect.endpoint && IsDoubtfulServer(failure.status)) {
        return ua::Error{failure.status, DescribeDoubtfulServer(endpointUrl, failure.text)};
    }
    if (connect.credentials && IsSecurityRefusal(failure.status)) {
        return ua::Error{
            failure.status,
            DescribeSecurityRefusal(endpointUrl, failure.text, services_.own.CertificatePath(),
                                    ThumbprintText(connect.credentials->certificate))};
    }
    return session;
}

}  // namespace cv::security
