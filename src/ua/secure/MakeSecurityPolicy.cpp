#include "ua/secure/MakeSecurityPolicy.h"

#include "ua/secure/CryptoSecurityPolicy.h"
#include "ua/secure/NoneSecurityPolicy.h"
#include "ua/types/PlainText.h"

namespace cv::ua {

Result<std::unique_ptr<SecurityPolicy>> MakeSecurityPolicy(const EndpointDescription& endpoint,
                                                           const crypto::Credentials* own) {
    const bool none = endpoint.securityPolicyUri == NoneSecurityPolicy::kUri;
    if (none != (endpoint.securityMode == MessageSecurityMode::None)) {
        return Error{status::BadSecurityModeRejected, "The endpoint pairs the security policy \"" +
                                                          PlainText(endpoint.securityPolicyUri) +
                                                          "\" with a mode that does not fit it."};
    }
    if (none) {
        return std::unique_ptr<SecurityPolicy>(std::make_unique<NoneSecurityPolicy>());
    }
    const PolicyProfile* profile = FindPolicy(endpoint.securityPolicyUri);
    if (!profile) {
        return Error{status::BadSecurityPolicyRejected,
                     "The program does not know the security policy \"" +
                         PlainText(endpoint.securityPolicyUri) + "\"."};
    }
    if (!own) {
        return Error{status::BadCertificateInvalid,
                     "A secured connection needs the program's certificate."};
    }
    auto server = crypto::Certificate::FromDer(endpoint.serverCertificate.bytes);
    if (!server) {
        return Error{status::BadCertificateInvalid,
                     "The server's certificate cannot be read: " + server.Failure().text};
    }
    auto policy = CryptoSecurityPolicy::Make(*profile, endpoint.securityMode, *own,
                                             std::move(server.Value()));
    if (!policy) {
        return policy.Failure();
    }
    return std::unique_ptr<SecurityPolicy>(std::move(policy.Value()));
}

}  // namespace cv::ua
