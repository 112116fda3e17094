#include "ua/live/PeerSession.h"

namespace cv::ua::test {
namespace {

// Runs against a peer of its own, which it shuts down.
class PeerShutdown : public PeerSession {
  protected:
    ClientOptions Options() const override {
        ClientOptions options;
        options.keepAliveIntervalMs = 200;
        return options;
    }
};

TEST_F(PeerShutdown, AnnouncesTheShutdownWithItsReasonThenLosesTheConnection) {
    std::vector<std::pair<ConnectionEvent, Error>> events;
    client_->SetEventHandler([&events](ConnectionEvent event, const Error& reason) {
        events.emplace_back(event, reason);
    });
    auto written = Await<std::vector<StatusCode>>(queue_, [&](auto done) {
        client_->WriteValues({{Node("Control.ShutdownReason"), "Maintenance of the test peer"},
                              {Node("Control.ShutdownDelay"), 600},
                              {Node("Control.Shutdown"), true}},
                             std::move(done));
    });
    ASSERT_TRUE(written) << written.Failure().text;
    ASSERT_TRUE(queue_.RunUntil([&] { return events.size() >= 2; }));
    EXPECT_EQ(events[0].first, ConnectionEvent::ServerShutdown);
    EXPECT_EQ(events[0].second.status, status::BadShutdown);
    EXPECT_EQ(events[0].second.text, "Maintenance of the test peer");
    EXPECT_EQ(events[1].first, ConnectionEvent::ConnectionLost);
    EXPECT_TRUE(events[1].second.status.IsBad());

    const DataValue after = ReadOne(NodeId(0, ids::ServerStatusState));
    EXPECT_EQ(after.status, status::BadSessionClosed);
}

}  // namespace
}  // namespace cv::ua::test
