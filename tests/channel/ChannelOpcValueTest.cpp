#include <chrono>
#include <memory>
#include <string>
#include <tuple>

#include <gtest/gtest.h>

#include "channel/Channel.h"
#include "opc/CvOpcAutoClient.h"
#include "platform/OleDate.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

constexpr int32_t kGood = 0xC0;
constexpr int32_t kUncertain = 0x40;
const std::string kUncertainText =
    "Uncertain value reported by OPC Server.  The reported reason is :\"Uncertain value - "
    "Undefined reason\"\r\n\r\nContinue showing this warning in this session?";

struct OpcChannel : testing::Test {
    OpcChannel() {
        channel.SetComType(ComTypeCode::Opc);
        channel.SetDescription("PV");
    }
    test::TestPlatform tp;
    Channel channel{tp.platform};
};

TEST_F(OpcChannel, ArraysBecomeLinesAndTextsStopAtNul) {
    channel.SetExpectANumber(false);
    channel.MarkGoingOnline();
    channel.OpcSetRawValue(
        Variant::Array(VT_R8, {Variant::R8(1), Variant::R8(2.5), Variant::R8(-3)}, 1), kGood, 4.5,
        false);
    EXPECT_EQ(channel.RawValue(), Variant::Str("1\r\n2.5\r\n-3\r\n"));
    EXPECT_EQ(channel.OpcRawValueVarType(), VT_BSTR);
    EXPECT_EQ(channel.OpcTimeStamp(), 4.5);
    channel.OpcSetRawValue(Variant::Bytes({0, 7, 255}), kGood, 0, false);
    EXPECT_EQ(channel.RawValue(), Variant::Str("0\r\n7\r\n255\r\n"));
    channel.OpcSetRawValue(Variant::Str(std::string("ab\0cd", 5)), kGood, 0, false);
    EXPECT_EQ(channel.RawValue(), Variant::Str("ab"));
}

TEST_F(OpcChannel, FirstValueMustBeANumberAndQualityDecidesTheState) {
    channel.MarkGoingOnline();
    channel.OpcSetRawValue(Variant::Str("abc"), kGood, 0, false);
    EXPECT_FALSE(channel.IsOnline());
    EXPECT_EQ(channel.ErrorStr(), "\"abc\" has been sent from the Server.  This is not a number.");
    channel.OpcSetRawValue(Variant::R8(1), 0x08, 0, false);  // bad while offline: silent
    EXPECT_EQ(std::tuple(channel.IsOnline(), channel.ErrorStr()), std::tuple(false, ""));
    channel.MarkGoingOnline();
    channel.OpcSetRawValue(Variant::R8(2), 0x15, 0, false);  // last known, low limit
    EXPECT_EQ(std::tuple(channel.IsOnline(), channel.RawValue()), std::tuple(true, Variant::R8(2)));
    channel.OpcSetRawValue(Variant::R8(3), 0x08, 0, false);
    EXPECT_EQ(std::tuple(channel.IsOnline(), channel.OpcRawValueVarType()), std::tuple(false, 0));
    EXPECT_EQ(channel.ErrorStr(), "OPC Server error: \"Not connected\"");
    EXPECT_EQ(channel.ErrorStr(), "");  // told once
}

