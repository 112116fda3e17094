#include "ua/crypto/PrivateKey.h"

#include <openssl/pem.h>
#include <openssl/rsa.h>

namespace cv::ua::crypto {

Result<PrivateKey> PrivateKey::Generate(int bits) {
    EVP_PKEY* key = EVP_RSA_gen(static_cast<unsigned int>(bits));
    if (!key) {
        return OpenSslFailure("make an RSA key", status::BadInternalError);
    }
    return PrivateKey(key);
}

Result<PrivateKey> PrivateKey::FromPem(std::string_view pem) {
    BioPtr bio(BIO_new_mem_buf(pem.data(), static_cast<int>(pem.size())));
    EVP_PKEY* key = bio ? PEM_read_bio_PrivateKey(bio.get(), nullptr, nullptr, nullptr) : nullptr;
    if (!key) {
        return OpenSslFailure("read the private key", status::BadCertificateInvalid);
    }
    if (EVP_PKEY_get_base_id(key) != EVP_PKEY_RSA) {
        EVP_PKEY_free(key);
        return Error{status::BadCertificateInvalid, "The private key is not an RSA key."};
    }
    return PrivateKey(key);
}

std::string PrivateKey::ToPem() const {
    BioPtr bio(BIO_new(BIO_s_mem()));
    if (!bio || !key_ ||
        PEM_write_bio_PrivateKey(bio.get(), key_.get(), nullptr, nullptr, 0, nullptr, nullptr) !=
            1) {
        return {};
    }
    return BioText(bio.get());
}

int PrivateKey::Bits() const {
    return key_ ? EVP_PKEY_get_bits(key_.get()) : 0;
}

Result<std::string> PrivateKey::SignSha256(std::string_view data) const {
    MdCtxPtr context(EVP_MD_CTX_new());
    size_t size = 0;
    if (!key_ || !context ||
        EVP_DigestSignInit(context.get(), nullptr, EVP_sha256(), nullptr, key_.get()) != 1 ||
        EVP_DigestSign(context.get(), nullptr, &size, Bytes(data), data.size()) != 1) {
        return OpenSslFailure("sign a message");
    }
    std::string signature(size, '\0');
    if (EVP_DigestSign(context.get(), Bytes(signature), &size, Bytes(data), data.size()) != 1) {
        return OpenSslFailure("sign a message");
    }
    signature.resize(size);
    return signature;
}

Result<std::string> PrivateKey::DecryptOaep(std::string_view data) const {
    const size_t block = static_cast<size_t>(Bits() / 8);
    PkeyCtxPtr context(key_ ? EVP_PKEY_CTX_new(key_.get(), nullptr) : nullptr);
    if (!context || block == 0 || data.size() % block != 0 ||
        EVP_PKEY_decrypt_init(context.get()) != 1 ||
        EVP_PKEY_CTX_set_rsa_padding(context.get(), RSA_PKCS1_OAEP_PADDING) != 1) {
        return Error{status::BadSecurityChecksFailed,
                     "The encrypted part of a message is not a whole number of RSA blocks."};
    }
    std::string plain;
    plain.reserve(data.size());
    for (size_t at = 0; at < data.size(); at += block) {
        std::string out(block, '\0');
        size_t size = out.size();
        if (EVP_PKEY_decrypt(context.get(), Bytes(out), &size, Bytes(data.substr(at, block)),
                             block) != 1) {
            return OpenSslFailure("decrypt a message with the program's private key");
        }
        plain.append(out, 0, size);
    }
    return plain;
}

}  // namespace cv::ua::crypto
