#pragma once

#include <asio/io_context.hpp>
#include <asio/steady_timer.hpp>
#include <chrono>
#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <string_view>

#include "ua/client/ClientOptions.h"
#include "ua/client/ConnectDeadline.h"
#include "ua/client/ConnectOptions.h"
#include "ua/client/ServiceCall.h"
#include "ua/client/SessionInfo.h"
#include "ua/services/AttributeServices.h"
#include "ua/services/SessionServices.h"

namespace cv::ua {

// A session over its own secure channel: CreateSession with a fresh random
// nonce, ActivateSession with the user's identity token, typed service calls
// carrying the session's token, a keep-alive read of the server's state
// (which also notices an announced shutdown), CloseSession. On a secured
// endpoint the channel signs (and encrypts) with the program's certificate,
// the server's session signature is checked against the certificate the
// endpoint showed, and ActivateSession carries the program's signature.
// Lives on the I/O thread.
//
// When the channel breaks, the session is resumed on a new one (a new
// channel, then ActivateSession with the same token) until the session
// time-out has passed since the break; calls made meanwhile wait for it,
// each within its own time-out (Session_resume.cpp). A server that
// announced its shutdown, said it is halting, or no longer knows the
// session ends it for good.
class Session : public std::enable_shared_from_this<Session> {
  public:
    using EventHandler = std::function<void(ConnectionEvent, const Error&)>;

    Session(asio::io_context& io, const ClientOptions& options, EventHandler events);

    void Connect(const std::string& sEndpointUrl, ConnectOptions connect,
                 std::function<void(Result<SessionInfo>)> done);

    template <class Request, class Response>
    void Call(Request request, std::function<void(Result<Response>)> done, uint32_t timeoutMs = 0) {
        if (!active_) {
            if (resuming_) {
                Park(std::move(request), std::move(done), timeoutMs);
                return;
            }
            asio::post(io_, [done = std::move(done)] {
                done(Error{status::BadSessionClosed, "There is no open session."});
            });
            return;
        }
        request.header.authenticationToken = authenticationToken_;
        request.header.requestHandle = ++lastRequestHandle_;
        CallService<Request, Response>(*channel_, std::move(request),
                                       timeoutMs ? timeoutMs : options_.requestTimeoutMs,
                                       WatchSession(std::move(done)));
    }

    // Closes the session and its channel; done runs when both are gone.
    void Close(std::function<void()> done);
    // Drops everything at once, telling nobody.
    void Abort();
    bool IsActive() const { return active_; }
    const SessionInfo& Info() const { return info_; }
    uint32_t TokenCount() const { return channel_ ? channel_->TokenCount() : 0; }
    // Times the session was resumed on a new channel.
    uint32_t Resumes() const { return resumes_; }

  private:
    // A call made while the session is being resumed.
    struct Parked {
        std::function<void()> send;
        std::function<void(const Error&)> fail;
        std::unique_ptr<asio::steady_timer> timer;
    };

    Result<std::unique_ptr<SecurityPolicy>> MakePolicy() const;
    // Opens a channel and starts the one wait that covers it and the
    // session services after it (connectDeadline_).
    void OpenChannel(const std::string& sEndpointUrl, std::function<void(Result<Done>)> opened);
    void CreateSession(std::function<void(Result<SessionInfo>)> done);
    Result<Done> OnCreated(const CreateSessionResponse& created);
    Result<EndpointDescription> ServerEndpoint(const CreateSessionResponse& created) const;
    void ActivateSession(std::function<void(Result<SessionInfo>)> done);
    Result<ActivateSessionRequest> MakeActivateRequest() const;
    bool Secured() const {
        return connect_.endpoint && connect_.endpoint->securityMode != MessageSecurityMode::None;
    }
    bool Named() const { return connect_.identity.type == UserTokenType::UserName; }
    // Something worth protecting goes to the server (keys or a password), so
    // it must be the server whose certificate the caller checked.
    bool GuardsIdentity() const { return Secured() || Named(); }
    Result<Done> CheckEndpointCertificate() const;
    Result<Done> CheckCreatedServer(const CreateSessionResponse& created) const;
    void StartKeepAlive();
    void OnKeepAlive(Result<ReadResponse> response);
    void Lose(const Error& reason);
    // Session_resume.cpp
    static bool EndsTheSession(StatusCode status);
    void StartResume(const Error& reason);
    void TryResume();
    void OnResumeFailed(const Error& failure);
    void OnResumed();
    void EndForGood(const Error& reason);
    template <class Request, class Response>
    void Park(Request request, std::function<void(Result<Response>)> done, uint32_t timeoutMs) {
        auto shared = std::make_shared<std::function<void(Result<Response>)>>(std::move(done));
        Park(
            [weak = weak_from_this(), request = std::move(request), shared, timeoutMs]() mutable {
                if (auto self = weak.lock()) {
                    self->Call<Request, Response>(std::move(request), std::move(*shared),
                                                  timeoutMs);
                }
            },
            [shared](const Error& error) { (*shared)(error); },
            timeoutMs ? timeoutMs : options_.requestTimeoutMs, ServiceName(Request::kEncodingId));
    }
    void Park(std::function<void()> send, std::function<void(const Error&)> fail,
              uint32_t timeoutMs, std::string_view service);
    void SendParked();
    void FailParked(const Error& reason);

    // Passes a response on, and treats a session the server no longer knows
    // as the end of the connection.
    template <class Response>
    std::function<void(Result<Response>)> WatchSession(std::function<void(Result<Response>)> done) {
        return [weak = weak_from_this(), done = std::move(done)](Result<Response> response) {
            auto self = weak.lock();
            if (self && !response && IsSessionGone(response.Failure().status)) {
                self->Lose(response.Failure());
            }
            done(std::move(response));
        };
    }
    static bool IsSessionGone(StatusCode status);

    asio::io_context& io_;
    ClientOptions options_;
    EventHandler events_;
    std::shared_ptr<SecureChannel> channel_;
    asio::steady_timer keepAliveTimer_;
    ConnectOptions connect_;
    ByteString clientNonce_;
    ByteString serverNonce_;
    ByteString serverCertificate_;
    NodeId authenticationToken_;
    uint32_t lastRequestHandle_ = 0;
    bool active_ = false;
    bool shutdownAnnounced_ = false;
    SessionInfo info_;
    ConnectDeadline connectDeadline_;
    // Resuming after a broken channel.
    bool resuming_ = false;
    Error lostReason_;
    std::chrono::steady_clock::time_point resumeDeadline_;
    uint32_t resumeAttempts_ = 0;
    uint32_t resumes_ = 0;
    asio::steady_timer resumeTimer_;
    std::map<uint64_t, Parked> parked_;
    uint64_t lastParked_ = 0;
};

}  // namespace cv::ua
