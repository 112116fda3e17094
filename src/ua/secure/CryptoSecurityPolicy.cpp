#include "ua/secure/CryptoSecurityPolicy.h"

#include <algorithm>

#include "ua/crypto/Primitives.h"
#include "ua/encoding/Decoder.h"
#include "ua/encoding/Encoder.h"
#include "ua/secure/ChunkPadding.h"
#include "ua/secure/SymmetricChunk.h"
#include "ua/transport/TcpMessages.h"
#include "ua/types/PlainText.h"

namespace cv::ua {
namespace {

constexpr size_t kTokenIdAt = kFrameHeaderSize + 4;
constexpr size_t kSequenceHeaderBytes = 8;
constexpr int kPaddingByteBits = 2048;

uint32_t UInt32At(const std::string& chunk, size_t at) {
    uint32_t value = 0;
    for (size_t i = 0; i < 4; ++i) {
        value |= uint32_t{static_cast<unsigned char>(chunk[at + i])} << (8 * i);
    }
    return value;
}

Error BadSignature(std::string_view what) {
    return Error{status::BadSecurityChecksFailed,
                 "The signature of " + std::string(what) + " from the server does not match."};
}

Result<Done> CheckKeySize(const PolicyProfile& profile, int bits, std::string_view whose) {
    if (bits < profile.minKeyBits || bits > profile.maxKeyBits) {
        return Error{status::BadCertificateUseNotAllowed,
                     std::string(whose) + " key has " + std::to_string(bits) + " bits; " +
                         std::string(profile.name) + " needs " +
                         std::to_string(profile.minKeyBits) + " to " +
                         std::to_string(profile.maxKeyBits) + "."};
    }
    return Done{};
}

}  // namespace

CryptoSecurityPolicy::CryptoSecurityPolicy(const PolicyProfile& profile, MessageSecurityMode mode,
                                           crypto::Credentials own, crypto::Certificate server)
    : profile_(profile),
      mode_(mode),
      own_(std::move(own)),
      server_(std::move(server)),
      serverThumbprint_(server_.Thumbprint()),
      ownThumbprint_(own_.certificate.Thumbprint()) {}

Result<std::unique_ptr<CryptoSecurityPolicy>> CryptoSecurityPolicy::Make(
    const PolicyProfile& profile, MessageSecurityMode mode, crypto::Credentials own,
    crypto::Certificate server) {
    if (mode != MessageSecurityMode::Sign && mode != MessageSecurityMode::SignAndEncrypt) {
        return Error{status::BadSecurityModeRejected,
                     "A security policy needs the mode Sign or SignAndEncrypt."};
    }
    if (own.certificate.Empty() || !own.certificate.Matches(own.key) || server.Empty()) {
        return Error{status::BadCertificateInvalid,
                     "Signing needs the program's certificate with its private key and the "
                     "server's certificate."};
    }
    for (auto check : {CheckKeySize(profile, own.key.Bits(), "The program's"),
                       CheckKeySize(profile, server.KeyBits(), "The server's")}) {
        if (!check) {
            return check.Failure();
        }
    }
    return std::unique_ptr<CryptoSecurityPolicy>(
        new CryptoSecurityPolicy(profile, mode, std::move(own), std::move(server)));
}

Result<ByteString> CryptoSecurityPolicy::NewClientNonce() {
    auto nonce = crypto::RandomBytes(profile_.nonceBytes);
    if (!nonce) {
        return nonce.Failure();
    }
    clientNonce_ = nonce.Value();
    return ByteString{std::move(nonce.Value())};
}

Result<Done> CryptoSecurityPolicy::AcceptToken(uint32_t tokenId, const ByteString& serverNonce) {
    if (serverNonce.bytes.size() != profile_.nonceBytes) {
        return Error{status::BadNonceInvalid,
                     "The server sent a nonce of " + std::to_string(serverNonce.bytes.size()) +
                         " bytes; " + std::string(profile_.name) + " needs " +
                         std::to_string(profile_.nonceBytes) + "."};
    }
    RetireToken(tokenId);
    tokens_.push_back({tokenId, DeriveKeys(profile_, serverNonce.bytes, clientNonce_),
                       DeriveKeys(profile_, clientNonce_, serverNonce.bytes)});
    if (tokens_.size() > 2) {
        tokens_.erase(tokens_.begin());
    }
    return Done{};
}

void CryptoSecurityPolicy::RetireToken(uint32_t tokenId) {
    std::erase_if(tokens_, [tokenId](const TokenKeys& keys) { return keys.tokenId == tokenId; });
}

void CryptoSecurityPolicy::WriteAsymmetricHeader(Encoder& encoder) const {
    encoder(std::string(profile_.uri));
    encoder(ByteString{own_.certificate.Der()});
    encoder(ByteString{serverThumbprint_});
}

Result<Done> CryptoSecurityPolicy::ReadAsymmetricHeader(Decoder& decoder) const {
    std::string uri;
    ByteString certificate;
    ByteString thumbprint;
    decoder(uri);
    decoder(certificate);
    decoder(thumbprint);
    if (!decoder.Ok()) {
        return decoder.Failure();
    }
    if (uri != profile_.uri) {
        return Error{status::BadSecurityPolicyRejected,
                     "The server answered with the security policy \"" + PlainText(uri) +
                         "\" instead of " + std::string(profile_.name) + "."};
    }
    if (!std::string_view(certificate.bytes).starts_with(server_.LeafDer())) {
        return Error{status::BadCertificateInvalid,
                     "The server signed with another certificate than the one its endpoint "
                     "shows."};
    }
    if (thumbprint.bytes != ownThumbprint_) {
        return Error{status::BadCertificateInvalid,
                     "The server encrypted for another certificate than the program's."};
    }
    return Done{};
}

size_t CryptoSecurityPolicy::BodyRoom(size_t chunkSize, size_t headerSize, bool asymmetric) const {
    const size_t sequenceAt = headerSize - kSequenceHeaderBytes;
    if (asymmetric) {
        const auto cipherBlock = static_cast<size_t>(server_.KeyBits() / 8);
        return EncryptedBodyRoom(chunkSize, sequenceAt, cipherBlock - kOaepOverhead, cipherBlock,
                                 static_cast<size_t>(own_.key.Bits() / 8),
                                 server_.KeyBits() > kPaddingByteBits);
    }
    if (Encrypts()) {
        return EncryptedBodyRoom(chunkSize, sequenceAt, kSymmetricBlockBytes, kSymmetricBlockBytes,
                                 kSymmetricSignatureBytes, false);
    }
    const size_t fixed = headerSize + kSymmetricSignatureBytes;
    return chunkSize > fixed ? chunkSize - fixed : 0;
}

Result<Done> CryptoSecurityPolicy::Protect(std::string& chunk, size_t sequenceAt, bool asymmetric) {
    return asymmetric ? ProtectAsymmetric(chunk, sequenceAt) : ProtectSymmetric(chunk, sequenceAt);
}

Result<size_t> CryptoSecurityPolicy::Unprotect(std::string& chunk, size_t sequenceAt,
                                               bool asymmetric) {
    return asymmetric ? UnprotectAsymmetric(chunk, sequenceAt)
                      : UnprotectSymmetric(chunk, sequenceAt);
}

Result<Done> CryptoSecurityPolicy::ProtectAsymmetric(std::string& chunk, size_t sequenceAt) {
    const auto cipherBlock = static_cast<size_t>(server_.KeyBits() / 8);
    const size_t plainBlock = cipherBlock - kOaepOverhead;
    const auto signatureBytes = static_cast<size_t>(own_.key.Bits() / 8);
    const bool extraByte = server_.KeyBits() > kPaddingByteBits;
    AppendPadding(chunk,
                  PaddingCount(chunk.size() - sequenceAt, signatureBytes, plainBlock, extraByte),
                  extraByte);
    const size_t blocks = (chunk.size() - sequenceAt + signatureBytes) / plainBlock;
    SetChunkSize(chunk, sequenceAt + blocks * cipherBlock);
    auto signature = own_.key.SignSha256(chunk);
    if (!signature) {
        return signature.Failure();
    }
    chunk += signature.Value();
    auto encrypted = server_.EncryptOaep(std::string_view(chunk).substr(sequenceAt));
    if (!encrypted) {
        return encrypted.Failure();
    }
    chunk.replace(sequenceAt, std::string::npos, encrypted.Value());
    return Done{};
}

const CryptoSecurityPolicy::TokenKeys* CryptoSecurityPolicy::KeysOf(
    const std::string& chunk) const {
    if (chunk.size() < kTokenIdAt + 4) {
        return nullptr;
    }
    const uint32_t tokenId = UInt32At(chunk, kTokenIdAt);
    const auto found = std::find_if(tokens_.begin(), tokens_.end(),
                                    [tokenId](const TokenKeys& k) { return k.tokenId == tokenId; });
    return found == tokens_.end() ? nullptr : &*found;
}

Result<Done> CryptoSecurityPolicy::ProtectSymmetric(std::string& chunk, size_t sequenceAt) {
    const TokenKeys* keys = KeysOf(chunk);
    if (!keys) {
        return Error{status::BadSecureChannelTokenUnknown,
                     "The program has no keys for the security token of a message."};
    }
    return SealChunk(chunk, sequenceAt, keys->client, Encrypts());
}

Result<size_t> CryptoSecurityPolicy::UnprotectAsymmetric(std::string& chunk, size_t sequenceAt) {
    auto plain = own_.key.DecryptOaep(std::string_view(chunk).substr(sequenceAt));
    if (!plain) {
        return plain.Failure();
    }
    chunk.replace(sequenceAt, std::string::npos, plain.Value());
    const auto signatureBytes = static_cast<size_t>(server_.KeyBits() / 8);
    if (chunk.size() < sequenceAt + signatureBytes) {
        return BadSignature("an open message");
    }
    const size_t signedEnd = chunk.size() - signatureBytes;
    auto verified = server_.VerifySha256(std::string_view(chunk).substr(0, signedEnd),
                                         std::string_view(chunk).substr(signedEnd));
    if (!verified) {
        return BadSignature("an open message");
    }
    auto padding = PaddingLength(std::string_view(chunk).substr(sequenceAt, signedEnd - sequenceAt),
                                 own_.key.Bits() > kPaddingByteBits);
    if (!padding) {
        return padding.Failure();
    }
    return signedEnd - padding.Value();
}

Result<size_t> CryptoSecurityPolicy::UnprotectSymmetric(std::string& chunk, size_t sequenceAt) {
    const TokenKeys* keys = KeysOf(chunk);
    if (!keys) {
        return Error{status::BadSecureChannelTokenUnknown,
                     "The server used a security token whose keys are gone."};
    }
    return OpenChunk(chunk, sequenceAt, keys->server, Encrypts());
}

}  // namespace cv::ua
