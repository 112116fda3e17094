#include "ua/client/EndpointChoice.h"

#include <algorithm>
#include <tuple>

#include "ua/secure/NoneSecurityPolicy.h"
#include "ua/secure/PolicyProfile.h"
#include "ua/types/PlainText.h"

namespace cv::ua {
namespace {

bool Speaks(const EndpointDescription& endpoint) {
    const bool binary = endpoint.transportProfileUri.empty() ||
                        endpoint.transportProfileUri.ends_with("uatcp-uasc-uabinary");
    const bool none = endpoint.securityPolicyUri == NoneSecurityPolicy::kUri &&
                      endpoint.securityMode == MessageSecurityMode::None;
    const bool secured = FindPolicy(endpoint.securityPolicyUri) &&
                         (endpoint.securityMode == MessageSecurityMode::Sign ||
                          endpoint.securityMode == MessageSecurityMode::SignAndEncrypt);
    return binary && (none || secured);
}

bool Takes(const EndpointDescription& endpoint, UserTokenType identity) {
    return std::any_of(endpoint.userIdentityTokens.begin(), endpoint.userIdentityTokens.end(),
                       [identity](const UserTokenPolicy& p) { return p.tokenType == identity; });
}

bool Fits(const EndpointDescription& endpoint, const SecurityChoice& choice) {
    return (choice.mode == MessageSecurityMode::Invalid || endpoint.securityMode == choice.mode) &&
           (choice.policyUri.empty() || endpoint.securityPolicyUri == choice.policyUri) &&
           Speaks(endpoint) && Takes(endpoint, choice.identity);
}

// Larger is better.
auto Rank(const EndpointDescription& endpoint) {
    const auto policies = SupportedPolicies();
    const auto order = std::find_if(policies.begin(), policies.end(), [&](const auto& p) {
        return p.uri == endpoint.securityPolicyUri;
    });
    return std::make_tuple(static_cast<int32_t>(endpoint.securityMode), endpoint.securityLevel,
                           -static_cast<int>(order - policies.begin()));
}

std::string Wanted(const SecurityChoice& choice) {
    const std::string mode =
        choice.mode == MessageSecurityMode::Invalid ? "any mode" : "mode " + ModeName(choice.mode);
    const std::string policy =
        choice.policyUri.empty() ? "any policy" : "policy " + PolicyName(choice.policyUri);
    const std::string user =
        choice.identity == UserTokenType::UserName ? "a user name" : "an anonymous user";
    return policy + ", " + mode + " and " + user;
}

std::string Offered(const std::vector<EndpointDescription>& endpoints) {
    std::string offered;
    for (const EndpointDescription& endpoint : endpoints) {
        offered += (offered.empty() ? "" : ", ") + PolicyName(endpoint.securityPolicyUri) + " " +
                   ModeName(endpoint.securityMode);
    }
    return offered.empty() ? "nothing" : offered;
}

}  // namespace

std::string PolicyName(const std::string& policyUri) {
    const size_t hash = policyUri.rfind('#');
    return PlainText(hash == std::string::npos ? policyUri : policyUri.substr(hash + 1));
}

std::string ModeName(MessageSecurityMode mode) {
    switch (mode) {
        case MessageSecurityMode::None:
            return "None";
        case MessageSecurityMode::Sign:
            return "Sign";
        case MessageSecurityMode::SignAndEncrypt:
            return "SignAndEncrypt";
        case MessageSecurityMode::Invalid:
            break;
    }
    return "Invalid";
}

Result<EndpointDescription> ChooseEndpoint(const std::vector<EndpointDescription>& endpoints,
                                           const SecurityChoice& choice) {
    const EndpointDescription* best = nullptr;
    for (const EndpointDescription& endpoint : endpoints) {
        if (Fits(endpoint, choice) && (!best || Rank(endpoint) > Rank(*best))) {
            best = &endpoint;
        }
    }
    if (!best) {
        return Error{status::BadSecurityPolicyRejected, "The server offers no endpoint with " +
                                                            Wanted(choice) + "; it offers " +
                                                            Offered(endpoints) + "."};
    }
    return *best;
}

}  // namespace cv::ua
