#pragma once

#include <string>

#include "platform/CertificateTrust.h"
#include "ua/crypto/Certificate.h"

namespace cv::security {

// 40 upper-case hexadecimal digits.
std::string ThumbprintText(const ua::crypto::Certificate& certificate);
// "2024-01-02 06:00:00 UTC".
std::string TimeText(ua::DateTime time);
// Whether the certificate names host (an IP address among its addresses,
// or a DNS name, compared without regard to case, "*." matching one label).
bool NamesHost(const ua::crypto::Certificate& certificate, const std::string& host);
// What the user is shown about a certificate reached at host.
platform::CertificateFacts FactsOf(const ua::crypto::Certificate& certificate,
                                   const std::string& host);

}  // namespace cv::security
