#pragma once

#include <openssl/evp.h>
#include <openssl/x509.h>

#include <memory>
#include <string>
#include <string_view>

#include "ua/types/BuiltinTypes.h"
#include "ua/types/Result.h"

namespace cv::ua::crypto {

// Owners of OpenSSL objects, freed with the library's own functions.
template <class T, void (*Free)(T*)>
struct OpenSslDeleter {
    void operator()(T* object) const { Free(object); }
};
template <class T, void (*Free)(T*)>
using OpenSslPtr = std::unique_ptr<T, OpenSslDeleter<T, Free>>;

using PkeyCtxPtr = OpenSslPtr<EVP_PKEY_CTX, EVP_PKEY_CTX_free>;
using MdCtxPtr = OpenSslPtr<EVP_MD_CTX, EVP_MD_CTX_free>;
using CipherCtxPtr = OpenSslPtr<EVP_CIPHER_CTX, EVP_CIPHER_CTX_free>;
using BioPtr = OpenSslPtr<BIO, BIO_free_all>;
using X509StorePtr = OpenSslPtr<X509_STORE, X509_STORE_free>;
using X509StoreCtxPtr = OpenSslPtr<X509_STORE_CTX, X509_STORE_CTX_free>;

// A failure of an OpenSSL call: what was being done, with the reason OpenSSL
// left in its error queue (which this empties).
Error OpenSslFailure(std::string_view what, StatusCode status = status::BadSecurityChecksFailed);

// The bytes a memory BIO holds.
std::string BioText(BIO* bio);

inline int64_t UnixSeconds(DateTime time) {
    return (time.ticks - DateTime::kUnixEpochTicks) / (DateTime::kTicksPerMillisecond * 1000);
}

inline const unsigned char* Bytes(std::string_view data) {
    return reinterpret_cast<const unsigned char*>(data.data());
}
inline unsigned char* Bytes(std::string& data) {
    return reinterpret_cast<unsigned char*>(data.data());
}

}  // namespace cv::ua::crypto
