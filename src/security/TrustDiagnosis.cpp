#include "security/TrustDiagnosis.h"

#include <algorithm>

namespace cv::security {
namespace {

using platform::CertificateProblem;

constexpr const char* kCrLf = "\r\n";

std::string Quoted(const std::string& text) {
    return "\"" + text + "\"";
}

std::string Names(const std::vector<std::string>& names) {
    if (names.empty()) {
        return "it names no host";
    }
    std::string text = "it names ";
    for (size_t i = 0; i < names.size(); ++i) {
        text += (i == 0 ? "" : ", ") + Quoted(names[i]);
    }
    return text;
}

std::string Line(CertificateProblem problem, const platform::CertificateFacts& facts,
                 const TrustFolders& folders) {
    switch (problem) {
        case CertificateProblem::Untrusted:
            return "It is not trusted yet. Check that this is the server you meant: " +
                   Quoted(facts.subject) + ", application " + Quoted(facts.applicationUri) +
                   ", thumbprint " + facts.thumbprint + ".";
        case CertificateProblem::Rejected:
            return "It was rejected before and lies in " + Quoted(folders.rejected) +
                   ". Move it to " + Quoted(folders.trusted) + " if you trust it now.";
        case CertificateProblem::Expired:
            return "It expired on " + facts.validTo +
                   ". Check the clocks of this computer and of the server, or ask the "
                   "server's administrator for a new certificate.";
        case CertificateProblem::NotYetValid:
            return "It is valid only from " + facts.validFrom +
                   ". Check the clocks of this computer and of the server.";
        case CertificateProblem::HostMismatch:
            return "It does not name the host " + Quoted(facts.host) + "; " +
                   Names(facts.hostNames) +
                   ". Check the server address, or connect by a name the certificate lists.";
        case CertificateProblem::Invalid:
            break;
    }
    return "It cannot be checked, so nobody can vouch for it. Ask the server's administrator "
           "for a valid certificate.";
}

bool Has(const platform::TrustQuestion& question, CertificateProblem problem) {
    return std::find(question.problems.begin(), question.problems.end(), problem) !=
           question.problems.end();
}

}  // namespace

std::string DescribeProblems(const platform::TrustQuestion& question, const TrustFolders& folders) {
    std::string text;
    for (size_t i = 0; i < question.problems.size(); ++i) {
        text += (i == 0 ? "" : kCrLf) + std::to_string(i + 1) + ". " +
                Line(question.problems[i], question.facts, folders);
    }
    return text;
}

std::string DescribeQuestion(const platform::TrustQuestion& question, const TrustFolders& folders) {
    return "The certificate of the server at " + Quoted(question.endpointUrl) +
           " needs your decision before the program connects." + kCrLf + kCrLf +
           DescribeProblems(question, folders);
}

std::string DescribeRefusal(const platform::TrustQuestion& question, const TrustFolders& folders) {
    const std::string why = Has(question, CertificateProblem::Invalid)     ? "is not valid"
                            : Has(question, CertificateProblem::Rejected)  ? "was rejected"
                            : Has(question, CertificateProblem::Untrusted) ? "is not trusted"
                                                                           : "was not accepted";
    return "The program did not connect to " + Quoted(question.endpointUrl) +
           ": the server's certificate " + why + "." + kCrLf + kCrLf +
           DescribeProblems(question, folders);
}

}  // namespace cv::security
