#include <gtest/gtest.h>

#include "ua/ScriptedServer.h"
#include "ua/client/Client.h"
#include "ua/support/DispatchQueue.h"

namespace cv::ua::test {
namespace {

using Script = ScriptedServer::Script;
using Request = ScriptedServer::Request;

// A client of the scripted server with short time-outs (real ones: the
// tests wait for completions, never for time). A broken connection ends the
// session here; resuming it is tested on its own.
class Scripted {
  public:
    explicit Scripted(Script script, ClientOptions options = Options())
        : server_(std::move(script)),
          client_(std::make_unique<Client>(queue_.MakeDispatcher(), options)) {
        client_->SetEventHandler([this](ConnectionEvent event, const Error& reason) {
            events_.emplace_back(event, reason);
        });
    }

    static ClientOptions Options() {
        ClientOptions options;
        options.requestTimeoutMs = 200;
        options.channel.connectTimeoutMs = 200;
        options.resumeSessions = false;
        return options;
    }

    Result<SessionInfo> Connect() {
        return Await<SessionInfo>(queue_,
                                  [&](auto done) { client_->Connect(server_.Url(), done); });
    }
    Result<std::vector<DataValue>> Read() {
        return Await<std::vector<DataValue>>(queue_, [&](auto done) {
            client_->Read({{NodeId(1, 5u), attribute::Value, "", {}}}, 0, TimestampsToReturn::Both,
                          done);
        });
    }
    bool WaitForEvents(size_t count) {
        return queue_.RunUntil([&] { return events_.size() >= count; });
    }

