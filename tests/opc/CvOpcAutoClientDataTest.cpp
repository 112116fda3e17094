#include <optional>
#include <utility>

#include "opc/OpcClientFixture.h"

namespace cv::test {
namespace {

// Channels A (group 1), B (group 2) and C (group 1) on the plant's memory
// items: their client handles are 1, 2 and 3.
struct ServedThree : OpcClientTest {
    ServedThree() {
        for (const auto& [item, type] :
             {std::pair("Types.Memory.I4", 0), std::pair("Types.Memory.R8", 13),
              std::pair("Types.Memory.I2", 0)}) {
            EXPECT_FALSE(client->AddChannel(NewChannel(item, type)));
        }
    }
    std::unique_ptr<CvOpcAutoClient> client = Connected(tp.platform);
};

// A value reaches only the channel its handle was given to, whatever group
// 2 holds; a handle of no channel of the notifying group ends the
// notification.
TEST_F(ServedThree, NotificationsReachOnlyTheirOwnChannel) {
    struct Row {
        int32_t group;
        std::vector<int32_t> handles;
        std::vector<int32_t> values;
    };
    const Row rows[] = {
        {1, {3, 1}, {10, -1, 30}},     {1, {2, 3}, {-1, -1, -1}}, {2, {2}, {-1, 20, -1}},
        {1, {1, 99, 3}, {10, -1, -1}}, {1, {0, 1}, {-1, -1, -1}}, {1, {-4, 1}, {-1, -1, -1}},
        {2, {1}, {-1, -1, -1}},
    };
    for (const Row& row : rows) {
        for (const auto& channel : channels) {
            channel->MarkGoingOnline();
        }
        const DataChangeArgs args = Notification(row.handles);
        row.group == 2 ? client->mcOpcGroup2_DataChange(args)
                       : client->mcOpcGroup1_DataChange(args);
        EXPECT_EQ(Values(), row.values) << row.handles.front();
    }
}

TEST_F(ServedThree, NotificationsSurviveBrokenArraysAndRemovedChannels) {
    DataChangeArgs args = Notification({1, 3});
    args.NumItems = 5;
    args.Qualities = OneBased<int32_t>{kGood};
    client->mcOpcGroup1_DataChange(args);
    EXPECT_EQ(Values(), (std::vector<int32_t>{10, -1, -1}));
    args.NumItems = -1;
    client->mcOpcGroup1_DataChange(args);
    channels[0].reset();
    client->mcOpcGroup1_DataChange(Notification({1, 3}));
    EXPECT_EQ(Values(), (std::vector<int32_t>{-1, -1, 30}));
    client->RemoveExtraGroup();
    ASSERT_FALSE(client->AddChannel(NewChannel("Types.Memory.I4")));
    client->mcOpcGroup1_DataChange(Notification({2, 4}));
    client->mcOpcGroup1_DataChange(Notification({4}));
    EXPECT_EQ(Values(), (std::vector<int32_t>{-1, -1, 30, 40}));
}

// The plant's own notifications, once advised, with group 2 in between.
TEST_F(ServedThree, AdvisedGroupOneSendsItsValues) {
    ASSERT_FALSE(tp.plant.SetItemValue("", kPlant, "Types.Memory.I4", Variant::I4(7)));
    ASSERT_FALSE(tp.plant.SetItemValue("", kPlant, "Types.Memory.I2", Variant::I2(3)));
    ASSERT_FALSE(client->UpdateRate(1, 100));
    client->Advise(1, true);
    tp.events.Advance(200);
    EXPECT_EQ(channels[0]->RawValue(), Variant::I4(7));
    EXPECT_EQ(channels[2]->RawValue(), Variant::I2(3));
    EXPECT_FALSE(channels[1]->IsOnline());
}

TEST_F(OpcClientTest, GroupReadStopsAtAnItemErrorOrAChannelNotOnline) {
    const auto client = Connected(tp.platform);
    for (const char* item : {"Quality.Good", "Quality.NotConnected", "Quality.Good"}) {
        ASSERT_FALSE(client->AddChannel(NewChannel(item)));
    }
    EXPECT_FALSE(client->SingleShotReadGroup(1));
    EXPECT_TRUE(channels[0]->IsOnline());
    EXPECT_EQ(channels[1]->ErrorStr(), "OPC Server error: \"Not connected\"");
    EXPECT_EQ(channels[2]->OpcRawValueVarType(), 0);
    EXPECT_EQ(client->SingleShotReadGroup(2).Number, 91);

    const auto scriptedClient = Connected(scripted);
    for (int i = 0; i < 3; ++i) {
        ASSERT_FALSE(scriptedClient->AddChannel(NewChannel("A.B")));
    }
    script.itemErrors = {{2, OPC_E_BADRIGHTS}};
    EXPECT_EQ(scriptedClient->SingleShotReadGroup(1).Number, OPC_E_BADRIGHTS);
    EXPECT_TRUE(channels[3]->IsOnline());
    EXPECT_FALSE(channels[4]->IsOnline() || channels[5]->IsOnline());
    script.answeredItems = 2;
    EXPECT_EQ(scriptedClient->SingleShotReadGroup(1).Number, E_FAIL);
}

// The written value by the item's type, found from a device read the first
// time an item is written.
TEST_F(OpcClientTest, SendValueConvertsTheTextToTheItemsType) {
    struct Row {
        const char* item;
        const char* text;
        const char* written;
        bool readFirst;
        std::optional<Variant> readBack;  // none: the server refuses it
    };
    const Row rows[] = {
        {"Types.Memory.I2", "2.5", "2", true, Variant::I2(2)},
        {"Types.Memory.I2", "3.5", "4", false, Variant::I2(4)},
        {"Types.Memory.I2", "40000", "40000", false, std::nullopt},
        {"Types.Memory.I4", "-7.5", "-8", true, Variant::I4(-8)},
        {"Types.Memory.R4", "1.25", "1.25", true, Variant::R4(1.25f)},
        {"Types.Memory.R8", "0.1", "0.100000001490116", true, Variant::R8(0.1f)},
        {"Types.Memory.BSTR", "a b", "a b", true, Variant::Str("a b")},
        {"Types.Memory.BOOL", "TRUE", "True", true, Variant::Bool(true)},
        {"Types.Memory.BOOL", "0", "False", false, Variant::Bool(false)},
        {"Types.Memory.BOOL", "2.5", "True", false, Variant::Bool(true)},
        {"Types.Memory.DATE", "2", "2", true, Variant::Date(2)},
        {"Types.ReadOnly.R8", "1", "1", true, std::nullopt},
    };
    const auto client = Connected(tp.platform);
    for (const Row& row : rows) {
        Channel& channel = NewChannel(row.item);
        ASSERT_FALSE(client->AddChannel(channel));
        Trace();
        ErrorInfo error;
        const std::string message = client->SendValue(channel, row.text, error);
        EXPECT_FALSE(error) << row.item << " " << row.text;
        EXPECT_EQ(message.empty(), row.readBack.has_value()) << message;
        const auto labels = Trace();
        EXPECT_EQ(labels.front() == "Group.SyncRead , Items=1", row.readFirst) << row.item;
        EXPECT_EQ(labels.back(),
                  std::string("Group.SyncWrite , Items=1, Value(1) = ") + row.written);
        if (row.readBack) {
            ASSERT_FALSE(client->SingleShotReadOneItem(channel));
            EXPECT_EQ(channel.RawValue(), *row.readBack) << row.item << " " << row.text;
        }
    }
}

// A read that fails before a write leaves its error; the value then goes
// out in single precision with the server's words for the write's error.
TEST_F(OpcClientTest, SendValueKeepsTheReadErrorAndTheServersWords) {
    const auto client = Connected(scripted);
    Channel& channel = NewChannel("A.B");
    ASSERT_FALSE(client->AddChannel(channel));
    script.itemErrors = {{1, OPC_E_BADTYPE}};
    ErrorInfo error;
    EXPECT_EQ(client->SendValue(channel, "12", error),
              "Error message from OPC Server: \"Scripted text of -1073479676\".");
    EXPECT_EQ(error.Number, OPC_E_BADTYPE);
    EXPECT_EQ(script.written, std::vector<Variant>{Variant::R4(12)});
    script.failures = {{"GetErrorString", E_FAIL}};
    EXPECT_EQ(client->SendValue(channel, "12", error), "");
    EXPECT_EQ(error.Number, OPC_E_BADTYPE);
    Channel& stranger = NewChannel("A.B");
    EXPECT_EQ(client->SendValue(stranger, "1", error), "");
    EXPECT_EQ(error.Number, OPC_E_INVALIDHANDLE);
    EXPECT_EQ(client->SingleShotReadOneItem(stranger).Number, OPC_E_INVALIDHANDLE);
}

}  // namespace
}  // namespace cv::test
