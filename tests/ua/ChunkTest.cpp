#include <gtest/gtest.h>

#include "ua/encoding/Decoder.h"
#include "ua/encoding/Encoder.h"
#include "ua/secure/ChunkAssembler.h"
#include "ua/secure/ChunkWriter.h"
#include "ua/secure/NoneSecurityPolicy.h"

namespace cv::ua {
namespace {

Frame AsFrame(std::string bytes) {
    auto header = ParseFrameHeader(bytes.substr(0, kFrameHeaderSize), 1u << 20);
    return {header.Value(), std::move(bytes)};
}

uint32_t SequenceNumberOf(const std::string& chunk) {
    Decoder decoder(std::string_view(chunk).substr(16));
    uint32_t sequence = 0;
    decoder(sequence);
    return sequence;
}

class Chunks : public ::testing::Test {
  protected:
    Chunks() : writer_(policy_), assembler_(policy_) {
        assembler_.SetChannelId(7);
        assembler_.AcceptToken(3);
    }

    NoneSecurityPolicy policy_;
    ChunkWriter writer_;
    ChunkAssembler assembler_;
};

TEST_F(Chunks, SplitsAMessageIntoNumberedChunksThatJoinAgain) {
    writer_.SetLimits({8192, 0, 0});
    std::string body(20'000, '\0');
    for (size_t i = 0; i < body.size(); ++i) {
        body[i] = static_cast<char>(i * 7);
    }
    auto chunks = writer_.Write(MessageKind::Message, 7, 3, 42, body);
    ASSERT_TRUE(chunks);
    ASSERT_EQ(chunks.Value().size(), 3u);
    std::optional<SecureMessage> joined;
    for (size_t i = 0; i < 3; ++i) {
        const std::string& chunk = chunks.Value()[i];
        EXPECT_LE(chunk.size(), 8192u);
        EXPECT_EQ(chunk.substr(0, 4), i < 2 ? "MSGC" : "MSGF");
        EXPECT_EQ(SequenceNumberOf(chunk), i + 1);
        auto outcome = assembler_.Add(AsFrame(chunk));
        ASSERT_TRUE(outcome) << outcome.Failure().text;
        joined = outcome.Value().message;
        EXPECT_EQ(joined.has_value(), i == 2);
    }
    EXPECT_EQ(joined->requestId, 42u);
    EXPECT_EQ(joined->body, body);
}

TEST_F(Chunks, RefusesAMessageOverTheServersLimitsWithoutUsingASequenceNumber) {
    writer_.SetLimits({8192, 10'000, 2});
    auto tooLarge = writer_.Write(MessageKind::Message, 7, 3, 1, std::string(10'001, 'x'));
    ASSERT_FALSE(tooLarge);
    EXPECT_EQ(tooLarge.Failure().status, status::BadRequestTooLarge);
    writer_.SetLimits({8192, 0, 2});
    EXPECT_FALSE(writer_.Write(MessageKind::Message, 7, 3, 1, std::string(20'000, 'x')));
    auto fits = writer_.Write(MessageKind::Message, 7, 3, 1, "small");
    ASSERT_TRUE(fits);
    EXPECT_EQ(SequenceNumberOf(fits.Value()[0]), 1u);
}

TEST_F(Chunks, ChecksChannelTokenAndSequence) {
    const auto chunk = [](uint32_t channel, uint32_t token, uint32_t sequence) {
        std::string bytes(kFrameHeaderSize, '\0');
        Encoder encoder(bytes);
        encoder(channel);
        encoder(token);
        encoder(sequence);
        encoder(uint32_t{1});
        bytes.replace(0, 4, "MSGF");
        encoder.PatchUInt32(4, static_cast<uint32_t>(bytes.size()));
        return AsFrame(bytes);
    };
    const std::vector<std::tuple<std::vector<Frame>, StatusCode>> cases = {
        {{chunk(7, 3, 0xFFFFFFFFu - 10), chunk(7, 3, 0xFFFFFFFFu - 9), chunk(7, 3, 2)},
         status::Good},
        {{chunk(7, 3, 5), chunk(7, 3, 7)}, status::BadSequenceNumberInvalid},
        {{chunk(7, 3, 5), chunk(7, 3, 5)}, status::BadSequenceNumberInvalid},
        {{chunk(7, 3, 1000), chunk(7, 3, 2)}, status::BadSequenceNumberInvalid},
        {{chunk(8, 3, 1)}, status::BadTcpSecureChannelUnknown},
        {{chunk(7, 4, 1)}, status::BadSecureChannelTokenUnknown},
    };
    for (const auto& [frames, expected] : cases) {
        ChunkAssembler assembler(policy_);
        assembler.SetChannelId(7);
        assembler.AcceptToken(3);
        StatusCode last = status::Good;
        for (const Frame& frame : frames) {
            auto outcome = assembler.Add(frame);
            last = outcome ? status::Good : outcome.Failure().status;
        }
        EXPECT_EQ(last, expected);
    }
}

TEST_F(Chunks, AcceptsTheTokenInForceAndTheOneBefore) {
    assembler_.AcceptToken(4);
    assembler_.AcceptToken(5);
    writer_.SetLimits({8192, 0, 0});
    for (const auto& [token, accepted] :
         std::vector<std::pair<uint32_t, bool>>{{5, true}, {4, true}, {3, false}}) {
        auto chunks = writer_.Write(MessageKind::Message, 7, token, 1, "x");
        EXPECT_EQ(assembler_.Add(AsFrame(chunks.Value()[0])).Ok(), accepted) << token;
    }
}

struct Piece {
    uint32_t requestId;
    char chunkType;
    size_t size;
};

struct Assembly {
    const char* name;
    std::vector<Piece> pieces;
    // The status of the last piece; all before it are taken.
    StatusCode last;
    const char* text;
};

// Messages up to 20000 bytes, all unfinished ones up to 30000 together.
TEST_F(Chunks, UnfinishedMessagesHoldNoMoreThanTheirCapTogether) {
    const std::vector<Assembly> cases = {
        {"four interleaved up to the cap, a finished one frees its room",
         {{1, 'C', 7000},
          {2, 'C', 7000},
          {3, 'C', 7000},
          {4, 'C', 9000},
          {1, 'F', 0},
          {2, 'C', 7000}},
         status::Good,
         ""},
        {"four interleaved over the cap",
         {{1, 'C', 7000}, {2, 'C', 7000}, {3, 'C', 7000}, {4, 'C', 7000}, {1, 'C', 2001}},
         status::BadTcpMessageTooLarge,
         "4 messages unfinished that together hold more than 30000"},
        {"an aborted message frees its room",
         {{1, 'C', 15000}, {2, 'C', 14000}, {1, 'A', 0}, {3, 'C', 16000}},
         status::Good,
         ""},
        {"one message over its limit",
         {{1, 'C', 15000}, {1, 'C', 5001}},
         status::BadTcpMessageTooLarge,
         "larger than 20000 bytes"},
    };
    for (const Assembly& assembly : cases) {
        SCOPED_TRACE(assembly.name);
        ChunkAssembler assembler(policy_);
        assembler.SetLimits(20'000, 0, 30'000);
        assembler.AcceptToken(3);
        uint32_t sequence = 1;
        Result<ChunkAssembler::Outcome> outcome = ChunkAssembler::Outcome{};
        for (const Piece& piece : assembly.pieces) {
            ASSERT_TRUE(outcome) << outcome.Failure().text;
            std::string chunk = MakeFrame(MessageKind::Message, ChunkType::Final, "");
            Encoder encoder(chunk);
            for (const uint32_t field : {7u, 3u, sequence++, piece.requestId}) {
                encoder(field);
            }
            chunk += std::string(piece.size, 'x');
            chunk[3] = piece.chunkType;
            encoder.PatchUInt32(4, static_cast<uint32_t>(chunk.size()));
            outcome = assembler.Add(AsFrame(chunk));
        }
        EXPECT_EQ(outcome ? status::Good : outcome.Failure().status, assembly.last);
        EXPECT_NE((outcome ? std::string() : outcome.Failure().text).find(assembly.text),
                  std::string::npos);
    }
}

TEST_F(Chunks, FrameReaderCutsAStreamThatArrivesByteByByte) {
    const std::string first = MakeFrame(MessageKind::Acknowledge, ChunkType::Final, "abcd");
    const std::string second = MakeFrame(MessageKind::Message, ChunkType::Intermediate, "");
    const std::string stream = first + second;
    FrameReader reader(1024);
    std::vector<std::string> frames;
    for (const char byte : stream) {
        reader.Append(std::string_view(&byte, 1));
        auto frame = reader.Next();
        ASSERT_TRUE(frame);
        if (frame.Value()) {
            frames.push_back(frame.Value()->bytes);
        }
    }
    EXPECT_EQ(frames, (std::vector<std::string>{first, second}));
    EXPECT_EQ(reader.PendingBytes(), 0u);
}

}  // namespace
}  // namespace cv::ua
