#pragma once

#include <set>
#include <string>
#include <utility>
#include <vector>

#include "platform/CertificateTrust.h"
#include "platform/PasswordStore.h"
#include "security/OwnCertificate.h"
#include "security/ServerSettings.h"
#include "security/ServerTrust.h"
#include "ua/client/ConnectOptions.h"
#include "ua/client/SessionInfo.h"

namespace cv::security {

// What the connect options are made from.
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

// Makes the library's connect options for a server from the user's choices
// for it (ServerSettings) and the endpoints it offers: the endpoint that
// fits, the program's certificate (made on first use) for a secured one, the
// user's word on the server's certificate when it is not trusted
// (ServerTrust, CertificateTrust), and the identity with its password from
// the store or the prompt. Afterwards it learns how the connect went: a
// password that worked is kept, one the server refused is forgotten, and a
// refusal is put in plain words.
//
// Runs on the window thread, where the questions are asked.
class ConnectOptionsBuilder {
  public:
    explicit ConnectOptionsBuilder(ConnectServices services);

    // False when the choices are anonymous without security: the options
    // are then empty and the server's endpoints not needed.
    bool NeedsEndpoints(const std::string& endpointUrl) const;
    ua::Result<ua::ConnectOptions> Build(const std::string& endpointUrl,
                                         const std::vector<ua::EndpointDescription>& endpoints);
    // The outcome of connecting with options Build made; failures come back
    // with a diagnosis when security or the user name was the reason.
    ua::Result<ua::SessionInfo> Settle(const std::string& endpointUrl,
                                       const ua::ConnectOptions& connect,
                                       ua::Result<ua::SessionInfo> session);

  private:
    ua::Result<ua::Done> GuardPassword(const std::string& endpointUrl,
                                       const ServerSecurity& security,
                                       const ua::EndpointDescription& endpoint);
    ua::Result<ua::Done> Approve(const std::string& endpointUrl,
                                 const ua::EndpointDescription& endpoint);
    ua::Result<ua::UserIdentity> Identity(const std::string& endpointUrl,
                                          const ServerSecurity& security);

    ConnectServices services_;
    // User names whose password a server refused in this run.
    std::set<std::pair<std::string, std::string>> refused_;
};

}  // namespace cv::security
