#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "ua/services/ChannelServices.h"
#include "ua/types/Result.h"

namespace cv::ua {

class Encoder;
class Decoder;

// What a security policy does to the chunks of a secure channel. The channel
// lays out each chunk (message header, channel id, security header, sequence
// header, body) and hands it here to be signed and encrypted before sending,
// or checked and decrypted after receiving. Open chunks use the asymmetric
// keys, the others the symmetric keys derived from the nonces of the token
// named in their security header.
class SecurityPolicy {
  public:
    virtual ~SecurityPolicy() = default;

    virtual std::string_view Uri() const = 0;
    virtual MessageSecurityMode Mode() const = 0;
    // The nonce for an open request; new keys follow from it and the
    // server's nonce once the response has come.
    virtual Result<ByteString> NewClientNonce() = 0;
    // The keys of a new token, from the last client nonce and the server's.
    // The keys of the token before stay until RetireToken.
    virtual Result<Done> AcceptToken(uint32_t tokenId, const ByteString& serverNonce) = 0;
    virtual void RetireToken(uint32_t tokenId) = 0;

    // The security header of open chunks: policy URI, our certificate and
    // the thumbprint of the server's.
    virtual void WriteAsymmetricHeader(Encoder& encoder) const = 0;
    virtual Result<Done> ReadAsymmetricHeader(Decoder& decoder) const = 0;

    // How many body bytes fit a chunk of chunkSize whose headers take
    // headerSize bytes, after padding and signature.
    virtual size_t BodyRoom(size_t chunkSize, size_t headerSize, bool asymmetric) const = 0;
    // Secures a laid-out chunk in place; the size in its header is final
    // afterwards. sequenceAt is where the sequence header starts.
    virtual Result<Done> Protect(std::string& chunk, size_t sequenceAt, bool asymmetric) = 0;
    // Checks and decrypts a received chunk in place; gives the end of the
    // plain body (before padding and signature).
    virtual Result<size_t> Unprotect(std::string& chunk, size_t sequenceAt, bool asymmetric) = 0;
};

}  // namespace cv::ua
