#pragma once

#include <string>
#include <vector>

#include "ua/crypto/Certificate.h"

namespace cv::ua::crypto {

// What is wrong with a certificate, found while building its chain to a
// trusted certificate. More than one may hold.
struct ChainReport {
    // Neither it nor an issuer of it is among the trusted certificates.
    bool untrusted = false;
    // It, or a certificate of its chain, is past its end...
    bool expired = false;
    // ...or before its start.
    bool notYetValid = false;
    // A broken signature or an unusable chain: nobody can vouch for it.
    bool invalid = false;
    // OpenSSL's words for the first problem that made it invalid.
    std::string invalidReason;

    bool Clean() const { return !untrusted && !expired && !notYetValid && !invalid; }
};

// Checks certificate against the trusted certificates (application
// certificates or authorities, each trusted by itself) and the issuers
// (authorities that only help to build a chain), at the time given. The
// issuers the certificate's own bytes carry help too.
ChainReport CheckChain(const Certificate& certificate, const std::vector<Certificate>& trusted,
                       const std::vector<Certificate>& issuers, DateTime at);

}  // namespace cv::ua::crypto
