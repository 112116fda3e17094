#include <gtest/gtest.h>

#include "ua/encoding/Decoder.h"
#include "ua/secure/ChunkAssembler.h"
#include "ua/secure/ChunkWriter.h"
#include "ua/secure/CryptoSecurityPolicy.h"
#include "ua/support/TestCredentials.h"

namespace cv::ua::test {
namespace {

Frame AsFrame(std::string bytes) {
    auto header = ParseFrameHeader(bytes.substr(0, kFrameHeaderSize), 1u << 20);
    return {header.Value(), std::move(bytes)};
}

std::unique_ptr<CryptoSecurityPolicy> Policy(const PolicyProfile& profile, MessageSecurityMode mode,
                                             const crypto::Credentials& own,
                                             const crypto::Credentials& peer) {
    auto made = CryptoSecurityPolicy::Make(profile, mode, own, peer.certificate);
    return made ? std::move(made.Value()) : nullptr;
}

std::string Body(size_t size) {
    std::string body(size, '\0');
    for (size_t i = 0; i < size; ++i) {
        body[i] = static_cast<char>(i * 13 + 5);
    }
    return body;
}

// Our side and a mirror that plays the server: each holds its own key and
// the other's certificate, and their nonces are exchanged, so the keys one
// sends with are the keys the other receives with.
struct Pair {
    Pair(const PolicyProfile& profile, MessageSecurityMode mode, const crypto::Credentials& own,
         const crypto::Credentials& peer)
        : client(Policy(profile, mode, own, peer)), server(Policy(profile, mode, peer, own)) {}

    void Token(uint32_t tokenId) {
        const ByteString ours = client->NewClientNonce().Value();
        const ByteString theirs = server->NewClientNonce().Value();
        ASSERT_TRUE(client->AcceptToken(tokenId, theirs));
        ASSERT_TRUE(server->AcceptToken(tokenId, ours));
    }

    // Writes body from client to server and gives what the server put together.
    Result<std::string> Carry(MessageKind kind, uint32_t tokenId, const std::string& body,
                              uint32_t chunkSize = 8192) {
        ChunkWriter writer(*client);
        writer.SetLimits({chunkSize, 0, 0});
        ChunkAssembler assembler(*server);
        assembler.SetChannelId(7);
        assembler.AcceptToken(tokenId);
        auto chunks = writer.Write(kind, 7, tokenId, 1, body);
        if (!chunks) {
            return chunks.Failure();
        }
        for (std::string& chunk : chunks.Value()) {
            EXPECT_LE(chunk.size(), chunkSize);
            auto outcome = assembler.Add(AsFrame(std::move(chunk)));
            if (!outcome) {
                return outcome.Failure();
            }
            if (outcome.Value().message) {
                return outcome.Value().message->body;
            }
        }
        return Error{status::BadDecodingError, "no message came out"};
    }

