#pragma once

#include <asio/io_context.hpp>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "ua/client/Client.h"
#include "ua/client/Session.h"
#include "ua/client/SubscriptionEngine.h"

namespace cv::ua {

// The client's state on its I/O thread: the session, its subscriptions and
// the channels of discovery calls. Each member is one operation of Client,
// run on the I/O thread; answers go back through deliver.
class ClientCore : public std::enable_shared_from_this<ClientCore> {
  public:
    using Deliver = std::function<void(std::function<void()>)>;
    template <class T>
    using Callback = Client::Callback<T>;

    ClientCore(asio::io_context& io, ClientOptions options, Deliver deliver);

    void SetEventHandler(Client::EventHandler handler) { events_ = std::move(handler); }
    void Connect(const std::string& sEndpointUrl, ConnectOptions connect,
                 Callback<SessionInfo> done);
    void Close(std::function<void()> done);
    void Abort();

    void FindServers(const std::string& sUrl, Callback<std::vector<ApplicationDescription>> done);
    void GetEndpoints(const std::string& sUrl, Callback<std::vector<EndpointDescription>> done);

    void Browse(std::vector<BrowseDescription> nodes, uint32_t maxReferencesPerNode,
                Callback<std::vector<BrowseResult>> done);
    void BrowseNext(std::vector<ByteString> continuationPoints, bool release,
                    Callback<std::vector<BrowseResult>> done);
    void TranslateBrowsePaths(std::vector<BrowsePath> paths,
                              Callback<std::vector<BrowsePathResult>> done);
    void Read(std::vector<ReadValueId> nodes, double maxAgeMs, TimestampsToReturn timestamps,
              Callback<std::vector<DataValue>> done);
    void Write(std::vector<WriteValue> values, Callback<std::vector<StatusCode>> done);
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
    void ModifyMonitoredItems(uint32_t subscriptionId, TimestampsToReturn timestamps,
                              std::vector<MonitoredItemModifyRequest> items,
                              Callback<std::vector<MonitoredItemModifyResult>> done);
    void SetMonitoringMode(uint32_t subscriptionId, MonitoringMode mode,
                           std::vector<uint32_t> monitoredItemIds,
                           Callback<std::vector<StatusCode>> done);
    void DeleteMonitoredItems(uint32_t subscriptionId, std::vector<uint32_t> monitoredItemIds,
                              Callback<std::vector<StatusCode>> done);
    Client::Statistics Statistics() const;

    template <class T>
    void Reply(const Callback<T>& done, Result<T> result) {
        deliver_([done, result = std::move(result)]() mutable { done(std::move(result)); });
    }

  private:
    // Sends a request whose response lists one result per operation.
    template <class Request, class Response, class T>
    void Operate(Request request, size_t operations, std::vector<T> Response::*results,
                 Callback<std::vector<T>> done);
    template <class Request, class Response, class T>
    void Discover(const std::string& sUrl, Request request, std::vector<T> Response::*results,
                  Callback<std::vector<T>> done);
    void OnEvent(ConnectionEvent event, const Error& reason);
    void WriteConverted(std::vector<std::pair<NodeId, Variant>> values,
                        std::vector<DataValue> dataTypes, Callback<std::vector<StatusCode>> done);

    asio::io_context& io_;
    ClientOptions options_;
    Deliver deliver_;
    Client::EventHandler events_;
    std::shared_ptr<Session> session_;
    std::shared_ptr<SubscriptionEngine> engine_;
    std::set<std::shared_ptr<SecureChannel>> discovery_;
    bool connecting_ = false;
};

}  // namespace cv::ua
