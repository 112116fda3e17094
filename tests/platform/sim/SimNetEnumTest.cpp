#include "platform/sim/SimFixture.h"

namespace cv::sim::test {
namespace {

using namespace platform;
using Names = std::vector<std::string>;

struct SimNetEnumTest : SimFixture {
    NetEnumApi& net = plant.NetEnum();

    static NetResourceRecord Named(std::string remote, std::string provider = "") {
        NetResourceRecord record;
        record.lpRemoteName = std::move(remote);
        record.lpProvider = std::move(provider);
        return record;
    }

    // Every record of the container, fetched as the browser does: first
    // with no room, then with the size that asked for.
    struct Listing {
        int32_t open = 0;
        std::vector<NetResourceRecord> records;
        int32_t end = 0;
        Names Remote() const {
            Names names;
            for (const auto& record : records) {
                names.push_back(record.lpRemoteName);
            }
            return names;
        }
    };
    Listing List(const NetResourceRecord& container, int32_t scope = kResourceGlobalNet,
                 int32_t type = kResourceTypeAny, int32_t usage = kResourceUsageAll) {
        Listing listing;
        NetEnumApi::Handle handle = 0;
        listing.open = net.OpenEnum(scope, type, usage, container, handle);
        if (listing.open != kNetSuccess) {
            EXPECT_EQ(handle, 0);
            return listing;
        }
        for (;;) {
            int32_t count = 1;
            int32_t size = 0;
            NetResourceRecord record;
            int32_t result = net.EnumResource(handle, count, record, size);
            if (result == kNetErrorMoreData) {
                EXPECT_GT(size, 32);
                result = net.EnumResource(handle, count, record, size);
            }
            if (result != kNetSuccess) {
                listing.end = result;
                EXPECT_EQ(count, 0);
                break;
            }
            EXPECT_EQ(count, 1);
            listing.records.push_back(record);
        }
        EXPECT_EQ(net.CloseEnum(handle), kNetSuccess);
        return listing;
    }
};

TEST_F(SimNetEnumTest, ListsProvidersDomainsComputersAndShares) {
    struct Case {
        NetResourceRecord container;
        Names remote;
        int32_t displayType;
    };
    const Case cases[] = {
        {{}, {"Microsoft Windows Network", "Web Client Network"}, kDisplayTypeNetwork},
        {Named("Microsoft Windows Network"), {"PLANT", "OFFICE", "WORKGROUP"}, kDisplayTypeDomain},
        {Named("Web Client Network"), {}, 0},
        {Named("plant"),
         {"\\\\OPCHOST1", "\\\\OPCHOST2", "\\\\SECURE1", "\\\\FIELD7"},
         kDisplayTypeServer},
        // This computer is listed under the name it has on this run.
        {Named("WORKGROUP"), {"\\\\MYPC", "\\\\LAPTOP3"}, kDisplayTypeServer},
        {Named("\\\\OPCHOST1"), {"\\\\OPCHOST1\\Data", "\\\\OPCHOST1\\Logs"}, kDisplayTypeShare},
        {Named("\\\\localhost"), {"\\\\MYPC\\Users"}, kDisplayTypeShare},
        {Named("\\\\OFFICE12"), {}, 0},
    };
    for (const Case& c : cases) {
        const Listing listing = List(c.container);
        SCOPED_TRACE(c.container.lpRemoteName);
        EXPECT_EQ(listing.open, kNetSuccess);
        EXPECT_EQ(listing.end, kNetErrorNoMoreItems);
        EXPECT_EQ(listing.Remote(), c.remote);
        for (const auto& record : listing.records) {
            EXPECT_EQ(record.dwDisplayType, c.displayType);
            EXPECT_EQ(record.dwScope, kResourceGlobalNet);
        }
    }
}

TEST_F(SimNetEnumTest, AComputerRecordCarriesItsCommentAndProvider) {
    const NetResourceRecord host = List(Named("PLANT")).records.at(0);
    EXPECT_EQ(host, (NetResourceRecord{kResourceGlobalNet, kResourceTypeAny, kDisplayTypeServer,
                                       kResourceUsageContainer, "", "\\\\OPCHOST1",
                                       "Control room server", "Microsoft Windows Network"}));
    EXPECT_EQ(host.ByteSize(), 32 + 11 + 20 + 26);
}

TEST_F(SimNetEnumTest, ContainersThatCannotBeListedFailAtOnce) {
    struct Case {
        NetResourceRecord container;
        int32_t scope;
        int32_t type;
        int32_t usage;
        int32_t result;
    };
    const Case cases[] = {
        {Named("\\\\SECURE1"), kResourceGlobalNet, 0, kResourceUsageAll, kNetErrorAccessDenied},
        {Named("\\\\NOWHERE"), kResourceGlobalNet, 0, kResourceUsageAll, kNetErrorBadNetPath},
        {Named("\\\\"), kResourceGlobalNet, 0, kResourceUsageAll, kNetErrorBadNetPath},
        {Named("NODOMAIN"), kResourceGlobalNet, 0, kResourceUsageAll, kNetErrorBadNetPath},
        {Named("\\\\OPCHOST1\\Data"), kResourceGlobalNet, 0, kResourceUsageAll,
         kNetErrorNotContainer},
        {Named("PLANT", "Novell"), kResourceGlobalNet, 0, kResourceUsageAll, kNetErrorBadProvider},
        {{}, 7, 0, kResourceUsageAll, kNetErrorInvalidParameter},
        {{}, kResourceGlobalNet, 9, kResourceUsageAll, kNetErrorInvalidParameter},
        {{}, kResourceGlobalNet, 0, 0x100, kNetErrorInvalidParameter},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.container.lpRemoteName);
        EXPECT_EQ(List(c.container, c.scope, c.type, c.usage).open, c.result);
    }
    EXPECT_EQ(events.TimeGetTime(), 0u) << "none of them waits";
}

TEST_F(SimNetEnumTest, AComputerThatDoesNotAnswerKeepsTheCallerWaitingThenIsNotFound) {
    int ticks = 0;
    events.StartTimer(1000, true, [&] { ++ticks; });
    EXPECT_EQ(List(Named("\\\\FIELD7")).open, kNetErrorBadNetPath);
    EXPECT_EQ(events.TimeGetTime(), 20000u);
    EXPECT_EQ(ticks, 20) << "events ran while it waited";
    EXPECT_EQ(notice.Shown().size(), 1u) << "the busy notice showed past 5 s";
    EXPECT_FALSE(notice.Visible());
}

TEST_F(SimNetEnumTest, ScopesTypesAndUsagesNarrowTheList) {
    EXPECT_EQ(List({}, kResourceConnected).Remote(), Names{}) << "nothing is connected";
    // Containers stay in the list whatever type is asked for.
    EXPECT_EQ(List(Named("OFFICE"), kResourceGlobalNet, kResourceTypePrint).Remote().size(), 2u);
    EXPECT_EQ(List(Named("\\\\FILESRV"), kResourceGlobalNet, kResourceTypePrint).Remote(), Names{});
    EXPECT_EQ(List(Named("\\\\FILESRV"), kResourceGlobalNet, 0, kResourceUsageContainer).Remote(),
              Names{});
}

TEST_F(SimNetEnumTest, HandlesAreCheckedAndTheRecordWaitsForRoom) {
    NetEnumApi::Handle handle = 0;
    ASSERT_EQ(net.OpenEnum(kResourceGlobalNet, 0, 0, {}, handle), kNetSuccess);
    int32_t count = 1;
    int32_t size = 10;
    NetResourceRecord record;
    ASSERT_EQ(net.EnumResource(handle, count, record, size), kNetErrorMoreData);
    const int32_t needed = size;
    EXPECT_EQ(needed, 32 + 2 * 26);
    size = needed - 1;
    EXPECT_EQ(net.EnumResource(handle, count, record, size), kNetErrorMoreData)
        << "the same record again, still too large";
    count = 0;
    size = needed;
    EXPECT_EQ(net.EnumResource(handle, count, record, size), kNetErrorInvalidParameter);
    count = 1;
    ASSERT_EQ(net.EnumResource(handle, count, record, size), kNetSuccess);
    EXPECT_EQ(record.lpRemoteName, "Microsoft Windows Network");

    EXPECT_EQ(net.CloseEnum(handle), kNetSuccess);
    EXPECT_EQ(net.CloseEnum(handle), kNetErrorInvalidHandle);
    EXPECT_EQ(net.EnumResource(handle, count, record, size), kNetErrorInvalidHandle);
    EXPECT_EQ(net.CloseEnum(0), kNetErrorInvalidHandle);
}

}  // namespace
}  // namespace cv::sim::test
