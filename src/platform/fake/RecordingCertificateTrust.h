#pragma once

#include <vector>

#include "platform/CertificateTrust.h"

namespace cv::fake {

// Gives the same answer to every question and records the questions.
class RecordingCertificateTrust : public platform::CertificateTrust {
  public:
    platform::TrustAnswer Ask(const platform::TrustQuestion& question) override {
        questions.push_back(question);
        return answer;
    }

    platform::TrustAnswer answer = platform::TrustAnswer::Refuse;
    std::vector<platform::TrustQuestion> questions;
};

}  // namespace cv::fake
