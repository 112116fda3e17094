#include "ua/client/Client.h"

#include <asio/post.hpp>

#include "ua/client/ClientCore.h"
#include "ua/client/IoThread.h"

namespace cv::ua {

Client::Client(Dispatcher dispatcher, ClientOptions options)
    : io_(std::make_unique<IoThread>(std::move(dispatcher))),
      core_(std::make_shared<ClientCore>(io_->Context(), std::move(options), io_->Deliverer())) {}

Client::~Client() {
    io_->Stop([core = core_] { core->Abort(); });
}

template <class Work>
void Client::Run(Work work) {
    asio::post(io_->Context(), [core = core_, work = std::move(work)]() mutable { work(*core); });
}

void Client::SetEventHandler(EventHandler handler) {
    Run([handler = std::move(handler)](ClientCore& core) mutable {
        core.SetEventHandler(std::move(handler));
    });
}

void Client::Connect(std::string endpointUrl, ConnectOptions connect, Callback<SessionInfo> done) {
    Run([url = std::move(endpointUrl), connect = std::move(connect), done = std::move(done)](
            ClientCore& core) mutable { core.Connect(url, std::move(connect), std::move(done)); });
}

void Client::Close(std::function<void()> done) {
    Run([done = std::move(done)](ClientCore& core) mutable { core.Close(std::move(done)); });
}

void Client::FindServers(std::string discoveryUrl,
                         Callback<std::vector<ApplicationDescription>> done) {
    Run([url = std::move(discoveryUrl), done = std::move(done)](ClientCore& core) mutable {
        core.FindServers(url, std::move(done));
    });
}

void Client::GetEndpoints(std::string endpointUrl,
                          Callback<std::vector<EndpointDescription>> done) {
    Run([url = std::move(endpointUrl), done = std::move(done)](ClientCore& core) mutable {
        core.GetEndpoints(url, std::move(done));
    });
}

void Client::Browse(std::vector<BrowseDescription> nodes, uint32_t maxReferencesPerNode,
                    Callback<std::vector<BrowseResult>> done) {
    Run([nodes = std::move(nodes), maxReferencesPerNode,
         done = std::move(done)](ClientCore& core) mutable {
        core.Browse(std::move(nodes), maxReferencesPerNode, std::move(done));
    });
}

void Client::BrowseNext(std::vector<ByteString> continuationPoints, bool release,
                        Callback<std::vector<BrowseResult>> done) {
    Run([points = std::move(continuationPoints), release,
         done = std::move(done)](ClientCore& core) mutable {
        core.BrowseNext(std::move(points), release, std::move(done));
    });
}

void Client::TranslateBrowsePaths(std::vector<BrowsePath> paths,
                                  Callback<std::vector<BrowsePathResult>> done) {
    Run([paths = std::move(paths), done = std::move(done)](ClientCore& core) mutable {
        core.TranslateBrowsePaths(std::move(paths), std::move(done));
    });
}

void Client::Read(std::vector<ReadValueId> nodes, double maxAgeMs, TimestampsToReturn timestamps,
                  Callback<std::vector<DataValue>> done) {
    Run([nodes = std::move(nodes), maxAgeMs, timestamps,
         done = std::move(done)](ClientCore& core) mutable {
        core.Read(std::move(nodes), maxAgeMs, timestamps, std::move(done));
    });
}

void Client::Write(std::vector<WriteValue> values, Callback<std::vector<StatusCode>> done) {
    Run([values = std::move(values), done = std::move(done)](ClientCore& core) mutable {
        core.Write(std::move(values), std::move(done));
    });
}

void Client::WriteValues(std::vector<std::pair<NodeId, Variant>> values,
                         Callback<std::vector<StatusCode>> done) {
    Run([values = std::move(values), done = std::move(done)](ClientCore& core) mutable {
        core.WriteValues(std::move(values), std::move(done));
    });
}

void Client::CreateSubscription(const SubscriptionSettings& settings, SubscriptionHandlers handlers,
                                Callback<SubscriptionInfo> done) {
    Run([settings, handlers = std::move(handlers),
         done = std::move(done)](ClientCore& core) mutable {
        core.CreateSubscription(settings, std::move(handlers), std::move(done));
    });
}

void Client::ModifySubscription(uint32_t subscriptionId, const SubscriptionSettings& settings,
                                Callback<SubscriptionInfo> done) {
    Run([subscriptionId, settings, done = std::move(done)](ClientCore& core) mutable {
        core.ModifySubscription(subscriptionId, settings, std::move(done));
    });
}

void Client::DeleteSubscriptions(std::vector<uint32_t> subscriptionIds,
                                 Callback<std::vector<StatusCode>> done) {
    Run([ids = std::move(subscriptionIds), done = std::move(done)](ClientCore& core) mutable {
        core.DeleteSubscriptions(std::move(ids), std::move(done));
    });
}

void Client::CreateMonitoredItems(uint32_t subscriptionId, TimestampsToReturn timestamps,
                                  std::vector<MonitoredItemCreateRequest> items,
                                  Callback<std::vector<MonitoredItemCreateResult>> done) {
    Run([subscriptionId, timestamps, items = std::move(items),
         done = std::move(done)](ClientCore& core) mutable {
        core.CreateMonitoredItems(subscriptionId, timestamps, std::move(items), std::move(done));
    });
}

void Client::ModifyMonitoredItems(uint32_t subscriptionId, TimestampsToReturn timestamps,
                                  std::vector<MonitoredItemModifyRequest> items,
                                  Callback<std::vector<MonitoredItemModifyResult>> done) {
    Run([subscriptionId, timestamps, items = std::move(items),
         done = std::move(done)](ClientCore& core) mutable {
        core.ModifyMonitoredItems(subscriptionId, timestamps, std::move(items), std::move(done));
    });
}

void Client::SetMonitoringMode(uint32_t subscriptionId, MonitoringMode mode,
                               std::vector<uint32_t> monitoredItemIds,
                               Callback<std::vector<StatusCode>> done) {
    Run([subscriptionId, mode, ids = std::move(monitoredItemIds),
         done = std::move(done)](ClientCore& core) mutable {
        core.SetMonitoringMode(subscriptionId, mode, std::move(ids), std::move(done));
    });
}

void Client::DeleteMonitoredItems(uint32_t subscriptionId, std::vector<uint32_t> monitoredItemIds,
                                  Callback<std::vector<StatusCode>> done) {
    Run([subscriptionId, ids = std::move(monitoredItemIds),
         done = std::move(done)](ClientCore& core) mutable {
        core.DeleteMonitoredItems(subscriptionId, std::move(ids), std::move(done));
    });
}

void Client::GetStatistics(std::function<void(Statistics)> done) {
    Run([deliver = io_->Deliverer(), done = std::move(done)](ClientCore& core) {
        deliver([done, statistics = core.Statistics()] { done(statistics); });
    });
}

}  // namespace cv::ua
