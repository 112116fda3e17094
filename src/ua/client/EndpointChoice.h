#pragma once

#include <string>
#include <vector>

#include "ua/services/DiscoveryServices.h"
#include "ua/types/Result.h"

namespace cv::ua {

// What a user chose for a server: a security mode and policy, each of which
// may be left to the client (then the most secure the server offers).
struct SecurityChoice {
    // Invalid: the most secure mode.
    MessageSecurityMode mode = MessageSecurityMode::Invalid;
    // Empty: the most secure policy (for the mode).
    std::string policyUri;
    // The endpoint must take a user of this kind.
    UserTokenType identity = UserTokenType::Anonymous;
};

// The endpoint to connect to: of those with the binary transport, a policy
// this library speaks and a user token policy for the identity, the one that
// fits the choice, preferring SignAndEncrypt to Sign to None, then the
// server's own security level, then Basic256Sha256 to Aes128_Sha256_RsaOaep.
// Fails with a text listing what the server offers.
Result<EndpointDescription> ChooseEndpoint(const std::vector<EndpointDescription>& endpoints,
                                           const SecurityChoice& choice);

// "Basic256Sha256", "None": the name at the end of a policy URI.
std::string PolicyName(const std::string& policyUri);
// "None", "Sign", "SignAndEncrypt".
std::string ModeName(MessageSecurityMode mode);

}  // namespace cv::ua
