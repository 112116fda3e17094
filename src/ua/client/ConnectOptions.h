#pragma once

#include <memory>
#include <optional>
#include <string>

#include "ua/crypto/Credentials.h"
#include "ua/services/DiscoveryServices.h"

namespace cv::ua {

// Who the session is for.
struct UserIdentity {
    // Anonymous or UserName.
    UserTokenType type = UserTokenType::Anonymous;
    std::string userName;
    std::string password;
};

// How one connection is made.
struct ConnectOptions {
    // The endpoint to use, as GetEndpoints described it (its security mode,
    // policy and certificate). Without one the client takes the server's
    // endpoint without security.
    std::optional<EndpointDescription> endpoint;
    // The program's certificate and key; needed for a secured endpoint. The
    // certificate's application URI must be the client's.
    std::shared_ptr<const crypto::Credentials> credentials;
    UserIdentity identity;
};

}  // namespace cv::ua
