#pragma once

#include <asio/io_context.hpp>
#include <asio/steady_timer.hpp>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>

#include "ua/client/ClientOptions.h"
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
class Session : public std::enable_shared_from_this<Session> {
  public:
    using EventHandler = std::function<void(ConnectionEvent, const Error&)>;

    Session(asio::io_context& io, const ClientOptions& options, EventHandler events);

    void Connect(const std::string& sEndpointUrl, ConnectOptions connect,
                 std::function<void(Result<SessionInfo>)> done);

    template <class Request, class Response>
    void Call(Request request, std::function<void(Result<Response>)> done, uint32_t timeoutMs = 0) {
        if (!active_) {
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

  private:
    void CreateSession(std::function<void(Result<SessionInfo>)> done);
    Result<Done> OnCreated(const CreateSessionResponse& created);
    Result<EndpointDescription> ServerEndpoint(const CreateSessionResponse& created) const;
    void ActivateSession(std::function<void(Result<SessionInfo>)> done);
    Result<ActivateSessionRequest> MakeActivateRequest() const;
    bool Secured() const {
        return connect_.endpoint && connect_.endpoint->securityMode != MessageSecurityMode::None;
    }
    void StartKeepAlive();
    void OnKeepAlive(Result<ReadResponse> response);
    void Lose(const Error& reason);

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
};

}  // namespace cv::ua
