#pragma once

#include <string>

#include "ua/crypto/Credentials.h"

namespace cv::ua::crypto {

// What an application instance certificate says about its application.
struct CertificateRequest {
    std::string applicationUri;
    std::string applicationName;
    // A DNS name, or an IP address (then an IP entry).
    std::string hostName;
    int keyBits = 2048;
    // Zero: from an hour ago (for clocks slightly behind) for validDays.
    DateTime notBefore;
    DateTime notAfter;
    int validDays = 5 * 365;
};

// Makes a self-signed application instance certificate as OPC UA wants it:
// X.509 v3, a new RSA key, SHA-256, the application URI and host name in
// subjectAltName, key usages for signing and encryption (and for signing
// itself), extended key usages serverAuth and clientAuth.
Result<Credentials> CreateSelfSigned(const CertificateRequest& request);

}  // namespace cv::ua::crypto
