// Decoding speed of the OPC UA client: Publish responses carrying a
// DataChangeNotification of 1,000 monitored items (Double value, source and
// server time stamps, as node-opcua sends them), decoded from the message
// body, and from the chunks of a connection through reassembly.

#include <benchmark/benchmark.h>

#include <cstring>

#include "ua/secure/ChunkAssembler.h"
#include "ua/secure/ChunkWriter.h"
#include "ua/secure/NoneSecurityPolicy.h"
#include "ua/services/ServiceMessages.h"
#include "ua/services/SubscriptionServices.h"

namespace {

using namespace cv::ua;

constexpr uint32_t kItems = 1000;

std::string PublishBody() {
    PublishResponse response;
    response.subscriptionId = 1;
    response.availableSequenceNumbers = {1};
    response.notificationMessage.sequenceNumber = 1;
    response.notificationMessage.publishTime = DateTime::Now();
    DataChangeNotification change;
    for (uint32_t i = 0; i < kItems; ++i) {
        DataValue value;
        value.value = 1000.0 + i * 0.25;
        value.sourceTimestamp = DateTime::Now();
        value.serverTimestamp = value.sourceTimestamp;
        change.monitoredItems.push_back({i + 1, value});
    }
    response.notificationMessage.dataChanges.push_back(std::move(change));
    return EncodeMessage(response);
}

void BM_DecodeDataChangeMessage(benchmark::State& state) {
    const std::string body = PublishBody();
    const DecodeLimits limits;
    for (auto _ : state) {
        auto response = DecodeResponse<PublishResponse>(body, "Publish", limits);
        benchmark::DoNotOptimize(response);
        if (!response) {
            state.SkipWithError(response.Failure().text.c_str());
            break;
        }
    }
    state.SetItemsProcessed(static_cast<int64_t>(state.iterations()) * kItems);
    state.counters["values_per_s"] = benchmark::Counter(
        static_cast<double>(state.iterations()) * kItems, benchmark::Counter::kIsRate);
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * body.size()));
}
BENCHMARK(BM_DecodeDataChangeMessage);

// Cut into 64 KiB chunks as a server sends them; each pass copies the
// chunks in as the socket would, joins them and decodes the message.
void BM_AssembleAndDecodeDataChangeMessage(benchmark::State& state) {
    NoneSecurityPolicy policy;
    ChunkWriter writer(policy);
    writer.SetLimits({65535, 0, 0});
    auto chunks = writer.Write(MessageKind::Message, 1, 1, 1, PublishBody());
    std::vector<Frame> frames;
    for (std::string& chunk : chunks.Value()) {
        auto header = ParseFrameHeader(chunk.substr(0, kFrameHeaderSize), 65535);
        frames.push_back({header.Value(), std::move(chunk)});
    }
    const DecodeLimits limits;
    uint32_t sequence = 0;
    for (auto _ : state) {
        ChunkAssembler assembler(policy);
        assembler.AcceptToken(1);
        for (Frame frame : frames) {
            std::memcpy(frame.bytes.data() + 16, &++sequence, 4);
            auto outcome = assembler.Add(std::move(frame));
            if (outcome && outcome.Value().message) {
                auto response = DecodeResponse<PublishResponse>(outcome.Value().message->body,
                                                                "Publish", limits);
                benchmark::DoNotOptimize(response);
            }
        }
    }
    state.counters["values_per_s"] = benchmark::Counter(
        static_cast<double>(state.iterations()) * kItems, benchmark::Counter::kIsRate);
}
BENCHMARK(BM_AssembleAndDecodeDataChangeMessage);

}  // namespace
