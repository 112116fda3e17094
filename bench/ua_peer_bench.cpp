// The OPC UA client against the node-opcua peer (tests/ua/peer), which this
// program starts with 10,000 changing variables and its secured endpoints,
// and stops at the end. Each figure of our client comes without security
// (argument 0) and with Basic256Sha256 SignAndEncrypt (argument 1):
// - connect time, from Hello to an activated session (secured: the
//   endpoints and our certificate are at hand, as after the first connect);
// - 10,000 monitored items at a 100 ms publishing interval: values received
//   per second and the client's CPU share (process CPU time over wall time;
//   1.0 is one core), then the same workload received by node-opcua's own
//   client (the anchor, without security), measured the same way by its
//   script.
// Needs Node.js and the installed peer (bash scripts/dev.sh test installs it).

#include <benchmark/benchmark.h>
#include <spawn.h>
#include <sys/wait.h>

#include <chrono>
#include <cstdio>
#include <ctime>
#include <fstream>
#include <map>
#include <memory>
#include <sstream>

#include "ua/client/Client.h"
#include "ua/client/EndpointChoice.h"
#include "ua/secure/PolicyProfile.h"
#include "ua/support/DispatchQueue.h"
#include "ua/support/TestCredentials.h"

extern char** environ;

namespace {

using namespace cv::ua;
using cv::ua::test::Await;
using cv::ua::test::DispatchQueue;

constexpr uint32_t kItems = 10'000;
constexpr int kSeconds = 10;
const std::string kPeerDir = CV_UA_PEER_DIR;
const std::string kState = CV_UA_BENCH_STATE;

int Run(std::vector<std::string> args) {
    std::vector<char*> argv;
    for (std::string& arg : args) {
        argv.push_back(arg.data());
    }
    argv.push_back(nullptr);
    pid_t pid = 0;
    if (posix_spawnp(&pid, argv[0], nullptr, nullptr, argv.data(), environ) != 0) {
        return -1;
    }
    int status = 0;
    waitpid(pid, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

// The peer, started on first use by this process (it ends with it).
const std::string& PeerUrl() {
    static const std::string url = [] {
        if (Run({"bash", kPeerDir + "/start.sh", kState, "--bulk", std::to_string(kItems),
                 "--secure"}) != 0) {
            return std::string();
        }
        std::atexit([] { Run({"bash", kPeerDir + "/stop.sh", kState}); });
        std::ifstream in(kState + "/url");
        std::string line;
        std::getline(in, line);
        return line;
    }();
    return url;
}

const crypto::Credentials& OwnCredentials() {
    static const crypto::Credentials credentials = cv::ua::test::MakeCredentials("bench");
    return credentials;
}

std::unique_ptr<Client> NewClient(DispatchQueue& queue) {
    ClientOptions options;
    options.applicationUri = OwnCredentials().certificate.ApplicationUri();
    return std::make_unique<Client>(queue.MakeDispatcher(), options);
}

// No options for argument 0; Basic256Sha256 SignAndEncrypt for 1.
Result<ConnectOptions> OptionsFor(DispatchQueue& queue, int64_t secured) {
    if (secured == 0) {
        return ConnectOptions{};
    }
    auto client = NewClient(queue);
    auto endpoints = Await<std::vector<EndpointDescription>>(
        queue, [&](auto done) { client->GetEndpoints(PeerUrl(), std::move(done)); });
    if (!endpoints) {
        return endpoints.Failure();
    }
    auto endpoint = ChooseEndpoint(
        endpoints.Value(),
        {MessageSecurityMode::SignAndEncrypt, std::string(SupportedPolicies().front().uri)});
    if (!endpoint) {
        return endpoint.Failure();
    }
    ConnectOptions connect;
    connect.endpoint = endpoint.Value();
    connect.credentials = std::make_shared<crypto::Credentials>(OwnCredentials());
    return connect;
}

double CpuSeconds() {
    timespec now{};
    clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &now);
    return static_cast<double>(now.tv_sec) + now.tv_nsec / 1e9;
}

double Since(std::chrono::steady_clock::time_point start) {
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

void BM_ConnectToActivatedSession(benchmark::State& state) {
    if (PeerUrl().empty()) {
        state.SkipWithError("the peer did not start");
        return;
    }
    DispatchQueue queue;
    const auto connect = OptionsFor(queue, state.range(0));
    if (!connect) {
        state.SkipWithError(connect.Failure().text.c_str());
        return;
    }
    for (auto _ : state) {
        auto owned = NewClient(queue);
        Client& client = *owned;
        const auto start = std::chrono::steady_clock::now();
        auto session = Await<SessionInfo>(
            queue, [&](auto done) { client.Connect(PeerUrl(), connect.Value(), std::move(done)); });
        state.SetIterationTime(Since(start));
        if (!session) {
            state.SkipWithError(session.Failure().text.c_str());
            return;
        }
        bool closed = false;
        client.Close([&closed] { closed = true; });
        queue.RunUntil([&closed] { return closed; });
    }
}
BENCHMARK(BM_ConnectToActivatedSession)
    ->Arg(0)
    ->Arg(1)
    ->UseManualTime()
    ->Unit(benchmark::kMillisecond);

void BM_EndToEnd10000Items100ms(benchmark::State& state) {
    if (PeerUrl().empty()) {
        state.SkipWithError("the peer did not start");
        return;
    }
    DispatchQueue queue;
    const auto connect = OptionsFor(queue, state.range(0));
    if (!connect) {
        state.SkipWithError(connect.Failure().text.c_str());
        return;
    }
    auto owned = NewClient(queue);
    Client& client = *owned;
    for (auto _ : state) {
        if (!Await<SessionInfo>(
                queue, [&](auto done) { client.Connect(PeerUrl(), connect.Value(), done); })) {
            state.SkipWithError("connect failed");
            return;
        }
        std::vector<bool> seen(kItems + 1);
        uint32_t missing = kItems;
        uint64_t values = 0;
        SubscriptionSettings settings;
        settings.publishingIntervalMs = 100;
        SubscriptionHandlers handlers;
        handlers.dataChange = [&](std::vector<MonitoredItemNotification>& changes) {
            values += changes.size();
            for (const auto& change : changes) {
                if (change.clientHandle <= kItems && !seen[change.clientHandle]) {
                    seen[change.clientHandle] = true;
                    --missing;
                }
            }
        };
        auto subscription = Await<SubscriptionInfo>(
            queue, [&](auto done) { client.CreateSubscription(settings, handlers, done); });
        std::vector<MonitoredItemCreateRequest> items(kItems);
        for (uint32_t i = 0; i < kItems; ++i) {
            items[i].itemToMonitor.nodeId = NodeId(1, "Bulk.V" + std::to_string(i));
            items[i].requestedParameters.clientHandle = i + 1;
            items[i].requestedParameters.samplingInterval = 100;
        }
        const auto created = std::chrono::steady_clock::now();
        auto results = Await<std::vector<MonitoredItemCreateResult>>(queue, [&](auto done) {
            client.CreateMonitoredItems(subscription.Value().subscriptionId,
                                        TimestampsToReturn::Both, std::move(items), done);
        });
        if (!results || !queue.RunUntil([&] { return missing == 0; }, std::chrono::minutes(2))) {
            state.SkipWithError("not every item reported a value");
            return;
        }
        const double firstAll = Since(created);
        // The workload settles before it is measured, as the anchor's does.
        const auto warm = std::chrono::steady_clock::now();
        queue.RunUntil([&] { return Since(warm) >= 3; }, std::chrono::seconds(5));
        const uint64_t valuesBefore = values;
        const double cpuBefore = CpuSeconds();
        const auto start = std::chrono::steady_clock::now();
        queue.RunUntil([&] { return Since(start) >= kSeconds; },
                       std::chrono::seconds(kSeconds + 2));
        const double wall = Since(start);
        const double cpu = CpuSeconds() - cpuBefore;
        state.counters["values_per_s"] = static_cast<double>(values - valuesBefore) / wall;
        state.counters["cpu_share"] = cpu / wall;
        state.counters["cpu_us_per_value"] = cpu * 1e6 / static_cast<double>(values - valuesBefore);
        state.counters["first_all_ms"] = firstAll * 1000;
        bool closed = false;
        client.Close([&closed] { closed = true; });
        queue.RunUntil([&closed] { return closed; });
    }
}
BENCHMARK(BM_EndToEnd10000Items100ms)->Arg(0)->Arg(1)->Iterations(1)->Unit(benchmark::kSecond);

// node-opcua's client on the same workload; its script prints
// "ANCHOR key=value ...".
void BM_EndToEnd10000Items100msAnchor(benchmark::State& state) {
    if (PeerUrl().empty()) {
        state.SkipWithError("the peer did not start");
        return;
    }
    for (auto _ : state) {
        const std::string command = "cd '" + kState + "' && XDG_CONFIG_HOME='" + kState +
                                    "/config' node '" + kPeerDir + "/anchor_client.js' --url '" +
                                    PeerUrl() + "' --count " + std::to_string(kItems) +
                                    " --seconds " + std::to_string(kSeconds) + " --interval 100";
        FILE* pipe = popen(command.c_str(), "r");
        std::map<std::string, double> figures;
        char line[1024];
        while (pipe && std::fgets(line, sizeof line, pipe)) {
            std::istringstream words(line);
            std::string word;
            if (words >> word && word == "ANCHOR") {
                while (words >> word) {
                    const size_t equals = word.find('=');
                    figures[word.substr(0, equals)] = std::atof(word.c_str() + equals + 1);
                }
            }
        }
        if (!pipe || pclose(pipe) != 0 || !figures.count("values_per_s")) {
            state.SkipWithError("the anchor client failed");
            return;
        }
        state.counters["values_per_s"] = figures["values_per_s"];
        state.counters["cpu_share"] = figures["cpu_share"];
        state.counters["cpu_us_per_value"] = figures["cpu_ms"] * 1000 / figures["values"];
        state.counters["first_all_ms"] = figures["first_all_ms"];
    }
}
BENCHMARK(BM_EndToEnd10000Items100msAnchor)->Iterations(1)->Unit(benchmark::kSecond);

}  // namespace
