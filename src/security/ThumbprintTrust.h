#pragma once

#include <string>

#include "platform/CertificateTrust.h"

namespace cv::security {

// The command line's answer: trust for this run the one certificate whose
// thumbprint the user named (hexadecimal, with or without ":" or spaces,
// either case), and refuse any other without recording it. Certificates
// that are broken or were rejected are refused before anybody is asked.
class ThumbprintTrust : public platform::CertificateTrust {
  public:
    explicit ThumbprintTrust(const std::string& thumbprint);

    platform::TrustAnswer Ask(const platform::TrustQuestion& question) override;

    // Upper-case hexadecimal digits only.
    static std::string Normalised(const std::string& thumbprint);

  private:
    std::string thumbprint_;
};

}  // namespace cv::security
