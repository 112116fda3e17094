// Reading and writing a whole tuning document of the OPC tuner kind with 200
// charted channels and 20 loops (about 4,000 keys). Reads are measured with
// the profile files' parsed-file cache warm (the same file read again) and
// cold (a new profile store, so the file is read and parsed afresh). Writes
// change one description each time, so every save really replaces the file
// (one batch: one atomic replacement, fsync included).

#include <cstdlib>
#include <memory>
#include <string>

#include <benchmark/benchmark.h>

#include "document/TunFile.h"
#include "support/TestPlatform.h"

namespace {

constexpr int32_t kChannels = 200;
constexpr int32_t kLoops = 20;
constexpr int32_t kOpcTuner = 9;

// A document of kChannels charted channels and kLoops loops, saved once.
struct SavedDocument {
    SavedDocument() : path(tp.folder.File("Plant.tun")) {
        cv::TunFile document(tp.platform);
        document.SetDefaults(kOpcTuner);
        for (int32_t k = 4; k <= kChannels; ++k) {
            bool error = false;
            cv::Channel* channel = document.Archives().Add(k, error);
            channel->SetComType(cv::ComTypeCode::Opc);
            channel->SetOpcNodeAndServer("\\\\PLANT-OPC1\\Corvalent.SimPlant.1");
            channel->SetItemName("Area1.TI" + std::to_string(k) + ".PV");
            channel->SetDescription("Temperature " + std::to_string(k));
            channel->SetRange(cv::RangeType::Engineering, 0, 250);
        }
        for (int32_t k = 2; k <= kLoops; ++k) {
            bool failed = false;
            cv::LoopClass* loop = document.Loops().Add(k, failed);
            loop->SetDescription("Loop " + std::to_string(k));
            loop->SetPVChannel(k + 3);
        }
        if (!document.WriteToDisk(path)) {
            std::abort();  // nothing to measure without the file
        }
    }
    cv::test::TestPlatform tp;
    std::string path;
};

void BM_ReadDocumentWarm(benchmark::State& state) {
    SavedDocument saved;
    for (auto _ : state) {
        cv::TunFile document(saved.tp.platform);
        benchmark::DoNotOptimize(document.ReadFromDisk(kOpcTuner, saved.path));
    }
}
BENCHMARK(BM_ReadDocumentWarm)->Unit(benchmark::kMillisecond);

void BM_ReadDocumentCold(benchmark::State& state) {
    SavedDocument saved;
    cv::test::TestPlatform& tp = saved.tp;
    for (auto _ : state) {
        cv::posix::FileProfiles profiles(tp.folder.Path());
        cv::Platform platform{tp.dialogs,
                              tp.locale,
                              tp.program,
                              tp.help,
                              tp.computer,
                              tp.events,
                              tp.registry,
                              profiles,
                              tp.run,
                              tp.plant,
                              tp.serverCalls,
                              tp.trace,
                              tp.plant.NetEnum(),
                              tp.plant.DdeServers(),
                              tp.modeless};
        cv::TunFile document(platform);
        benchmark::DoNotOptimize(document.ReadFromDisk(kOpcTuner, saved.path));
    }
}
BENCHMARK(BM_ReadDocumentCold)->Unit(benchmark::kMillisecond);

void BM_WriteDocument(benchmark::State& state) {
    SavedDocument saved;
    cv::TunFile document(saved.tp.platform);
    document.ReadFromDisk(kOpcTuner, saved.path);
    int64_t lSave = 0;
    for (auto _ : state) {
        document.Archives().Item(kChannels)->SetDescription("Save " + std::to_string(++lSave));
        benchmark::DoNotOptimize(document.WriteToDisk(saved.path));
    }
}
BENCHMARK(BM_WriteDocument)->Unit(benchmark::kMillisecond);

}  // namespace
