#pragma once

#include <functional>
#include <memory>
#include <set>
#include <string>
#include <utility>

#include "platform/CertificateTrust.h"
#include "platform/PasswordStore.h"
#include "security/OwnCertificate.h"
#include "security/ServerSettings.h"
#include "security/ServerTrust.h"
#include "ua/client/Client.h"

namespace cv::security {

// What SecureConnect works with.
struct ConnectServices {
    ServerSettings& settings;
    OwnCertificate& own;
    ServerTrust& trust;
    platform::PasswordStore& passwords;
    // Nobody to ask (null): every certificate problem refuses the connection.
    platform::CertificateTrust* question = nullptr;
    // Nobody to ask (null): a user name without a known password is refused.
    platform::PasswordPrompt* prompt = nullptr;
};

// Connects a client to a server as the user chose for it (ServerSettings).
//
// Anonymous without security connects at once, as before. Otherwise the
// server's endpoints are fetched and the one that fits the choice taken.
// On a secured endpoint the server's certificate must be trusted (ServerTrust);
// when it is not, the user is asked (CertificateTrust), and without the
// user's word the connection fails with a diagnosis. The program's own
// certificate is made on first use. A user name takes its password from the
// store or asks for it; a password the server refuses is forgotten.
//
// Runs on the window thread: the client's completions come back there, and
// the questions are asked there.
class SecureConnect {
  public:
    using Done = std::function<void(ua::Result<ua::SessionInfo>)>;

    SecureConnect(ua::Client& client, ConnectServices services);

    void Connect(const std::string& endpointUrl, Done done);

  private:
    void OnEndpoints(const std::string& endpointUrl, const ServerSecurity& security,
                     const std::vector<ua::EndpointDescription>& endpoints, Done done);
    ua::Result<ua::ConnectOptions> Prepare(const std::string& endpointUrl,
                                           const ServerSecurity& security,
                                           const ua::EndpointDescription& endpoint);
    ua::Result<ua::Done> Approve(const std::string& endpointUrl,
                                 const ua::EndpointDescription& endpoint);
    ua::Result<ua::UserIdentity> Identity(const std::string& endpointUrl,
                                          const ServerSecurity& security);
    void Finish(const std::string& endpointUrl, const ua::ConnectOptions& connect,
                ua::Result<ua::SessionInfo> session, const Done& done);

    ua::Client& client_;
    ConnectServices services_;
    // User names whose password a server refused in this run.
    std::set<std::pair<std::string, std::string>> refused_;
    std::shared_ptr<int> life_ = std::make_shared<int>(0);
};

}  // namespace cv::security
