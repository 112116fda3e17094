// The browsers on a generated plant, in virtual time on Qt's offscreen
// platform: opening a branch of 10,000 items in the item browser (the
// server's answers, the tree's nodes, the Qt tree's items and one paint of
// the window), and opening a domain of 1,000 computers in the server
// browser (1,000 records of the network enumeration, a pair of calls each,
// and the tree), each also without the window.

#include <benchmark/benchmark.h>

#include <cstdlib>
#include <memory>
#include <string>

#include <QApplication>
#include <QTreeWidget>

#include "browse/MousePointer.h"
#include "browse/Network.h"
#include "browse/OpcItemTree.h"
#include "platform/sim/SimulatedPlant.h"
#include "support/TestPlatform.h"
#include "ui/browse/frmBrowseOpcServers.h"
#include "ui/browse/frmOpcBrowse.h"

namespace {

using namespace cv;

constexpr int32_t kItems = 10000;
constexpr int32_t kComputers = 1000;

std::string Numbered(const char* prefix, int32_t i) {
    std::string digits = std::to_string(i);
    return prefix + std::string(5 - digits.size(), '0') + digits;
}

// One server with a branch "Big" of 10,000 items, on this computer in the
// domain BENCH of 1,000 more computers.
std::shared_ptr<const sim::PlantDescription> BenchPlant() {
    auto plant = std::make_shared<sim::PlantDescription>();
    plant->providers.push_back({"Microsoft Windows Network", {"BENCH"}});
    sim::ServerSpec server;
    server.id = "Bench.Items.1";
    sim::BranchSpec big;
    big.name = "Big";
    for (int32_t i = 0; i < kItems; ++i) {
        sim::ItemSpec item;
        item.name = Numbered("Item", i);
        item.itemId = "Big." + item.name;
        item.value = Variant::R8(i);
        server.items.push_back(item);
        server.IndexItem(server.items.size() - 1);
        big.items.push_back(server.items.size() - 1);
    }
    server.root.branches.push_back(std::move(big));
    plant->servers.push_back(std::move(server));
    sim::ComputerSpec here;
    here.name = "HERE";
    here.local = true;
    here.domain = "BENCH";
    here.servers = {"Bench.Items.1"};
    plant->computers.push_back(here);
    for (int32_t i = 0; i < kComputers; ++i) {
        sim::ComputerSpec computer;
        computer.name = Numbered("PC", i);
        computer.domain = "BENCH";
        plant->computers.push_back(computer);
    }
    return plant;
}

// The test platform with the generated plant for its servers and network.
struct BenchPlatform {
    test::TestPlatform tp;
    sim::SimulatedPlant plant{BenchPlant(), tp.serverCalls,
                              sim::PlantOptions{"HERE", test::TestPlatform::kStartDate}};
    Platform platform{
        tp.dialogs,      tp.locale,          tp.program, tp.help, tp.computer,    tp.events,
        tp.registry,     tp.profiles,        tp.run,     plant,   tp.serverCalls, tp.trace,
        plant.NetEnum(), plant.DdeServers(), tp.modeless};
};

void ItemBranchInTheWindow(benchmark::State& state) {
    BenchPlatform bench;
    for (auto _ : state) {
        state.PauseTiming();
        auto window =
            std::make_unique<frmOpcBrowse>(bench.platform, "Bench.Items.1", "", "", "", false);
        window->Connect();
        window->Load();
        window->resize(480, 600);
        window->show();
        auto* tree = window->findChild<QTreeWidget*>("tvwItems");
        QTreeWidgetItem* big = tree->topLevelItem(0)->child(0);
        state.ResumeTiming();
        tree->expandItem(big);
        benchmark::DoNotOptimize(window->grab());
        if (big->childCount() != kItems) {
            state.SkipWithError("the branch did not fill");
        }
        state.PauseTiming();
        window.reset();
        state.ResumeTiming();
    }
}
BENCHMARK(ItemBranchInTheWindow)->Unit(benchmark::kMillisecond);

void ItemBranchWithoutTheWindow(benchmark::State& state) {
    BenchPlatform bench;
    for (auto _ : state) {
        state.PauseTiming();
        TreeNodes nodes;
        MousePointer pointer;
        OpcItemTree tree(bench.platform, nodes, pointer, "Bench.Items.1", "", "", "", false);
        tree.Connect();
        tree.Load();
        const TreeNodes::Id big = nodes.Children(nodes.First()).front();
        state.ResumeTiming();
        tree.Expand(big);
        benchmark::DoNotOptimize(nodes.Count());
    }
}
BENCHMARK(ItemBranchWithoutTheWindow)->Unit(benchmark::kMillisecond);

void DomainInTheWindow(benchmark::State& state) {
    BenchPlatform bench;
    for (auto _ : state) {
        state.PauseTiming();
        auto window = std::make_unique<frmBrowseOpcServers>(bench.platform, "", 0);
        window->show();
        auto* tree = window->findChild<QTreeWidget*>("tvwItems");
        QTreeWidgetItem* network = tree->topLevelItem(0)->child(1);
        tree->expandItem(network);
        tree->expandItem(network->child(0));
        QTreeWidgetItem* domain = network->child(0)->child(0);
        state.ResumeTiming();
        tree->expandItem(domain);
        benchmark::DoNotOptimize(window->grab());
        if (domain->childCount() != kComputers + 1) {
            state.SkipWithError("the domain did not fill");
        }
        state.PauseTiming();
        window.reset();
        state.ResumeTiming();
    }
}
BENCHMARK(DomainInTheWindow)->Unit(benchmark::kMillisecond);

void DomainWithoutTheWindow(benchmark::State& state) {
    BenchPlatform bench;
    for (auto _ : state) {
        Network network(bench.platform.network);
        for (int step = 0; step < 2; ++step) {
            network.GetResources();
            network.GoToKey(network.Item(1)->Key());
        }
        network.GetResources();
        if (network.Count() != kComputers + 1) {
            state.SkipWithError("the domain did not fill");
        }
    }
}
BENCHMARK(DomainWithoutTheWindow)->Unit(benchmark::kMillisecond);

}  // namespace

int main(int argc, char** argv) {
    setenv("QT_QPA_PLATFORM", "offscreen", 0);
    QApplication application(argc, argv);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
