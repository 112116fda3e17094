#include "ua/secure/SecureChannel.h"

#include <algorithm>
#include <asio/connect.hpp>
#include <asio/post.hpp>
#include <asio/write.hpp>
#include <iterator>

#include "ua/services/ChannelServices.h"
#include "ua/services/ServiceMessages.h"
#include "ua/types/PlainText.h"
#include "ua/types/StatusCodeTable.h"

namespace cv::ua {
namespace {

constexpr std::string_view kOpenService = "OpenSecureChannel";

Error Closed() {
    return Error{status::BadSecureChannelClosed,
                 "The connection was closed before the answer came."};
}

}  // namespace

SecureChannel::SecureChannel(asio::io_context& io, ChannelOptions options,
                             std::unique_ptr<SecurityPolicy> policy)
    : io_(io),
      options_(options),
      policy_(std::move(policy)),
      resolver_(io),
      socket_(io),
      connectTimer_(io),
      renewTimer_(io),
      retireTimer_(io),
      reader_(options.limits.receiveBufferSize),
      writer_(*policy_),
      assembler_(*policy_) {}

SecureChannel::~SecureChannel() = default;

std::string SecureChannel::Where() const {
    return url_.host + ":" + std::to_string(url_.port);
}

void SecureChannel::Open(const std::string& sEndpointUrl, OpenHandler done) {
    auto url = EndpointUrl::Parse(sEndpointUrl);
    if (!url) {
        asio::post(io_, [done = std::move(done), error = url.Failure()] { done(error); });
        return;
    }
    url_ = url.Value();
    urlText_ = sEndpointUrl;
    openDone_ = std::move(done);
    state_ = State::Connecting;
    connectTimer_.expires_after(std::chrono::milliseconds(options_.connectTimeoutMs));
    connectTimer_.async_wait([self = shared_from_this()](const asio::error_code& ec) {
        if (ec || self->state_ == State::Open || self->state_ == State::Closed) {
            return;
        }
        const char* step = self->state_ == State::Connecting ? "accept the connection"
                           : self->state_ == State::AwaitAck ? "answer the Hello message"
                                                             : "open a secure channel";
        self->Fail(Error{status::BadTimeout,
                         "The server at " + self->Where() + " did not " + step + " within " +
                             std::to_string(self->options_.connectTimeoutMs) + " ms."});
    });
    resolver_.async_resolve(
        url_.host, std::to_string(url_.port),
        [self = shared_from_this()](const asio::error_code& ec,
                                    asio::ip::tcp::resolver::results_type results) {
            if (self->state_ != State::Connecting) {
                return;
            }
            if (ec) {
                self->Fail(Error{status::BadConnectionRejected,
                                 "The host name \"" + self->url_.host +
                                     "\" could not be resolved (" + ec.message() + ")."});
                return;
            }
            asio::async_connect(
                self->socket_, results, [self](const asio::error_code& error, const auto&) {
                    if (self->state_ != State::Connecting) {
                        return;
                    }
                    if (error) {
                        self->Fail(Error{status::BadConnectionRejected,
                                         "The server at " + self->Where() + " cannot be reached (" +
                                             error.message() + ")."});
                        return;
                    }
                    self->OnConnected();
                });
        });
}

void SecureChannel::OnConnected() {
    asio::error_code ignored;
    socket_.set_option(asio::ip::tcp::no_delay(true), ignored);
    state_ = State::AwaitAck;
    HelloMessage hello;
    hello.receiveBufferSize = options_.limits.receiveBufferSize;
    hello.sendBufferSize = options_.limits.sendBufferSize;
    hello.maxMessageSize = options_.limits.maxMessageSize;
    hello.maxChunkCount = options_.limits.maxChunkCount;
    hello.endpointUrl = urlText_;
    Write(MakeFrame(MessageKind::Hello, ChunkType::Final, Encode(hello)));
    Read();
}

void SecureChannel::Read() {
    socket_.async_read_some(
        asio::buffer(readBuffer_),
        [self = shared_from_this()](const asio::error_code& ec, size_t size) {
            if (self->state_ == State::Closed) {
                return;
            }
            if (ec) {
                const bool midMessage = self->reader_.PendingBytes() > 0;
                self->Fail(Error{status::BadConnectionClosed,
                                 midMessage
                                     ? "The server closed the connection in the middle "
                                       "of a message."
                                     : "The server closed the connection (" + ec.message() + ")."});
                return;
            }
            self->reader_.Append(std::string_view(self->readBuffer_.data(), size));
            while (self->state_ != State::Closed) {
                auto frame = self->reader_.Next();
                if (!frame) {
                    self->Fail(frame.Failure());
                    return;
                }
                if (!frame.Value()) {
                    break;
                }
                ++self->framesReceived_;
                self->OnFrame(std::move(*frame.Value()));
            }
            if (self->state_ != State::Closed) {
                self->Read();
            }
        });
}

void SecureChannel::OnFrame(Frame frame) {
    switch (frame.header.kind) {
        case MessageKind::Acknowledge:
            OnAcknowledge(frame);
            return;
        case MessageKind::Error: {
            ErrorMessage error;
            Decoder decoder(std::string_view(frame.bytes).substr(kFrameHeaderSize));
            decoder(error);
            const StatusCode code =
                error.error.code != 0 ? error.error : status::BadUnexpectedError;
            Fail(Error{code, "The server ended the connection: " +
                                 (error.reason.empty() ? DescribeStatusCode(code)
                                                       : PlainText(error.reason))});
            return;
        }
        case MessageKind::Hello:
            Fail(Error{status::BadTcpMessageTypeInvalid, "The server sent a Hello message."});
            return;
        case MessageKind::Close:
            Fail(Error{status::BadSecureChannelClosed, "The server closed the secure channel."});
            return;
        case MessageKind::Open:
        case MessageKind::Message:
            break;
    }
    if (state_ == State::AwaitAck) {
        Fail(Error{status::BadTcpMessageTypeInvalid,
                   "The server sent a secure message before its Acknowledge."});
        return;
    }
    auto outcome = assembler_.Add(std::move(frame));
    if (!outcome) {
        Fail(outcome.Failure());
        return;
    }
    if (outcome.Value().aborted) {
        const AbortedMessage& aborted = *outcome.Value().aborted;
        const auto found = pending_.find(aborted.requestId);
        if (found != pending_.end()) {
            Completion done = std::move(found->second.done);
            pending_.erase(found);
            done(Error{aborted.error.status, PlainText(aborted.error.text)});
        }
    }
    if (outcome.Value().message) {
        OnSecureMessage(std::move(*outcome.Value().message));
    }
}

void SecureChannel::OnAcknowledge(const Frame& frame) {
    if (state_ != State::AwaitAck) {
        Fail(Error{status::BadTcpMessageTypeInvalid,
                   "The server sent an Acknowledge message out of turn."});
        return;
    }
    auto ack = Decode<AcknowledgeMessage>(std::string_view(frame.bytes).substr(kFrameHeaderSize));
    if (!ack) {
        Fail(ack.Failure());
        return;
    }
    const AcknowledgeMessage& limits = ack.Value();
    if (limits.receiveBufferSize < kMinBufferSize || limits.sendBufferSize < kMinBufferSize) {
        Fail(Error{status::BadTcpInternalError,
                   "The server offered buffers smaller than 8192 bytes in its Acknowledge."});
        return;
    }
    writer_.SetLimits({std::min(options_.limits.sendBufferSize, limits.receiveBufferSize),
                       limits.maxMessageSize, limits.maxChunkCount});
    assembler_.SetLimits(options_.limits.maxMessageSize, options_.limits.maxChunkCount,
                         options_.limits.maxUnfinishedSize);
    state_ = State::AwaitOpen;
    SendOpen(false);
}

void SecureChannel::SendOpen(bool renew) {
    OpenSecureChannelRequest request;
    request.header.timestamp = DateTime::Now();
    request.header.requestHandle = ++lastRequestHandle_;
    request.header.timeoutHint = options_.connectTimeoutMs;
    request.requestType = renew ? SecurityTokenRequestType::Renew : SecurityTokenRequestType::Issue;
    request.securityMode = policy_->Mode();
    auto nonce = policy_->NewClientNonce();
    if (!nonce) {
        Fail(nonce.Failure());
        return;
    }
    request.clientNonce = std::move(nonce.Value());
    request.requestedLifetime = options_.requestedLifetimeMs;
    Completion done = [self = shared_from_this(), renew](Result<std::string> body) {
        self->OnOpened(std::move(body), renew);
    };
    const uint32_t requestId = ++lastRequestId_;
    SendChunks(MessageKind::Open, requestId, EncodeMessage(request), done);
    if (!done) {
        return;
    }
    Track(requestId, std::move(done), kOpenService, options_.connectTimeoutMs);
}

void SecureChannel::OnOpened(Result<std::string> body, bool renew) {
    if (!body) {
        Fail(body.Failure());
        return;
    }
    auto response = DecodeResponse<OpenSecureChannelResponse>(body.Value(), kOpenService,
                                                              options_.decodeLimits);
    if (!response) {
        Fail(response.Failure());
        return;
    }
    const ChannelSecurityToken& token = response.Value().securityToken;
    auto keys = policy_->AcceptToken(token.tokenId, response.Value().serverNonce);
    if (!keys) {
        Fail(keys.Failure());
        return;
    }
    if (renew && token.tokenId != tokenId_) {
        RetireAtExpiry(tokenId_);
    }
    channelId_ = token.channelId;
    tokenId_ = token.tokenId;
    ++tokenCount_;
    assembler_.SetChannelId(channelId_);
    assembler_.AcceptToken(tokenId_);
    const uint32_t lifetime =
        token.revisedLifetime != 0 ? token.revisedLifetime : options_.requestedLifetimeMs;
    tokenStart_ = std::chrono::steady_clock::now();
    tokenLifetimeMs_ = lifetime;
    renewTimer_.expires_after(std::chrono::milliseconds(uint64_t{lifetime} * 3 / 4));
    renewTimer_.async_wait([self = shared_from_this()](const asio::error_code& ec) {
        if (!ec && self->state_ == State::Open) {
            self->SendOpen(true);
        }
    });
    if (!renew) {
        state_ = State::Open;
        connectTimer_.cancel();
        OpenHandler done = std::move(openDone_);
        openDone_ = nullptr;
        done(Done{});
    }
}

// The server may still answer under the token it has just replaced, until
// that token's lifetime (with the quarter of grace servers give) is over.
void SecureChannel::RetireAtExpiry(uint32_t tokenId) {
    retireTimer_.expires_at(tokenStart_ +
                            std::chrono::milliseconds(uint64_t{tokenLifetimeMs_} * 5 / 4));
    retireTimer_.async_wait([self = shared_from_this(), tokenId](const asio::error_code& ec) {
        if (!ec && self->state_ == State::Open) {
            self->assembler_.RetireToken(tokenId);
            self->policy_->RetireToken(tokenId);
        }
    });
}

void SecureChannel::Send(std::string body, std::string_view service, uint32_t timeoutMs,
                         Completion done) {
    if (state_ != State::Open) {
        Post(std::move(done), Error{status::BadSecureChannelClosed,
                                    "The " + std::string(service) +
                                        " request cannot be sent: the connection is closed."});
        return;
    }
    const uint32_t requestId = ++lastRequestId_;
    SendChunks(MessageKind::Message, requestId, body, done);
    if (!done) {
        return;
    }
    Track(requestId, std::move(done), service, timeoutMs);
}

void SecureChannel::Track(uint32_t requestId, Completion done, std::string_view service,
                          uint32_t timeoutMs) {
    Pending& pending = pending_[requestId];
    pending.done = std::move(done);
    pending.service = service;
    pending.timeoutMs = timeoutMs;
    pending.framesAtSend = framesReceived_;
    pending.timer = std::make_unique<asio::steady_timer>(io_);
    pending.timer->expires_after(std::chrono::milliseconds(timeoutMs));
    pending.timer->async_wait([self = shared_from_this(), requestId](const asio::error_code& ec) {
        if (!ec) {
            self->OnTimeout(requestId);
        }
    });
}

// On success done is left as it was; on failure it has been posted the error
// and is empty afterwards.
void SecureChannel::SendChunks(MessageKind kind, uint32_t requestId, std::string_view body,
                               Completion& done) {
    auto chunks = writer_.Write(kind, channelId_, tokenId_, requestId, body);
    if (!chunks) {
        Post(std::move(done), chunks.Failure());
        done = nullptr;
        return;
    }
    for (std::string& chunk : chunks.Value()) {
        Write(std::move(chunk));
    }
}

void SecureChannel::OnSecureMessage(SecureMessage message) {
    const auto found = pending_.find(message.requestId);
    if (found == pending_.end()) {
        // The answer to a request that has timed out already.
        return;
    }
    const bool open = found->second.service == kOpenService;
    if (open != (message.kind == MessageKind::Open)) {
        Fail(Error{status::BadUnknownResponse,
                   "The server answered a request with the wrong "
                   "kind of message."});
        return;
    }
    Completion done = std::move(found->second.done);
    pending_.erase(found);
    done(std::move(message.body));
}

void SecureChannel::OnTimeout(uint32_t requestId) {
    const auto found = pending_.find(requestId);
    if (found == pending_.end()) {
        return;
    }
    const std::string timeout = std::to_string(found->second.timeoutMs);
    const bool silent = found->second.framesAtSend == framesReceived_;
    Completion done = std::move(found->second.done);
    const std::string service = found->second.service;
    pending_.erase(found);
    done(Error{status::BadTimeout,
               "The server did not answer the " + service + " request within " + timeout + " ms."});
    if (silent) {
        Fail(Error{status::BadTimeout,
                   "The server stopped answering: nothing arrived for " + timeout + " ms."});
    }
}

void SecureChannel::Write(std::string bytes) {
    outbox_.push_back(std::move(bytes));
    if (!writing_) {
        WriteNext();
    }
}

void SecureChannel::WriteNext() {
    if (outbox_.empty()) {
        writing_ = false;
        if (closeAfterWrite_) {
            asio::error_code ignored;
            socket_.shutdown(asio::ip::tcp::socket::shutdown_both, ignored);
            socket_.close(ignored);
        }
        return;
    }
    writing_ = true;
    asio::async_write(
        socket_, asio::buffer(outbox_.front()),
        [self = shared_from_this()](const asio::error_code& ec, size_t) {
            self->outbox_.pop_front();
            if (ec && self->state_ != State::Closed) {
                self->Fail(Error{status::BadConnectionClosed,
                                 "The connection broke while sending (" + ec.message() + ")."});
                return;
            }
            if (!ec) {
                self->WriteNext();
            }
        });
}

void SecureChannel::Post(Completion done, Error error) {
    asio::post(io_, [done = std::move(done), error = std::move(error)] { done(error); });
}

void SecureChannel::Fail(Error reason) {
    if (state_ == State::Closed) {
        return;
    }
    const bool opened = state_ == State::Open;
    state_ = State::Closed;
    asio::error_code ignored;
    resolver_.cancel();
    connectTimer_.cancel();
    renewTimer_.cancel();
    retireTimer_.cancel();
    socket_.close(ignored);
    auto pending = std::move(pending_);
    pending_.clear();
    for (auto& [id, request] : pending) {
        request.timer->cancel();
        if (request.service != kOpenService) {
            Post(std::move(request.done), reason);
        }
    }
    if (!opened && openDone_) {
        OpenHandler done = std::move(openDone_);
        openDone_ = nullptr;
        asio::post(io_, [done = std::move(done), reason] { done(reason); });
    } else if (opened && lost_) {
        asio::post(io_, [lost = lost_, reason] { lost(reason); });
    }
}

void SecureChannel::Close() {
    if (state_ == State::Closed) {
        return;
    }
    if (state_ == State::Open) {
        CloseSecureChannelRequest request;
        request.header.timestamp = DateTime::Now();
        request.header.requestHandle = ++lastRequestHandle_;
        auto chunks = writer_.Write(MessageKind::Close, channelId_, tokenId_, ++lastRequestId_,
                                    EncodeMessage(request));
        if (chunks) {
            for (std::string& chunk : chunks.Value()) {
                outbox_.push_back(std::move(chunk));
            }
        }
    }
    state_ = State::Closed;
    asio::error_code ignored;
    resolver_.cancel();
    connectTimer_.cancel();
    renewTimer_.cancel();
    retireTimer_.cancel();
    for (auto& [id, request] : pending_) {
        request.timer->cancel();
        if (request.service != kOpenService) {
            Post(std::move(request.done), Closed());
        }
    }
    pending_.clear();
    if (openDone_) {
        OpenHandler done = std::move(openDone_);
        openDone_ = nullptr;
        asio::post(io_, [done = std::move(done)] { done(Closed()); });
    }
    closeAfterWrite_ = true;
    if (!writing_) {
        WriteNext();
    }
}

void SecureChannel::Abort() {
    state_ = State::Closed;
    openDone_ = nullptr;
    lost_ = nullptr;
    pending_.clear();
    // A write in flight still reads the first bytes; its handler drops them.
    outbox_.erase(writing_ && !outbox_.empty() ? outbox_.begin() + 1 : outbox_.begin(),
                  outbox_.end());
    asio::error_code ignored;
    resolver_.cancel();
    connectTimer_.cancel();
    renewTimer_.cancel();
    retireTimer_.cancel();
    socket_.close(ignored);
}

}  // namespace cv::ua
