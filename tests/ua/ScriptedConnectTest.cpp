#include <gtest/gtest.h>

#include <limits>

#include "ua/ScriptedServer.h"
#include "ua/client/Client.h"
#include "ua/support/DispatchQueue.h"

namespace cv::ua::test {
namespace {

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
