#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "ua/client/ClientOptions.h"
#include "ua/client/ConnectOptions.h"
#include "ua/client/SessionInfo.h"
#include "ua/client/SubscriptionTypes.h"
#include "ua/services/MonitoredItemServices.h"
#include "ua/services/SessionServices.h"
#include "ua/services/ViewServices.h"

namespace cv::ua {

class ClientCore;
class IoThread;

// An OPC UA client: one session with one server at a time, plus discovery
// calls that open a channel of their own.
//
// Every call returns at once. The work runs on the client's own I/O thread,
// and each completion, data change and connection event runs through the
// dispatcher on the caller's thread, in the order the client produced them.
// Every request has a time-out. Destroying the client closes the
// connection without waiting, and no completion runs after the destructor
// has begun (completions already queued in the dispatcher find the client
// gone and do nothing). The client may be destroyed inside a completion.
//
// Results hold either the answer or an Error whose status code and text say
// what went wrong. A service that works answers one result per operation;
// those carry their own status codes.
class Client {
  public:
    template <class T>
    using Callback = std::function<void(Result<T>)>;
    using EventHandler = std::function<void(ConnectionEvent event, const Error& reason)>;

    explicit Client(Dispatcher dispatcher, ClientOptions options = {});
    ~Client();
    Client(const Client&) = delete;
    Client& operator=(const Client&) = delete;

    // Told when the server announces its shutdown, when the connection
    // breaks and when the session is resumed on a new one, and when the
    // connection is lost for good. Set it before Connect.
    void SetEventHandler(EventHandler handler);

    // Opens a secure channel and a session at endpointUrl as connect says
    // (by default SecurityPolicy None and an anonymous user). Refused while
    // connected or connecting (Bad_InvalidState).
    void Connect(std::string endpointUrl, ConnectOptions connect, Callback<SessionInfo> done);
    void Connect(std::string endpointUrl, Callback<SessionInfo> done) {
        Connect(std::move(endpointUrl), {}, std::move(done));
    }
    // Closes the session (deleting its subscriptions) and the channel.
    void Close(std::function<void()> done);

    // Discovery over a channel of their own; no session needed.
    void FindServers(std::string discoveryUrl, Callback<std::vector<ApplicationDescription>> done);
    void GetEndpoints(std::string endpointUrl, Callback<std::vector<EndpointDescription>> done);

    // maxReferencesPerNode 0 lets the server choose; results with a
    // continuation point go on with BrowseNext.
    void Browse(std::vector<BrowseDescription> nodes, uint32_t maxReferencesPerNode,
                Callback<std::vector<BrowseResult>> done);
    // release true gives the continuation points back without results.
    void BrowseNext(std::vector<ByteString> continuationPoints, bool release,
                    Callback<std::vector<BrowseResult>> done);
    void TranslateBrowsePaths(std::vector<BrowsePath> paths,
                              Callback<std::vector<BrowsePathResult>> done);

    // maxAgeMs 0 reads from the device.
    void Read(std::vector<ReadValueId> nodes, double maxAgeMs, TimestampsToReturn timestamps,
              Callback<std::vector<DataValue>> done);
    // Writes the given values as they are.
    void Write(std::vector<WriteValue> values, Callback<std::vector<StatusCode>> done);
    // Writes each value alone (no status, no time stamps) to the Value
    // attribute after converting it to the node's data type, which is read
    // first. A node whose type cannot be read or whose value does not
    // convert gets that status and is not written.
    void WriteValues(std::vector<std::pair<NodeId, Variant>> values,
                     Callback<std::vector<StatusCode>> done);

    void CreateSubscription(const SubscriptionSettings& settings, SubscriptionHandlers handlers,
                            Callback<SubscriptionInfo> done);
    void ModifySubscription(uint32_t subscriptionId, const SubscriptionSettings& settings,
                            Callback<SubscriptionInfo> done);
    void DeleteSubscriptions(std::vector<uint32_t> subscriptionIds,
                             Callback<std::vector<StatusCode>> done);
    void CreateMonitoredItems(uint32_t subscriptionId, TimestampsToReturn timestamps,
                              std::vector<MonitoredItemCreateRequest> items,
                              Callback<std::vector<MonitoredItemCreateResult>> done);
    // Changes the sampling interval, queue or filter of monitored items.
    void ModifyMonitoredItems(uint32_t subscriptionId, TimestampsToReturn timestamps,
                              std::vector<MonitoredItemModifyRequest> items,
                              Callback<std::vector<MonitoredItemModifyResult>> done);
    void SetMonitoringMode(uint32_t subscriptionId, MonitoringMode mode,
                           std::vector<uint32_t> monitoredItemIds,
                           Callback<std::vector<StatusCode>> done);
    void DeleteMonitoredItems(uint32_t subscriptionId, std::vector<uint32_t> monitoredItemIds,
                              Callback<std::vector<StatusCode>> done);

    // For tests and diagnostics: security tokens the current channel has
    // received (1 before any renewal), Publish requests at the server,
    // notification messages fetched again with Republish, and times the
    // session was resumed on a new connection.
    struct Statistics {
        uint32_t securityTokens = 0;
        uint32_t outstandingPublishes = 0;
        uint64_t republished = 0;
        uint32_t resumes = 0;
    };
    void GetStatistics(std::function<void(Statistics)> done);

  private:
    template <class Work>
    void Run(Work work);

    std::unique_ptr<IoThread> io_;
    std::shared_ptr<ClientCore> core_;
};

}  // namespace cv::ua
