#include "ua/crypto/Primitives.h"

#include <openssl/crypto.h>
#include <openssl/hmac.h>
#include <openssl/rand.h>

#include "ua/crypto/OpenSsl.h"

namespace cv::ua::crypto {
namespace {

Result<std::string> AesCbc(std::string_view key, std::string_view iv, std::string_view data,
                           bool encrypt) {
    const EVP_CIPHER* cipher = key.size() == 16   ? EVP_aes_128_cbc()
                               : key.size() == 32 ? EVP_aes_256_cbc()
                                                  : nullptr;
    if (!cipher || iv.size() != kAesBlockBytes || data.size() % kAesBlockBytes != 0) {
        return Error{status::BadSecurityChecksFailed,
                     "The encrypted part of a message is not a whole number of blocks."};
    }
    CipherCtxPtr context(EVP_CIPHER_CTX_new());
    std::string out(data.size(), '\0');
    int written = 0;
    if (!context ||
        EVP_CipherInit_ex(context.get(), cipher, nullptr, Bytes(key), Bytes(iv), encrypt) != 1 ||
        EVP_CIPHER_CTX_set_padding(context.get(), 0) != 1 ||
        EVP_CipherUpdate(context.get(), Bytes(out), &written, Bytes(data),
                         static_cast<int>(data.size())) != 1) {
        return OpenSslFailure(encrypt ? "encrypt a message" : "decrypt a message");
    }
    return out;
}

}  // namespace

Result<std::string> RandomBytes(size_t count) {
    std::string bytes(count, '\0');
    if (count > 0 && RAND_bytes(Bytes(bytes), static_cast<int>(count)) != 1) {
        return OpenSslFailure("make random bytes", status::BadInternalError);
    }
    return bytes;
}

std::string Sha1(std::string_view data) {
    std::string digest(kSha1Bytes, '\0');
    EVP_Digest(data.data(), data.size(), Bytes(digest), nullptr, EVP_sha1(), nullptr);
    return digest;
}

std::string HmacSha256(std::string_view key, std::string_view data) {
    std::string mac(kSha256Bytes, '\0');
    unsigned int size = 0;
    HMAC(EVP_sha256(), key.data(), static_cast<int>(key.size()), Bytes(data), data.size(),
         Bytes(mac), &size);
    return mac;
}

Result<std::string> AesCbcEncrypt(std::string_view key, std::string_view iv,
                                  std::string_view data) {
    return AesCbc(key, iv, data, true);
}

Result<std::string> AesCbcDecrypt(std::string_view key, std::string_view iv,
                                  std::string_view data) {
    return AesCbc(key, iv, data, false);
}

bool SameBytes(std::string_view a, std::string_view b) {
    return a.size() == b.size() && CRYPTO_memcmp(a.data(), b.data(), a.size()) == 0;
}

}  // namespace cv::ua::crypto
