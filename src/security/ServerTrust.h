#pragma once

#include <set>
#include <string>
#include <system_error>

#include "platform/CertificateTrust.h"
#include "platform/PkiApi.h"
#include "security/TrustDiagnosis.h"
#include "ua/crypto/Certificate.h"

namespace cv::security {

// Decides whether the program may use a server's certificate, and records
// the user's word about it.
//
// A certificate may be used when it, or an authority that issued it, lies in
// the trusted folder (authorities in the issuers folder help to build the
// chain), it is valid now and it names the host of the endpoint URL. One the
// user rejected (in the rejected folder) is refused. Trusting for the
// session covers every problem the certificate has, until the program ends;
// trusting always stores it in the trusted folder and covers the rest of
// its problems (time, host) for the session, so they are asked about again
// next time.
class ServerTrust {
  public:
    explicit ServerTrust(platform::PkiApi& pki);

    // The question for the user; it lists no problems when the program may
    // connect.
    platform::TrustQuestion Examine(const ua::crypto::Certificate& certificate,
                                    const std::string& endpointUrl, ua::DateTime now) const;

    void TrustForSession(const ua::crypto::Certificate& certificate);
    // Also takes it out of the rejected folder.
    std::error_code TrustAlways(const ua::crypto::Certificate& certificate);
    // Also takes it out of the trusted folder and the session's trust.
    std::error_code Reject(const ua::crypto::Certificate& certificate);

    // The folders the texts send the user to.
    TrustFolders Folders() const;

    // "<common name> [<thumbprint>].der", as OPC UA applications name them.
    static std::string FileName(const ua::crypto::Certificate& certificate);

  private:
    std::vector<ua::crypto::Certificate> Certificates(platform::PkiFolder folder) const;
    bool Holds(platform::PkiFolder folder, const std::string& thumbprint) const;
    std::error_code RemoveFrom(platform::PkiFolder folder, const std::string& thumbprint);

    platform::PkiApi& pki_;
    std::set<std::string> session_;
};

}  // namespace cv::security
