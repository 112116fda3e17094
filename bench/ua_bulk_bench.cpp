// The OPC UA client at scale, against a bulk server on open62541, a second
// OPC UA stack (bench/open62541/ua_bulk_server: N Doubles rewritten every P
// ms, started here for each workload and stopped after it). Each workload is
// run by our client library and then by open62541's own client
// (bench/open62541/ua_bulk_anchor, its default settings) on the same server
// in the same run, each in a process of its own: one subscription at P ms
// over all N items, sampled every P ms, queue size 1. After a first value of
// every item and 3 s to settle, each client waits for a period's first values
// (the first after a silence of half a period; a saturated server is never
// silent) and counts kSeconds less half a period from there, which holds
// kSeconds' worth of periods. Counters, per client:
// - values_per_s: the values counted over kSeconds;
// - cpu_us_per_value: the process's CPU time while counting per value;
// - first_all_ms: from creating the subscription to a first value of every
//   item;
// - peak_mb: the process's peak resident memory (wait4).
// Workloads: 10,000 items at 100 ms; 100,000 items at 1 s; 100,000 items at
// 100 ms (more than the server can sample and send: saturated).

#include <benchmark/benchmark.h>
#include <signal.h>
#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <map>
#include <sstream>
#include <string>
#include <vector>

#include "ua/client/Client.h"
#include "ua/support/DispatchQueue.h"

extern char** environ;

namespace {

using namespace cv::ua;
using cv::ua::test::Await;
using cv::ua::test::DispatchQueue;

constexpr int kSeconds = 10;
constexpr int kSettleSeconds = 3;
// The server ends by itself after this, should the benchmark not stop it.
constexpr int kServerSeconds = 600;

using Figures = std::map<std::string, double>;

double CpuSeconds() {
    timespec now{};
    clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &now);
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) / 1e9;
}

