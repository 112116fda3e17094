#include <gtest/gtest.h>

#include <limits>
#include <regex>

#include "ua/ScriptedServer.h"
#include "ua/client/Client.h"
#include "ua/support/DispatchQueue.h"

namespace cv::ua::test {
namespace {

using Request = ScriptedServer::Request;
using namespace std::chrono_literals;

// A whole connection may take a second, each request a minute: only the
// connection's one wait can end a connect that stalls.
ClientOptions OneSecondToConnect() {
    ClientOptions options;
    options.channel.connectTimeoutMs = 1'000;
    options.requestTimeoutMs = 60'000;
    options.resumeSessions = false;
    return options;
}

// Runs the script for requests of one kind only (0: Hello).
ScriptedServer::Script On(uint32_t typeId, std::function<void(ScriptedServer&, const Request&)> f) {
    return [typeId, f](ScriptedServer& server, const Request& request) {
        if (request.typeId != typeId || (typeId == 0 && request.kind != MessageKind::Hello)) {
            return false;
        }
        f(server, request);
        return true;
    };
}

// Sends the answer a byte every 100 ms: it would take seconds to arrive.
template <class Response>
void DripAnswer(ScriptedServer& server, const Request& request, Response response) {
    response.header.requestHandle = request.requestHandle;
    server.Drip(server.Chunk(MessageKind::Message, 'F', request.requestId, EncodeMessage(response)),
                100ms);
}

struct Stall {
    const char* name;
    ScriptedServer::Script script;
    bool discovery;
};

TEST(ScriptedConnect, AStallingServerGetsOneWaitForTheWholeConnection) {
    const std::vector<Stall> stalls = {
        {"Hello never answered", On(0, [](ScriptedServer&, const Request&) {}), false},
        {"Acknowledge dripped",
         On(0,
            [](ScriptedServer& s, const Request&) {
                s.Drip(MakeFrame(MessageKind::Acknowledge, ChunkType::Final, Encode(s.acknowledge)),
                       100ms);
            }),
         false},
        {"CreateSession answer dripped",
         On(CreateSessionRequest::kEncodingId,
            [](ScriptedServer& s, const Request& r) { DripAnswer(s, r, CreateSessionResponse{}); }),
         false},
        {"ActivateSession never answered",
         On(ActivateSessionRequest::kEncodingId, [](ScriptedServer&, const Request&) {}), false},
        {"GetEndpoints answer dripped",
         On(GetEndpointsRequest::kEncodingId,
            [](ScriptedServer& s, const Request& r) { DripAnswer(s, r, GetEndpointsResponse{}); }),
         true},
    };
    for (const Stall& stall : stalls) {
        SCOPED_TRACE(stall.name);
        ScriptedServer server(stall.script);
        DispatchQueue queue;
        Client client(queue.MakeDispatcher(), OneSecondToConnect());
        std::optional<Error> failure;
        const auto fail = [&failure](const auto& result) {
            failure = result ? Error{} : result.Failure();
        };
        if (stall.discovery) {
            client.GetEndpoints(server.Url(), fail);
        } else {
            client.Connect(server.Url(), fail);
        }
        // A generous bound, far below the minute a request may take.
        ASSERT_TRUE(queue.RunUntil([&failure] { return failure.has_value(); }, 20s));
        EXPECT_EQ(failure->status, status::BadTimeout) << failure->text;
        std::smatch wait;
        ASSERT_TRUE(std::regex_search(failure->text, wait, std::regex(R"(within (\d+) ms)")))
            << failure->text;
        EXPECT_LE(std::stoul(wait[1]), 1'000u) << failure->text;
    }
}

TEST(ScriptedConnect, TheServersSessionTimeOutIsKeptWithinASecondAndAnHour) {
    constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();
    constexpr double kInfinity = std::numeric_limits<double>::infinity();
    const uint32_t asked = ClientOptions{}.requestedSessionTimeoutMs;
    const std::vector<std::pair<double, uint32_t>> cases = {
        {60'000, 60'000},  {kNaN, asked},       {-5, asked},
        {0, asked},        {-kInfinity, asked}, {10, 1'000},
        {1e12, 3'600'000}, {1e300, 3'600'000},  {kInfinity, 3'600'000},
    };
    for (const auto& [revised, kept] : cases) {
        SCOPED_TRACE(revised);
        ScriptedServer server;
        server.sessionTimeoutMs = revised;
        DispatchQueue queue;
        Client client(queue.MakeDispatcher());
        auto session =
            Await<SessionInfo>(queue, [&](auto done) { client.Connect(server.Url(), done); });
        ASSERT_TRUE(session) << session.Failure().text;
        EXPECT_EQ(session.Value().revisedSessionTimeoutMs, kept);
    }
}

}  // namespace
}  // namespace cv::ua::test
