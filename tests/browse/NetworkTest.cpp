#include "browse/Network.h"

#include <gtest/gtest.h>

#include "browse/ScriptedNetEnum.h"

namespace cv {
namespace {

using namespace platform;
using test::ScriptedNetEnum;
using Names = std::vector<std::string>;

struct NetworkTest : ::testing::Test {
    ScriptedNetEnum net;

    NetworkTest() {
        net.containers[""].records = {ScriptedNetEnum::Record(kDisplayTypeNetwork, "Net A"),
                                      ScriptedNetEnum::Record(kDisplayTypeNetwork, "Net B")};
        net.containers["Net A"].records = {ScriptedNetEnum::Record(kDisplayTypeDomain, "PLANT")};
    }

    static Names Children(const Network& network) {
        Names names;
        for (int32_t i = 1; i <= network.Count(); ++i) {
            names.push_back(network.Item(i)->RemoteNameMixedCase());
        }
        return names;
    }
};

TEST_F(NetworkTest, ChildrenGetConsecutiveKeysInTheOrderTheNetworkGaveThem) {
    Network network(net);
    EXPECT_EQ(network.Key(), 1);
    EXPECT_EQ(network.Count(), 0);
    EXPECT_TRUE(net.opened.empty()) << "nothing is enumerated before it is asked for";
    network.GetResources();
    ASSERT_EQ(network.Count(), 2);
    EXPECT_EQ(Children(network), (Names{"Net a", "Net b"}));
    for (int32_t i : {1, 2}) {
        EXPECT_EQ(network.Item(i)->Key(), i + 1);
        EXPECT_EQ(network.Item(i)->Parent(), 1);
        EXPECT_FALSE(network.Item(i)->Enumerated());
    }
    for (int32_t outside : {0, -1, 3}) {
        EXPECT_EQ(network.Item(outside), nullptr) << outside;
    }

    network.GoToKey(2);
    network.GetResources();
    EXPECT_EQ(network.Key(), 2);
    EXPECT_EQ(Children(network), Names{"Plant"});
    EXPECT_EQ(network.Item(1)->Key(), 4);
    EXPECT_EQ(net.opened, (Names{"", "Net A"})) << "each container is opened with its own record";

    network.GoToRoot();
    EXPECT_EQ(network.Key(), 1);
    EXPECT_EQ(Children(network), (Names{"Net a", "Net b"})) << "grandchildren are not children";
}

TEST_F(NetworkTest, ANodeIsEnumeratedOnceAndKeysNeverIssuedChangeNothing) {
    Network network(net);
    network.GetResources();
    network.GetResources();
    EXPECT_EQ(net.opened.size(), 1u);
    EXPECT_EQ(network.Count(), 2);
    EXPECT_EQ(network.Item(2)->Key(), 3) << "no node was added the second time";
    for (int32_t never : {0, 4, -7, 1000}) {
        network.GoToKey(2);
        network.GoToKey(never);
        EXPECT_EQ(network.Key(), 2) << never;
    }
}

TEST_F(NetworkTest, EachRecordIsFetchedWithASizingCallThenTheRealOne) {
    Network network(net);
    network.GetResources();
    const int32_t first = net.containers[""].records[0].ByteSize();
    const int32_t second = net.containers[""].records[1].ByteSize();
    ASSERT_EQ(net.enumCalls.size(), 5u);
    const std::vector<std::pair<int32_t, int32_t>> expected = {
        {1, 0}, {1, first}, {1, 0}, {1, second}, {1, 0}};
    for (size_t i = 0; i < expected.size(); ++i) {
        EXPECT_EQ(net.enumCalls[i].count, expected[i].first) << i;
        EXPECT_EQ(net.enumCalls[i].bufferSize, expected[i].second) << i;
    }
    EXPECT_EQ(net.OpenHandles(), 0);
    EXPECT_EQ(net.closed, 1);
}

TEST_F(NetworkTest, FailuresLeaveWhatWasFoundAndAreNotRepeated) {
    struct Case {
        const char* what;
        ScriptedNetEnum::Container container;
        int32_t children;
        int32_t lastReply;
        int closed;
    };
    const auto three = ScriptedNetEnum::Record(kDisplayTypeServer, "\\\\A");
    const Case cases[] = {
        {"all of them", {0, {three, three}}, 2, kNetErrorNoMoreItems, 1},
        {"access denied", {kNetErrorAccessDenied, {three}}, 0, kNetErrorAccessDenied, 0},
        {"not a container", {kNetErrorNotContainer, {}}, 0, kNetErrorNotContainer, 0},
        {"lost half way",
         {0, {three, three, three}, 2, kNetErrorBadNetPath},
         2,
         kNetErrorBadNetPath,
         1},
        {"nothing in it", {0, {}}, 0, kNetErrorNoMoreItems, 1},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        ScriptedNetEnum scripted;
        scripted.containers[""] = c.container;
        Network network(scripted);
        network.GetResources();
        EXPECT_EQ(network.Count(), c.children);
        EXPECT_EQ(network.Item(c.children + 1), nullptr);
        network.GoToKey(1);
        network.GetResources();
        EXPECT_EQ(scripted.opened.size(), 1u) << "the failure is not retried";
        EXPECT_EQ(scripted.closed, c.closed);
        EXPECT_EQ(scripted.OpenHandles(), 0);
        NetResource probe(scripted);
        auto born = probe.GiveBirth(kResourceGlobalNet, kResourceTypeAny, kResourceUsageAll);
        EXPECT_EQ(static_cast<int32_t>(born.size()), c.children);
        EXPECT_EQ(probe.Children(), c.children);
        EXPECT_EQ(probe.LastReply(), c.lastReply);
    }
}

TEST(NetResourceTest, RemoteNameMixedCaseCapitalisesTheFirstLetterOnly) {
    const std::pair<const char*, const char*> cases[] = {
        {"\\\\OPCHOST1", "\\\\Opchost1"},
        {"PLANT", "Plant"},
        {"Microsoft Windows Network", "Microsoft windows network"},
        {"\\\\12-AB", "\\\\12-Ab"},
        {"_X", "_X"},
        {"123", "123"},
        {"\\\\", "\\\\"},
        {"7", "7"},
        {"", ""},
    };
    test::ScriptedNetEnum net;
    for (const auto& [name, mixed] : cases) {
        NetResource resource(net);
        resource.SetRemoteName(name);
        EXPECT_EQ(resource.RemoteNameMixedCase(), mixed) << name;
    }
}

}  // namespace
}  // namespace cv
