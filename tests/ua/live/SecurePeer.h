#pragma once

#include <memory>

#include "ua/client/EndpointChoice.h"
#include "ua/live/PeerSession.h"
#include "ua/secure/PolicyProfile.h"
#include "ua/support/TestCredentials.h"

namespace cv::ua::test {

// A client of a peer started with --secure: it finds the peer's endpoints
// and connects to the one a choice picks, with the test client's
// certificate.
class SecurePeer : public ::testing::Test {
  protected:
    void SetUp() override {
        url_ = PeerUrl();
        ASSERT_FALSE(url_.empty()) << "CV_UA_PEER_URL_FILE names no endpoint URL";
        ClientOptions options;
        options.applicationUri = ClientCredentials().certificate.ApplicationUri();
        client_ = std::make_unique<Client>(queue_.MakeDispatcher(), options);
        auto endpoints = Await<std::vector<EndpointDescription>>(
            queue_, [&](auto done) { client_->GetEndpoints(url_, std::move(done)); });
        ASSERT_TRUE(endpoints) << endpoints.Failure().text;
        endpoints_ = endpoints.Value();
    }

    void TearDown() override { Close(); }

    Result<SessionInfo> Connect(const SecurityChoice& choice, UserIdentity identity = {}) {
        auto endpoint = ChooseEndpoint(endpoints_, choice);
        if (!endpoint) {
            return endpoint.Failure();
        }
        ConnectOptions connect;
        connect.endpoint = endpoint.Value();
        connect.credentials = std::make_shared<crypto::Credentials>(ClientCredentials());
        connect.identity = std::move(identity);
        return Await<SessionInfo>(
            queue_, [&](auto done) { client_->Connect(url_, connect, std::move(done)); });
    }

    void Close() {
        bool closed = false;
        client_->Close([&closed] { closed = true; });
        queue_.RunUntil([&closed] { return closed; });
    }

    Result<std::vector<DataValue>> Read(std::vector<ReadValueId> nodes) {
        return Await<std::vector<DataValue>>(queue_, [&](auto done) {
            client_->Read(std::move(nodes), 0, TimestampsToReturn::Both, std::move(done));
        });
    }

    static ReadValueId ValueOf(const std::string& path) {
        return {NodeId(1, path), attribute::Value, "", {}};
    }

    DispatchQueue queue_;
    std::string url_;
    std::unique_ptr<Client> client_;
    std::vector<EndpointDescription> endpoints_;
};

}  // namespace cv::ua::test
