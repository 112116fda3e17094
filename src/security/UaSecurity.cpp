#include "security/UaSecurity.h"

#include <utility>

namespace cv::security {

UaSecurity::UaSecurity(platform::RegistryApi& registry, platform::PkiApi& pki,
                       ApplicationIdentity identity, platform::CertificateTrust* question,
                       platform::PasswordPrompt* prompt)
    : settings_(registry),
      own_(pki, std::move(identity)),
      trust_(pki),
      question_(question),
      prompt_(prompt) {}

ConnectServices UaSecurity::Services() {
    return {settings_, own_, trust_, passwords_, question_, prompt_};
}

}  // namespace cv::security
