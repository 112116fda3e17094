#pragma once

#include <asio/io_context.hpp>
#include <asio/ip/tcp.hpp>
#include <chrono>
#include <condition_variable>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include "ua/services/ServiceMessages.h"
#include "ua/transport/FrameReader.h"

namespace cv::ua::test {

// A small OPC UA server on a loopback port, run by a script, for the fault
// tests. It answers Hello, OpenSecureChannel, CreateSession,
// ActivateSession, CloseSession, Read and CreateSubscription by itself like
// a plain server; the script sees every request first and may answer it
// otherwise: with a fault, broken chunks, garbage, silence or a closed
// socket. Publish requests are kept for the script to answer. The server
// runs on its own thread; the script runs there too.
class ScriptedServer {
  public:
    // One request as received: its kind, request id, the encoding id of its
    // body (0 for Hello) and the body itself after that id.
    struct Request {
        MessageKind kind = MessageKind::Message;
        uint32_t requestId = 0;
        uint32_t typeId = 0;
        uint32_t requestHandle = 0;
        std::string body;

        template <class T>
        T As() const {
            auto decoded = Decode<T>(body);
            return decoded ? decoded.Value() : T{};
        }
    };
    // Returns true when it has dealt with the request.
    using Script = std::function<bool(ScriptedServer& server, const Request& request)>;

    explicit ScriptedServer(Script script = nullptr);
    ~ScriptedServer();

    std::string Url() const { return "opc.tcp://127.0.0.1:" + std::to_string(port_) + "/scripted"; }

    // What the Acknowledge offers; set before the client connects.
    AcknowledgeMessage acknowledge{0, 65535, 65535, 0, 0};
    uint32_t tokenLifetimeMs = 600'000;
    // The session time-out CreateSession answers.
    double sessionTimeoutMs = 60'000;

    // For the script, on the server's thread.
    template <class Response>
    void Reply(const Request& request, Response response) {
        response.header.requestHandle = request.requestHandle;
        SendChunk(MessageKind::Message, 'F', request.requestId, EncodeMessage(response));
    }
    void SendChunk(MessageKind kind, char chunkType, uint32_t requestId, std::string_view body) {
        SendRaw(Chunk(kind, chunkType, requestId, body));
    }
    // The bytes of a chunk, numbered in turn, for the script to send.
    std::string Chunk(MessageKind kind, char chunkType, uint32_t requestId, std::string_view body);
    void SendRaw(std::string bytes);
    // Sends the bytes one at a time, one each interval.
    void Drip(std::string bytes, std::chrono::milliseconds interval);
    void SkipSequenceNumber() { ++sequence_; }
    void CloseConnection();

    // For the test: waits (with a generous bound) until the server has
    // received a request of this encoding id count times.
    bool WaitForRequests(uint32_t typeId, size_t count);
    // Waits (with the same bound) until holds() is true of the requests so far.
    bool WaitUntil(const std::function<bool(const std::vector<Request>&)>& holds);
    std::vector<Request> Received(uint32_t typeId);

  private:
    void Accept();
    void ReadMore();
    void OnFrame(const Frame& frame);
    void Answer(const Request& request);
    void Record(const Request& request);

    Script script_;
    asio::io_context io_;
    asio::ip::tcp::acceptor acceptor_;
    std::unique_ptr<asio::ip::tcp::socket> socket_;
    uint16_t port_ = 0;
    FrameReader reader_{1u << 24};
    std::array<char, 65536> buffer_;
    uint32_t sequence_ = 0;
    uint32_t tokenId_ = 0;
    std::mutex mutex_;
    std::condition_variable changed_;
    std::vector<Request> received_;
    std::thread thread_;
};

}  // namespace cv::ua::test
