#include "ua/secure/NoneSecurityPolicy.h"

#include "ua/encoding/Decoder.h"
#include "ua/encoding/Encoder.h"
#include "ua/types/PlainText.h"

namespace cv::ua {

void NoneSecurityPolicy::WriteAsymmetricHeader(Encoder& encoder) const {
    encoder(std::string(kUri));
    encoder(ByteString{});
    encoder(ByteString{});
}

Result<Done> NoneSecurityPolicy::ReadAsymmetricHeader(Decoder& decoder) const {
    std::string uri;
    ByteString certificate;
    ByteString thumbprint;
    decoder(uri);
    decoder(certificate);
    decoder(thumbprint);
    if (!decoder.Ok()) {
        return decoder.Failure();
    }
    if (uri != kUri) {
        return Error{status::BadSecurityChecksFailed,
                     "The server answered with the security policy \"" + PlainText(uri) +
                         "\" instead of None."};
    }
    return Done{};
}

}  // namespace cv::ua
