#include "ua/ScriptedServer.h"

#include <algorithm>
#include <asio/post.hpp>
#include <asio/steady_timer.hpp>
#include <asio/write.hpp>

#include "ua/secure/NoneSecurityPolicy.h"
#include "ua/services/AttributeServices.h"
#include "ua/services/SessionServices.h"
#include "ua/services/SubscriptionServices.h"

namespace cv::ua::test {
namespace {

constexpr uint32_t kChannelId = 7;

EndpointDescription NoneEndpoint(const std::string& url) {
    EndpointDescription endpoint;
    endpoint.endpointUrl = url;
    endpoint.securityMode = MessageSecurityMode::None;
    endpoint.securityPolicyUri = NoneSecurityPolicy::kUri;
    endpoint.transportProfileUri =
        "http://opcfoundation.org/UA-Profile/Transport/uatcp-uasc-uabinary";
    endpoint.userIdentityTokens = {{"anon", UserTokenType::Anonymous, "", "", ""}};
    return endpoint;
}

}  // namespace

ScriptedServer::ScriptedServer(Script script)
    : script_(std::move(script)),
      acceptor_(io_, asio::ip::tcp::endpoint(asio::ip::make_address("127.0.0.1"), 0)) {
    port_ = acceptor_.local_endpoint().port();
    Accept();
    thread_ = std::thread([this] { io_.run(); });
}

ScriptedServer::~ScriptedServer() {
    asio::post(io_, [this] { io_.stop(); });
    thread_.join();
}

void ScriptedServer::Accept() {
    acceptor_.async_accept([this](const asio::error_code& ec, asio::ip::tcp::socket socket) {
        if (ec) {
            return;
        }
        socket_ = std::make_unique<asio::ip::tcp::socket>(std::move(socket));
        reader_ = FrameReader(1u << 24);
        sequence_ = 0;
        ReadMore();
        Accept();
    });
}

void ScriptedServer::ReadMore() {
    socket_->async_read_some(asio::buffer(buffer_), [this](const asio::error_code& ec, size_t n) {
        if (ec) {
            return;
        }
        reader_.Append(std::string_view(buffer_.data(), n));
        for (;;) {
            auto frame = reader_.Next();
            if (!frame || !frame.Value()) {
                break;
            }
            OnFrame(*frame.Value());
        }
        if (socket_ && socket_->is_open()) {
            ReadMore();
        }
    });
}

void ScriptedServer::OnFrame(const Frame& frame) {
    Request request;
    request.kind = frame.header.kind;
    Decoder decoder(std::string_view(frame.bytes).substr(kFrameHeaderSize));
    if (request.kind != MessageKind::Hello) {
        uint32_t channelId = 0;
        decoder(channelId);
        if (request.kind == MessageKind::Open) {
            NoneSecurityPolicy().ReadAsymmetricHeader(decoder);
        } else {
            uint32_t tokenId = 0;
            decoder(tokenId);
        }
        uint32_t sequenceNumber = 0;
        decoder(sequenceNumber);
        decoder(request.requestId);
        NodeId typeId;
        decoder(typeId);
        request.typeId = typeId.Numeric();
    }
    request.body = std::string(decoder.Bytes(decoder.Remaining()));
    if (request.kind != MessageKind::Hello) {
        Decoder header(request.body);
        RequestHeader requestHeader;
        header(requestHeader);
        request.requestHandle = requestHeader.requestHandle;
    }
    Record(request);
    if (!script_ || !script_(*this, request)) {
        Answer(request);
    }
}

void ScriptedServer::Answer(const Request& request) {
    if (request.kind == MessageKind::Hello) {
        SendRaw(MakeFrame(MessageKind::Acknowledge, ChunkType::Final, Encode(acknowledge)));
        return;
    }
    if (request.kind == MessageKind::Close) {
        CloseConnection();
        return;
    }
    switch (request.typeId) {
        case OpenSecureChannelRequest::kEncodingId: {
            OpenSecureChannelResponse response;
            response.header.requestHandle = request.requestHandle;
            response.securityToken = {kChannelId, ++tokenId_, DateTime::Now(), tokenLifetimeMs};
            SendChunk(MessageKind::Open, 'F', request.requestId, EncodeMessage(response));
            return;
        }
        case CreateSessionRequest::kEncodingId: {
            CreateSessionResponse response;
            response.sessionId = NodeId(1, 1u);
            response.authenticationToken = NodeId(1, std::string("token"));
            response.revisedSessionTimeout = sessionTimeoutMs;
            response.serverEndpoints = {NoneEndpoint(Url())};
            Reply(request, response);
            return;
        }
        case ActivateSessionRequest::kEncodingId:
            Reply(request, ActivateSessionResponse{});
            return;
        case CloseSessionRequest::kEncodingId:
            Reply(request, CloseSessionResponse{});
            return;
        case ReadRequest::kEncodingId: {
            ReadResponse response;
            response.results.resize(request.As<ReadRequest>().nodesToRead.size());
            for (DataValue& value : response.results) {
                value.value = 1.0;
            }
            Reply(request, response);
            return;
        }
        case CreateSubscriptionRequest::kEncodingId: {
            const auto asked = request.As<CreateSubscriptionRequest>();
            CreateSubscriptionResponse response;
            response.subscriptionId = 1;
            response.revisedPublishingInterval = asked.requestedPublishingInterval;
            response.revisedLifetimeCount = asked.requestedLifetimeCount;
            response.revisedMaxKeepAliveCount = asked.requestedMaxKeepAliveCount;
            Reply(request, response);
            return;
        }
        case PublishRequest::kEncodingId:
            return;
        default: {
            ServiceFault fault;
            fault.header.serviceResult = status::BadServiceUnsupported;
            Reply(request, fault);
        }
    }
}

std::string ScriptedServer::Chunk(MessageKind kind, char chunkType, uint32_t requestId,
                                  std::string_view body) {
    std::string chunk(kFrameHeaderSize, '\0');
    Encoder encoder(chunk);
    encoder(kChannelId);
    if (kind == MessageKind::Open) {
        NoneSecurityPolicy().WriteAsymmetricHeader(encoder);
    } else {
        encoder(tokenId_);
    }
    encoder(++sequence_);
    encoder(requestId);
    chunk.append(body);
    chunk.replace(0, 4, std::string(MessageKindCode(kind)) + chunkType);
    encoder.PatchUInt32(4, static_cast<uint32_t>(chunk.size()));
    return chunk;
}

void ScriptedServer::SendRaw(std::string bytes) {
    if (socket_ && socket_->is_open()) {
        asio::error_code ignored;
        asio::write(*socket_, asio::buffer(bytes), ignored);
    }
}

void ScriptedServer::Drip(std::string bytes, std::chrono::milliseconds interval) {
    if (bytes.empty()) {
        return;
    }
    SendRaw(bytes.substr(0, 1));
    auto timer = std::make_shared<asio::steady_timer>(io_, interval);
    timer->async_wait([this, timer, rest = bytes.substr(1), interval](const asio::error_code& ec) {
        if (!ec) {
            Drip(rest, interval);
        }
    });
}

void ScriptedServer::CloseConnection() {
    if (socket_) {
        asio::error_code ignored;
        socket_->shutdown(asio::ip::tcp::socket::shutdown_both, ignored);
        socket_->close(ignored);
    }
}

void ScriptedServer::Record(const Request& request) {
    std::lock_guard lock(mutex_);
    received_.push_back(request);
    changed_.notify_all();
}

bool ScriptedServer::WaitUntil(const std::function<bool(const std::vector<Request>&)>& holds) {
    std::unique_lock lock(mutex_);
    return changed_.wait_for(lock, std::chrono::seconds(30), [&] { return holds(received_); });
}

bool ScriptedServer::WaitForRequests(uint32_t typeId, size_t count) {
    return WaitUntil([&](const std::vector<Request>& received) {
        return static_cast<size_t>(
                   std::count_if(received.begin(), received.end(),
                                 [&](const Request& r) { return r.typeId == typeId; })) >= count;
    });
}

std::vector<ScriptedServer::Request> ScriptedServer::Received(uint32_t typeId) {
    std::lock_guard lock(mutex_);
    std::vector<Request> found;
    for (const Request& request : received_) {
        if (request.typeId == typeId) {
            found.push_back(request);
        }
    }
    return found;
}

}  // namespace cv::ua::test
