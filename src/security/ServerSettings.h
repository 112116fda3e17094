#pragma once

#include <optional>
#include <string>

#include "platform/RegistryApi.h"
#include "ua/services/DiscoveryServices.h"

namespace cv::security {

// How the program connects to one server.
struct ServerSecurity {
    // Invalid: the most secure mode the server offers.
    ua::MessageSecurityMode mode = ua::MessageSecurityMode::Invalid;
    // Empty: the most secure policy the server offers for the mode.
    std::string policyUri;
    // Anonymous or UserName.
    ua::UserTokenType identity = ua::UserTokenType::Anonymous;
    std::string userName;

    bool operator==(const ServerSecurity&) const = default;
};

// Choices for one run ahead of the registry's, for every server (the
// command line's options). A mode set here brings its policy (empty: the
// best for the mode); a user name logs on with it.
struct RunChoices {
    std::optional<ua::MessageSecurityMode> mode;
    std::string policyUri;
    std::string userName;
};

// The security choices per server (endpoint URL) in the user's registry:
// HKEY_CURRENT_USER\Software\Corvalent\TestClient\UaServers\<URL>, values
// "SecurityMode" ("Best", "None", "Sign", "SignAndEncrypt"),
// "SecurityPolicy" (a policy URI, empty for the best), "Identity"
// ("Anonymous", "UserName") and "UserName". No password is ever stored here.
// Unknown or unreadable values read as their defaults.
class ServerSettings {
  public:
    explicit ServerSettings(platform::RegistryApi& registry);

    ServerSecurity Read(const std::string& endpointUrl);
    void Write(const std::string& endpointUrl, const ServerSecurity& security);
    // Read gives these ahead of the registry's until the program ends;
    // nothing is written.
    void SetRunChoices(RunChoices choices) { run_ = std::move(choices); }

    // The key of a URL: "\" and "%" become %5C and %25.
    static std::string KeyOf(const std::string& endpointUrl);

  private:
    platform::RegistryApi& registry_;
    RunChoices run_;
};

}  // namespace cv::security
