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
// - the same through the automation interface (the OPC UA backend on a real
//   event loop): a server object's Connect (connect and session), adding a
//   group (subscription), adding and activating one item, and its first
//   notification; then 10,000 items in one group at a 100 ms update rate:
//   time to the first notification of all, values per second, CPU share.
// Needs Node.js and the installed peer (bash scripts/dev.sh test installs it).

#include <benchmark/benchmark.h>
#include <spawn.h>
#include <sys/wait.h>

#include <chrono>
#include <cstdio>
#include <ctime>
#include <fstream>
#include <functional>
#include <map>
#include <memory>
#include <sstream>

#include "platform/ServerCallWait.h"
#include "platform/fake/RecordingBusyNotice.h"
#include "platform/opc/OpcResult.h"
#include "platform/posix/SteadyEventLoop.h"
#include "platform/ua/UaBackend.h"
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

// The OPC UA backend as the program uses it, on a real event loop.
struct Automation {
    Automation() { wait.SetCallLimit(120'000); }

    bool WaitUntil(const std::function<bool()>& done, uint32_t ms) {
        return events.WaitUntil(done, ms);
    }

    cv::posix::SteadyEventLoop events;
    cv::fake::RecordingBusyNotice busy;
    cv::platform::ServerCallWait wait{events, busy};
    cv::uaopc::UaBackend backend{wait};
};

using GroupPtr = std::shared_ptr<cv::platform::OPCGroup>;

// Adds the bulk variables V0 to V<count-1> with client handles from 1;
// false when any is refused.
bool AddBulkItems(cv::platform::OPCGroup& group, uint32_t count) {
    using cv::platform::OneBased;
    OneBased<std::string> ids;
    OneBased<std::string> paths;
    OneBased<int32_t> clientHandles;
    for (uint32_t i = 0; i < count; ++i) {
        ids.Add("ns=1;s=Bulk.V" + std::to_string(i));
        paths.Add("");
        clientHandles.Add(static_cast<int32_t>(i + 1));
    }
    OneBased<int32_t> handles;
    OneBased<int32_t> errors;
    const auto n = static_cast<int32_t>(count);
    if (group.OPCItems().AddItems(n, ids, clientHandles, paths, handles, errors)) {
        return false;
    }
    for (int32_t i = 1; i <= n; ++i) {
        if (errors(i) != 0) {
            return false;
        }
    }
    return true;
}

// An inactive, subscribed group at a 100 ms rate that counts the values
// and the items heard from.
GroupPtr CountingGroup(cv::platform::OPCServer& server, std::vector<bool>& seen, uint32_t& missing,
                       uint64_t& values) {
    GroupPtr group;
    if (server.OPCGroups().Add("Bench", group) || group->SetIsActive(false) ||
        group->SetUpdateRate(100)) {
        return nullptr;
    }
    group->SetDataChangeHandler([&](const cv::platform::DataChangeArgs& args) {
        values += static_cast<uint64_t>(args.NumItems);
        for (int32_t i = 1; i <= args.NumItems; ++i) {
            const auto handle = static_cast<size_t>(args.ClientHandles(i));
            if (handle < seen.size() && !seen[handle]) {
                seen[handle] = true;
                --missing;
            }
        }
    });
    return group->SetIsSubscribed(true) ? nullptr : group;
}

void BM_AutomationFirstValueOfOneItem(benchmark::State& state) {
    if (PeerUrl().empty()) {
        state.SkipWithError("the peer did not start");
        return;
    }
    Automation automation;
    double connect = 0;
    double subscription = 0;
    double item = 0;
    double first = 0;
    for (auto _ : state) {
        std::unique_ptr<cv::platform::OPCServer> server;
        (void)automation.backend.CreateServer(server);
        auto mark = std::chrono::steady_clock::now();
        const auto lap = [&mark](double& total) {
            total += Since(mark);
            mark = std::chrono::steady_clock::now();
        };
        const auto start = mark;
        if (server->Connect(PeerUrl(), "")) {
            state.SkipWithError("connect failed");
            return;
        }
        lap(connect);
        std::vector<bool> seen(2);
        uint32_t missing = 1;
        uint64_t values = 0;
        const GroupPtr group = CountingGroup(*server, seen, missing, values);
        lap(subscription);
        if (!group || !AddBulkItems(*group, 1) || group->SetIsActive(true)) {
            state.SkipWithError("the group or its item failed");
            return;
        }
        lap(item);
        if (!automation.WaitUntil([&] { return missing == 0; }, 10'000)) {
            state.SkipWithError("no first value");
            return;
        }
        lap(first);
        state.SetIterationTime(Since(start));
        (void)server->Disconnect();
    }
    const auto perRun = [&state](double total) {
        return total * 1000 / static_cast<double>(state.iterations());
    };
    state.counters["connect_session_ms"] = perRun(connect);
    state.counters["subscription_ms"] = perRun(subscription);
    state.counters["add_activate_ms"] = perRun(item);
    state.counters["first_value_ms"] = perRun(first);
}
BENCHMARK(BM_AutomationFirstValueOfOneItem)->UseManualTime()->Unit(benchmark::kMillisecond);

void BM_Automation10000Items100ms(benchmark::State& state) {
    if (PeerUrl().empty()) {
        state.SkipWithError("the peer did not start");
        return;
    }
    Automation automation;
    for (auto _ : state) {
        std::unique_ptr<cv::platform::OPCServer> server;
        (void)automation.backend.CreateServer(server);
        std::vector<bool> seen(kItems + 1);
        uint32_t missing = kItems;
        uint64_t values = 0;
        const GroupPtr group = server->Connect(PeerUrl(), "")
                                   ? nullptr
                                   : CountingGroup(*server, seen, missing, values);
        const auto added = std::chrono::steady_clock::now();
        if (!group || !AddBulkItems(*group, kItems) || group->SetIsActive(true) ||
            !automation.WaitUntil([&] { return missing == 0; }, 120'000)) {
            state.SkipWithError("not every item reported a value");
            return;
        }
        const double firstAll = Since(added);
        automation.WaitUntil([] { return false; }, 3'000);
        const uint64_t valuesBefore = values;
        const double cpuBefore = CpuSeconds();
        const auto start = std::chrono::steady_clock::now();
        automation.WaitUntil([] { return false; }, kSeconds * 1000);
        const double wall = Since(start);
        const double cpu = CpuSeconds() - cpuBefore;
        state.counters["values_per_s"] = static_cast<double>(values - valuesBefore) / wall;
        state.counters["cpu_share"] = cpu / wall;
        state.counters["first_all_ms"] = firstAll * 1000;
        (void)server->Disconnect();
    }
}
BENCHMARK(BM_Automation10000Items100ms)->Iterations(1)->Unit(benchmark::kSecond);

}  // namespace
