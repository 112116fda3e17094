#include "ua/crypto/Certificate.h"

#include <arpa/inet.h>
#include <openssl/err.h>
#include <openssl/rsa.h>
#include <openssl/x509v3.h>

#include <ctime>

#include "ua/crypto/Primitives.h"

namespace cv::ua::crypto {
namespace {

// What OAEP with SHA-1 takes from each RSA block.
constexpr size_t kOaepOverhead = 42;

using GeneralNamesPtr = std::unique_ptr<GENERAL_NAMES, void (*)(GENERAL_NAMES*)>;

GeneralNamesPtr AltNames(X509* x509) {
    auto* names =
        static_cast<GENERAL_NAMES*>(X509_get_ext_d2i(x509, NID_subject_alt_name, nullptr, nullptr));
    return GeneralNamesPtr(names, GENERAL_NAMES_free);
}

std::string Text(const ASN1_STRING* text) {
    return std::string(reinterpret_cast<const char*>(ASN1_STRING_get0_data(text)),
                       static_cast<size_t>(ASN1_STRING_length(text)));
}

std::vector<std::string> AltNamesOfType(X509* x509, int type) {
    std::vector<std::string> found;
    const GeneralNamesPtr names = AltNames(x509);
    for (int i = 0; names && i < sk_GENERAL_NAME_num(names.get()); ++i) {
        const GENERAL_NAME* name = sk_GENERAL_NAME_value(names.get(), i);
        if (name->type != type) {
            continue;
        }
        if (type != GEN_IPADD) {
            found.push_back(Text(name->d.ia5));
            continue;
        }
        const std::string address = Text(name->d.iPAddress);
        char buffer[INET6_ADDRSTRLEN] = {};
        const int family = address.size() == 4 ? AF_INET : AF_INET6;
        if ((address.size() == 4 || address.size() == 16) &&
            inet_ntop(family, address.data(), buffer, sizeof buffer)) {
            found.emplace_back(buffer);
        }
    }
    return found;
}

std::string NameText(const X509_NAME* name) {
    BioPtr bio(BIO_new(BIO_s_mem()));
    if (!bio ||
        X509_NAME_print_ex(bio.get(), name, 0, XN_FLAG_RFC2253 & ~ASN1_STRFLGS_ESC_MSB) < 0) {
        return {};
    }
    return BioText(bio.get());
}

DateTime TimeOf(const ASN1_TIME* time) {
    std::tm parts{};
    if (!time || ASN1_TIME_to_tm(time, &parts) != 1) {
        return {};
    }
    return DateTime::FromUnixMilliseconds(int64_t{timegm(&parts)} * 1000);
}

}  // namespace

Result<Certificate> Certificate::FromDer(std::string_view der) {
    const unsigned char* at = Bytes(der);
    X509* x509 = d2i_X509(nullptr, &at, static_cast<long>(der.size()));
    if (!x509) {
        return OpenSslFailure("read the certificate", status::BadCertificateInvalid);
    }
    Certificate certificate;
    certificate.x509_ = std::shared_ptr<X509>(x509, X509_free);
    certificate.der_ = std::string(der);
    certificate.leafSize_ = static_cast<size_t>(at - Bytes(der));
    EVP_PKEY* key = X509_get0_pubkey(x509);
    if (!key || EVP_PKEY_get_base_id(key) != EVP_PKEY_RSA) {
        return Error{status::BadCertificateInvalid, "The certificate does not hold an RSA key."};
    }
    return certificate;
}

std::string Certificate::Thumbprint() const {
    return Sha1(LeafDer());
}

int Certificate::KeyBits() const {
    EVP_PKEY* key = x509_ ? X509_get0_pubkey(x509_.get()) : nullptr;
    return key ? EVP_PKEY_get_bits(key) : 0;
}

bool Certificate::Matches(const PrivateKey& key) const {
    return x509_ && !key.Empty() && X509_check_private_key(x509_.get(), key.Get()) == 1;
}

Result<Done> Certificate::VerifySha256(std::string_view data, std::string_view signature) const {
    MdCtxPtr context(EVP_MD_CTX_new());
    if (!x509_ || !context ||
        EVP_DigestVerifyInit(context.get(), nullptr, EVP_sha256(), nullptr,
                             X509_get0_pubkey(x509_.get())) != 1 ||
        EVP_DigestVerify(context.get(), Bytes(signature), signature.size(), Bytes(data),
                         data.size()) != 1) {
        ERR_clear_error();
        return Error{status::BadSecurityChecksFailed, "The signature does not match."};
    }
    return Done{};
}

Result<std::string> Certificate::EncryptOaep(std::string_view data) const {
    const size_t cipherBlock = static_cast<size_t>(KeyBits() / 8);
    PkeyCtxPtr context(x509_ ? EVP_PKEY_CTX_new(X509_get0_pubkey(x509_.get()), nullptr) : nullptr);
    if (!context || cipherBlock <= kOaepOverhead || EVP_PKEY_encrypt_init(context.get()) != 1 ||
        EVP_PKEY_CTX_set_rsa_padding(context.get(), RSA_PKCS1_OAEP_PADDING) != 1) {
        return OpenSslFailure("encrypt with the server's key");
    }
    const size_t plainBlock = cipherBlock - kOaepOverhead;
    std::string cipher;
    for (size_t at = 0; at < data.size(); at += plainBlock) {
        const std::string_view block = data.substr(at, plainBlock);
        std::string out(cipherBlock, '\0');
        size_t size = out.size();
        if (EVP_PKEY_encrypt(context.get(), Bytes(out), &size, Bytes(block), block.size()) != 1) {
            return OpenSslFailure("encrypt with the server's key");
        }
        cipher.append(out, 0, size);
    }
    return cipher;
}

std::string Certificate::Subject() const {
    return x509_ ? NameText(X509_get_subject_name(x509_.get())) : std::string();
}

std::string Certificate::Issuer() const {
    return x509_ ? NameText(X509_get_issuer_name(x509_.get())) : std::string();
}

std::string Certificate::CommonName() const {
    const X509_NAME* name = x509_ ? X509_get_subject_name(x509_.get()) : nullptr;
    const int index = name ? X509_NAME_get_index_by_NID(name, NID_commonName, -1) : -1;
    if (index < 0) {
        return {};
    }
    return Text(X509_NAME_ENTRY_get_data(X509_NAME_get_entry(name, index)));
}

std::string Certificate::ApplicationUri() const {
    const auto uris = x509_ ? AltNamesOfType(x509_.get(), GEN_URI) : std::vector<std::string>();
    return uris.empty() ? std::string() : uris.front();
}

std::vector<std::string> Certificate::DnsNames() const {
    return x509_ ? AltNamesOfType(x509_.get(), GEN_DNS) : std::vector<std::string>();
}

std::vector<std::string> Certificate::IpAddresses() const {
    return x509_ ? AltNamesOfType(x509_.get(), GEN_IPADD) : std::vector<std::string>();
}

DateTime Certificate::NotBefore() const {
    return x509_ ? TimeOf(X509_get0_notBefore(x509_.get())) : DateTime{};
}

DateTime Certificate::NotAfter() const {
    return x509_ ? TimeOf(X509_get0_notAfter(x509_.get())) : DateTime{};
}

}  // namespace cv::ua::crypto
