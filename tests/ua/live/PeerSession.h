#pragma once

#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>
#include <memory>
#include <string>

#include "ua/client/Client.h"
#include "ua/support/DispatchQueue.h"
#include "ua/support/Printers.h"

namespace cv::ua::test {

// The endpoint URL of the node-opcua peer that CTest started for this test.
inline std::string PeerUrl() {
    const char* file = std::getenv("CV_UA_PEER_URL_FILE");
    std::ifstream in(file ? file : "");
    std::string url;
    std::getline(in, url);
    return url;
}

// A test with a client connected to the peer.
class PeerSession : public ::testing::Test {
  protected:
    void SetUp() override {
        url_ = PeerUrl();
        ASSERT_FALSE(url_.empty()) << "CV_UA_PEER_URL_FILE names no endpoint URL";
        client_ = std::make_unique<Client>(queue_.MakeDispatcher(), Options());
        auto session =
            Await<SessionInfo>(queue_, [&](auto done) { client_->Connect(url_, std::move(done)); });
        ASSERT_TRUE(session) << session.Failure().text;
    }

    void TearDown() override {
        if (client_) {
            bool closed = false;
            client_->Close([&closed] { closed = true; });
            queue_.RunUntil([&closed] { return closed; });
        }
    }

    virtual ClientOptions Options() const { return {}; }

    // The peer's node ns=1;s=<path>.
    static NodeId Node(const std::string& path) { return NodeId(1, path); }
    static ReadValueId ValueOf(const NodeId& node, uint32_t attributeId = attribute::Value) {
        return {node, attributeId, "", {}};
    }

    Result<std::vector<DataValue>> Read(std::vector<ReadValueId> nodes, double maxAgeMs = 0) {
        return Await<std::vector<DataValue>>(queue_, [&](auto done) {
            client_->Read(std::move(nodes), maxAgeMs, TimestampsToReturn::Both, std::move(done));
        });
    }
    DataValue ReadOne(const NodeId& node) {
        auto values = Read({ValueOf(node)});
        return values ? values.Value().at(0)
                      : DataValue{Variant(), values.Failure().status, {}, {}, 0, 0};
    }

    DispatchQueue queue_;
    std::string url_;
    std::unique_ptr<Client> client_;
};

}  // namespace cv::ua::test