    DispatchQueue queue_;
    ScriptedServer server_;
    std::unique_ptr<Client> client_;
    std::vector<std::pair<ConnectionEvent, Error>> events_;
};

// A script that answers the first Read request with answer and leaves the
// rest to the server's plain answers.
Script OnFirstRead(std::function<void(ScriptedServer&, const Request&)> answer) {
    return [answer, done = false](ScriptedServer& server, const Request& request) mutable {
        if (request.typeId != ReadRequest::kEncodingId || done) {
            return false;
        }
        done = true;
        answer(server, request);
        return true;
    };
}

std::string Header(std::string_view code, uint32_t size) {
    std::string header(code);
    header.append(reinterpret_cast<const char*>(&size), 4);
    return header;
}

ReadResponse OneValue() {
    ReadResponse response;
    response.results.resize(1);
    response.results[0].value = 1.0;
    return response;
}

struct ReadFault {
    const char* name;
    std::function<void(ScriptedServer&, const Request&)> answer;
    StatusCode status;
    const char* text;
    bool connectionLost;
};

TEST(ScriptedServerFaults, EachBrokenAnswerEndsTheReadWithAClearError) {
    const std::vector<ReadFault> faults = {
        {"service fault",
         [](ScriptedServer& s, const Request& r) {
             ServiceFault fault;
             fault.header.serviceResult = status::BadNodeIdInvalid;
             s.Reply(r, fault);
         },
         status::BadNodeIdInvalid, "The server refused the Read request: Bad_NodeIdInvalid", false},
        {"bad service result",
         [](ScriptedServer& s, const Request& r) {
             ReadResponse response = OneValue();
             response.header.serviceResult = StatusCode{0x80100000};
             s.Reply(r, response);
         },
         StatusCode{0x80100000}, "Bad_TooManyOperations", false},
        {"results missing", [](ScriptedServer& s, const Request& r) { s.Reply(r, ReadResponse{}); },
         status::BadUnknownResponse, "0 results for 1 operations", false},
        {"abort chunk",
         [](ScriptedServer& s, const Request& r) {
             s.SendChunk(MessageKind::Message, 'A', r.requestId,
                         Encode(ErrorMessage{status::BadResponseTooLarge, "too big"}));
         },
         status::BadResponseTooLarge, "gave up on its answer: too big", false},
        {"silence", [](ScriptedServer&, const Request&) {}, status::BadTimeout,
         "did not answer the Read request within 200 ms", true},
        {"closed socket", [](ScriptedServer& s, const Request&) { s.CloseConnection(); },
         status::BadConnectionClosed, "closed the connection", true},
        {"closed mid-message",
         [](ScriptedServer& s, const Request&) {
             s.SendRaw(Header("MSGF", 100) + std::string(30, '\0'));
             s.CloseConnection();
         },
         status::BadConnectionClosed, "in the middle of a message", true},
        {"size below header",
         [](ScriptedServer& s, const Request&) { s.SendRaw(Header("MSGF", 4)); },
         status::BadTcpMessageTypeInvalid, "smaller than its header", true},
        {"size over the limit",
         [](ScriptedServer& s, const Request&) { s.SendRaw(Header("MSGF", 1u << 20)); },
         status::BadTcpMessageTooLarge, "the agreed limit is 65535 bytes", true},
        {"unknown message type",
         [](ScriptedServer& s, const Request&) { s.SendRaw(Header("XYZF", 8)); },
         status::BadTcpMessageTypeInvalid, "unknown type \"XYZ\"", true},
        {"unknown chunk type",
         [](ScriptedServer& s, const Request&) { s.SendRaw(Header("MSGQ", 8)); },
         status::BadTcpMessageTypeInvalid, "unknown chunk type \"Q\"", true},
        {"unfinished messages over their cap",
         [](ScriptedServer& s, const Request& r) {
             // Four answers of 4.2 MB, none finished: each within the message
             // limit, together over the cap.
             const std::string part(60'000, 'x');
             for (uint32_t i = 0; i < 4 * 70; ++i) {
                 s.SendChunk(MessageKind::Message, 'C', r.requestId + i % 4, part);
             }
         },
         status::BadTcpMessageTooLarge,
         "4 messages unfinished that together hold more than 16777216 bytes", true},
        {"ERR message",
         [](ScriptedServer& s, const Request&) {
             s.SendRaw(MakeFrame(MessageKind::Error, ChunkType::Final,
                                 Encode(ErrorMessage{status::BadTcpInternalError, "overloaded"})));
         },
         status::BadTcpInternalError, "The server ended the connection: overloaded", true},
        {"garbled body",
         [](ScriptedServer& s, const Request& r) {
             s.SendChunk(MessageKind::Message, 'F', r.requestId,
                         EncodeMessage(OneValue()).substr(0, 12));
         },
         status::BadDecodingError, "could not be decoded", true},
        {"another response type",
         [](ScriptedServer& s, const Request& r) { s.Reply(r, WriteResponse{}); },
         status::BadUnknownResponse, "with a message of another type", true},
        {"sequence gap",
         [](ScriptedServer& s, const Request& r) {
             s.SkipSequenceNumber();
             s.Reply(r, OneValue());
         },
         status::BadSequenceNumberInvalid, "where number", true},
        {"unknown token",
         [](ScriptedServer& s, const Request& r) {
             std::string chunk(kFrameHeaderSize, '\0');
             Encoder encoder(chunk);
             encoder(7u);
             encoder(99u);
             encoder(100u);
             encoder(r.requestId);
             chunk.replace(0, 4, "MSGF");
             encoder.PatchUInt32(4, static_cast<uint32_t>(chunk.size()));
             s.SendRaw(chunk);
         },
         status::BadSecureChannelTokenUnknown, "under the token 99", true},
    };
    for (const ReadFault& fault : faults) {
        SCOPED_TRACE(fault.name);
        Scripted scripted(OnFirstRead(fault.answer));
        ASSERT_TRUE(scripted.Connect());
        auto read = scripted.Read();
        ASSERT_FALSE(read);
        EXPECT_EQ(read.Failure().status, fault.status);
        EXPECT_NE(read.Failure().text.find(fault.text), std::string::npos) << read.Failure().text;
        if (fault.connectionLost) {
            ASSERT_TRUE(scripted.WaitForEvents(1));
            EXPECT_EQ(scripted.events_[0].first, ConnectionEvent::ConnectionLost);
            EXPECT_TRUE(scripted.events_[0].second.status.IsBad());
        } else {
            EXPECT_TRUE(scripted.Read()) << "the connection should have stayed";
        }
    }
}

struct ConnectFault {
    const char* name;
    Script script;
    StatusCode status;
    const char* text;
};

TEST(ScriptedServerFaults, EachBrokenHandshakeEndsConnectWithAClearError) {
    const auto onType = [](uint32_t typeId,
                           std::function<void(ScriptedServer&, const Request&)> f) {
        return [typeId, f](ScriptedServer& s, const Request& r) {
            if (r.typeId != typeId || (typeId == 0 && r.kind != MessageKind::Hello)) {
                return false;
            }
            f(s, r);
            return true;
        };
    };
    const std::vector<ConnectFault> faults = {
        {"ERR to Hello",
         onType(0,
                [](ScriptedServer& s, const Request&) {
                    s.SendRaw(
                        MakeFrame(MessageKind::Error, ChunkType::Final,
                                  Encode(ErrorMessage{status::BadTcpEndpointUrlInvalid, ""})));
                }),
         status::BadTcpEndpointUrlInvalid, "Bad_TcpEndpointUrlInvalid"},
        {"no Acknowledge", onType(0, [](ScriptedServer&, const Request&) {}), status::BadTimeout,
         "did not answer the Hello message within 200 ms"},
        {"small buffers",
         onType(0,
                [](ScriptedServer& s, const Request&) {
                    s.SendRaw(MakeFrame(MessageKind::Acknowledge, ChunkType::Final,
                                        Encode(AcknowledgeMessage{0, 1024, 1024, 0, 0})));
                }),
         status::BadTcpInternalError, "smaller than 8192"},
        {"no channel",
         onType(OpenSecureChannelRequest::kEncodingId, [](ScriptedServer&, const Request&) {}),
         status::BadTimeout, "did not open a secure channel"},
        {"session refused",
         onType(CreateSessionRequest::kEncodingId,
                [](ScriptedServer& s, const Request& r) {
                    ServiceFault fault;
                    fault.header.serviceResult = StatusCode{0x80560000};
                    s.Reply(r, fault);
                }),
         StatusCode{0x80560000}, "CreateSession request: Bad_TooManySessions"},
        {"no anonymous endpoint",
         onType(CreateSessionRequest::kEncodingId,
                [](ScriptedServer& s, const Request& r) { s.Reply(r, CreateSessionResponse{}); }),
         status::BadIdentityTokenInvalid, "anonymous"},
    };
    for (const ConnectFault& fault : faults) {
        SCOPED_TRACE(fault.name);
        Scripted scripted(fault.script);
        auto session = scripted.Connect();
        ASSERT_FALSE(session);
        EXPECT_EQ(session.Failure().status, fault.status);
        EXPECT_NE(session.Failure().text.find(fault.text), std::string::npos)
            << session.Failure().text;
    }
}

TEST(ScriptedServerFaults, ConnectNamesAnUnusableAddress) {
    DispatchQueue queue;
    Client client(queue.MakeDispatcher(), Scripted::Options());
    const std::vector<std::tuple<std::string, StatusCode, std::string>> cases = {
        {"http://127.0.0.1:4840", status::BadTcpEndpointUrlInvalid, "does not start with"},
        {"opc.tcp://:4840", status::BadTcpEndpointUrlInvalid, "names no host"},
        {"opc.tcp://127.0.0.1:99999", status::BadTcpEndpointUrlInvalid, "no valid port"},
        {"opc.tcp://127.0.0.1:1", status::BadConnectionRejected, "cannot be reached"},
    };
    for (const auto& [url, code, text] : cases) {
        auto session = Await<SessionInfo>(queue, [&](auto done) { client.Connect(url, done); });
        ASSERT_FALSE(session) << url;
        EXPECT_EQ(session.Failure().status, code) << url;
        EXPECT_NE(session.Failure().text.find(text), std::string::npos) << session.Failure().text;
    }
}

// A reason that would retitle the terminal, clear it, draw a value line of
// its own and start a C1 escape, and how it must arrive.
const std::string kHostileReason =
    "overloaded\x1b]0;owned\x07\x1b[2J\n12:00:00.000\t42.5\t42.5\tgood\xc2\x9b"
    "31m";
const std::string kReasonArrives = "overloaded]0;owned[2J 12:00:00.000 42.5 42.5 good31m";

bool HasControls(std::string_view text) {
    for (size_t i = 0; i < text.size(); ++i) {
        const auto byte = static_cast<unsigned char>(text[i]);
        const bool c1 = byte == 0xC2 && i + 1 < text.size() &&
                        (static_cast<unsigned char>(text[i + 1]) & 0xE0) == 0x80;
        if (byte < 0x20 || byte == 0x7F || c1) {
            return true;
        }
    }
    return false;
}

TEST(ScriptedServerFaults, ReasonsFromTheServerArriveWithoutControlCharacters) {
    const ErrorMessage hostile{status::BadTcpInternalError, kHostileReason};
    const auto readFailure = [](std::function<void(ScriptedServer&, const Request&)> answer) {
        Scripted scripted(OnFirstRead(std::move(answer)));
        EXPECT_TRUE(scripted.Connect());
        auto read = scripted.Read();
        return read ? std::string("the Read worked") : read.Failure().text;
    };
    const auto shutdownReason = [] {
        ClientOptions options = Scripted::Options();
        options.keepAliveIntervalMs = 100;
        Scripted scripted(OnFirstRead([](ScriptedServer& s, const Request& r) {
                              ReadResponse state;
                              state.results.resize(2);
                              state.results[0].value = int32_t{4};
                              state.results[1].value = LocalizedText{"en", kHostileReason};
                              s.Reply(r, state);
                          }),
                          options);
        EXPECT_TRUE(scripted.Connect());
        return scripted.WaitForEvents(1) ? scripted.events_[0].second.text : "no event";
    };
    const std::vector<std::pair<const char*, std::string>> texts = {
        {"abort chunk", readFailure([&](ScriptedServer& s, const Request& r) {
             s.SendChunk(MessageKind::Message, 'A', r.requestId, Encode(hostile));
         })},
        {"ERR message", readFailure([&](ScriptedServer& s, const Request&) {
             s.SendRaw(MakeFrame(MessageKind::Error, ChunkType::Final, Encode(hostile)));
         })},
        {"shutdown reason", shutdownReason()},
    };
    for (const auto& [name, text] : texts) {
        SCOPED_TRACE(name);
        EXPECT_FALSE(HasControls(text)) << text;
        EXPECT_NE(text.find(kReasonArrives), std::string::npos) << text;
    }
}

}  // namespace
}  // namespace cv::ua::test
