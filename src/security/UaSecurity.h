#pragma once

#include "platform/PkiApi.h"
#include "platform/RegistryApi.h"
#include "security/ConnectOptionsBuilder.h"
#include "security/RunPasswords.h"

namespace cv::security {

// The security of the program's OPC UA connections for one run: the choices
// per server in the registry, the program's certificate and the trust in
// servers' certificates in the certificate store, the passwords of the run,
// and who is asked (null: nobody, so problems refuse the connection).
class UaSecurity {
  public:
    UaSecurity(platform::RegistryApi& registry, platform::PkiApi& pki, ApplicationIdentity identity,
               platform::CertificateTrust* question, platform::PasswordPrompt* prompt);

    ServerSettings& Settings() { return settings_; }
    ServerTrust& Trust() { return trust_; }
    OwnCertificate& Own() { return own_; }
    // For SecureConnect or ConnectOptionsBuilder; valid while this lives.
    ConnectServices Services();

  private:
    ServerSettings settings_;
    OwnCertificate own_;
    ServerTrust trust_;
    RunPasswords passwords_;
    platform::CertificateTrust* question_;
    platform::PasswordPrompt* prompt_;
};

}  // namespace cv::security
