#include <algorithm>
#include <cmath>
#include <functional>
#include <limits>

#include "opc/OpcClientFixture.h"

namespace cv::test {
namespace {

int Count(const std::vector<std::string>& labels, const std::string& label) {
    return static_cast<int>(std::count(labels.begin(), labels.end(), label));
}

bool IsNaN(const Variant& value) {
    return std::isnan(value.AsR8()) || std::isnan(value.AsR4());
}

// Equal, or NaN of the same type.
bool SameValue(const Variant& a, const Variant& b) {
    return a == b || (a.VarType() == b.VarType() && IsNaN(a) && IsNaN(b));
}

TEST_F(OpcClientTest, ShutdownDuringAPendingCallEndsTheClientOnce) {
    const auto client = Connected(tp.platform);
    Channel& channel = NewChannel("Types.Memory.I4");
    ASSERT_FALSE(client->AddChannel(channel));
    ASSERT_FALSE(tp.plant.SetCallDelay("", kPlant, 1000));
    tp.events.Post([&] { (void)tp.plant.ShutDownServer("", kPlant, "Maintenance"); });
    EXPECT_EQ(client->SingleShotReadGroup(1).Number, RPC_E_DISCONNECTED);
    tp.events.Advance(5000);
    EXPECT_FALSE(client->GoOffline());
    ASSERT_EQ(tp.dialogs.Messages().size(), 1u);
    EXPECT_EQ(tp.dialogs.Last().text, "The OPC Server has been shutdown");
    EXPECT_EQ(tp.dialogs.Last().style, MsgBoxStyle::OKOnly);
    EXPECT_EQ(tp.dialogs.Last().title, "");
    EXPECT_EQ(channel.OpcClient(), nullptr);
    EXPECT_EQ(channel.Online(false), OnlineState::Offline);
    EXPECT_EQ(client->ServerID(), "");
    const auto labels = Trace();
    EXPECT_EQ(Count(labels, "Server.OPCGroups.RemoveAll"), 1);
    EXPECT_EQ(Count(labels, "Server.Disconnect"), 1);
}

// Every call fails cleanly once the server has gone; going offline still
// ends everything and tells the first failure.
TEST_F(OpcClientTest, ServerThatDisappearsFailsEveryCallCleanly) {
    const auto client = Connected(tp.platform);
    Channel& channel = NewChannel("Types.Memory.I4");
    ASSERT_FALSE(client->AddChannel(channel));
    ASSERT_FALSE(tp.plant.DropServer("", kPlant));
    ErrorInfo sent;
    const std::function<ErrorInfo()> calls[] = {
        [&] { return client->SingleShotReadGroup(1); },
        [&] { return client->SingleShotReadOneItem(channel); },
        [&] { return (void)client->SendValue(channel, "1", sent), sent; },
        [&] { return client->AddChannel(NewChannel("Types.Memory.R8")); },
        [&] { return client->UpdateRate(1, 100); },
        [&] { return client->AddExtraGroup(); },
        [&] { return client->GoOffline(); },
    };
    for (const auto& call : calls) {
        EXPECT_EQ(call().Number, RPC_S_SERVER_UNAVAILABLE);
    }
    client->Advise(1, true);
    client->RemoveExtraGroup();
    EXPECT_EQ(client->Channels().Count(), 0);
    EXPECT_EQ(channel.OpcClient(), nullptr);
    EXPECT_EQ(client->ServerID(), "");
}

// The owner may destroy the client while one of its calls waits (an event
// handler does it); the call then answers and touches nothing of it.
TEST_F(OpcClientTest, ClientDestroyedDuringItsOwnCall) {
    using Call = std::function<int32_t(CvOpcAutoClient&, Channel&)>;
    const std::pair<Call, int32_t> rows[] = {
        {[](auto& c, auto&) { return c.SingleShotReadGroup(1).Number; }, RPC_E_DISCONNECTED},
        {[](auto& c, auto& ch) { return c.SingleShotReadOneItem(ch).Number; }, RPC_E_DISCONNECTED},
        {[](auto& c, auto& ch) {
             ErrorInfo error;
             return (void)c.SendValue(ch, "5", error), error.Number;
         },
         RPC_E_DISCONNECTED},
        {[this](auto& c, auto&) { return c.AddChannel(NewChannel("Signals.Ramp")).Number; },
         RPC_E_DISCONNECTED},
        {[this](auto& c, auto&) { return c.AddChannel(NewChannel("Signals.Ramp", 13)).Number; },
         RPC_E_DISCONNECTED},
        {[](auto& c, auto&) { return c.UpdateRate(1, 100).Number; }, RPC_E_DISCONNECTED},
        {[](auto& c, auto&) { return c.RemoveExtraGroup(), 0; }, 0},
        {[](auto& c, auto&) { return c.GoOffline().Number; }, 0},
    };
    for (const auto& [call, result] : rows) {
        ASSERT_FALSE(tp.plant.SetCallDelay("", kPlant, 0));
        auto client = Connected(tp.platform);
        Channel& channel = NewChannel("Types.Memory.I4", 13);
        ASSERT_FALSE(client->AddChannel(channel));
        ASSERT_FALSE(client->UpdateRate(1, 100));
        client->Advise(1, true);
        ASSERT_FALSE(tp.plant.SetCallDelay("", kPlant, 1000));
        tp.events.Post([&] { client.reset(); });
        CvOpcAutoClient& raw = *client;
        EXPECT_EQ(call(raw, channel), result);
        EXPECT_EQ(client, nullptr);
        EXPECT_EQ(channel.OpcClient(), nullptr);
        tp.events.Advance(5000);
    }
    EXPECT_TRUE(tp.dialogs.Messages().empty());
}

// Whichever call an event interrupts, by destroying the client or by taking
// it offline, the member stops there and touches nothing of it after.
TEST_F(OpcClientTest, MembersStopWhereverTheClientEndsUnderThem) {
    using Member = std::function<int32_t(CvOpcAutoClient&, Channel&)>;
    const Member connect = [](auto& c, auto&) { return c.CreateServerAndGroup("X.1", "").Number; };
    const Member add = [this](auto& c, auto&) { return c.AddChannel(NewChannel("E.F")).Number; };
    const Member readGroup = [](auto& c, auto&) { return c.SingleShotReadGroup(1).Number; };
    const Member readOne = [](auto& c, auto& ch) { return c.SingleShotReadOneItem(ch).Number; };
    const Member send = [](auto& c, auto& ch) {
        ErrorInfo error;
        return (void)c.SendValue(ch, "5", error), error.Number;
    };
    const Member removeExtra = [](auto& c, auto&) { return c.RemoveExtraGroup(), 0; };
    const Member offline = [](auto& c, auto&) { return c.GoOffline().Number; };
    const struct {
        const Member& member;
        std::vector<const char*> calls;
        int32_t result;
    } rows[] = {
        {connect,
         {"ServerName", "Connect", "SetClientName", "Add", "SetIsActive", "SetIsSubscribed"},
         RPC_E_DISCONNECTED},
        {add,
         {"IsActive", "SetIsActive", "AddItems", "GetOPCItem", "Item.SetIsActive", "Item.IsActive"},
         RPC_E_DISCONNECTED},
        {readGroup, {"SyncRead"}, RPC_E_DISCONNECTED},
        {readOne, {"SyncRead"}, RPC_E_DISCONNECTED},
        {send, {"SyncRead", "SyncWrite"}, RPC_E_DISCONNECTED},
        {send, {"GetErrorString"}, OPC_E_BADTYPE},
        {removeExtra, {"SetIsSubscribed", "RemoveItems", "Remove"}, 0},
        {offline, {"SetIsActive", "RemoveItems", "RemoveAll", "Disconnect"}, 0},
    };
    for (const bool destroy : {true, false}) {
        for (const auto& row : rows) {
            for (const char* call : row.calls) {
                auto client = &row.member == &connect ? std::make_unique<CvOpcAutoClient>(scripted)
                                                      : Connected(scripted);
                Channel& extra = NewChannel("C.D", 13);
                if (&row.member != &connect) {
                    ASSERT_FALSE(client->AddChannel(NewChannel("A.B")));
                    ASSERT_FALSE(client->AddChannel(extra));
                    client->Advise(1, true);
                }
                script.itemErrors = {{extra.OpcServerHandle(), OPC_E_BADTYPE}};
                script.interruptAt = call;
                script.interruption = [&] { destroy ? client.reset() : (void)client->GoOffline(); };
                CvOpcAutoClient& raw = *client;
                EXPECT_EQ(row.member(raw, extra), row.result) << call << " " << destroy;
                EXPECT_TRUE(script.interruptAt.empty()) << call;
                EXPECT_TRUE(destroy ? client == nullptr : client->Channels().Count() == 0);
                for (const auto& channel : channels) {
                    EXPECT_TRUE(channel == nullptr || channel->OpcClient() == nullptr) << call;
                }
            }
        }
    }
}

TEST_F(OpcClientTest, ConnectingToASlowServerShowsTheBusyNoticeAndMayBeAbandoned) {
    auto client = std::make_unique<CvOpcAutoClient>(tp.platform);
    tp.events.StartTimer(5500, false, [&] { client.reset(); });
    CvOpcAutoClient& raw = *client;
    EXPECT_EQ(raw.CreateServerAndGroup("Sim.Slow.1", "").Number, RPC_E_DISCONNECTED);
    EXPECT_EQ(tp.busy.Shown(), std::vector<std::string>{"Please wait...\r\n\r\nThe OPC Server, "
                                                        "\"Sim.Slow.1\", is still busy."});
    EXPECT_FALSE(tp.busy.Visible());
}

TEST_F(OpcClientTest, NotificationsArriveWhileACallWaits) {
    const auto client = Connected(tp.platform);
    Channel& reader = NewChannel("Types.Memory.I4");
    Channel& writer = NewChannel("Types.Memory.I4", 6);
    ASSERT_FALSE(client->AddChannel(reader));
    ASSERT_FALSE(client->AddChannel(writer));
    ASSERT_FALSE(client->UpdateRate(1, 100));
    client->Advise(1, true);
    ASSERT_FALSE(tp.plant.SetCallDelay("", kPlant, 1000));
    ErrorInfo error;
    EXPECT_EQ(client->SendValue(writer, "42", error), "");
    EXPECT_FALSE(error);
    tp.events.Advance(1000);
    EXPECT_EQ(reader.RawValue(), Variant::I4(42));
}

// Whatever a server sends reaches the channel, which keeps it by its own
// rules: texts cut at a NUL, arrays as lines, numbers that are not finite.
TEST_F(OpcClientTest, UnusualValuesReachTheirChannels) {
    const double kInfinity = std::numeric_limits<double>::infinity();
    const std::pair<const char*, Variant> rows[] = {
        {"Special.NaN", Variant::R8(std::nan(""))},
        {"Special.PlusInfinity", Variant::R8(kInfinity)},
        {"Special.MinusInfinity", Variant::R8(-kInfinity)},
        {"Special.SingleNaN", Variant::R4(std::nanf(""))},
        {"Special.TextWithNul", Variant::Str("before")},
        {"Special.EmptyText", Variant::Str("")},
        {"Types.Arrays.Empty", Variant::Str("")},
        {"Types.ReadOnly.BSTRArray", Variant::Str("one\r\ntwo\r\n\r\n")},
        {"Special.I4Min", Variant::I4(std::numeric_limits<int32_t>::min())},
    };
    const auto client = Connected(tp.platform);
    for (const auto& [item, value] : rows) {
        ASSERT_FALSE(client->AddChannel(NewChannel(item)));
    }
    Channel& huge = NewChannel("Types.Arrays.Huge");
    ASSERT_FALSE(client->AddChannel(huge));
    client->Advise(1, true);
    tp.events.Advance(100);
    for (size_t i = 0; i < std::size(rows); ++i) {
        EXPECT_TRUE(SameValue(channels[i]->RawValue(), rows[i].second)) << rows[i].first;
    }
    std::string lines;
    for (int i = 0; i < 100000; ++i) {
        lines += "7\r\n";
    }
    EXPECT_EQ(huge.RawValue(), Variant::Str(lines));

    DataChangeArgs args = Notification({1, 2, 3});
    args.ItemValues = OneBased<Variant>(
        {Variant(), Variant::Null(),
         Variant::Array(VT_VARIANT, {Variant::Array(VT_I2, {Variant::I2(1)}), Variant::Str("x")})});
    client->mcOpcGroup1_DataChange(args);
    EXPECT_EQ(channels[0]->RawValue(), Variant());
    EXPECT_EQ(channels[1]->OpcRawValueVarType(), 0);
    EXPECT_EQ(channels[2]->RawValue(), Variant::Str("\r\nx\r\n"));
}

}  // namespace
}  // namespace cv::test
