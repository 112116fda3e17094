#include "security/ServerTrust.h"

#include <algorithm>

#include "security/CertificateFacts.h"
#include "ua/crypto/ChainCheck.h"
#include "ua/transport/EndpointUrl.h"
#include "ua/types/PlainText.h"

namespace cv::security {

using platform::CertificateProblem;
using platform::PkiFolder;

namespace {

constexpr size_t kMaxNameBytes = 64;

}  // namespace

ServerTrust::ServerTrust(platform::PkiApi& pki) : pki_(pki) {}

// The common name comes from the server. Plain (no control characters),
// without separators, not hidden (a listing skips names that start with a
// dot), and cut on a character boundary so the whole name stays far below
// the 255 bytes a file name may have.
std::string ServerTrust::FileName(const ua::crypto::Certificate& certificate) {
    std::string name = ua::PlainText(certificate.CommonName());
    std::replace_if(
        name.begin(), name.end(), [](char c) { return c == '/' || c == '\\'; }, '_');
    if (name.size() > kMaxNameBytes) {
        size_t cut = kMaxNameBytes;
        while ((static_cast<unsigned char>(name[cut]) & 0xC0) == 0x80) {
            --cut;
        }
        name.resize(cut);
    }
    if (name.starts_with('.')) {
        name.front() = '_';
    }
    return (name.empty() ? "" : name + " ") + "[" + ThumbprintText(certificate) + "].der";
}

std::vector<ua::crypto::Certificate> ServerTrust::Certificates(PkiFolder folder) const {
    std::vector<ua::crypto::Certificate> certificates;
    for (const platform::PkiFile& file : pki_.List(folder)) {
        if (auto certificate = ua::crypto::Certificate::FromDer(file.bytes)) {
            certificates.push_back(std::move(certificate.Value()));
        }
    }
    return certificates;
}

bool ServerTrust::Holds(PkiFolder folder, const std::string& thumbprint) const {
    const auto certificates = Certificates(folder);
    return std::any_of(certificates.begin(), certificates.end(),
                       [&](const auto& c) { return c.Thumbprint() == thumbprint; });
}

platform::TrustQuestion ServerTrust::Examine(const ua::crypto::Certificate& certificate,
                                             const std::string& endpointUrl,
                                             ua::DateTime now) const {
    platform::TrustQuestion question;
    question.endpointUrl = endpointUrl;
    const auto url = ua::EndpointUrl::Parse(endpointUrl);
    question.facts = FactsOf(certificate, url ? url.Value().host : endpointUrl);
    if (session_.contains(certificate.Thumbprint())) {
        return question;
    }
    const ua::crypto::ChainReport chain = ua::crypto::CheckChain(
        certificate, Certificates(PkiFolder::Trusted), Certificates(PkiFolder::Issuers), now);
    const bool rejected = Holds(PkiFolder::Rejected, certificate.Thumbprint());
    const std::pair<bool, CertificateProblem> found[] = {
        {chain.invalid, CertificateProblem::Invalid},
        {rejected, CertificateProblem::Rejected},
        {chain.untrusted && !rejected && !chain.invalid, CertificateProblem::Untrusted},
        {chain.expired, CertificateProblem::Expired},
        {chain.notYetValid, CertificateProblem::NotYetValid},
        {!question.facts.hostMatches, CertificateProblem::HostMismatch},
    };
    for (const auto& [holds, problem] : found) {
        if (holds) {
            question.problems.push_back(problem);
        }
    }
    question.diagnosis = DescribeQuestion(question, Folders());
    return question;
}

TrustFolders ServerTrust::Folders() const {
    return {pki_.PathOf(PkiFolder::Trusted, ""), pki_.PathOf(PkiFolder::Rejected, "")};
}

void ServerTrust::TrustForSession(const ua::crypto::Certificate& certificate) {
    session_.insert(certificate.Thumbprint());
}

std::error_code ServerTrust::RemoveFrom(PkiFolder folder, const std::string& thumbprint) {
    for (const platform::PkiFile& file : pki_.List(folder)) {
        auto certificate = ua::crypto::Certificate::FromDer(file.bytes);
        if (certificate && certificate.Value().Thumbprint() == thumbprint) {
            if (const std::error_code error = pki_.Remove(folder, file.name)) {
                return error;
            }
        }
    }
    return {};
}

std::error_code ServerTrust::TrustAlways(const ua::crypto::Certificate& certificate) {
    session_.insert(certificate.Thumbprint());
    if (const std::error_code error = RemoveFrom(PkiFolder::Rejected, certificate.Thumbprint())) {
        return error;
    }
    return pki_.Write(PkiFolder::Trusted, FileName(certificate), certificate.LeafDer());
}

std::error_code ServerTrust::Reject(const ua::crypto::Certificate& certificate) {
    session_.erase(certificate.Thumbprint());
    if (const std::error_code error = RemoveFrom(PkiFolder::Trusted, certificate.Thumbprint())) {
        return error;
    }
    return pki_.Write(PkiFolder::Rejected, FileName(certificate), certificate.LeafDer());
}

}  // namespace cv::security