double Since(std::chrono::steady_clock::time_point start) {
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

// Reads "KEY name=value ..." lines of a child's output.
void ReadFigures(FILE* in, Figures& figures) {
    char line[1024];
    while (std::fgets(line, sizeof line, in)) {
        std::istringstream words(line);
        std::string word;
        if (words >> word && word == "ANCHOR") {
            while (words >> word) {
                const size_t equals = word.find('=');
                figures[word.substr(0, equals)] = std::atof(word.c_str() + equals + 1);
            }
        }
    }
}

// A child whose standard output is read to its end; its resources come
// from wait4.
struct Child {
    pid_t pid = 0;
    FILE* out = nullptr;

    bool Finish(Figures& figures) {
        ReadFigures(out, figures);
        std::fclose(out);
        int status = 0;
        rusage usage{};
        wait4(pid, &status, 0, &usage);
        figures["peak_mb"] = static_cast<double>(usage.ru_maxrss) / 1024;
        return WIFEXITED(status) && WEXITSTATUS(status) == 0 && figures.count("values");
    }
};

Child Spawn(std::vector<std::string> args) {
    int pipeEnds[2];
    if (pipe(pipeEnds) != 0) {
        return {};
    }
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_adddup2(&actions, pipeEnds[1], STDOUT_FILENO);
    posix_spawn_file_actions_addclose(&actions, pipeEnds[0]);
    std::vector<char*> argv;
    for (std::string& arg : args) {
        argv.push_back(arg.data());
    }
    argv.push_back(nullptr);
    pid_t pid = 0;
    const int failed = posix_spawn(&pid, argv[0], &actions, nullptr, argv.data(), environ);
    posix_spawn_file_actions_destroy(&actions);
    close(pipeEnds[1]);
    if (failed) {
        close(pipeEnds[0]);
        return {};
    }
    return {pid, fdopen(pipeEnds[0], "r")};
}

// The bulk server of the workload at hand; one at a time.
class BulkServer {
  public:
    static const std::string& For(uint32_t items, uint32_t periodMs) {
        static BulkServer server;
        if (server.items_ != items || server.periodMs_ != periodMs) {
            server.Stop();
            server.Start(items, periodMs);
        }
        return server.url_;
    }

    ~BulkServer() { Stop(); }

  private:
    void Start(uint32_t items, uint32_t periodMs) {
        items_ = items;
        periodMs_ = periodMs;
        child_ =
            Spawn({CV_UA_BULK_SERVER, std::to_string(items), std::to_string(periodMs), "--seconds",
                   std::to_string(kServerSeconds), "--exit-with-pid", std::to_string(getpid())});
        char line[1024];
        while (child_.out && std::fgets(line, sizeof line, child_.out)) {
            const std::string text = line;
            if (text.rfind("READY ", 0) == 0) {
                url_ = text.substr(6, text.find_last_not_of("\r\n") - 5);
                return;
            }
        }
    }

    void Stop() {
        if (child_.pid) {
            kill(child_.pid, SIGTERM);
            std::fclose(child_.out);
            waitpid(child_.pid, nullptr, 0);
        }
        child_ = {};
        url_.clear();
        items_ = periodMs_ = 0;
    }

    Child child_;
    std::string url_;
    uint32_t items_ = 0;
    uint32_t periodMs_ = 0;
};

// Counts the values and the items heard from, and marks where a server
// period's values begin: the first after a silence of half a period.
struct Counting {
    Counting(uint32_t items, uint32_t periodMs)
        : seen(items), missing(items), silence(std::chrono::milliseconds(periodMs) / 2) {}

    void Add(const std::vector<MonitoredItemNotification>& changes) {
        const auto now = std::chrono::steady_clock::now();
        if (now - last >= silence) {
            ++periodStarts;
            valuesBeforeStart = values;
        }
        last = now;
        values += changes.size();
        for (const auto& change : changes) {
            if (change.clientHandle < seen.size() && !seen[change.clientHandle]) {
                seen[change.clientHandle] = true;
                --missing;
            }
        }
    }

    std::vector<bool> seen;
    uint32_t missing;
    std::chrono::steady_clock::duration silence;
    std::chrono::steady_clock::time_point last;
    uint64_t values = 0;
    uint64_t periodStarts = 0;
    uint64_t valuesBeforeStart = 0;
};

bool Subscribe(DispatchQueue& queue, Client& client, Counting& counting, uint32_t periodMs) {
    SubscriptionSettings settings;
    settings.publishingIntervalMs = periodMs;
    SubscriptionHandlers handlers;
    handlers.dataChange = [&counting](std::vector<MonitoredItemNotification>& changes) {
        counting.Add(changes);
    };
    auto subscription = Await<SubscriptionInfo>(
        queue, [&](auto done) { client.CreateSubscription(settings, handlers, done); });
    if (!subscription) {
        return false;
    }
    std::vector<MonitoredItemCreateRequest> requests(counting.seen.size());
    for (uint32_t i = 0; i < requests.size(); ++i) {
        requests[i].itemToMonitor.nodeId = NodeId(1, "Bulk.V" + std::to_string(i));
        requests[i].requestedParameters.clientHandle = i;
        requests[i].requestedParameters.samplingInterval = periodMs;
        requests[i].requestedParameters.queueSize = 1;
    }
    auto results = Await<std::vector<MonitoredItemCreateResult>>(queue, [&](auto done) {
        client.CreateMonitoredItems(subscription.Value().subscriptionId, TimestampsToReturn::Both,
                                    std::move(requests), done);
    });
    return results &&
           queue.RunUntil([&] { return counting.missing == 0; }, std::chrono::minutes(2));
}

// Settles, waits (three periods at most) for a period's first values and
// counts kSeconds less half a period from there: the values of kSeconds'
// worth of periods. Prints the anchor's line.
void Measure(DispatchQueue& queue, Counting& counting, uint32_t periodMs, double firstAll) {
    using std::chrono::milliseconds;
    queue.RunUntil([] { return false; }, std::chrono::seconds(kSettleSeconds));
    const uint64_t starts = counting.periodStarts;
    queue.RunUntil([&] { return counting.periodStarts > starts; }, milliseconds(3 * periodMs));
    const uint64_t before =
        counting.periodStarts > starts ? counting.valuesBeforeStart : counting.values;
    const double cpuBefore = CpuSeconds();
    queue.RunUntil([] { return false; }, milliseconds(kSeconds * 1000 - periodMs / 2));
    const double cpu = CpuSeconds() - cpuBefore;
    std::printf("ANCHOR values=%llu seconds=%d cpu_ms=%.1f first_all_ms=%.1f\n",
                static_cast<unsigned long long>(counting.values - before), kSeconds, cpu * 1000,
                firstAll * 1000);
    std::fflush(stdout);
}

// Our client's side of a workload, run in a forked child (which has no
// other thread than the client's own).
int RunOurs(const std::string& url, uint32_t items, uint32_t periodMs) {
    DispatchQueue queue;
    ClientOptions options;
    options.requestTimeoutMs = 120'000;
    Client client(queue.MakeDispatcher(), options);
    bool broken = false;
    client.SetEventHandler([&broken](ConnectionEvent event, const Error&) {
        broken = broken || event != ConnectionEvent::Resumed;
    });
    if (!Await<SessionInfo>(queue, [&](auto done) { client.Connect(url, done); })) {
        return 1;
    }
    Counting counting(items, periodMs);
    const auto created = std::chrono::steady_clock::now();
    if (!Subscribe(queue, client, counting, periodMs)) {
        return 1;
    }
    Measure(queue, counting, periodMs, Since(created));
    bool closed = false;
    client.Close([&closed] { closed = true; });
    queue.RunUntil([&closed] { return closed; });
    return broken ? 1 : 0;
}

Child ForkOurs(const std::string& url, uint32_t items, uint32_t periodMs) {
    int pipeEnds[2];
    if (pipe(pipeEnds) != 0) {
        return {};
    }
    std::fflush(nullptr);
    const pid_t pid = fork();
    if (pid == 0) {
        close(pipeEnds[0]);
        dup2(pipeEnds[1], STDOUT_FILENO);
        close(pipeEnds[1]);
        _exit(RunOurs(url, items, periodMs));
    }
    close(pipeEnds[1]);
    if (pid < 0) {
        close(pipeEnds[0]);
        return {};
    }
    return {pid, fdopen(pipeEnds[0], "r")};
}

void Report(benchmark::State& state, Figures& figures) {
    state.counters["values_per_s"] = figures["values"] / figures["seconds"];
    state.counters["cpu_us_per_value"] = figures["cpu_ms"] * 1000 / figures["values"];
    state.counters["first_all_ms"] = figures["first_all_ms"];
    state.counters["peak_mb"] = figures["peak_mb"];
}

// Argument 0: items; 1: interval in ms; 2: 0 for our client, 1 for
// open62541's.
void BM_Bulk(benchmark::State& state) {
    const auto items = static_cast<uint32_t>(state.range(0));
    const auto periodMs = static_cast<uint32_t>(state.range(1));
    const bool anchor = state.range(2) == 1;
    state.SetLabel(anchor ? "open62541 client" : "our client");
    const std::string& url = BulkServer::For(items, periodMs);
    if (url.empty()) {
        state.SkipWithError("the bulk server did not start");
        return;
    }
    for (auto _ : state) {
        Child child = anchor ? Spawn({CV_UA_BULK_ANCHOR, url, std::to_string(items),
                                      std::to_string(periodMs), std::to_string(kSeconds)})
                             : ForkOurs(url, items, periodMs);
        Figures figures;
        if (!child.pid || !child.Finish(figures)) {
            state.SkipWithError("the client failed");
            return;
        }
        Report(state, figures);
    }
}
BENCHMARK(BM_Bulk)
    ->ArgNames({"items", "ms", "open62541"})
    ->Args({10'000, 100, 0})
    ->Args({10'000, 100, 1})
    ->Args({100'000, 1000, 0})
    ->Args({100'000, 1000, 1})
    ->Args({100'000, 100, 0})
    ->Args({100'000, 100, 1})
    ->Iterations(1)
    ->Unit(benchmark::kSecond);

}  // namespace
