#pragma once

#include <string>
#include <vector>

namespace cv::platform {

// Why a server's certificate cannot simply be used.
enum class CertificateProblem {
    Untrusted,     // neither it nor an authority behind it is trusted
    Rejected,      // the user refused it before (it is in the rejected folder)
    Expired,       // past its end of validity
    NotYetValid,   // before its start of validity
    HostMismatch,  // it does not name the host the program connects to
    Invalid,       // broken or unusable: nobody can vouch for it
};

// What a user is shown about a server's certificate.
struct CertificateFacts {
    // RFC 2253, e.g. "CN=UA test peer,O=Test".
    std::string subject;
    std::string applicationUri;
    // SHA-1 of the certificate, 40 upper-case hexadecimal digits.
    std::string thumbprint;
    // UTC, "2024-01-02 06:00:00 UTC".
    std::string validFrom;
    std::string validTo;
    // The host of the endpoint URL, whether the certificate names it, and the
    // host names and addresses it does name.
    std::string host;
    bool hostMatches = false;
    std::vector<std::string> hostNames;
};

// A server certificate that needs the user's word before the program
// connects.
struct TrustQuestion {
    std::string endpointUrl;
    CertificateFacts facts;
    std::vector<CertificateProblem> problems;
    // The problems in plain words, one numbered line each, with what to check.
    std::string diagnosis;
};

enum class TrustAnswer {
    Refuse,           // do not connect this time; remember nothing
    Reject,           // refuse it and remember that (rejected folder)
    TrustForSession,  // use it until the program ends
    TrustAlways,      // use it and remember that (trusted folder)
};

// Asks the user about a server certificate: a window, or the command line's
// option naming the thumbprint to trust. Runs on the window thread and
// returns the user's answer.
class CertificateTrust {
  public:
    virtual ~CertificateTrust() = default;
    virtual TrustAnswer Ask(const TrustQuestion& question) = 0;
};

}  // namespace cv::platform
