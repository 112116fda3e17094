#include "ua/crypto/OpenSsl.h"

#include <openssl/bio.h>
#include <openssl/err.h>

namespace cv::ua::crypto {

Error OpenSslFailure(std::string_view what, StatusCode status) {
    std::string reason;
    while (const unsigned long code = ERR_get_error()) {
        char text[256];
        ERR_error_string_n(code, text, sizeof text);
        reason = text;
    }
    std::string message = "The program could not " + std::string(what);
    message += reason.empty() ? "." : " (" + reason + ").";
    return Error{status, message};
}

std::string BioText(BIO* bio) {
    char* data = nullptr;
    const long size = BIO_get_mem_data(bio, &data);
    return size > 0 ? std::string(data, static_cast<size_t>(size)) : std::string();
}

}  // namespace cv::ua::crypto
