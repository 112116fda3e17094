#pragma once

#include <memory>
#include <string>

#include "platform/PkiApi.h"
#include "ua/crypto/Credentials.h"
#include "ua/types/Result.h"

namespace cv::security {

// Who the program says it is to OPC UA servers.
struct ApplicationIdentity {
    // Must be the URI the client sends in CreateSession.
    std::string applicationUri;
    std::string applicationName;
    std::string hostName;
};

// The program's application instance certificate with its private key,
// kept in the certificate store (own/certs, own/private). Made on first use
// (RSA 2048, SHA-256); made anew when the stored one no longer fits: another
// application URI, expired or not yet valid, a key that is not its own, or
// unreadable. The key is written before the certificate, so a certificate
// on disk always has its key.
class OwnCertificate {
  public:
    static constexpr const char* kCertificateName = "cvopctestclient.der";
    static constexpr const char* kKeyName = "cvopctestclient.pem";

    OwnCertificate(platform::PkiApi& pki, ApplicationIdentity identity);

    // The same credentials for every call once they exist.
    ua::Result<std::shared_ptr<const ua::crypto::Credentials>> Get();
    // The certificate's file, for texts that send the user there.
    std::string CertificatePath() const;

  private:
    std::shared_ptr<const ua::crypto::Credentials> Stored() const;
    ua::Result<std::shared_ptr<const ua::crypto::Credentials>> Create();

    platform::PkiApi& pki_;
    ApplicationIdentity identity_;
    std::shared_ptr<const ua::crypto::Credentials> credentials_;
};

}  // namespace cv::security
