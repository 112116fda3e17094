// The OPC client's dispatch of one change notification: one client with n
// items in its main group on the built-in plant, and one DataChange carrying
// all of them, handed to the client's handler as the group would. The
// figure is per item, from the client handle to the channel's stored value;
// n runs from 100 to 100,000 and the fitted complexity shows the curve.
//
//   cmake --preset bench && cmake --build --preset bench --target opc_dispatch_bench
//   build/bench/bench/opc_dispatch_bench

#include <benchmark/benchmark.h>

#include <memory>
#include <vector>

#include "channel/Channel.h"
#include "opc/CvOpcAutoClient.h"
#include "support/TestPlatform.h"

namespace {

using namespace cv;

struct Served {
    explicit Served(int32_t items) {
        if (client.CreateServerAndGroup("Sim.Plant.1", "")) {
            return;
        }
        for (int32_t i = 1; i <= items; ++i) {
            auto channel = std::make_unique<Channel>(tp.platform);
            channel->SetComType(ComTypeCode::Opc);
            channel->SetItemName("Types.Memory.R8");
            channel->SetExpectANumber(false);
            channel->MarkGoingOnline();
            if (client.AddChannel(*channel)) {
                return;
            }
            channels.push_back(std::move(channel));
            args.ClientHandles.Add(i);
            args.ItemValues.Add(Variant::R8(i * 0.5));
            args.Qualities.Add(0xC0);
            args.TimeStamps.Add(test::TestPlatform::kStartDate);
        }
        args.NumItems = items;
    }

    test::TestPlatform tp;
    CvOpcAutoClient client{tp.platform};
    std::vector<std::unique_ptr<Channel>> channels;
    platform::DataChangeArgs args;
};

void PerItem(benchmark::State& state, int32_t items) {
    state.SetComplexityN(items);
    state.SetItemsProcessed(state.iterations() * items);
    state.counters["time_per_item"] = benchmark::Counter(
        static_cast<double>(items),
        benchmark::Counter::kIsIterationInvariantRate | benchmark::Counter::kInvert);
}

void DataChangeDispatch(benchmark::State& state) {
    const auto items = static_cast<int32_t>(state.range(0));
    Served served(items);
    if (static_cast<int32_t>(served.channels.size()) != items) {
        state.SkipWithError("the plant refused an item");
        return;
    }
    served.client.mcOpcGroup1_DataChange(served.args);  // every channel comes online
    for (auto _ : state) {
        served.client.mcOpcGroup1_DataChange(served.args);
    }
    PerItem(state, items);
}
BENCHMARK(DataChangeDispatch)
    ->RangeMultiplier(10)
    ->Range(100, 100000)
    ->Unit(benchmark::kMicrosecond)
    ->Complexity(benchmark::oN);

// The same values stored straight into the same channels, without the
// client: what is left of the figure above is the client's own part.
void ChannelsAlone(benchmark::State& state) {
    const auto items = static_cast<int32_t>(state.range(0));
    Served served(items);
    const platform::DataChangeArgs& args = served.args;
    for (auto _ : state) {
        for (int32_t i = 1; i <= items; ++i) {
            served.channels[static_cast<size_t>(i) - 1]->OpcSetRawValue(
                args.ItemValues(i), args.Qualities(i), args.TimeStamps(i), false);
        }
    }
    PerItem(state, items);
}
BENCHMARK(ChannelsAlone)
    ->RangeMultiplier(10)
    ->Range(100, 100000)
    ->Unit(benchmark::kMicrosecond)
    ->Complexity(benchmark::oN);

}  // namespace
