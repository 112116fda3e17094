#include <gtest/gtest.h>

#include "ua/crypto/PSha256.h"
#include "ua/encoding/Encoder.h"
#include "ua/secure/ChunkPadding.h"
#include "ua/secure/PolicyProfile.h"
#include "ua/secure/SymmetricChunk.h"
#include "ua/support/TestCredentials.h"

namespace cv::ua::test {
namespace {

// The expected bytes below were computed with OpenSSL's command-line tools:
// P_SHA256 as its TLS1-PRF key derivation with SHA-256 and no label, the
// chunks with its HMAC-SHA256 and AES-256-CBC (-nopad) over chunks laid out
// by hand.
std::string Counting(int from, int count) {
    std::string bytes;
    for (int i = 0; i < count; ++i) {
        bytes += static_cast<char>(from + i);
    }
    return bytes;
}

const std::string kSecret = Counting(0, 32);
const std::string kSeed = Counting(32, 32);
const std::string kForward =
    "b72593c43fee5fafa0256cd6bb904ff40c066a225db95f66dd744e20858a2220"
    "ddf75067e3d76ac714c08e24eabd85ff425d7f5fb25e6e083b94b174e29db89b"
    "c513e9172274d5ed54e52a3552901ae0";

TEST(PSha256, MatchesKnownOutputs) {
    struct Case {
        std::string secret;
        std::string seed;
        size_t length;
        std::string expected;
    };
    const std::vector<Case> cases = {
        {kSecret, kSeed, 80, kForward},
        {kSeed, kSecret, 80,
         "dd585db0c102dd1a4c1ed4dd195606dec3f7a1c789afca78f9479ed3a5d668af"
         "ce49cb8f1c65a827f412c48e71c9f9cb3b5c2ee2fc2e4b3bd46d4098b5e45475"
         "a77832c6215b6e7ab85f2e668be7aeff"},
        {"key", "short seed", 64,
         "904c632dc57807127b678292f58786a4d816ebf9423a01956b704b8f5ee675f7"
         "8bbcf5a68ff318bce9e5eb5722b474e5eaf466bd1bf506fd9bd4604e1ef3ab57"},
        {kSecret, kSeed, 5, kForward.substr(0, 10)},
    };
    for (const Case& c : cases) {
        EXPECT_EQ(Hex(crypto::PSha256(c.secret, c.seed, c.length)), c.expected) << c.length;
    }
}

TEST(PSha256, KeysAreSigningKeyEncryptingKeyAndIvInThatOrder) {
    for (const PolicyProfile& profile : SupportedPolicies()) {
        const SymmetricKeys keys = DeriveKeys(profile, kSecret, kSeed);
        const size_t encrypting = profile.encryptingKeyBytes;
        EXPECT_EQ(Hex(keys.signing), kForward.substr(0, 64)) << profile.name;
        EXPECT_EQ(Hex(keys.encrypting), kForward.substr(64, encrypting * 2)) << profile.name;
        EXPECT_EQ(Hex(keys.iv), kForward.substr(64 + encrypting * 2, 32)) << profile.name;
    }
}

std::string LaidOutChunk(std::string_view body) {
    std::string chunk = "MSGF";
    Encoder encoder(chunk);
    for (const uint32_t field : {0u, 7u, 3u, 51u, 9u}) {
        encoder(field);
    }
    chunk += body;
    return chunk;
}

constexpr size_t kSequenceAt = 16;
const SymmetricKeys kKeys = DeriveKeys(SupportedPolicies()[0], kSecret, kSeed);

TEST(SymmetricChunk, SealsToKnownBytes) {
    const std::string body = "Hello, secure channel";
    std::string signedOnly = LaidOutChunk(body);
    ASSERT_TRUE(SealChunk(signedOnly, kSequenceAt, kKeys, false));
    EXPECT_EQ(Hex(signedOnly),
              "4d5347464d0000000700000003000000330000000900000048656c6c6f2c20736563757265206368"
              "616e6e656ce279413c182f21d35eea6f6ca60232e7d637a659ddd17729b3ae2da10f3bd9a5");
    std::string encrypted = LaidOutChunk(body);
    ASSERT_TRUE(SealChunk(encrypted, kSequenceAt, kKeys, true));
    EXPECT_EQ(Hex(encrypted),
              "4d534746500000000700000003000000bbe0b2888a0328a1f2ec7036edc5e98152e5e09e412d303a"
              "acf1947e007c4c75f379d4ab603e06e0db0a2683bcc9008c5817413fd1ff374513dd8432e1e8e266");
}

TEST(SymmetricChunk, OpensWhatItSealedForEveryBodyLength) {
    for (const bool encrypt : {false, true}) {
        for (size_t length = 0; length < 40; ++length) {
            const std::string body = Counting(100, static_cast<int>(length));
            std::string chunk = LaidOutChunk(body);
            ASSERT_TRUE(SealChunk(chunk, kSequenceAt, kKeys, encrypt));
            EXPECT_EQ(chunk.size() % 16 == 0 || !encrypt, true);
            auto end = OpenChunk(chunk, kSequenceAt, kKeys, encrypt);
            ASSERT_TRUE(end) << end.Failure().text;
            EXPECT_EQ(chunk.substr(kSequenceAt + 8, end.Value() - kSequenceAt - 8), body);
        }
    }
}

TEST(SymmetricChunk, RefusesWhatWasChangedOnTheWay) {
    struct Case {
        const char* name;
        std::function<void(std::string&)> change;
        bool encrypt;
    };
    const std::vector<Case> cases = {
        {"header byte", [](std::string& c) { c[9] ^= 1; }, true},
        {"cipher byte", [](std::string& c) { c[20] ^= 1; }, true},
        {"signature byte", [](std::string& c) { c.back() ^= 1; }, false},
        {"body byte", [](std::string& c) { c[30] ^= 1; }, false},
        {"cut short", [](std::string& c) { c.resize(c.size() - 16); }, true},
        {"not whole blocks", [](std::string& c) { c.pop_back(); }, true},
        {"no signature", [](std::string& c) { c.resize(20); }, false},
    };
    for (const Case& c : cases) {
        std::string chunk = LaidOutChunk("Hello, secure channel");
        ASSERT_TRUE(SealChunk(chunk, kSequenceAt, kKeys, c.encrypt));
        c.change(chunk);
        auto end = OpenChunk(chunk, kSequenceAt, kKeys, c.encrypt);
        ASSERT_FALSE(end) << c.name;
        EXPECT_EQ(end.Failure().status, status::BadSecurityChecksFailed) << c.name;
    }
}

TEST(ChunkPadding, FillsToWholeBlocksAndChecksEveryPaddingByte) {
    struct Case {
        size_t plain, signature, block;
        bool extra;
        size_t count;
    };
    // sequence header + body, signature, block size, extra byte, padding count
    const std::vector<Case> cases = {
        {29, 32, 16, false, 2},     {31, 32, 16, false, 0},     {32, 32, 16, false, 15},
        {100, 256, 214, false, 71}, {100, 384, 342, true, 198}, {10, 384, 342, true, 288},
    };
    for (const Case& c : cases) {
        const size_t count = PaddingCount(c.plain, c.signature, c.block, c.extra);
        EXPECT_EQ(count, c.count) << c.plain << " in blocks of " << c.block;
        std::string plain(c.plain, 'x');
        AppendPadding(plain, count, c.extra);
        EXPECT_EQ((plain.size() + c.signature) % c.block, 0u);
        auto length = PaddingLength(plain, c.extra);
        ASSERT_TRUE(length);
        EXPECT_EQ(length.Value(), plain.size() - c.plain);
        if (count > 0) {
            plain[c.plain + 1] ^= 1;
            EXPECT_FALSE(PaddingLength(plain, c.extra)) << "a changed padding byte";
        }
    }
    EXPECT_FALSE(PaddingLength(std::string(3, '\x07'), false)) << "more padding than bytes";
    EXPECT_FALSE(PaddingLength("", false));
}

TEST(ChunkPadding, BodyRoomFillsTheChunkWithoutPassingIt) {
    // 2048-bit receiver: blocks of 214 plain / 256 cipher bytes.
    const size_t sequenceAt = 1200;
    const size_t room = EncryptedBodyRoom(8192, sequenceAt, 214, 256, 256, false);
    const size_t blocks = (8192 - sequenceAt) / 256;
    EXPECT_EQ(room, blocks * 214 - 8 - 1 - 256);
    EXPECT_LE(sequenceAt + blocks * 256, 8192u);
    EXPECT_EQ(PaddingCount(8 + room, 256, 214, false), 0u);
    EXPECT_EQ(EncryptedBodyRoom(1000, 900, 214, 256, 256, false), 0u);
}

}  // namespace
}  // namespace cv::ua::test