    std::unique_ptr<CryptoSecurityPolicy> client;
    std::unique_ptr<CryptoSecurityPolicy> server;
};

struct PolicySetup {
    const char* name;
    const PolicyProfile& profile;
    MessageSecurityMode mode;
    const crypto::Credentials& server;
};

std::vector<PolicySetup> PolicySetups() {
    const auto policies = SupportedPolicies();
    std::vector<PolicySetup> setups;
    for (const PolicyProfile& profile : policies) {
        for (const auto mode : {MessageSecurityMode::Sign, MessageSecurityMode::SignAndEncrypt}) {
            setups.push_back({"2048-bit server", profile, mode, ServerCredentials()});
        }
    }
    setups.push_back({"3072-bit server (extra padding byte)", policies[0],
                      MessageSecurityMode::SignAndEncrypt, LargeKeyCredentials()});
    return setups;
}

TEST(CryptoPolicy, CarriesOpenAndServiceMessagesAcrossChunks) {
    for (const PolicySetup& setup : PolicySetups()) {
        SCOPED_TRACE(std::string(setup.profile.name) + " " +
                     std::to_string(static_cast<int>(setup.mode)) + " " + setup.name);
        Pair pair(setup.profile, setup.mode, ClientCredentials(), setup.server);
        ASSERT_TRUE(pair.client && pair.server);
        pair.Token(1);
        for (const size_t size : {size_t{0}, size_t{1}, size_t{300}, size_t{9'000}}) {
            for (const auto kind : {MessageKind::Open, MessageKind::Message}) {
                auto carried = pair.Carry(kind, 1, Body(size));
                ASSERT_TRUE(carried) << size << ": " << carried.Failure().text;
                EXPECT_EQ(carried.Value(), Body(size)) << size;
            }
        }
    }
}

TEST(CryptoPolicy, EncryptsTheBodyOnlyInSignAndEncrypt) {
    const std::string body = "a plain text that must not show " + std::string(40, '!');
    for (const auto mode : {MessageSecurityMode::Sign, MessageSecurityMode::SignAndEncrypt}) {
        Pair pair(SupportedPolicies()[0], mode, ClientCredentials(), ServerCredentials());
        pair.Token(1);
        ChunkWriter writer(*pair.client);
        writer.SetLimits({8192, 0, 0});
        const std::string message = writer.Write(MessageKind::Message, 7, 1, 1, body).Value()[0];
        const std::string open = writer.Write(MessageKind::Open, 7, 1, 2, body).Value()[0];
        const bool visible = message.find(body) != std::string::npos;
        EXPECT_EQ(visible, mode == MessageSecurityMode::Sign);
        EXPECT_EQ(open.find(body), std::string::npos) << "open messages are always encrypted";
    }
}

TEST(CryptoPolicy, KeepsTheKeysOfTheTokenBeforeUntilItIsRetired) {
    Pair pair(SupportedPolicies()[1], MessageSecurityMode::SignAndEncrypt, ClientCredentials(),
              ServerCredentials());
    pair.Token(1);
    pair.Token(2);
    EXPECT_TRUE(pair.Carry(MessageKind::Message, 1, "old"));
    EXPECT_TRUE(pair.Carry(MessageKind::Message, 2, "new"));
    pair.server->RetireToken(1);
    auto retired = pair.Carry(MessageKind::Message, 1, "old");
    ASSERT_FALSE(retired);
    EXPECT_EQ(retired.Failure().status, status::BadSecureChannelTokenUnknown);
    pair.Token(3);
    auto dropped = pair.Carry(MessageKind::Message, 1, "old");
    ASSERT_FALSE(dropped) << "at most two tokens' keys are kept";
}

TEST(CryptoPolicy, RefusesOpenChunksNotMeantForIt) {
    const PolicyProfile& profile = SupportedPolicies()[0];
    const auto mode = MessageSecurityMode::SignAndEncrypt;
    struct Case {
        const char* name;
        std::unique_ptr<CryptoSecurityPolicy> sender;
        StatusCode status;
    };
    Case cases[] = {
        {"another policy",
         Policy(SupportedPolicies()[1], mode, ClientCredentials(), ServerCredentials()),
         status::BadSecurityPolicyRejected},
        {"another sender", Policy(profile, mode, LargeKeyCredentials(), ServerCredentials()),
         status::BadCertificateInvalid},
        {"another receiver", Policy(profile, mode, ClientCredentials(), LargeKeyCredentials()),
         status::BadCertificateInvalid},
    };
    // The receiver expects the client's messages, encrypted for the server.
    auto receiver = Policy(profile, mode, ServerCredentials(), ClientCredentials());
    for (Case& c : cases) {
        ChunkWriter writer(*c.sender);
        writer.SetLimits({8192, 0, 0});
        ChunkAssembler assembler(*receiver);
        const std::string chunk = writer.Write(MessageKind::Open, 0, 0, 1, "x").Value()[0];
        auto outcome = assembler.Add(AsFrame(chunk));
        ASSERT_FALSE(outcome) << c.name;
        EXPECT_EQ(outcome.Failure().status, c.status) << c.name;
    }
}

TEST(CryptoPolicy, RefusesAChangedOpenChunk) {
    Pair pair(SupportedPolicies()[0], MessageSecurityMode::Sign, ClientCredentials(),
              ServerCredentials());
    ChunkWriter writer(*pair.client);
    writer.SetLimits({8192, 0, 0});
    std::string chunk = writer.Write(MessageKind::Open, 0, 0, 1, Body(100)).Value()[0];
    chunk[chunk.size() - 300] ^= 1;
    ChunkAssembler assembler(*pair.server);
    auto outcome = assembler.Add(AsFrame(chunk));
    ASSERT_FALSE(outcome);
    EXPECT_EQ(outcome.Failure().status, status::BadSecurityChecksFailed);
}

TEST(CryptoPolicy, MakeRefusesWhatCannotWork) {
    const PolicyProfile& profile = SupportedPolicies()[0];
    static const crypto::Credentials small = MakeCredentials("small", 1024);
    crypto::Credentials mismatched{ClientCredentials().certificate, ServerCredentials().key};
    struct Case {
        const char* name;
        MessageSecurityMode mode;
        crypto::Credentials own;
        crypto::Certificate server;
        StatusCode status;
    };
    const std::vector<Case> cases = {
        {"mode None", MessageSecurityMode::None, ClientCredentials(),
         ServerCredentials().certificate, status::BadSecurityModeRejected},
        {"a key that is not the certificate's", MessageSecurityMode::Sign, mismatched,
         ServerCredentials().certificate, status::BadCertificateInvalid},
        {"no server certificate",
         MessageSecurityMode::Sign,
         ClientCredentials(),
         {},
         status::BadCertificateInvalid},
        {"a 1024-bit server key", MessageSecurityMode::Sign, ClientCredentials(), small.certificate,
         status::BadCertificateUseNotAllowed},
        {"a 1024-bit own key", MessageSecurityMode::Sign, small, ServerCredentials().certificate,
         status::BadCertificateUseNotAllowed},
    };
    for (const Case& c : cases) {
        auto made = CryptoSecurityPolicy::Make(profile, c.mode, c.own, c.server);
        ASSERT_FALSE(made) << c.name;
        EXPECT_EQ(made.Failure().status, c.status) << c.name;
    }
}

TEST(CryptoPolicy, TakesOnlyServerNoncesOfThePolicysLength) {
    auto policy = Policy(SupportedPolicies()[0], MessageSecurityMode::Sign, ClientCredentials(),
                         ServerCredentials());
    ASSERT_TRUE(policy->NewClientNonce());
    for (const size_t size : {0, 16, 31, 33}) {
        auto accepted = policy->AcceptToken(1, ByteString{std::string(size, 'n')});
        ASSERT_FALSE(accepted) << size;
        EXPECT_EQ(accepted.Failure().status, status::BadNonceInvalid);
    }
    EXPECT_TRUE(policy->AcceptToken(1, ByteString{std::string(32, 'n')}));
}

}  // namespace
}  // namespace cv::ua::test
