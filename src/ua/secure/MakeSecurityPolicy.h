#pragma once

#include <memory>

#include "ua/crypto/Credentials.h"
#include "ua/secure/SecurityPolicy.h"
#include "ua/services/DiscoveryServices.h"

namespace cv::ua {

// The security policy for a channel to endpoint: None, or a signing policy
// with the program's credentials and the endpoint's certificate. Fails for a
// policy this library does not speak, a mode that does not fit the policy,
// missing credentials or keys of the wrong size.
Result<std::unique_ptr<SecurityPolicy>> MakeSecurityPolicy(const EndpointDescription& endpoint,
                                                           const crypto::Credentials* own);

}  // namespace cv::ua
