// The item test's cost, on Qt's offscreen platform:
// - ValueArrivalToLabel: a value set in the simulated plant, in virtual time,
//   until the client has it (arrival) and until lblInstValue shows it; the
//   counters give both delays in virtual milliseconds, the time per
//   iteration is the processor time of one value's way.
// - WindowCpuOver30s: the test window refreshing every 100 ms for 30 s of
//   real time on Qt's event loop; cpu_percent is the process's CPU time
//   over those 30 s.
// - CommandLineCpuOver30s: the program's command-line test read of 300
//   values at 100 ms, as a process; cpu_percent of its own CPU time.

#include <fcntl.h>
#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>

#include <benchmark/benchmark.h>

#include <algorithm>
#include <chrono>
#include <cstdlib>
#include <memory>
#include <string>

#include <QApplication>
#include <QElapsedTimer>
#include <QEventLoop>
#include <QLabel>
#include <QTimer>

#include "channel/Channel.h"
#include "document/TunFile.h"
#include "platform/qt/QtEventLoop.h"
#include "support/RecordingModeless.h"
#include "support/TestPlatform.h"
#include "ui/test/frmDDETest.h"

extern char** environ;

namespace {

using namespace cv;

constexpr const char* kPlant = "Sim.Plant.1";
constexpr const char* kItem = "Types.Memory.R8";

double CpuSeconds(const rusage& usage) {
    return usage.ru_utime.tv_sec + usage.ru_stime.tv_sec +
           (usage.ru_utime.tv_usec + usage.ru_stime.tv_usec) / 1e6;
}

double ProcessCpuSeconds() {
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return CpuSeconds(usage);
}

// A test window on the document's SP channel, reading kItem every 100 ms.
struct TestWindow {
    explicit TestWindow(Platform& platform) : document(platform) {
        document.SetDefaults(9);
        document.General().SetSIinSec(0.1);
        Channel& channel = *document.Archives().SPChannel();
        channel.SetOpcNodeAndServer(kPlant);
        channel.SetItemName(kItem);
        channel.SetDescription(kItem);
        window = std::make_unique<frmDDETest>(platform, document, channel);
        window->show();
    }
    Channel& TestChannel() { return *document.Archives().SPChannel(); }
    QString Shown() const { return window->findChild<QLabel*>("lblInstValue")->text(); }

    TunFile document;
    std::unique_ptr<frmDDETest> window;
};

void ValueArrivalToLabel(benchmark::State& state) {
    test::TestPlatform t;
    TestWindow test(t.platform);
    t.events.Advance(2000);
    double value = 0;
    uint64_t arrivalMs = 0;
    uint64_t shownMs = 0;
    int64_t worstMs = 0;
    for (auto _ : state) {
        value += 1;
        (void)t.plant.SetItemValue("", kPlant, kItem, Variant::R8(value));
        const QString expected = QString::number(value);
        int64_t arrival = 0;
        while (test.TestChannel().RawValue().AsR8() != value && arrival < 1000) {
            t.events.Advance(1);
            ++arrival;
        }
        int64_t shown = 0;
        while (test.Shown() != expected && shown < 1000) {
            t.events.Advance(1);
            ++shown;
        }
        arrivalMs += static_cast<uint64_t>(arrival);
        shownMs += static_cast<uint64_t>(shown);
        worstMs = std::max(worstMs, shown);
    }
    state.counters["arrival_ms"] =
        benchmark::Counter(static_cast<double>(arrivalMs), benchmark::Counter::kAvgIterations);
    state.counters["arrival_to_label_ms"] =
        benchmark::Counter(static_cast<double>(shownMs), benchmark::Counter::kAvgIterations);
    state.counters["worst_arrival_to_label_ms"] = static_cast<double>(worstMs);
}
BENCHMARK(ValueArrivalToLabel)->Unit(benchmark::kMicrosecond);

// The TestPlatform's pieces with Qt's event loop and the real clock.
struct RealTimePlatform {
    test::TestPlatform parts;
    qtui::QtEventLoop events;
    platform::ServerCallWait serverCalls{events, parts.busy};
    sim::SimulatedPlant plant{sim::BuiltInPlant(), serverCalls,
                              sim::PlantOptions{"TESTPC", test::TestPlatform::kStartDate}};
    Platform platform{
        parts.dialogs, parts.locale,   parts.program,   parts.help,         parts.computer,
        events,        parts.registry, parts.profiles,  parts.run,          plant,
        serverCalls,   parts.trace,    plant.NetEnum(), plant.DdeServers(), parts.modeless};
};

void WindowCpuOver30s(benchmark::State& state) {
    for (auto _ : state) {
        RealTimePlatform real;
        TestWindow test(real.platform);
        const double before = ProcessCpuSeconds();
        QElapsedTimer clock;
        clock.start();
        QEventLoop loop;
        QTimer::singleShot(30000, &loop, &QEventLoop::quit);
        loop.exec();
        const double cpu = ProcessCpuSeconds() - before;
        state.counters["cpu_percent"] = cpu * 100 / (clock.elapsed() / 1000.0);
        state.counters["shows_value"] = test.Shown() != QStringLiteral("?") ? 1 : 0;
    }
}
BENCHMARK(WindowCpuOver30s)->Iterations(1)->Unit(benchmark::kSecond)->UseRealTime();

void CommandLineCpuOver30s(benchmark::State& state) {
    for (auto _ : state) {
        std::string program = CV_PROGRAM_PATH;
        std::vector<std::string> arguments = {program,  "--test-read",  kPlant,
                                              "--item", "Signals.Ramp", "--count",
                                              "300",    "--interval",   "0.1"};
        std::vector<char*> argv;
        for (auto& argument : arguments) {
            argv.push_back(argument.data());
        }
        argv.push_back(nullptr);
        posix_spawn_file_actions_t actions;
        posix_spawn_file_actions_init(&actions);
        posix_spawn_file_actions_addopen(&actions, 1, "/dev/null", O_WRONLY, 0);
        pid_t pid = 0;
        const auto start = std::chrono::steady_clock::now();
        if (posix_spawn(&pid, program.c_str(), &actions, nullptr, argv.data(), environ) != 0) {
            state.SkipWithError("the program did not start");
            break;
        }
        posix_spawn_file_actions_destroy(&actions);
        int status = 0;
        rusage usage{};
        wait4(pid, &status, 0, &usage);
        const std::chrono::duration<double> wall = std::chrono::steady_clock::now() - start;
        if (!WIFEXITED(status) || WEXITSTATUS(status) != 0) {
            state.SkipWithError("the test read failed");
            break;
        }
        state.counters["cpu_percent"] = CpuSeconds(usage) * 100 / wall.count();
        state.counters["wall_s"] = wall.count();
    }
}
BENCHMARK(CommandLineCpuOver30s)->Iterations(1)->Unit(benchmark::kSecond)->UseRealTime();

}  // namespace

int main(int argc, char** argv) {
    setenv("QT_QPA_PLATFORM", "offscreen", 0);
    QApplication application(argc, argv);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