// Each reason in words: a bad one as the error text of a one-shot read, an
// uncertain one in the warning.
TEST_F(OpcChannel, QualityTextNamesEveryReason) {
    struct Case {
        int32_t quality;
        std::string text;
    };
    const Case cases[] = {
        {0x00, "Bad value of unknown status reported by OPC Server."},
        {0x04, "OPC Server configuration error"},
        {0x08, "OPC Server error: \"Not connected\""},
        {0x0C, "OPC Server error: \"Device failure\""},
        {0x10, "OPC Server error: \"Sensor failure\""},
        {0x18, "OPC Server error: \"Communications failure\""},
        {0x1F, "OPC Server error: \"Out of service\""},
        {0x20, "Bad value of unknown status reported by OPC Server."},
        {0x40, "Uncertain value - Undefined reason"},
        {0x44, "Uncertain value - Last usable"},
        {0x48, "Uncertain value - Undefined reason"},
        {0x50, "Uncertain value - Sensor Cal"},
        {0x54, "Uncertain value - EGU exceeded"},
        {0x59, "Uncertain value - Sub normal"},
    };
    for (const Case& c : cases) {
        Channel read(tp.platform);
        read.SetComType(ComTypeCode::Opc);
        read.SetExpectANumber(false);
        read.MarkGoingOnline();
        tp.run.UncertainWarningOff = false;
        read.OpcSetRawValue(Variant::R8(1), c.quality, 0, true);
        if (read.IsOnline()) {
            (void)read.RawValue();
            EXPECT_NE(tp.dialogs.Last().text.find('"' + c.text + '"'), std::string::npos)
                << std::hex << c.quality;
        } else {
            EXPECT_EQ(read.ErrorStr(), c.text) << std::hex << c.quality;
        }
    }
}

// A late value reaching a channel that timed out (and released its client)
// is kept, but only a channel going online comes online.
TEST_F(OpcChannel, OnlyAChannelGoingOnlineComesOnline) {
    channel.MarkGoingOnline();
    EXPECT_EQ(channel.Online(true), OnlineState::Offline);
    EXPECT_EQ(channel.ErrorStr(), "Timed out waiting for a response");
    for (const int32_t lQuality : {kGood, 0x14, kUncertain}) {
        channel.OpcSetRawValue(Variant::R8(lQuality), lQuality, 0, false);
        EXPECT_EQ(std::tuple(channel.Online(false), channel.OpcRawValueVarType()),
                  std::tuple(OnlineState::Offline, VT_R8));
    }
    EXPECT_TRUE(tp.dialogs.Messages().empty());
    channel.MarkGoingOnline();
    channel.OpcSetRawValue(Variant::R8(5), kGood, 0, false);
    EXPECT_EQ(std::tuple(channel.Online(false), channel.RawValue()),
              std::tuple(OnlineState::Online, Variant::R8(5)));
}

TEST_F(OpcChannel, UncertainWarningOncePerChannelAndNoSilencesAll) {
    channel.MarkGoingOnline();
    channel.OpcSetRawValue(Variant::R8(7), kUncertain, 0, false);
    ASSERT_TRUE(channel.IsOnline());
    ASSERT_EQ(tp.dialogs.Messages().size(), 1u);  // asked while proving the number
    EXPECT_EQ(tp.dialogs.Last().text, kUncertainText);
    EXPECT_EQ(tp.dialogs.Last().title, "PV: Uncertain OPC Value");
    EXPECT_EQ(tp.dialogs.Last().style, 4 + 48);
    channel.OpcSetRawValue(Variant::R8(8), 0x54, 0, false);  // the mark survives
    EXPECT_EQ(channel.RawValue(), Variant::R8(8));
    EXPECT_EQ(tp.dialogs.Messages().size(), 1u);

    // Other channels ask once each, over HDA too, until one is answered No.
    auto uncertain = [&](int32_t lQuality, bool bNumber = false) {
        auto other = std::make_unique<Channel>(tp.platform);
        other->SetComType(ComTypeCode::Opc);
        other->SetExpectANumber(bNumber);
        other->MarkGoingOnline();
        other->OpcSetRawValue(Variant::R8(1), lQuality, 0, false);
        return other;
    };
    auto hda = uncertain(0x58);
    hda->SetComType(ComTypeCode::OpcHda);
    hda->RawValue();
    ASSERT_EQ(tp.dialogs.Messages().size(), 2u);
    EXPECT_NE(tp.dialogs.Last().text.find("OPC HDA Server.  The reported reason is :\"Uncertain "
                                          "value - Sub normal\""),
              std::string::npos);
    tp.dialogs.QueueAnswer(MsgBoxResult::No);
    uncertain(0x44)->RawValue();
    ASSERT_EQ(tp.dialogs.Messages().size(), 3u);
    EXPECT_NE(tp.dialogs.Last().text.find("\"Uncertain value - Last usable\""), std::string::npos);
    EXPECT_TRUE(tp.run.UncertainWarningOff);
    uncertain(kUncertain, true)->RawValue();
    EXPECT_EQ(tp.dialogs.Messages().size(), 3u);
}

