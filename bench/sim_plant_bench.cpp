// The simulated plant's own cost: CPU time per simulated second for one
// group of 10,000 active items at a 100 ms update rate, in virtual time.
// With generated items, the sines and ramps (two thirds) change at every look
// and go out in each notification, the random ones hold for a minute; memory
// items never change, so the plant only looks at them.

#include <benchmark/benchmark.h>

#include <memory>
#include <string>

#include "platform/ServerCallWait.h"
#include "platform/fake/RecordingBusyNotice.h"
#include "platform/fake/VirtualEventLoop.h"
#include "platform/sim/SimulatedPlant.h"

namespace {

using namespace cv;
using platform::OneBased;

constexpr int32_t kItems = 10000;

std::shared_ptr<const sim::PlantDescription> PlantOf(int32_t items, bool generated) {
    auto plant = std::make_shared<sim::PlantDescription>();
    sim::ServerSpec server;
    server.id = "Bench.1";
    const sim::GeneratorKind kinds[] = {sim::GeneratorKind::Sine, sim::GeneratorKind::Ramp,
                                        sim::GeneratorKind::Random};
    for (int32_t i = 0; i < items; ++i) {
        sim::ItemSpec item;
        item.name = "I" + std::to_string(i);
        item.itemId = item.name;
        item.value = Variant::R8(i);
        if (generated) {
            item.generator.kind = kinds[i % 3];
            item.generator.periodMs = 60000 + static_cast<uint32_t>(i);
        }
        server.items.push_back(item);
        server.IndexItem(server.items.size() - 1);
        server.root.items.push_back(server.items.size() - 1);
    }
    plant->servers.push_back(std::move(server));
    sim::ComputerSpec computer;
    computer.name = "HERE";
    computer.local = true;
    computer.servers = {"Bench.1"};
    plant->computers.push_back(computer);
    return plant;
}

void PlantPerSimulatedSecond(benchmark::State& state) {
    fake::VirtualEventLoop events;
    fake::RecordingBusyNotice notice;
    platform::ServerCallWait wait(events, notice);
    sim::SimulatedPlant plant(PlantOf(kItems, state.range(0) != 0), wait,
                              sim::PlantOptions{"HERE", 45658.0});
    std::unique_ptr<platform::OPCServer> server;
    std::shared_ptr<platform::OPCGroup> group;
    if (plant.CreateServer(server) || server->Connect("Bench.1", "") ||
        server->OPCGroups().Add("bench", group)) {
        state.SkipWithError("the bench server could not be set up");
        return;
    }
    OneBased<std::string> ids;
    OneBased<int32_t> handles;
    for (int32_t i = 0; i < kItems; ++i) {
        ids.Add("I" + std::to_string(i));
        handles.Add(i + 1);
    }
    OneBased<int32_t> serverHandles;
    OneBased<int32_t> errors;
    if (group->OPCItems().AddItems(kItems, ids, handles, OneBased<std::string>(), serverHandles,
                                   errors)) {
        state.SkipWithError("the bench items could not be added");
        return;
    }
    int64_t delivered = 0;
    group->SetDataChangeHandler(
        [&delivered](const platform::DataChangeArgs& args) { delivered += args.NumItems; });
    if (group->SetUpdateRate(100) || group->SetIsSubscribed(true)) {
        state.SkipWithError("the bench group could not be subscribed");
        return;
    }
    events.Advance(1000);
    delivered = 0;
    for (auto _ : state) {
        events.Advance(1000);
    }
    state.counters["items_sent_per_sim_s"] = benchmark::Counter(
        static_cast<double>(delivered) / static_cast<double>(state.iterations()));
    state.SetItemsProcessed(state.iterations() * kItems * 10);
}
BENCHMARK(PlantPerSimulatedSecond)
    ->ArgName("generated")
    ->Arg(1)
    ->Arg(0)
    ->Unit(benchmark::kMillisecond);

}  // namespace
