#pragma once

#include <array>
#include <asio/io_context.hpp>
#include <asio/ip/tcp.hpp>
#include <asio/steady_timer.hpp>
#include <chrono>
#include <cstdint>
#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <string>

#include "ua/secure/ChannelOptions.h"
#include "ua/secure/ChunkAssembler.h"
#include "ua/secure/ChunkWriter.h"
#include "ua/transport/EndpointUrl.h"
#include "ua/transport/FrameReader.h"

namespace cv::ua {

// One UA-TCP connection with its secure channel: connect, Hello and
// Acknowledge, OpenSecureChannel, then requests matched to responses by
// request id, each with its own time-out; the security token is renewed at
// 75 % of its lifetime, and the one it replaces is accepted until it ends. Lives on the I/O thread:
// every member is called there and every handler runs there.
//
// When the connection fails (an ERR message, a closed socket, a malformed
// chunk, a server that stopped sending anything), every pending request ends
// with the reason, and so does Open, or else the lost handler is told once.
class SecureChannel : public std::enable_shared_from_this<SecureChannel> {
  public:
    using Completion = std::function<void(Result<std::string>)>;
    using OpenHandler = std::function<void(Result<Done>)>;
    using LostHandler = std::function<void(const Error&)>;

    SecureChannel(asio::io_context& io, ChannelOptions options,
                  std::unique_ptr<SecurityPolicy> policy);
    ~SecureChannel();

    void Open(const std::string& sEndpointUrl, OpenHandler done);
    // Sends a request body (encoding id and structure) and hands back the
    // response body. service names the request in error texts.
    void Send(std::string body, std::string_view service, uint32_t timeoutMs, Completion done);
    // Sends CloseSecureChannel and closes the socket; pending requests end
    // with Bad_SecureChannelClosed.
    void Close();
    // Closes the socket at once and drops every handler unheard.
    void Abort();
    // Ends the connection for a fault found above the channel (an answer that
    // cannot be decoded): pending requests and the lost handler hear reason.
    void Break(const Error& reason) { Fail(reason); }

    void SetLostHandler(LostHandler lost) { lost_ = std::move(lost); }
    bool IsOpen() const { return state_ == State::Open; }
    const DecodeLimits& Limits() const { return options_.decodeLimits; }
    // Security tokens received so far, the first included.
    uint32_t TokenCount() const { return tokenCount_; }

  private:
    enum class State { Idle, Connecting, AwaitAck, AwaitOpen, Open, Closed };

    struct Pending {
        Completion done;
        std::unique_ptr<asio::steady_timer> timer;
        std::string service;
        uint32_t timeoutMs = 0;
        uint64_t framesAtSend = 0;
    };

    void OnConnected();
    void Read();
    void OnFrame(Frame frame);
    void OnAcknowledge(const Frame& frame);
    void OnSecureMessage(SecureMessage message);
    void SendOpen(bool renew);
    void OnOpened(Result<std::string> body, bool renew);
    void RetireAtExpiry(uint32_t tokenId);
    void Track(uint32_t requestId, Completion done, std::string_view service, uint32_t timeoutMs);
    void SendChunks(MessageKind kind, uint32_t requestId, std::string_view body, Completion& done);
    void Write(std::string bytes);
    void WriteNext();
    void OnTimeout(uint32_t requestId);
    void Fail(Error reason);
    void Post(Completion done, Error error);
    std::string Where() const;

    asio::io_context& io_;
    ChannelOptions options_;
    std::unique_ptr<SecurityPolicy> policy_;
    asio::ip::tcp::resolver resolver_;
    asio::ip::tcp::socket socket_;
    asio::steady_timer connectTimer_;
    asio::steady_timer renewTimer_;
    asio::steady_timer retireTimer_;
    State state_ = State::Idle;
    EndpointUrl url_;
    std::string urlText_;
    OpenHandler openDone_;
    LostHandler lost_;
    FrameReader reader_;
    ChunkWriter writer_;
    ChunkAssembler assembler_;
    std::array<char, 65536> readBuffer_;
    std::deque<std::string> outbox_;
    bool writing_ = false;
    bool closeAfterWrite_ = false;
    uint32_t channelId_ = 0;
    uint32_t tokenId_ = 0;
    uint32_t tokenCount_ = 0;
    std::chrono::steady_clock::time_point tokenStart_;
    uint32_t tokenLifetimeMs_ = 0;
    uint32_t lastRequestId_ = 0;
    uint32_t lastRequestHandle_ = 0;
    uint64_t framesReceived_ = 0;
    std::map<uint32_t, Pending> pending_;
};

}  // namespace cv::ua
