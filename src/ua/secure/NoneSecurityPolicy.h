#pragma once

#include "ua/secure/SecurityPolicy.h"

namespace cv::ua {

// SecurityPolicy None: no certificates, no signatures, no encryption.
class NoneSecurityPolicy : public SecurityPolicy {
  public:
    static constexpr std::string_view kUri = "http://opcfoundation.org/UA/SecurityPolicy#None";

    std::string_view Uri() const override { return kUri; }
    MessageSecurityMode Mode() const override { return MessageSecurityMode::None; }
    Result<ByteString> NewClientNonce() override { return ByteString{}; }
    Result<Done> AcceptToken(uint32_t, const ByteString&) override { return Done{}; }
    void RetireToken(uint32_t) override {}
    void WriteAsymmetricHeader(Encoder& encoder) const override;
    Result<Done> ReadAsymmetricHeader(Decoder& decoder) const override;
    size_t BodyRoom(size_t chunkSize, size_t headerSize, bool) const override {
        return chunkSize > headerSize ? chunkSize - headerSize : 0;
    }
    Result<Done> Protect(std::string&, size_t, bool) override { return Done{}; }
    Result<size_t> Unprotect(std::string& chunk, size_t, bool) override { return chunk.size(); }
};

}  // namespace cv::ua
