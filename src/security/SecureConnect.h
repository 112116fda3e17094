#pragma once

#include <functional>
#include <memory>
#include <string>

#include "security/ConnectOptionsBuilder.h"
#include "ua/client/Client.h"

namespace cv::security {

// Connects a client to a server as the user chose for it (ServerSettings).
//
// Anonymous without security connects at once, as before. Otherwise the
// server's endpoints are fetched and ConnectOptionsBuilder makes the options
// from them: the endpoint that fits, trust in the server's certificate
// (asking the user when needed), the program's certificate, the identity.
//
// Runs on the window thread: the client's completions come back there, and
// the questions are asked there.
class SecureConnect {
  public:
    using Done = std::function<void(ua::Result<ua::SessionInfo>)>;

    SecureConnect(ua::Client& client, ConnectServices services);

    void Connect(const std::string& endpointUrl, Done done);

  private:
    void OnEndpoints(const std::string& endpointUrl,
                     const std::vector<ua::EndpointDescription>& endpoints, Done done);

    ua::Client& client_;
    ConnectOptionsBuilder builder_;
    std::shared_ptr<int> life_ = std::make_shared<int>(0);
};

}  // namespace cv::security
