#pragma once

#include "ua/crypto/Certificate.h"
#include "ua/crypto/PrivateKey.h"

namespace cv::ua::crypto {

// An application instance certificate with its private key.
struct Credentials {
    Certificate certificate;
    PrivateKey key;
};

}  // namespace cv::ua::crypto
