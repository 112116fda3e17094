#include "ua/client/ClientCore.h"

#include <asio/post.hpp>

#include "ua/client/ConnectDeadline.h"
#include "ua/secure/NoneSecurityPolicy.h"
#include "ua/types/VariantConversion.h"

namespace cv::ua {

ClientCore::ClientCore(asio::io_context& io, ClientOptions options, Deliver deliver)
    : io_(io), options_(std::move(options)), deliver_(std::move(deliver)) {
    session_ = std::make_shared<Session>(io_, options_, nullptr);
    engine_ = std::make_shared<SubscriptionEngine>(io_, session_, options_, deliver_);
}

void ClientCore::Connect(const std::string& sEndpointUrl, ConnectOptions connect,
                         Callback<SessionInfo> done) {
    if (session_->IsActive() || connecting_) {
        Reply(done, Result<SessionInfo>(
                        Error{status::BadInvalidState,
                              "The client is connected or connecting already; close it first."}));
        return;
    }
    connecting_ = true;
    session_->Abort();
    engine_->Stop();
    session_ = std::make_shared<Session>(
        io_, options_, [weak = weak_from_this()](ConnectionEvent event, const Error& reason) {
            if (auto self = weak.lock()) {
                self->OnEvent(event, reason);
            }
        });
    engine_ = std::make_shared<SubscriptionEngine>(io_, session_, options_, deliver_);
    session_->Connect(sEndpointUrl, std::move(connect),
                      [weak = weak_from_this(), done](Result<SessionInfo> info) {
                          if (auto self = weak.lock()) {
                              self->connecting_ = false;
                              self->Reply(done, std::move(info));
                          }
                      });
}

void ClientCore::OnEvent(ConnectionEvent event, const Error& reason) {
    if (event == ConnectionEvent::ConnectionLost) {
        engine_->Stop();
    } else if (event == ConnectionEvent::Resumed) {
        engine_->Resume();
    }
    if (events_) {
        deliver_([handler = events_, event, reason] { handler(event, reason); });
    }
}

void ClientCore::Close(std::function<void()> done) {
    connecting_ = false;
    engine_->Stop();
    session_->Close([deliver = deliver_, done = std::move(done)] { deliver(done); });
}

void ClientCore::Abort() {
    engine_->Stop();
    session_->Abort();
    for (const auto& channel : discovery_) {
        channel->Abort();
    }
    discovery_.clear();
    events_ = nullptr;
}

template <class Request, class Response, class T>
void ClientCore::Operate(Request request, size_t operations, std::vector<T> Response::*results,
                         Callback<std::vector<T>> done) {
    const std::string_view service = ServiceName(Request::kEncodingId);
    session_->Call<Request, Response>(
        std::move(request), [deliver = deliver_, operations, results, service,
                             done = std::move(done)](Result<Response> response) {
            Result<std::vector<T>> answer =
                !response ? Result<std::vector<T>>(response.Failure())
                : (response.Value().*results).size() != operations
                    ? Result<std::vector<T>>(Error{
                          status::BadUnknownResponse,
                          "The server answered the " + std::string(service) + " request with " +
                              std::to_string((response.Value().*results).size()) + " results for " +
                              std::to_string(operations) + " operations."})
                    : Result<std::vector<T>>(std::move(response.Value().*results));
            deliver([done, answer = std::move(answer)]() mutable { done(std::move(answer)); });
        });
}

template <class Request, class Response, class T>
void ClientCore::Discover(const std::string& sUrl, Request request,
                          std::vector<T> Response::*results, Callback<std::vector<T>> done) {
    auto channel = std::make_shared<SecureChannel>(io_, options_.channel,
                                                   std::make_unique<NoneSecurityPolicy>());
    discovery_.insert(channel);
    const auto finish = [weak = weak_from_this(), channel, done](Result<std::vector<T>> answer) {
        channel->Close();
        if (auto self = weak.lock()) {
            self->discovery_.erase(channel);
            self->Reply(done, std::move(answer));
        }
    };
    // One wait for the channel and the request together.
    const ConnectDeadline deadline(options_.channel.connectTimeoutMs);
    channel->Open(sUrl, [channel, request = std::move(request), results, finish,
                         deadline](Result<Done> opened) mutable {
        if (!opened) {
            finish(opened.Failure());
            return;
        }
        request.header.requestHandle = 1;
        CallService<Request, Response>(*channel, std::move(request), deadline.LeftMs(),
                                       [results, finish](Result<Response> response) {
                                           if (!response) {
                                               finish(response.Failure());
                                               return;
                                           }
                                           finish(std::move(response.Value().*results));
                                       });
    });
}

void ClientCore::FindServers(const std::string& sUrl,
                             Callback<std::vector<ApplicationDescription>> done) {
    FindServersRequest request;
    request.endpointUrl = sUrl;
    Discover(sUrl, std::move(request), &FindServersResponse::servers, std::move(done));
}

void ClientCore::GetEndpoints(const std::string& sUrl,
                              Callback<std::vector<EndpointDescription>> done) {
    GetEndpointsRequest request;
    request.endpointUrl = sUrl;
    Discover(sUrl, std::move(request), &GetEndpointsResponse::endpoints, std::move(done));
}

void ClientCore::Browse(std::vector<BrowseDescription> nodes, uint32_t maxReferencesPerNode,
                        Callback<std::vector<BrowseResult>> done) {
    BrowseRequest request;
    request.requestedMaxReferencesPerNode = maxReferencesPerNode;
    const size_t count = nodes.size();
    request.nodesToBrowse = std::move(nodes);
    Operate(std::move(request), count, &BrowseResponse::results, std::move(done));
}

void ClientCore::BrowseNext(std::vector<ByteString> continuationPoints, bool release,
                            Callback<std::vector<BrowseResult>> done) {
    BrowseNextRequest request;
    request.releaseContinuationPoints = release;
    const size_t count = continuationPoints.size();
    request.continuationPoints = std::move(continuationPoints);
    Operate(std::move(request), count, &BrowseNextResponse::results, std::move(done));
}

void ClientCore::TranslateBrowsePaths(std::vector<BrowsePath> paths,
                                      Callback<std::vector<BrowsePathResult>> done) {
    TranslateBrowsePathsRequest request;
    const size_t count = paths.size();
    request.browsePaths = std::move(paths);
    Operate(std::move(request), count, &TranslateBrowsePathsResponse::results, std::move(done));
}

void ClientCore::Read(std::vector<ReadValueId> nodes, double maxAgeMs,
                      TimestampsToReturn timestamps, Callback<std::vector<DataValue>> done) {
    ReadRequest request;
    request.maxAge = maxAgeMs;
    request.timestampsToReturn = timestamps;
    const size_t count = nodes.size();
    request.nodesToRead = std::move(nodes);
    Operate(std::move(request), count, &ReadResponse::results, std::move(done));
}

void ClientCore::Write(std::vector<WriteValue> values, Callback<std::vector<StatusCode>> done) {
    WriteRequest request;
    const size_t count = values.size();
    request.nodesToWrite = std::move(values);
    Operate(std::move(request), count, &WriteResponse::results, std::move(done));
}

void ClientCore::WriteValues(std::vector<std::pair<NodeId, Variant>> values,
                             Callback<std::vector<StatusCode>> done) {
    ReadRequest request;
    request.timestampsToReturn = TimestampsToReturn::Neither;
    for (const auto& [node, value] : values) {
        request.nodesToRead.push_back({node, attribute::DataType, "", {}});
    }
    const size_t count = values.size();
    session_->Call<ReadRequest, ReadResponse>(
        std::move(request), [weak = weak_from_this(), count, values = std::move(values),
                             done = std::move(done)](Result<ReadResponse> types) mutable {
            auto self = weak.lock();
            if (!self) {
                return;
            }
            if (types && types.Value().results.size() != count) {
                types = Error{status::BadUnknownResponse,
                              "The server did not give the data type of every node."};
            }
            if (!types) {
                self->Reply(done, Result<std::vector<StatusCode>>(types.Failure()));
                return;
            }
            self->WriteConverted(std::move(values), std::move(types.Value().results),
                                 std::move(done));
        });
}

void ClientCore::WriteConverted(std::vector<std::pair<NodeId, Variant>> values,
                                std::vector<DataValue> dataTypes,
                                Callback<std::vector<StatusCode>> done) {
    std::vector<StatusCode> statuses(values.size());
    std::vector<size_t> written;
    WriteRequest request;
    for (size_t i = 0; i < values.size(); ++i) {
        const NodeId* dataType = dataTypes[i].value.Get<NodeId>();
        if (dataTypes[i].status.IsBad() || !dataType) {
            statuses[i] =
                dataTypes[i].status.IsBad() ? dataTypes[i].status : status::BadTypeMismatch;
            continue;
        }
        const auto target = BuiltinTypeOf(*dataType);
        auto value = target ? ConvertVariant(values[i].second, *target)
                            : Result<Variant>(std::move(values[i].second));
        if (!value) {
            statuses[i] = value.Failure().status;
            continue;
        }
        DataValue data;
        data.value = std::move(value.Value());
        request.nodesToWrite.push_back({std::move(values[i].first), attribute::Value, "", data});
        written.push_back(i);
    }
    if (written.empty()) {
        Reply(done, Result<std::vector<StatusCode>>(std::move(statuses)));
        return;
    }
    Write(std::move(request.nodesToWrite),
          [statuses = std::move(statuses), written = std::move(written),
           done = std::move(done)](Result<std::vector<StatusCode>> results) mutable {
              if (!results) {
                  done(results.Failure());
                  return;
              }
              for (size_t k = 0; k < written.size(); ++k) {
                  statuses[written[k]] = results.Value()[k];
              }
              done(std::move(statuses));
          });
}

void ClientCore::CreateSubscription(const SubscriptionSettings& settings,
                                    SubscriptionHandlers handlers,
                                    Callback<SubscriptionInfo> done) {
    engine_->Create(settings, std::move(handlers),
                    [weak = weak_from_this(), done](Result<SubscriptionInfo> info) {
                        if (auto self = weak.lock()) {
                            self->Reply(done, std::move(info));
                        }
                    });
}

void ClientCore::ModifySubscription(uint32_t subscriptionId, const SubscriptionSettings& settings,
                                    Callback<SubscriptionInfo> done) {
    engine_->Modify(subscriptionId, settings,
                    [weak = weak_from_this(), done](Result<SubscriptionInfo> info) {
                        if (auto self = weak.lock()) {
                            self->Reply(done, std::move(info));
                        }
                    });
}

void ClientCore::DeleteSubscriptions(std::vector<uint32_t> subscriptionIds,
                                     Callback<std::vector<StatusCode>> done) {
    engine_->Delete(std::move(subscriptionIds),
                    [weak = weak_from_this(), done](Result<std::vector<StatusCode>> results) {
                        if (auto self = weak.lock()) {
                            self->Reply(done, std::move(results));
                        }
                    });
}

void ClientCore::CreateMonitoredItems(uint32_t subscriptionId, TimestampsToReturn timestamps,
                                      std::vector<MonitoredItemCreateRequest> items,
                                      Callback<std::vector<MonitoredItemCreateResult>> done) {
    CreateMonitoredItemsRequest request;
    request.subscriptionId = subscriptionId;
    request.timestampsToReturn = timestamps;
    const size_t count = items.size();
    request.itemsToCreate = std::move(items);
    Operate(std::move(request), count, &CreateMonitoredItemsResponse::results, std::move(done));
}

void ClientCore::ModifyMonitoredItems(uint32_t subscriptionId, TimestampsToReturn timestamps,
                                      std::vector<MonitoredItemModifyRequest> items,
                                      Callback<std::vector<MonitoredItemModifyResult>> done) {
    ModifyMonitoredItemsRequest request;
    request.subscriptionId = subscriptionId;
    request.timestampsToReturn = timestamps;
    const size_t count = items.size();
    request.itemsToModify = std::move(items);
    Operate(std::move(request), count, &ModifyMonitoredItemsResponse::results, std::move(done));
}

void ClientCore::SetMonitoringMode(uint32_t subscriptionId, MonitoringMode mode,
                                   std::vector<uint32_t> monitoredItemIds,
                                   Callback<std::vector<StatusCode>> done) {
    SetMonitoringModeRequest request;
    request.subscriptionId = subscriptionId;
    request.monitoringMode = mode;
    const size_t count = monitoredItemIds.size();
    request.monitoredItemIds = std::move(monitoredItemIds);
    Operate(std::move(request), count, &SetMonitoringModeResponse::results, std::move(done));
}

void ClientCore::DeleteMonitoredItems(uint32_t subscriptionId,
                                      std::vector<uint32_t> monitoredItemIds,
                                      Callback<std::vector<StatusCode>> done) {
    DeleteMonitoredItemsRequest request;
    request.subscriptionId = subscriptionId;
    const size_t count = monitoredItemIds.size();
    request.monitoredItemIds = std::move(monitoredItemIds);
    Operate(std::move(request), count, &DeleteMonitoredItemsResponse::results, std::move(done));
}

Client::Statistics ClientCore::Statistics() const {
    return {session_->TokenCount(), engine_->OutstandingPublishes(), engine_->Republished(),
            session_->Resumes()};
}

}  // namespace cv::ua
