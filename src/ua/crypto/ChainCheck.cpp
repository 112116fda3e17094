#include "ua/crypto/ChainCheck.h"

#include <openssl/err.h>
#include <openssl/x509_vfy.h>

namespace cv::ua::crypto {
namespace {

using CertificateStackPtr =
    std::unique_ptr<STACK_OF(X509), decltype([](STACK_OF(X509) * stack) { sk_X509_free(stack); })>;

void Note(ChainReport& report, int error) {
    switch (error) {
        case X509_V_OK:
            return;
        case X509_V_ERR_CERT_HAS_EXPIRED:
            report.expired = true;
            return;
        case X509_V_ERR_CERT_NOT_YET_VALID:
            report.notYetValid = true;
            return;
        case X509_V_ERR_DEPTH_ZERO_SELF_SIGNED_CERT:
        case X509_V_ERR_SELF_SIGNED_CERT_IN_CHAIN:
        case X509_V_ERR_UNABLE_TO_GET_ISSUER_CERT:
        case X509_V_ERR_UNABLE_TO_GET_ISSUER_CERT_LOCALLY:
        case X509_V_ERR_UNABLE_TO_VERIFY_LEAF_SIGNATURE:
        case X509_V_ERR_CERT_UNTRUSTED:
            report.untrusted = true;
            return;
        default:
            if (!report.invalid) {
                report.invalidReason = X509_verify_cert_error_string(error);
            }
            report.invalid = true;
    }
}

// Notes each problem and lets the check go on, so that all are found.
int Collect(int ok, X509_STORE_CTX* context) {
    if (!ok) {
        auto* report = static_cast<ChainReport*>(X509_STORE_CTX_get_app_data(context));
        Note(*report, X509_STORE_CTX_get_error(context));
    }
    return 1;
}

CertificateStackPtr Stack(const std::vector<Certificate>& certificates,
                          const std::vector<Certificate>& carried) {
    CertificateStackPtr stack(sk_X509_new_null());
    for (const auto* list : {&certificates, &carried}) {
        for (const Certificate& certificate : *list) {
            if (stack && !certificate.Empty()) {
                sk_X509_push(stack.get(), certificate.Get());
            }
        }
    }
    return stack;
}

// The certificates that follow the first in its bytes.
std::vector<Certificate> CarriedIssuers(const Certificate& certificate) {
    std::vector<Certificate> carried;
    std::string_view rest =
        std::string_view(certificate.Der()).substr(certificate.LeafDer().size());
    while (!rest.empty()) {
        auto next = Certificate::FromDer(rest);
        if (!next) {
            ERR_clear_error();
            break;
        }
        rest.remove_prefix(next.Value().LeafDer().size());
        carried.push_back(std::move(next.Value()));
    }
    return carried;
}

}  // namespace

ChainReport CheckChain(const Certificate& certificate, const std::vector<Certificate>& trusted,
                       const std::vector<Certificate>& issuers, DateTime at) {
    ChainReport report;
    X509StorePtr store(X509_STORE_new());
    X509StoreCtxPtr context(X509_STORE_CTX_new());
    const std::vector<Certificate> carried = CarriedIssuers(certificate);
    CertificateStackPtr untrusted = Stack(issuers, carried);
    if (!store || !context || !untrusted || certificate.Empty()) {
        report.invalid = true;
        report.invalidReason = "the check could not start";
        return report;
    }
    for (const Certificate& anchor : trusted) {
        if (!anchor.Empty()) {
            X509_STORE_add_cert(store.get(), anchor.Get());
        }
    }
    ERR_clear_error();
    X509_STORE_CTX_init(context.get(), store.get(), certificate.Get(), untrusted.get());
    X509_STORE_CTX_set_flags(context.get(),
                             X509_V_FLAG_PARTIAL_CHAIN | X509_V_FLAG_CHECK_SS_SIGNATURE);
    X509_STORE_CTX_set_time(context.get(), 0, static_cast<time_t>(UnixSeconds(at)));
    X509_STORE_CTX_set_app_data(context.get(), &report);
    X509_STORE_CTX_set_verify_cb(context.get(), Collect);
    if (X509_verify_cert(context.get()) != 1) {
        Note(report, X509_STORE_CTX_get_error(context.get()));
        if (report.Clean()) {
            report.untrusted = true;
        }
    }
    ERR_clear_error();
    return report;
}

}  // namespace cv::ua::crypto
