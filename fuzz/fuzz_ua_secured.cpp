// Feeds arbitrary bytes to the secured receiving paths of an OPC UA channel,
// with symmetric keys derived once from fixed nonces (Basic256Sha256 sizes).
// The first byte picks the mode (Sign or SignAndEncrypt) and whether the
// rest is a received byte stream as it is (decrypted and checked like any
// chunk, so the checks of sizes, padding and signature meet garbage), or
// pieces that are sealed first as the server seals them: a sealed piece
// must open to exactly what was sealed, one damaged byte must be refused,
// and the sealed pieces go through the chunk assembler to the decoding of
// every response the client knows.

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>

#include "ua/encoding/Encoder.h"
#include "ua/secure/ChunkAssembler.h"
#include "ua/secure/PolicyProfile.h"
#include "ua/secure/SymmetricChunk.h"
#include "ua/services/AttributeServices.h"
#include "ua/services/MonitoredItemServices.h"
#include "ua/services/ServiceMessages.h"
#include "ua/services/SessionServices.h"
#include "ua/services/SubscriptionServices.h"
#include "ua/services/ViewServices.h"
#include "ua/transport/TcpMessages.h"

namespace {

using namespace cv::ua;

constexpr uint32_t kChannelId = 7;
constexpr uint32_t kTokenId = 3;
// Message header, channel id, token id.
constexpr size_t kSequenceAt = kFrameHeaderSize + 8;

void Check(bool bCondition) {
    if (!bCondition) {
        std::abort();
    }
}

const SymmetricKeys& ServerKeys() {
    static const SymmetricKeys keys =
        DeriveKeys(SupportedPolicies().front(), std::string(32, '\x11'), std::string(32, '\x22'));
    return keys;
}

// The channel's security with the fixed keys, for symmetric chunks only.
class FixedKeyPolicy : public SecurityPolicy {
  public:
    explicit FixedKeyPolicy(bool encrypt) : encrypt_(encrypt) {}

    std::string_view Uri() const override { return SupportedPolicies().front().uri; }
    MessageSecurityMode Mode() const override {
        return encrypt_ ? MessageSecurityMode::SignAndEncrypt : MessageSecurityMode::Sign;
    }
    Result<ByteString> NewClientNonce() override { return ByteString{}; }
    Result<Done> AcceptToken(uint32_t, const ByteString&) override { return Done{}; }
    void RetireToken(uint32_t) override {}
    void WriteAsymmetricHeader(Encoder&) const override {}
    Result<Done> ReadAsymmetricHeader(Decoder&) const override { return Refused(); }
    size_t BodyRoom(size_t chunkSize, size_t headerSize, bool) const override {
        return chunkSize - headerSize;
    }
    Result<Done> Protect(std::string&, size_t, bool) override { return Refused(); }
    Result<size_t> Unprotect(std::string& chunk, size_t sequenceAt, bool asymmetric) override {
        if (asymmetric) {
            return Refused();
        }
        return OpenChunk(chunk, sequenceAt, ServerKeys(), encrypt_);
    }

  private:
    static Error Refused() { return Error{status::BadSecurityChecksFailed, "fuzz"}; }

    bool encrypt_;
};

DecodeLimits Limits() {
    DecodeLimits limits;
    limits.maxStringLength = 1u << 16;
    limits.maxArrayLength = 1u << 16;
    limits.maxAllocation = 1u << 20;
    return limits;
}

template <class... Responses>
void DecodeResponses(std::string_view body) {
    (DecodeResponse<Responses>(body, "fuzz", Limits()), ...);
}

// Every frame of the stream through the assembler; whole messages decoded.
void Receive(FixedKeyPolicy& policy, std::string_view stream) {
    ChunkAssembler assembler(policy);
    // Small enough for a fuzzed stream to reach every limit.
    assembler.SetLimits(1u << 14, 64, 1u << 15);
    assembler.SetChannelId(kChannelId);
    assembler.AcceptToken(kTokenId);
    FrameReader reader(1u << 16);
    reader.Append(stream);
    for (;;) {
        auto frame = reader.Next();
        if (!frame || !frame.Value()) {
            return;
        }
        auto outcome = assembler.Add(std::move(*frame.Value()));
        if (!outcome) {
            return;
        }
        if (outcome.Value().message) {
            DecodeResponses<OpenSecureChannelResponse, GetEndpointsResponse, CreateSessionResponse,
                            ActivateSessionResponse, BrowseResponse, ReadResponse, WriteResponse,
                            CreateSubscriptionResponse, CreateMonitoredItemsResponse,
                            PublishResponse, RepublishResponse>(outcome.Value().message->body);
        }
    }
}

// A MSG chunk around payload (sequence header and body) before sealing.
std::string LayOut(char chunkType, std::string_view payload) {
    std::string chunk = "MSG";
    chunk += chunkType;
    Encoder encoder(chunk);
    encoder(uint32_t{0});
    encoder(kChannelId);
    encoder(kTokenId);
    chunk += payload;
    return chunk;
}

// Seals the chunk, checks that it opens to what was sealed and that a
// damaged byte is refused; gives the sealed chunk.
std::string Seal(std::string chunk, bool encrypt, uint8_t damageAt) {
    Check(SealChunk(chunk, kSequenceAt, ServerKeys(), encrypt).Ok());
    std::string opened = chunk;
    auto end = OpenChunk(opened, kSequenceAt, ServerKeys(), encrypt);
    Check(end.Ok() && end.Value() <= opened.size());
    const size_t at = kSequenceAt + damageAt % (chunk.size() - kSequenceAt);
    std::string damaged = chunk;
    damaged[at] = static_cast<char>(damaged[at] ^ 0x5A);
    Check(!OpenChunk(damaged, kSequenceAt, ServerKeys(), encrypt).Ok());
    return chunk;
}

// Pieces: chunk type selector, length (one byte), payload.
std::string SealedStream(std::string_view bytes, bool encrypt) {
    static constexpr char kTypes[] = {'F', 'C', 'A'};
    std::string stream;
    while (bytes.size() >= 3) {
        const char type = kTypes[static_cast<uint8_t>(bytes[0]) % 3];
        const auto damageAt = static_cast<uint8_t>(bytes[1]);
        const size_t length = std::min<size_t>(static_cast<uint8_t>(bytes[2]), bytes.size() - 3);
        stream += Seal(LayOut(type, bytes.substr(3, length)), encrypt, damageAt);
        bytes.remove_prefix(3 + length);
    }
    return stream;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (size == 0) {
        return 0;
    }
    const std::string_view bytes(reinterpret_cast<const char*>(data) + 1, size - 1);
    const bool encrypt = (data[0] & 1) != 0;
    FixedKeyPolicy policy(encrypt);
    if ((data[0] & 2) != 0) {
        Receive(policy, SealedStream(bytes, encrypt));
    } else {
        Receive(policy, bytes);
    }
    return 0;
}
