#include "ua/client/Session.h"

#include <algorithm>

#include "ua/client/EndpointChoice.h"
#include "ua/client/IdentityToken.h"
#include "ua/crypto/Primitives.h"
#include "ua/secure/MakeSecurityPolicy.h"
#include "ua/secure/NoneSecurityPolicy.h"
#include "ua/secure/SessionSignature.h"
#include "ua/services/ViewServices.h"
#include "ua/types/PlainText.h"

namespace cv::ua {
namespace {

constexpr size_t kNonceSize = 32;
constexpr int32_t kServerStateShutdown = 4;
constexpr uint32_t kMinKeepAliveMs = 100;
constexpr double kMinSessionTimeoutMs = 1'000;
constexpr double kMaxSessionTimeoutMs = 3'600'000;

bool IsBinary(const EndpointDescription& endpoint) {
    return endpoint.transportProfileUri.empty() ||
           endpoint.transportProfileUri.ends_with("uatcp-uasc-uabinary");
}

// The session time-out paces the keep-alive reads (a third of it) and bounds
// how long a broken connection is resumed. Below a second the reads would
// flood the server; past an hour the program would go on resuming a session
// the server has long forgotten (a hostile 1e12 would mean years). A value
// that is no positive number (NaN, 0, negative) leaves what was asked for.
uint32_t UsableSessionTimeout(double revisedMs, uint32_t requestedMs) {
    const double ms = revisedMs > 0 ? revisedMs : requestedMs;
    return static_cast<uint32_t>(std::clamp(ms, kMinSessionTimeoutMs, kMaxSessionTimeoutMs));
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

void Session::Connect(const std::string& sEndpointUrl, ConnectOptions connect,
                      std::function<void(Result<SessionInfo>)> done) {
    connect_ = std::move(connect);
    info_ = {};
    info_.endpointUrl = sEndpointUrl;
    if (auto checked = CheckEndpointCertificate(); !checked) {
        asio::post(io_, [done = std::move(done), error = checked.Failure()] { done(error); });
        return;
    }
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

// Each channel, the first and every resumed one, gets its own policy made
// from the same connect options.
Result<std::unique_ptr<SecurityPolicy>> Session::MakePolicy() const {
    auto policy =
        connect_.endpoint
            ? MakeSecurityPolicy(*connect_.endpoint, connect_.credentials.get())
            : Result<std::unique_ptr<SecurityPolicy>>(std::make_unique<NoneSecurityPolicy>());
    if (policy && Secured() &&
        connect_.credentials->certificate.ApplicationUri() != options_.applicationUri) {
        policy = Error{status::BadCertificateUriInvalid,
                       "The program's certificate names the application \"" +
                           connect_.credentials->certificate.ApplicationUri() +
                           "\", but the program presents itself as \"" + options_.applicationUri +
                           "\"."};
    }
    return policy;
}

void Session::OpenChannel(const std::string& sEndpointUrl,
                          std::function<void(Result<Done>)> opened) {
    connectDeadline_ = ConnectDeadline(options_.channel.connectTimeoutMs);
    auto policy = MakePolicy();
    if (!policy) {
        asio::post(io_, [opened = std::move(opened), error = policy.Failure()] { opened(error); });
        return;
    }
    channel_ = std::make_shared<SecureChannel>(io_, options_.channel, std::move(policy.Value()));
    channel_->SetLostHandler([weak = weak_from_this()](const Error& reason) {
        if (auto self = weak.lock()) {
            self->Lose(reason);
        }
    });
    channel_->Open(sEndpointUrl, std::move(opened));
}

void Session::CreateSession(std::function<void(Result<SessionInfo>)> done) {
    auto nonce = crypto::RandomBytes(kNonceSize);
    if (!nonce) {
        channel_->Close();
        done(nonce.Failure());
        return;
    }
    clientNonce_ = ByteString{std::move(nonce.Value())};
    CreateSessionRequest request;
    request.header.requestHandle = ++lastRequestHandle_;
    request.clientDescription.applicationUri = options_.applicationUri;
    request.clientDescription.productUri = options_.applicationUri;
    request.clientDescription.applicationName = {"en", options_.applicationName};
    request.clientDescription.applicationType = ApplicationType::Client;
    request.endpointUrl = info_.endpointUrl;
    request.sessionName = options_.sessionName;
    request.clientNonce = clientNonce_;
    if (Secured()) {
        request.clientCertificate = ByteString{connect_.credentials->certificate.Der()};
    }
    request.requestedSessionTimeout = options_.requestedSessionTimeoutMs;
    request.maxResponseMessageSize = options_.channel.limits.maxMessageSize;
    CallService<CreateSessionRequest, CreateSessionResponse>(
        *channel_, std::move(request), connectDeadline_.LeftMs(),
        [weak = weak_from_this(), done = std::move(done)](Result<CreateSessionResponse> created) {
            auto self = weak.lock();
            if (!self) {
                return;
            }
            auto checked =
                created ? self->OnCreated(created.Value()) : Result<Done>(created.Failure());
            if (!checked) {
                self->channel_->Close();
                done(checked.Failure());
                return;
            }
            self->ActivateSession(std::move(done));
        });
}

// The caller checked the endpoint's certificate; it must also be the
// certificate of the application the endpoint describes.
Result<Done> Session::CheckEndpointCertificate() const {
    if (!GuardsIdentity()) {
        return Done{};
    }
    if (!connect_.endpoint) {
        return Error{status::BadIdentityTokenRejected,
                     "A user name is only sent to a server whose certificate was checked, and "
                     "none was given."};
    }
    auto certificate = crypto::Certificate::FromDer(connect_.endpoint->serverCertificate.bytes);
    if (!certificate) {
        return Error{status::BadCertificateInvalid,
                     "The server's certificate cannot be read: " + certificate.Failure().text};
    }
    const std::string& described = connect_.endpoint->server.applicationUri;
    const std::string named = certificate.Value().ApplicationUri();
    if (!described.empty() && named != described) {
        return Error{status::BadCertificateUriInvalid,
                     "The server's certificate names the application \"" + named +
                         "\", but its endpoint describes \"" + described + "\"."};
    }
    return Done{};
}

// What CreateSession answered must come from the server that was checked:
// its certificate, and a nonce long enough to sign and encrypt with.
Result<Done> Session::CheckCreatedServer(const CreateSessionResponse& created) const {
    if (!GuardsIdentity()) {
        return Done{};
    }
    auto shown = crypto::Certificate::FromDer(connect_.endpoint->serverCertificate.bytes);
    if (!shown ||
        !std::string_view(serverCertificate_.bytes).starts_with(shown.Value().LeafDer())) {
        return Error{status::BadCertificateInvalid,
                     "The server answered with another certificate than its endpoint shows."};
    }
    if (created.serverNonce.bytes.size() < kNonceSize) {
        return Error{status::BadNonceInvalid,
                     "The server's nonce is " + std::to_string(created.serverNonce.bytes.size()) +
                         " bytes long; at least " + std::to_string(kNonceSize) +
                         " are needed to keep the session safe."};
    }
    if (Secured()) {
        return CheckSessionSignature(shown.Value(), connect_.credentials->certificate.Der(),
                                     clientNonce_.bytes, created.serverSignature);
    }
    return Done{};
}

// The server's own description of the endpoint in use: the one discovery
// offered must be among those CreateSession lists (a server that lists
// none is taken at its discovery word).
Result<EndpointDescription> Session::ServerEndpoint(const CreateSessionResponse& created) const {
    const auto& endpoints = created.serverEndpoints;
    if (!connect_.endpoint) {
        auto none = ChooseEndpoint(
            endpoints, {MessageSecurityMode::None, std::string(NoneSecurityPolicy::kUri),
                        connect_.identity.type});
        if (!none) {
            return Error{status::BadIdentityTokenInvalid, none.Failure().text};
        }
        return none;
    }
    if (endpoints.empty()) {
        return *connect_.endpoint;
    }
    const auto found = std::find_if(endpoints.begin(), endpoints.end(), [this](const auto& e) {
        return IsBinary(e) && e.securityMode == connect_.endpoint->securityMode &&
               e.securityPolicyUri == connect_.endpoint->securityPolicyUri;
    });
    if (found == endpoints.end()) {
        return Error{status::BadSecurityChecksFailed,
                     "The server's session offers other endpoints than its discovery did (" +
                         PolicyName(connect_.endpoint->securityPolicyUri) + " " +
                         ModeName(connect_.endpoint->securityMode) + " is missing)."};
    }
    return *found;
}

Result<Done> Session::OnCreated(const CreateSessionResponse& created) {
    auto endpoint = ServerEndpoint(created);
    if (!endpoint) {
        return endpoint.Failure();
    }
    serverCertificate_ = created.serverCertificate.bytes.empty()
                             ? endpoint.Value().serverCertificate
                             : created.serverCertificate;
    if (auto checked = CheckCreatedServer(created); !checked) {
        return checked;
    }
    authenticationToken_ = created.authenticationToken;
    serverNonce_ = created.serverNonce;
    info_.sessionId = created.sessionId;
    info_.revisedSessionTimeoutMs =
        UsableSessionTimeout(created.revisedSessionTimeout, options_.requestedSessionTimeoutMs);
    info_.endpoint = std::move(endpoint.Value());
    return Done{};
}

Result<ActivateSessionRequest> Session::MakeActivateRequest() const {
    ActivateSessionRequest request;
    request.header.authenticationToken = authenticationToken_;
    request.localeIds = {"en"};
    if (Secured()) {
        auto signature =
            SignSession(connect_.credentials->key, serverCertificate_.bytes, serverNonce_.bytes);
        if (!signature) {
            return signature.Failure();
        }
        request.clientSignature = std::move(signature.Value());
    }
    auto token =
        MakeIdentityToken(connect_.identity, info_.endpoint, serverCertificate_, serverNonce_);
    if (!token) {
        return token.Failure();
    }
    request.userIdentityToken = std::move(token.Value());
    return request;
}

void Session::ActivateSession(std::function<void(Result<SessionInfo>)> done) {
    auto request = MakeActivateRequest();
    if (!request) {
        channel_->Close();
        done(request.Failure());
        return;
    }
    request.Value().header.requestHandle = ++lastRequestHandle_;
    CallService<ActivateSessionRequest, ActivateSessionResponse>(
        *channel_, std::move(request.Value()), connectDeadline_.LeftMs(),
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
            self->serverNonce_ = active.Value().serverNonce;
            self->active_ = true;
            self->StartKeepAlive();
            done(self->info_);
        });
}

void Session::StartKeepAlive() {
    const uint32_t interval = std::max(
        kMinKeepAliveMs, std::min(info_.revisedSessionTimeoutMs / 3, options_.keepAliveIntervalMs));
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
                                                       ? PlainText(reason->text)
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