TEST_F(OpcChannel, RequestedTypeConvertsOrEmpties) {
    test::TestPlatform comma(fake::FixedLocale::Comma());
    Channel german(comma.platform);
    german.SetComType(ComTypeCode::Opc);
    german.MarkGoingOnline();
    german.OpcSetRawValue(Variant::R8(12.5), kGood, 0, false);
    german.SetDisplayVarType(VT_BSTR);
    EXPECT_EQ(german.RawValue(), Variant::Str("12,5"));
    german.SetDisplayVarType(VT_I2);
    EXPECT_EQ(german.RawValue(), Variant::I2(12));
    german.SetExpectANumber(false);
    german.GoOffline();
    german.MarkGoingOnline();
    german.OpcSetRawValue(Variant::Str("x"), kGood, 0, false);
    EXPECT_EQ(german.RawValue(), Variant());
}

TEST_F(OpcChannel, TimeStampTimeOutAndSendResults) {
    const double dNowUtc = OleDateFromTimePoint(
        std::chrono::time_point_cast<std::chrono::milliseconds>(std::chrono::system_clock::now()));
    EXPECT_NEAR(channel.OpcTimeStamp(), dNowUtc, 0.6);      // no value yet: now, in local time
    EXPECT_EQ(channel.Online(true), OnlineState::Offline);  // only a waiting channel times out
    channel.MarkGoingOnline();
    channel.OpcSetRawValue(Variant::R8(1), kGood, 0, false);
    EXPECT_EQ(channel.Online(true), OnlineState::Online);
    EXPECT_EQ(channel.ErrorStr(), "");
    channel.OpcDataChange("refused");
    EXPECT_EQ(std::tuple(channel.SendResult(), channel.ErrorStr()), std::tuple(2, "refused"));
    channel.OpcDataChange("");
    EXPECT_EQ(channel.SendResult(), 0);
}

// Going offline lets go of the client (a main-group channel calls nothing
// of it; the extra group's removal is the client's test). A destroyed
// channel's presence reads null for the lists that keep it.
TEST_F(OpcChannel, GoingOfflineLetsGoOfTheClient) {
    CvOpcAutoClient client(tp.platform);
    channel.SetOpcClient(&client);
    channel.GoOffline();
    EXPECT_EQ(channel.OpcClient(), nullptr);
    EXPECT_EQ(tp.trace.Entries().size(), 0u);
    auto doomed = std::make_unique<Channel>(tp.platform);
    const auto presence = doomed->Presence();
    EXPECT_EQ(*presence, doomed.get());
    doomed.reset();
    EXPECT_EQ(*presence, nullptr);
}

TEST(ChannelComms, OpcMembersByChannelTypeAndTheUnknownTypesFault) {
    test::TestPlatform tp;
    Channel channel(tp.platform);
    for (int32_t lType : {0, 4, 11, 13, 14, 5, 10, 12, 15}) {
        channel.SetSpecificChannelType(lType);
        EXPECT_EQ(channel.OpcIsActive(), lType <= 4 || lType == 11 || lType == 13 || lType == 14);
        EXPECT_EQ(channel.OpcGroupNumber(), lType == 13 ? 2 : 1);
    }
    EXPECT_EQ(tp.dialogs.Last().text, "Channel.OpcIsActive fault");
    EXPECT_EQ(tp.dialogs.Messages().size(), 1u);
}

}  // namespace
}  // namespace cv
