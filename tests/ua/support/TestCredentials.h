#pragma once

#include <openssl/x509v3.h>

#include <string>
#include <string_view>

#include "ua/crypto/CertificateBuilder.h"

namespace cv::ua::test {

inline std::string Hex(std::string_view bytes) {
    static constexpr char kDigits[] = "0123456789abcdef";
    std::string text;
    for (const char byte : bytes) {
        text += kDigits[(static_cast<unsigned char>(byte) >> 4) & 0xF];
        text += kDigits[static_cast<unsigned char>(byte) & 0xF];
    }
    return text;
}

inline std::string FromHex(std::string_view text) {
    std::string bytes;
    for (size_t i = 0; i + 1 < text.size(); i += 2) {
        bytes += static_cast<char>(std::stoi(std::string(text.substr(i, 2)), nullptr, 16));
    }
    return bytes;
}

inline crypto::Credentials MakeCredentials(const std::string& name, int bits = 2048,
                                           const std::string& host = "localhost") {
    crypto::CertificateRequest request;
    request.applicationUri = "urn:test:" + name;
    request.applicationName = name;
    request.hostName = host;
    request.keyBits = bits;
    auto made = crypto::CreateSelfSigned(request);
    return made ? made.Value() : crypto::Credentials{};
}

// Key generation takes a while: each test program makes these once.
inline const crypto::Credentials& ClientCredentials() {
    static const crypto::Credentials credentials = MakeCredentials("client");
    return credentials;
}
inline const crypto::Credentials& ServerCredentials() {
    static const crypto::Credentials credentials = MakeCredentials("server");
    return credentials;
}
inline const crypto::Credentials& LargeKeyCredentials() {
    static const crypto::Credentials credentials = MakeCredentials("large", 3072);
    return credentials;
}

// Changes a certificate made by CreateSelfSigned and signs it again with
// the key of by (its own when by is empty): to make authorities and the
// certificates they issue.
inline crypto::Credentials Resigned(const crypto::Credentials& made, const crypto::Credentials& by,
                                    bool authority) {
    const crypto::Credentials& signer = by.key.Empty() ? made : by;
    X509* x509 = X509_dup(made.certificate.Get());
    for (const int nid : {NID_basic_constraints, NID_authority_key_identifier}) {
        X509_EXTENSION* old = X509_delete_ext(x509, X509_get_ext_by_NID(x509, nid, -1));
        X509_EXTENSION_free(old);
    }
    X509V3_CTX context;
    X509V3_set_ctx(&context, signer.certificate.Get(), x509, nullptr, nullptr, 0);
    X509_EXTENSION* constraints = X509V3_EXT_conf_nid(nullptr, &context, NID_basic_constraints,
                                                      authority ? "critical,CA:TRUE" : "CA:FALSE");
    X509_add_ext(x509, constraints, -1);
    X509_EXTENSION_free(constraints);
    X509_set_issuer_name(x509, X509_get_subject_name(signer.certificate.Get()));
    X509_sign(x509, signer.key.Get(), EVP_sha256());
    unsigned char* der = nullptr;
    const int size = i2d_X509(x509, &der);
    const std::string bytes(reinterpret_cast<char*>(der), static_cast<size_t>(size));
    OPENSSL_free(der);
    X509_free(x509);
    auto certificate = crypto::Certificate::FromDer(bytes);
    return {certificate ? certificate.Value() : crypto::Certificate{}, made.key};
}

}  // namespace cv::ua::test
