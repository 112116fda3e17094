#include <cmath>

#include "platform/sim/Generator.h"
#include "platform/sim/SimFixture.h"

namespace cv::sim::test {
namespace {

struct SimGroupTest : SimFixture {
    std::unique_ptr<OPCServer> server = Connected("Sim.Plant.1");
    std::shared_ptr<OPCGroup> group = AddGroup(*server);
    Notifications heard;

    // Makes the group send notifications at the rate.
    void Subscribe(int32_t rate) {
        heard.Listen(*group, events);
        ASSERT_FALSE(group->SetUpdateRate(rate));
        ASSERT_FALSE(group->SetIsSubscribed(true));
        ASSERT_FALSE(group->SetIsActive(true));
    }
};

TEST_F(SimGroupTest, AddItemsAnswersEachItemAsARealServerDoes) {
    struct Case {
        const char* id;
        const char* path;
        int32_t result;
    };
    const Case cases[] = {
        {"Area1.Unit1.FIC101.PV", "", S_OK},
        {"area1.unit1.fic101.pv", "", S_OK},
        {"Signals.Ramp", "any path", S_OK},  // items without paths take no notice of one
        {"", "", OPC_E_INVALIDITEMID},
        {"Area1..PV", "", OPC_E_INVALIDITEMID},
        {".Area1", "", OPC_E_INVALIDITEMID},
        {"Signals.", "", OPC_E_INVALIDITEMID},
        {"Signals. Ramp", "", OPC_E_INVALIDITEMID},
        {"Signals.Ramp\t", "", OPC_E_INVALIDITEMID},
        {"Signals.Nothing", "", OPC_E_UNKNOWNITEMID},
        {"Area1.Unit1", "", OPC_E_UNKNOWNITEMID},  // a branch, not an item
        {"Special.PathItem", "", OPC_E_UNKNOWNPATH},
        {"Special.PathItem", "COM3", OPC_E_UNKNOWNPATH},
        {"Special.PathItem", "com2", S_OK},
        {"Special.OptionalPath", "", S_OK},
        {"Special.OptionalPath", "Medium", OPC_E_UNKNOWNPATH},
    };
    for (const Case& c : cases) {
        const int32_t answer = AddItem(*group, c.id, 1, c.path);
        EXPECT_EQ(answer > 0 ? S_OK : answer, c.result) << "\"" << c.id << "\" path " << c.path;
    }
}

TEST_F(SimGroupTest, UnknownServerHandlesAreInvalidInEveryCall) {
    const int32_t handle = AddItem(*group, "Signals.Ramp");
    const int32_t unknown = handle + 100;
    OneBased<int32_t> errors;
    ASSERT_FALSE(group->OPCItems().Remove(1, OneBased<int32_t>{unknown}, errors));
    EXPECT_EQ(errors(1), OPC_E_INVALIDHANDLE);
    EXPECT_EQ(ReadOne(*group, unknown).error, OPC_E_INVALIDHANDLE);
    EXPECT_EQ(WriteOne(*group, unknown, Variant::R8(1)), OPC_E_INVALIDHANDLE);
    std::shared_ptr<platform::OPCItem> item;
    EXPECT_EQ(group->OPCItems().GetOPCItem(unknown, item).Number, OPC_E_INVALIDHANDLE);

    ASSERT_FALSE(group->OPCItems().GetOPCItem(handle, item));
    ASSERT_FALSE(group->OPCItems().Remove(1, OneBased<int32_t>{handle}, errors));
    EXPECT_EQ(ReadOne(*group, handle).error, OPC_E_INVALIDHANDLE) << "a removed item";
    EXPECT_EQ(item->SetIsActive(true).Number, OPC_E_INVALIDHANDLE);
}

TEST_F(SimGroupTest, CallsWithCountsTheArraysDoNotHoldAreRefused) {
    OneBased<Variant> values;
    OneBased<int32_t> errors, qualities, handles;
    OneBased<double> stamps;
    OneBased<ValueDetail> details;
    const OneBased<int32_t> one({1});
    EXPECT_EQ(group->SyncRead(2, 0, one, values, errors, qualities, stamps, details).Number,
              E_INVALIDARG);
    EXPECT_EQ(group->SyncRead(2, 2, one, values, errors, qualities, stamps, details).Number,
              E_INVALIDARG);
    EXPECT_EQ(group->SyncRead(3, 1, one, values, errors, qualities, stamps, details).Number,
              E_INVALIDARG);
    EXPECT_EQ(group->SyncWrite(1, one, OneBased<Variant>(), errors).Number, E_INVALIDARG);
    EXPECT_EQ(
        group->OPCItems()
            .AddItems(1, OneBased<std::string>(), one, OneBased<std::string>(), handles, errors)
            .Number,
        E_INVALIDARG);
}

TEST_F(SimGroupTest, NotificationsComeAtTheRateWithOnlyTheItemsThatChanged) {
    AddItem(*group, "Signals.Ramp", 1);     // moves every millisecond
    AddItem(*group, "Types.Memory.R8", 2);  // never moves
    AddItem(*group, "Signals.Square", 3);   // flips every 5 s
    Subscribe(1000);
    events.Advance(12000);

    ASSERT_EQ(heard.Count(), 13u) << "one at once, then one a second";
    EXPECT_EQ(heard.Handles(0), (std::vector<int32_t>{1, 2, 3}));
    for (size_t i = 1; i < heard.Count(); ++i) {
        EXPECT_EQ(heard.entries[i].atMs - heard.entries[i - 1].atMs, 1000u);
        const bool squareFlipped = heard.entries[i].atMs % 5000 == 0;
        const std::vector<int32_t> changed =
            squareFlipped ? std::vector<int32_t>{1, 3} : std::vector<int32_t>{1};
        EXPECT_EQ(heard.Handles(i), changed) << "at " << heard.entries[i].atMs;
    }
}

TEST_F(SimGroupTest, NothingIsSentUnlessGroupAndItemAreActiveAndTheGroupSubscribed) {
    struct Case {
        bool groupActive;
        bool subscribed;
        bool itemActive;
        bool sent;
    };
    const Case cases[] = {{true, true, true, true},
                          {false, true, true, false},
                          {true, false, true, false},
                          {true, true, false, false}};
    for (const Case& c : cases) {
        auto g = AddGroup(*server, "");
        Notifications seen;
        seen.Listen(*g, events);
        std::shared_ptr<platform::OPCItem> item;
        ASSERT_FALSE(g->OPCItems().GetOPCItem(AddItem(*g, "Signals.Ramp"), item));
        ASSERT_FALSE(item->SetIsActive(c.itemActive));
        ASSERT_FALSE(g->SetIsSubscribed(c.subscribed));
        ASSERT_FALSE(g->SetIsActive(c.groupActive));
        events.Advance(5000);
        EXPECT_EQ(seen.Count() > 0, c.sent) << c.groupActive << c.subscribed << c.itemActive;
    }
}

TEST_F(SimGroupTest, TheRateIsRevisedUpToTheServersFastest) {
    int32_t rate = 0;
    EXPECT_FALSE(group->UpdateRate(rate));
    EXPECT_EQ(rate, 1000) << "a new group's rate";
    EXPECT_EQ(group->SetUpdateRate(-1).Number, E_INVALIDARG);
    AddItem(*group, "Signals.Ramp");
    Subscribe(10);
    EXPECT_FALSE(group->UpdateRate(rate));
    EXPECT_EQ(rate, 50);
    events.Advance(1000);
    EXPECT_EQ(heard.Count(), 21u);
}

TEST_F(SimGroupTest, NotificationsComeFromTheEventLoopNotFromTheCall) {
    AddItem(*group, "Types.Memory.I2");
    heard.Listen(*group, events);
    ASSERT_FALSE(group->SetIsSubscribed(true));
    ASSERT_FALSE(group->SetIsActive(false));
    ASSERT_FALSE(group->SetIsActive(true));
    EXPECT_EQ(heard.Count(), 0u);
    events.DoEvents();
    EXPECT_EQ(heard.Count(), 1u);
}

TEST_F(SimGroupTest, ReactivationAndItemActivationSendThoseValuesOnceMore) {
    const int32_t handle = AddItem(*group, "Types.Memory.I2", 7);
    Subscribe(100);
    events.Advance(1000);
    ASSERT_EQ(heard.Count(), 1u);

    std::shared_ptr<platform::OPCItem> item;
    ASSERT_FALSE(group->OPCItems().GetOPCItem(handle, item));
    ASSERT_FALSE(item->SetIsActive(false));
    ASSERT_FALSE(item->SetIsActive(true));
    events.Advance(1000);
    EXPECT_EQ(heard.Count(), 2u);

    ASSERT_FALSE(group->SetIsActive(false));
    ASSERT_FALSE(group->SetIsActive(true));
    events.Advance(1000);
    EXPECT_EQ(heard.Count(), 3u);
}

TEST_F(SimGroupTest, ADeviceReadGivesTheValueNowACacheReadTheLastOneSeen) {
    const int32_t handle = AddItem(*group, "Signals.Ramp");
    ASSERT_FALSE(group->SetUpdateRate(1000));
    ASSERT_FALSE(group->SetIsActive(false));
    ASSERT_FALSE(group->SetIsActive(true));
    events.Advance(2500);  // looked at 0, 1000 and 2000 ms

    const Read device = ReadOne(*group, handle, 2);
    const Read cache = ReadOne(*group, handle, 1);
    // The ramp runs from 0 to 100 in a minute.
    EXPECT_NEAR(device.value.AsR8(), 2500 * 100.0 / 60000, 1e-9);
    EXPECT_NEAR(cache.value.AsR8(), 2500 * 100.0 / 60000, 1e-9) << "the device read refreshed it";
    EXPECT_EQ(device.quality, 0xC0);
    EXPECT_DOUBLE_EQ(device.stamp, kStartDate + 2500 / 86400000.0);
    EXPECT_DOUBLE_EQ(plant.Now(), device.stamp);

    events.Advance(500);
    EXPECT_NEAR(ReadOne(*group, handle, 1).value.AsR8(), 3000 * 100.0 / 60000, 1e-9);
    ASSERT_FALSE(group->SetIsActive(false));
    EXPECT_EQ(ReadOne(*group, handle, 1).quality, 0x1C) << "an inactive group's cache";
    EXPECT_EQ(ReadOne(*group, handle, 2).quality, 0xC0);
}

TEST_F(SimGroupTest, WritesConvertToTheItemsTypeOrFailAsARealServerDoes) {
    struct Case {
        const char* id;
        Variant value;
        int32_t result;
        Variant readBack;
    };
    const std::vector<Case> cases = {
        {"Types.Memory.I2", Variant::R8(2.5), S_OK, Variant::I2(2)},
        {"Types.Memory.I2", Variant::Str("-12"), S_OK, Variant::I2(-12)},
        {"Types.Memory.I2", Variant::R8(40000), OPC_E_RANGE, {}},
        {"Types.Memory.I2", Variant::Str("twelve"), OPC_E_BADTYPE, {}},
        {"Types.Memory.I2", Variant(), OPC_E_BADTYPE, {}},
        {"Types.Memory.I4", Variant::Bool(true), S_OK, Variant::I4(-1)},
        {"Types.Memory.R4", Variant::R8(1e300), OPC_E_RANGE, {}},
        {"Types.Memory.R8", Variant::R4(0.5f), S_OK, Variant::R8(0.5)},
        {"Types.Memory.BOOL", Variant::Str("true"), S_OK, Variant::Bool(true)},
        {"Types.Memory.BSTR", Variant::R8(1.5), S_OK, Variant::Str("1.5")},
        {"Types.Memory.DATE", Variant::R8(45000.5), S_OK, Variant::Date(45000.5)},
        {"Types.Memory.R8Array", Variant::Array(VT_I2, {Variant::I2(3)}), S_OK,
         Variant::Array(VT_R8, {Variant::R8(3)})},
        {"Types.Memory.I2Array",
         Variant::Array(VT_R8, {Variant::R8(1), Variant::R8(7e4)}),
         OPC_E_RANGE,
         {}},
        {"Types.Memory.R8Array", Variant::R8(1), OPC_E_BADTYPE, {}},
        {"Types.Memory.R8", Variant::Array(VT_R8, {}), OPC_E_BADTYPE, {}},
        {"Types.ReadOnly.R8", Variant::R8(1), OPC_E_BADRIGHTS, {}},
        {"Signals.Ramp", Variant::R8(1), OPC_E_BADRIGHTS, {}},
    };
    for (const Case& c : cases) {
        const int32_t handle = AddItem(*group, c.id);
        const Variant before = ReadOne(*group, handle).value;
        EXPECT_EQ(WriteOne(*group, handle, c.value), c.result) << c.id;
        const Variant after = ReadOne(*group, handle).value;
        EXPECT_EQ(after, c.result == S_OK ? c.readBack : before) << c.id;
    }
}

TEST_F(SimGroupTest, AWrittenValueGoesOutInTheNextNotificationOnce) {
    const int32_t handle = AddItem(*group, "Types.Memory.R8", 4);
    Subscribe(1000);
    events.Advance(1500);
    ASSERT_EQ(WriteOne(*group, handle, Variant::R8(8.25)), S_OK);
    events.Advance(3000);
    ASSERT_EQ(heard.Count(), 2u);
    EXPECT_EQ(heard.entries[1].atMs, 2000u);
    EXPECT_EQ(heard.entries[1].args.ItemValues(1), Variant::R8(8.25));
    EXPECT_DOUBLE_EQ(heard.entries[1].args.TimeStamps(1), kStartDate + 1500 / 86400000.0);
}

TEST_F(SimGroupTest, AValueThatIsNotANumberCountsAsChangedOnlyWhenItChanges) {
    AddItem(*group, "Special.NotNumbers");  // NaN, then infinities, 10 s each
    Subscribe(100);
    events.Advance(10000);
    ASSERT_EQ(heard.Count(), 2u);
    EXPECT_TRUE(std::isnan(heard.entries[0].args.ItemValues(1).AsR8()));
    EXPECT_EQ(heard.entries[1].atMs, 10000u);
    EXPECT_EQ(heard.entries[1].args.ItemValues(1).AsR8(), INFINITY);
}

}  // namespace
}  // namespace cv::sim::test
