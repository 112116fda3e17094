#include <algorithm>
#include <set>

#include "ua/live/PeerSession.h"

namespace cv::ua::test {
namespace {

class PeerBrowse : public PeerSession {
  protected:
    Result<std::vector<BrowseResult>> Browse(const NodeId& node, uint32_t maxReferences) {
        BrowseDescription description;
        description.nodeId = node;
        description.nodeClassMask =
            static_cast<uint32_t>(NodeClass::Object) | static_cast<uint32_t>(NodeClass::Variable);
        return Await<std::vector<BrowseResult>>(queue_, [&](auto done) {
            client_->Browse({description}, maxReferences, std::move(done));
        });
    }
    Result<std::vector<BrowseResult>> Next(const ByteString& point, bool release) {
        return Await<std::vector<BrowseResult>>(
            queue_, [&](auto done) { client_->BrowseNext({point}, release, std::move(done)); });
    }
    static std::set<std::string> Names(const BrowseResult& result) {
        std::set<std::string> names;
        for (const ReferenceDescription& reference : result.references) {
            names.insert(reference.displayName.text);
        }
        return names;
    }
};

TEST_F(PeerBrowse, FindsTheFoldersUnderObjectsAndTheVariablesOfAnItem) {
    auto objects = Browse(NodeId(0, ids::ObjectsFolder), 0);
    ASSERT_TRUE(objects) << objects.Failure().text;
    const auto names = Names(objects.Value()[0]);
    for (const char* folder : {"Plant", "Static", "Memory", "Quality", "Dynamic", "Control"}) {
        EXPECT_TRUE(names.count(folder)) << folder;
    }
    auto item = Browse(Node("Plant.Area1.FIC101"), 0);
    ASSERT_TRUE(item);
    EXPECT_EQ(Names(item.Value()[0]), (std::set<std::string>{"PV", "SP", "OUT", "Mode"}));
    const auto pv =
        std::find_if(item.Value()[0].references.begin(), item.Value()[0].references.end(),
                     [](const ReferenceDescription& r) { return r.displayName.text == "PV"; });
    EXPECT_EQ(pv->nodeId.nodeId, Node("Plant.Area1.FIC101.PV"));
    EXPECT_EQ(pv->nodeClass, NodeClass::Variable);
}

TEST_F(PeerBrowse, WalksALargeFolderWithContinuationPoints) {
    auto page = Browse(Node("Large"), 1000);
    ASSERT_TRUE(page) << page.Failure().text;
    std::set<std::string> names = Names(page.Value()[0]);
    int pages = 1;
    ByteString point = page.Value()[0].continuationPoint;
    while (!point.bytes.empty() && pages < 10) {
        auto next = Next(point, false);
        ASSERT_TRUE(next) << next.Failure().text;
        const auto more = Names(next.Value()[0]);
        names.insert(more.begin(), more.end());
        point = next.Value()[0].continuationPoint;
        ++pages;
    }
    EXPECT_EQ(names.size(), 3000u);
    EXPECT_EQ(pages, 3);
}

TEST_F(PeerBrowse, ReleasesAContinuationPoint) {
    auto page = Browse(Node("Large"), 10);
    ASSERT_TRUE(page);
    const ByteString point = page.Value()[0].continuationPoint;
    ASSERT_FALSE(point.bytes.empty());
    auto released = Next(point, true);
    ASSERT_TRUE(released) << released.Failure().text;
    EXPECT_TRUE(released.Value()[0].references.empty());
    auto reused = Next(point, false);
    ASSERT_TRUE(reused);
    EXPECT_EQ(reused.Value()[0].statusCode, status::BadContinuationPointInvalid);
}

TEST_F(PeerBrowse, TranslatesBrowsePathsToNodeIds) {
    const auto path = [](NodeId start, std::vector<QualifiedName> names) {
        BrowsePath browsePath;
        browsePath.startingNode = std::move(start);
        for (QualifiedName& name : names) {
            RelativePathElement element;
            element.targetName = std::move(name);
            browsePath.relativePath.elements.push_back(element);
        }
        return browsePath;
    };
    auto results = Await<std::vector<BrowsePathResult>>(queue_, [&](auto done) {
        client_->TranslateBrowsePaths({path(NodeId(0, ids::ObjectsFolder),
                                            {{1, "Plant"}, {1, "Area1"}, {1, "FIC101"}, {1, "PV"}}),
                                       path(Node("Plant.Area1.FIC101.PV"), {{0, "EURange"}}),
                                       path(NodeId(0, ids::ObjectsFolder), {{1, "NoSuchFolder"}})},
                                      std::move(done));
    });
    ASSERT_TRUE(results) << results.Failure().text;
    ASSERT_EQ(results.Value()[0].targets.size(), 1u);
    EXPECT_EQ(results.Value()[0].targets[0].targetId.nodeId, Node("Plant.Area1.FIC101.PV"));
    ASSERT_EQ(results.Value()[1].targets.size(), 1u);
    EXPECT_EQ(results.Value()[1].targets[0].targetId.nodeId, Node("Plant.Area1.FIC101.PV-EURange"));
    EXPECT_TRUE(results.Value()[2].statusCode.IsBad());
}

TEST_F(PeerBrowse, DiscoversTheServerAndItsEndpoint) {
    auto servers = Await<std::vector<ApplicationDescription>>(
        queue_, [&](auto done) { client_->FindServers(url_, std::move(done)); });
    ASSERT_TRUE(servers) << servers.Failure().text;
    ASSERT_EQ(servers.Value().size(), 1u);
    EXPECT_EQ(servers.Value()[0].applicationUri, "urn:127.0.0.1:ua-test-peer");
    EXPECT_EQ(servers.Value()[0].applicationType, ApplicationType::Server);
    EXPECT_FALSE(servers.Value()[0].discoveryUrls.empty());

    auto endpoints = Await<std::vector<EndpointDescription>>(
        queue_, [&](auto done) { client_->GetEndpoints(url_, std::move(done)); });
    ASSERT_TRUE(endpoints) << endpoints.Failure().text;
    ASSERT_EQ(endpoints.Value().size(), 1u);
    const EndpointDescription& endpoint = endpoints.Value()[0];
    EXPECT_EQ(endpoint.securityMode, MessageSecurityMode::None);
    EXPECT_TRUE(endpoint.transportProfileUri.ends_with("uatcp-uasc-uabinary"));
    ASSERT_FALSE(endpoint.userIdentityTokens.empty());
    EXPECT_EQ(endpoint.userIdentityTokens[0].policyId, "anonymous");
}

}  // namespace
}  // namespace cv::ua::test
