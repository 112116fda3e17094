#include "ua/client/Session.h"

#include <algorithm>
#include <random>

#include "ua/secure/NoneSecurityPolicy.h"
#include "ua/services/ViewServices.h"

namespace cv::ua {
namespace {

constexpr size_t kNonceSize = 32;
constexpr int32_t kServerStateShutdown = 4;
constexpr uint32_t kMinKeepAliveMs = 100;

ByteString RandomNonce() {
    std::random_device device;
    ByteString nonce;
    nonce.bytes.resize(kNonceSize);
    for (char& byte : nonce.bytes) {
        byte = static_cast<char>(device() & 0xFF);
    }
    return nonce;
}

bool IsBinaryNoneEndpoint(const EndpointDescription& endpoint) {
    return endpoint.securityMode == MessageSecurityMode::None &&
           endpoint.securityPolicyUri == NoneSecurityPolicy::kUri &&
           (endpoint.transportProfileUri.empty() ||
            endpoint.transportProfileUri.ends_with("uatcp-uasc-uabinary"));
}

const UserTokenPolicy* AnonymousPolicy(const EndpointDescription& endpoint) {
    const auto found = std::find_if(
        endpoint.userIdentityTokens.begin(), endpoint.userIdentityTokens.end(),
        [](const UserTokenPolicy& policy) { return policy.tokenType == UserTokenType::Anonymous; });
    return found == endpoint.userIdentityTokens.end() ? nullptr : &*found;
}

}  // namespace

Session::Session(asio::io_context& io, const ClientOptions& options, EventHandler events)
    : io_(io),
      options_(options),
      events_(std::move(events)),
      keepAliveTimer_(io),
      resumeTimer_(io) {}

bool Session::IsSessionGone(StatusCode status) {
    return status == status::BadSessionIdInvalid || status == status::BadSessionClosed ||
           status == status::BadSessionNotActivated || status == status::BadShutdown ||
           status == status::BadServerHalted;
}

void Session::Connect(const std::string& sEndpointUrl,
                      std::function<void(Result<SessionInfo>)> done) {
    info_ = {};
    info_.endpointUrl = sEndpointUrl;
    OpenChannel(sEndpointUrl,
                [weak = weak_from_this(), done = std::move(done)](Result<Done> opened) {
                    auto self = weak.lock();
                    if (!self) {
                        return;
                    }
                    if (!opened) {
                        done(opened.Failure());
                        return;
                    }
                    self->CreateSession(std::move(done));
                });
}

void Session::OpenChannel(const std::string& sEndpointUrl,
                          std::function<void(Result<Done>)> opened) {
    channel_ = std::make_shared<SecureChannel>(io_, options_.channel,
                                               std::make_unique<NoneSecurityPolicy>());
    channel_->SetLostHandler([weak = weak_from_this()](const Error& reason) {
        if (auto self = weak.lock()) {
            self->Lose(reason);
        }
    });
    channel_->Open(sEndpointUrl, std::move(opened));
}

void Session::CreateSession(std::function<void(Result<SessionInfo>)> done) {
    CreateSessionRequest request;
    request.header.requestHandle = ++lastRequestHandle_;
    request.clientDescription.applicationUri = options_.applicationUri;
    request.clientDescription.productUri = options_.applicationUri;
    request.clientDescription.applicationName = {"en", options_.applicationName};
    request.clientDescription.applicationType = ApplicationType::Client;
    request.endpointUrl = info_.endpointUrl;
    request.sessionName = options_.sessionName;
    request.clientNonce = RandomNonce();
    request.requestedSessionTimeout = options_.requestedSessionTimeoutMs;
    request.maxResponseMessageSize = options_.channel.limits.maxMessageSize;
    CallService<CreateSessionRequest, CreateSessionResponse>(
        *channel_, std::move(request), options_.requestTimeoutMs,
        [weak = weak_from_this(), done = std::move(done)](Result<CreateSessionResponse> created) {
            auto self = weak.lock();
            if (!self) {
                return;
            }
            if (!created) {
                self->channel_->Close();
                done(created.Failure());
                return;
            }
            const auto& endpoints = created.Value().serverEndpoints;
            const auto endpoint =
                std::find_if(endpoints.begin(), endpoints.end(), [](const EndpointDescription& e) {
                    return IsBinaryNoneEndpoint(e) && AnonymousPolicy(e);
                });
            if (endpoint == endpoints.end()) {
                self->channel_->Close();
                done(Error{status::BadIdentityTokenInvalid,
                           "The server offers no endpoint without security that takes an "
                           "anonymous user."});
                return;
            }
            self->authenticationToken_ = created.Value().authenticationToken;
            self->info_.sessionId = created.Value().sessionId;
            self->info_.revisedSessionTimeoutMs = created.Value().revisedSessionTimeout;
            self->info_.endpoint = *endpoint;
            self->ActivateSession(std::move(done));
        });
}

void Session::ActivateSession(std::function<void(Result<SessionInfo>)> done) {
    ActivateSessionRequest request;
    request.header.authenticationToken = authenticationToken_;
    request.header.requestHandle = ++lastRequestHandle_;
    request.localeIds = {"en"};
    request.userIdentityToken =
        MakeExtension(AnonymousIdentityToken{AnonymousPolicy(info_.endpoint)->policyId});
    CallService<ActivateSessionRequest, ActivateSessionResponse>(
        *channel_, std::move(request), options_.requestTimeoutMs,
        [weak = weak_from_this(), done = std::move(done)](Result<ActivateSessionResponse> active) {
            auto self = weak.lock();
            if (!self) {
                return;
            }
            if (!active) {
                self->channel_->Close();
                done(active.Failure());
                return;
            }
            self->active_ = true;
            self->StartKeepAlive();
            done(self->info_);
        });
}

void Session::StartKeepAlive() {
    const auto third = static_cast<uint32_t>(info_.revisedSessionTimeoutMs / 3);
    const uint32_t interval =
        std::max(kMinKeepAliveMs, third ? std::min(third, options_.keepAliveIntervalMs)
                                        : options_.keepAliveIntervalMs);
    keepAliveTimer_.expires_after(std::chrono::milliseconds(interval));
    keepAliveTimer_.async_wait([weak = weak_from_this()](const asio::error_code& ec) {
        auto self = weak.lock();
        if (ec || !self || !self->active_) {
            return;
        }
        ReadRequest read;
        read.nodesToRead = {{NodeId(0, ids::ServerStatusState), attribute::Value, "", {}},
                            {NodeId(0, ids::ShutdownReason), attribute::Value, "", {}}};
        self->Call<ReadRequest, ReadResponse>(std::move(read),
                                              [weak](Result<ReadResponse> response) {
                                                  if (auto session = weak.lock()) {
                                                      session->OnKeepAlive(std::move(response));
                                                  }
                                              });
    });
}

void Session::OnKeepAlive(Result<ReadResponse> response) {
    if (!active_) {
        return;
    }
    if (response && !response.Value().results.empty()) {
        const auto& results = response.Value().results;
        const int32_t* state = results[0].value.Get<int32_t>();
        if (state && *state == kServerStateShutdown && !shutdownAnnounced_) {
            shutdownAnnounced_ = true;
            const LocalizedText* reason =
                results.size() > 1 ? results[1].value.Get<LocalizedText>() : nullptr;
            if (events_) {
                events_(ConnectionEvent::ServerShutdown,
                        Error{status::BadShutdown, reason && !reason->text.empty()
                                                       ? reason->text
                                                       : "The server is shutting down."});
            }
        }
    }
    StartKeepAlive();
}

void Session::Lose(const Error& reason) {
    if (!active_) {
        return;
    }
    active_ = false;
    keepAliveTimer_.cancel();
    channel_->Close();
    if (options_.resumeSessions && !shutdownAnnounced_ && !EndsTheSession(reason.status)) {
        StartResume(reason);
        return;
    }
    if (events_) {
        events_(ConnectionEvent::ConnectionLost, reason);
    }
}

void Session::Close(std::function<void()> done) {
    keepAliveTimer_.cancel();
    if (resuming_) {
        resuming_ = false;
        resumeTimer_.cancel();
        FailParked(Error{status::BadSessionClosed, "The session was closed."});
    }
    if (!active_) {
        if (channel_) {
            channel_->Close();
        }
        asio::post(io_, std::move(done));
        return;
    }
    active_ = false;
    CloseSessionRequest request;
    request.header.authenticationToken = authenticationToken_;
    request.header.requestHandle = ++lastRequestHandle_;
    CallService<CloseSessionRequest, CloseSessionResponse>(
        *channel_, std::move(request), options_.requestTimeoutMs,
        [channel = channel_, done = std::move(done)](Result<CloseSessionResponse>) {
            channel->Close();
            done();
        });
}

void Session::Abort() {
    active_ = false;
    resuming_ = false;
    events_ = nullptr;
    keepAliveTimer_.cancel();
    resumeTimer_.cancel();
    parked_.clear();
    if (channel_) {
        channel_->Abort();
    }
}

}  // namespace cv::ua
