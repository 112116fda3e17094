// open62541's own client on the bulk workload, the anchor of ua_bulk_bench:
// one subscription at the given interval over Bulk.V0 to Bulk.V<N-1>
// (sampled at the same interval, queue size 1), with the library's default
// client settings otherwise.
//
//   ua_bulk_anchor <url> <items> <interval ms> <seconds>
//
// Waits for a first value of every item, lets the workload settle for 3 s,
// waits (three intervals at most) for an interval's first values (the first
// after a silence of half an interval) and counts from there for <seconds>
// less half an interval: the values of <seconds>' worth of intervals. Prints
//   ANCHOR values=<n> seconds=<seconds> cpu_ms=<process CPU> first_all_ms=<ms>
// with the CPU time of the counting and the time from creating the
// subscription to a first value of every item.

#include <open62541/client.h>
#include <open62541/client_config_default.h>
#include <open62541/client_subscriptions.h>
#include <open62541/plugin/log_stdout.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <optional>
#include <string>
#include <vector>

namespace {

struct Count {
    std::vector<bool> seen;
    uint32_t missing = 0;
    uint64_t values = 0;
};

Count counted;

void OnValue(UA_Client*, UA_UInt32, void*, UA_UInt32, void* context, UA_DataValue*) {
    ++counted.values;
    const auto index = reinterpret_cast<uintptr_t>(context);
    if (!counted.seen[index]) {
        counted.seen[index] = true;
        --counted.missing;
    }
}

double CpuSeconds() {
    timespec now{};
    clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &now);
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) / 1e9;
}

double Since(std::chrono::steady_clock::time_point start) {
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

// Runs the client's event loop until done() holds (true) or the bound has
// passed (done()); false at once when the connection fails.
template <class Done>
bool RunUntil(UA_Client* client, Done done, double boundSeconds) {
    const auto start = std::chrono::steady_clock::now();
    while (!done() && Since(start) < boundSeconds) {
        if (UA_Client_run_iterate(client, 50) != UA_STATUSCODE_GOOD) {
            return false;
        }
    }
    return done();
}

bool RunFor(UA_Client* client, double seconds) {
    const auto start = std::chrono::steady_clock::now();
    return RunUntil(
        client, [&start, seconds] { return Since(start) >= seconds; }, seconds + 1);
}

// Runs the event loop until a server period's first values come (after a
// silence of half a period), three periods at most; gives the count of
// values before them, none when the connection fails.
std::optional<uint64_t> AwaitPeriodStart(UA_Client* client, double periodMs) {
    const auto start = std::chrono::steady_clock::now();
    auto last = start;
    while (Since(start) < 3 * periodMs / 1000) {
        const uint64_t before = counted.values;
        if (UA_Client_run_iterate(client, 5) != UA_STATUSCODE_GOOD) {
            return std::nullopt;
        }
        const auto now = std::chrono::steady_clock::now();
        if (counted.values != before) {
            if (std::chrono::duration<double, std::milli>(now - last).count() >= periodMs / 2) {
                return before;
            }
            last = now;
        }
    }
    return counted.values;
}

bool Subscribe(UA_Client* client, uint32_t items, double intervalMs) {
    UA_CreateSubscriptionRequest subscription = UA_CreateSubscriptionRequest_default();
    subscription.requestedPublishingInterval = intervalMs;
    UA_CreateSubscriptionResponse created =
        UA_Client_Subscriptions_create(client, subscription, nullptr, nullptr, nullptr);
    const UA_UInt32 subscriptionId = created.subscriptionId;
    const bool good = created.responseHeader.serviceResult == UA_STATUSCODE_GOOD;
    UA_CreateSubscriptionResponse_clear(&created);
    if (!good) {
        return false;
    }
    std::vector<UA_MonitoredItemCreateRequest> requests;
    std::vector<std::string> ids;
    std::vector<void*> contexts;
    std::vector<UA_Client_DataChangeNotificationCallback> callbacks(items, OnValue);
    std::vector<UA_Client_DeleteMonitoredItemCallback> deletes(items, nullptr);
    ids.reserve(items);
    for (uint32_t i = 0; i < items; ++i) {
        ids.push_back("Bulk.V" + std::to_string(i));
        UA_MonitoredItemCreateRequest item =
            UA_MonitoredItemCreateRequest_default(UA_NODEID_STRING(1, ids.back().data()));
        item.requestedParameters.samplingInterval = intervalMs;
        requests.push_back(item);
        contexts.push_back(reinterpret_cast<void*>(static_cast<uintptr_t>(i)));
    }
    UA_CreateMonitoredItemsRequest request;
    UA_CreateMonitoredItemsRequest_init(&request);
    request.subscriptionId = subscriptionId;
    request.timestampsToReturn = UA_TIMESTAMPSTORETURN_BOTH;
    request.itemsToCreate = requests.data();
    request.itemsToCreateSize = requests.size();
    UA_CreateMonitoredItemsResponse response = UA_Client_MonitoredItems_createDataChanges(
        client, request, contexts.data(), callbacks.data(), deletes.data());
    bool all = response.responseHeader.serviceResult == UA_STATUSCODE_GOOD &&
               response.resultsSize == items;
    for (size_t i = 0; all && i < response.resultsSize; ++i) {
        all = response.results[i].statusCode == UA_STATUSCODE_GOOD;
    }
    UA_CreateMonitoredItemsResponse_clear(&response);
    return all;
}

}  // namespace

int main(int argc, char** argv) {
    if (argc != 5) {
        std::fprintf(stderr, "usage: ua_bulk_anchor <url> <items> <interval ms> <seconds>\n");
        return 2;
    }
    const uint32_t items = static_cast<uint32_t>(std::strtoul(argv[2], nullptr, 10));
    const double intervalMs = std::strtod(argv[3], nullptr);
    const double seconds = std::strtod(argv[4], nullptr);
    counted.seen.assign(items, false);
    counted.missing = items;

    UA_Client* client = UA_Client_new();
    UA_ClientConfig* config = UA_Client_getConfig(client);
    UA_Logger quiet = UA_Log_Stdout_withLevel(UA_LOGLEVEL_ERROR);
    quiet.clear = config->logging->clear;
    *config->logging = quiet;
    config->timeout = 120'000;
    if (UA_Client_connect(client, argv[1]) != UA_STATUSCODE_GOOD) {
        std::fprintf(stderr, "could not connect to %s\n", argv[1]);
        UA_Client_delete(client);
        return 1;
    }
    const auto created = std::chrono::steady_clock::now();
    if (!Subscribe(client, items, intervalMs) ||
        !RunUntil(
            client, [] { return counted.missing == 0; }, 120)) {
        std::fprintf(stderr, "not every item reported a value\n");
        UA_Client_delete(client);
        return 1;
    }
    const double firstAll = Since(created);
    const auto before = RunFor(client, 3) ? AwaitPeriodStart(client, intervalMs) : std::nullopt;
    const double cpuBefore = CpuSeconds();
    if (!before || !RunFor(client, seconds - intervalMs / 2000)) {
        std::fprintf(stderr, "the connection failed\n");
        UA_Client_delete(client);
        return 1;
    }
    const double cpu = CpuSeconds() - cpuBefore;
    std::printf("ANCHOR values=%llu seconds=%g cpu_ms=%.1f first_all_ms=%.1f\n",
                static_cast<unsigned long long>(counted.values - *before), seconds, cpu * 1000,
                firstAll * 1000);
    UA_Client_disconnect(client);
    UA_Client_delete(client);
    return 0;
}
