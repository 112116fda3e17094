#pragma once

#include <string>

#include "platform/CertificateTrust.h"

namespace cv::security {

// Where the store keeps what the texts point the user to.
struct TrustFolders {
    std::string trusted;
    std::string rejected;
};

// The problems of a server certificate in plain words: one numbered line per
// problem with what to check, lines joined by CR LF.
std::string DescribeProblems(const platform::TrustQuestion& question, const TrustFolders& folders);
// The question's text: a headline, an empty line, the problems.
std::string DescribeQuestion(const platform::TrustQuestion& question, const TrustFolders& folders);
// Why the program did not connect, when the problems stand.
std::string DescribeRefusal(const platform::TrustQuestion& question, const TrustFolders& folders);

}  // namespace cv::security
