#include "ua/crypto/CertificateBuilder.h"

#include <arpa/inet.h>
#include <openssl/bn.h>
#include <openssl/x509v3.h>

#include <ctime>

namespace cv::ua::crypto {
namespace {

constexpr int64_t kSecondsPerDay = 86'400;
constexpr int64_t kClockSlackSeconds = 3'600;

bool SetValidity(X509* x509, const CertificateRequest& request) {
    const int64_t now = std::time(nullptr);
    const int64_t from =
        request.notBefore.ticks ? UnixSeconds(request.notBefore) : now - kClockSlackSeconds;
    const int64_t to = request.notAfter.ticks ? UnixSeconds(request.notAfter)
                                              : from + request.validDays * kSecondsPerDay;
    return ASN1_TIME_set(X509_getm_notBefore(x509), static_cast<time_t>(from)) &&
           ASN1_TIME_set(X509_getm_notAfter(x509), static_cast<time_t>(to));
}

bool SetSerial(X509* x509) {
    OpenSslPtr<BIGNUM, BN_free> serial(BN_new());
    return serial && BN_rand(serial.get(), 127, BN_RAND_TOP_ANY, BN_RAND_BOTTOM_ANY) == 1 &&
           BN_to_ASN1_INTEGER(serial.get(), X509_get_serialNumber(x509));
}

bool SetName(X509* x509, const CertificateRequest& request) {
    X509_NAME* name = X509_get_subject_name(x509);
    const auto add = [name](const char* field, const std::string& value) {
        return X509_NAME_add_entry_by_txt(name, field, MBSTRING_UTF8, Bytes(value),
                                          static_cast<int>(value.size()), -1, 0) == 1;
    };
    return add("CN", request.applicationName) &&
           (request.hostName.empty() || add("DC", request.hostName)) &&
           X509_set_issuer_name(x509, name) == 1;
}

GENERAL_NAME* AltName(int type, const std::string& value) {
    GENERAL_NAME* name = GENERAL_NAME_new();
    ASN1_STRING* text =
        ASN1_STRING_type_new(type == GEN_IPADD ? V_ASN1_OCTET_STRING : V_ASN1_IA5STRING);
    if (!name || !text ||
        ASN1_STRING_set(text, value.data(), static_cast<int>(value.size())) != 1) {
        GENERAL_NAME_free(name);
        ASN1_STRING_free(text);
        return nullptr;
    }
    GENERAL_NAME_set0_value(name, type, text);
    return name;
}

// The host as an IP address in network byte order, or empty for a name.
std::string AddressBytes(const std::string& host) {
    unsigned char bytes[16];
    if (inet_pton(AF_INET, host.c_str(), bytes) == 1) {
        return std::string(reinterpret_cast<char*>(bytes), 4);
    }
    if (inet_pton(AF_INET6, host.c_str(), bytes) == 1) {
        return std::string(reinterpret_cast<char*>(bytes), 16);
    }
    return {};
}

bool AddAltNames(X509* x509, const CertificateRequest& request) {
    OpenSslPtr<GENERAL_NAMES, GENERAL_NAMES_free> names(sk_GENERAL_NAME_new_null());
    if (!names) {
        return false;
    }
    std::vector<std::pair<int, std::string>> wanted = {{GEN_URI, request.applicationUri}};
    if (!request.hostName.empty()) {
        const std::string address = AddressBytes(request.hostName);
        wanted.emplace_back(address.empty() ? GEN_DNS : GEN_IPADD,
                            address.empty() ? request.hostName : address);
    }
    for (const auto& [type, value] : wanted) {
        GENERAL_NAME* name = AltName(type, value);
        if (!name || sk_GENERAL_NAME_push(names.get(), name) == 0) {
            GENERAL_NAME_free(name);
            return false;
        }
    }
    return X509_add1_ext_i2d(x509, NID_subject_alt_name, names.get(), 0, X509V3_ADD_DEFAULT) == 1;
}

bool AddExtension(X509* x509, int nid, const char* value) {
    X509V3_CTX context;
    X509V3_set_ctx(&context, x509, x509, nullptr, nullptr, 0);
    X509_EXTENSION* extension = X509V3_EXT_conf_nid(nullptr, &context, nid, value);
    const bool added = extension && X509_add_ext(x509, extension, -1) == 1;
    X509_EXTENSION_free(extension);
    return added;
}

bool AddExtensions(X509* x509, const CertificateRequest& request) {
    return AddExtension(x509, NID_basic_constraints, "critical,CA:FALSE") &&
           AddExtension(x509, NID_key_usage,
                        "critical,digitalSignature,nonRepudiation,keyEncipherment,"
                        "dataEncipherment,keyCertSign") &&
           AddExtension(x509, NID_ext_key_usage, "serverAuth,clientAuth") &&
           AddExtension(x509, NID_subject_key_identifier, "hash") &&
           AddExtension(x509, NID_authority_key_identifier, "keyid:always") &&
           AddAltNames(x509, request);
}

}  // namespace

Result<Credentials> CreateSelfSigned(const CertificateRequest& request) {
    auto key = PrivateKey::Generate(request.keyBits);
    if (!key) {
        return key.Failure();
    }
    OpenSslPtr<X509, X509_free> x509(X509_new());
    if (!x509 || X509_set_version(x509.get(), 2) != 1 || !SetSerial(x509.get()) ||
        !SetValidity(x509.get(), request) || !SetName(x509.get(), request) ||
        X509_set_pubkey(x509.get(), key.Value().Get()) != 1 ||
        !AddExtensions(x509.get(), request) ||
        X509_sign(x509.get(), key.Value().Get(), EVP_sha256()) == 0) {
        return OpenSslFailure("make the application certificate", status::BadInternalError);
    }
    unsigned char* der = nullptr;
    const int size = i2d_X509(x509.get(), &der);
    if (size <= 0) {
        return OpenSslFailure("encode the application certificate", status::BadInternalError);
    }
    const std::string bytes(reinterpret_cast<const char*>(der), static_cast<size_t>(size));
    OPENSSL_free(der);
    auto certificate = Certificate::FromDer(bytes);
    if (!certificate) {
        return certificate.Failure();
    }
    return Credentials{std::move(certificate.Value()), std::move(key.Value())};
}

}  // namespace cv::ua::crypto
