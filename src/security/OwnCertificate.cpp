#include "security/OwnCertificate.h"

#include "ua/crypto/CertificateBuilder.h"

namespace cv::security {

using platform::PkiFolder;

OwnCertificate::OwnCertificate(platform::PkiApi& pki, ApplicationIdentity identity)
    : pki_(pki), identity_(std::move(identity)) {}

std::string OwnCertificate::CertificatePath() const {
    return pki_.PathOf(PkiFolder::OwnCertificate, kCertificateName);
}

ua::Result<std::shared_ptr<const ua::crypto::Credentials>> OwnCertificate::Get() {
    if (!credentials_) {
        credentials_ = Stored();
    }
    if (!credentials_) {
        auto created = Create();
        if (!created) {
            return created.Failure();
        }
        credentials_ = created.Value();
    }
    return credentials_;
}

std::shared_ptr<const ua::crypto::Credentials> OwnCertificate::Stored() const {
    const auto der = pki_.Read(PkiFolder::OwnCertificate, kCertificateName);
    const auto pem = pki_.Read(PkiFolder::OwnPrivateKey, kKeyName);
    if (!der || !pem) {
        return nullptr;
    }
    auto certificate = ua::crypto::Certificate::FromDer(*der);
    auto key = ua::crypto::PrivateKey::FromPem(*pem);
    const ua::DateTime now = ua::DateTime::Now();
    if (!certificate || !key || !certificate.Value().Matches(key.Value()) ||
        certificate.Value().ApplicationUri() != identity_.applicationUri ||
        certificate.Value().NotBefore() > now || certificate.Value().NotAfter() <= now) {
        return nullptr;
    }
    return std::make_shared<const ua::crypto::Credentials>(
        ua::crypto::Credentials{std::move(certificate.Value()), std::move(key.Value())});
}

ua::Result<std::shared_ptr<const ua::crypto::Credentials>> OwnCertificate::Create() {
    ua::crypto::CertificateRequest request;
    request.applicationUri = identity_.applicationUri;
    request.applicationName = identity_.applicationName;
    request.hostName = identity_.hostName;
    auto made = ua::crypto::CreateSelfSigned(request);
    if (!made) {
        return made.Failure();
    }
    const auto stored = [this](PkiFolder folder, const char* name, const std::string& bytes) {
        const std::error_code error = pki_.Write(folder, name, bytes);
        return error ? "\"" + pki_.PathOf(folder, name) + "\" cannot be written (" +
                           error.message() + ")"
                     : std::string();
    };
    std::string failure = stored(PkiFolder::OwnPrivateKey, kKeyName, made.Value().key.ToPem());
    if (failure.empty()) {
        failure =
            stored(PkiFolder::OwnCertificate, kCertificateName, made.Value().certificate.Der());
    }
    if (!failure.empty()) {
        return ua::Error{ua::status::BadInternalError,
                         "The program's certificate could not be stored: " + failure + "."};
    }
    return std::make_shared<const ua::crypto::Credentials>(std::move(made.Value()));
}

}  // namespace cv::security
