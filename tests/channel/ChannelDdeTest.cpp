#include <string>

#include <gtest/gtest.h>

#include "channel/Channel.h"
#include "document/TunFile.h"
#include "platform/DdeLink.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

// A DDE channel of a default document with a link from the simulated plant.
struct DdeChannel : testing::Test {
    DdeChannel() {
        document.SetDefaults(9);
        document.IniFileObject().SetFileName(tp.folder.Path() + "/LoopTag.tun");
        document.General().SetUseHotLinks(false);
        channel.SetComType(ComTypeCode::Dde);
        channel.SetDescription("PV");
        channel.SetExpectANumber(false);
    }
    void Attach(const std::string& appTopic, const std::string& item) {
        channel.SetDdeAppTopic(appTopic);
        channel.SetItemName(item);
        channel.SetDdeLabel(tp.platform.dde.CreateDdeLink());
    }
    bool GoOnline(bool bSilent) {
        int32_t lButtons = MsgBoxStyle::Critical;
        std::string sText;
        return channel.GoOnline(document, lButtons, sText, bSilent);
    }
    std::string FirstLine() {
        const std::string sError = channel.ErrorStr();
        return sError.substr(0, sError.find("\r\n"));
    }
    test::TestPlatform tp;
    TunFile document{tp.platform};
    Channel channel{tp.platform};
};

struct LinkCase {
    const char* appTopic;
    const char* item;
    bool hotLinks;
    const char* firstLine;  // empty: online
    uint32_t waitedMs;
};

TEST_F(DdeChannel, EachKindOfDdeFailureGivesItsDiagnosis) {
    const LinkCase cases[] = {
        {"PLC5|LIC20", "PV", false, "", 0},
        {"plc5|lic20", "pv", true, "", 0},
        {"Historian|Archive", "X", false, "DDE Initiate Failed.", 0},
        {"NoSuchApp|Topic", "X", true, "DDE Initiate Failed.", 0},
        {"PLC5|TIC99", "PV", false, "DDE Link Error.", 0},
        {"PLC5|LIC20", "NOPE", false, "DDE Link Error.", 0},
        {"PLC5|LIC20", "NOPE", true, "DDE Link Error.", 0},
        {"SlowLink|Line1", "PV", false, "Time out while waiting for DDE response.", 5000},
        {"SlowLink|Line1", "PV", true, "Time out while waiting for DDE response.", 5000},
    };
    for (const LinkCase& c : cases) {
        SCOPED_TRACE(std::string(c.appTopic) + " " + c.item);
        document.General().SetUseHotLinks(c.hotLinks);
        Attach(c.appTopic, c.item);
        const uint32_t start = tp.events.TimeGetTime();
        const bool bOnline = GoOnline(true);
        EXPECT_EQ(tp.events.TimeGetTime() - start, c.waitedMs);
        EXPECT_EQ(FirstLine(), c.firstLine);
        EXPECT_EQ(bOnline, std::string(c.firstLine).empty());
        EXPECT_EQ(channel.IsOnline(), bOnline);
        channel.ClearCommunicationsObject();
    }
    EXPECT_TRUE(tp.dialogs.Messages().empty());
}

TEST_F(DdeChannel, AnUnknownTopicAndAnUnknownItemAreNamed) {
    Attach("PLC5|TIC99", "PV");
    GoOnline(true);
    EXPECT_NE(channel.ErrorStr().find("not recognised the topic name"), std::string::npos);
    Attach("PLC5|LIC20", "NOPE");
    GoOnline(true);
    EXPECT_NE(channel.ErrorStr().find("PV item name \"NOPE\""), std::string::npos);
}

TEST_F(DdeChannel, AutomaticLinksFollowTheApplicationManualOnesKeepTheirValue) {
    Attach("PLC5|LIC20", "SP");
    document.General().SetUseHotLinks(true);
    ASSERT_TRUE(GoOnline(true));
    tp.plant.DdeServers().SetItemText("PLC5", "LIC20", "SP", "52");
    EXPECT_EQ(channel.RawValue(), Variant::Str("52"));
    channel.GoOffline();
    document.General().SetUseHotLinks(false);
    ASSERT_TRUE(GoOnline(true));
    tp.plant.DdeServers().SetItemText("PLC5", "LIC20", "SP", "53");
    EXPECT_EQ(channel.RawValue(), Variant::Str("52"));
    EXPECT_TRUE(channel.SingleShotRead(document, true));
    EXPECT_EQ(channel.RawValue(), Variant::Str("53"));
}

// A live link refuses the new item at once: the read fails like any other.
TEST_F(DdeChannel, AOneShotReadWhoseItemIsRefusedIsReported) {
    for (const bool bSilent : {true, false}) {
        SCOPED_TRACE(bSilent);
        tp.dialogs.Clear();
        document.General().SetUseHotLinks(true);
        Attach("PLC5|LIC20", "PV");
        ASSERT_TRUE(GoOnline(true));
        channel.SetItemName("NOPE");
        EXPECT_FALSE(channel.SingleShotRead(document, bSilent));
        EXPECT_EQ(channel.Online(false), OnlineState::Offline);
        if (bSilent) {
            EXPECT_EQ(FirstLine(), "DDE Link Error.");
            EXPECT_TRUE(tp.dialogs.Messages().empty());
        } else {
            ASSERT_EQ(tp.dialogs.Messages().size(), 1u);
            EXPECT_EQ(tp.dialogs.Last().title, "Error trying to read PV");
            EXPECT_EQ(tp.dialogs.Last().style, MsgBoxStyle::Critical);
            EXPECT_NE(tp.dialogs.Last().text.find("PV item name \"NOPE\""), std::string::npos);
        }
        channel.ClearCommunicationsObject();
    }
}

TEST_F(DdeChannel, ATextWhereANumberIsExpectedTakesTheChannelOffline) {
    channel.SetExpectANumber(true);
    Attach("PLC5|LIC20", "TAG");
    EXPECT_FALSE(GoOnline(true));
    EXPECT_FALSE(channel.IsOnline());
    EXPECT_EQ(channel.ErrorStr(),
              "\"LIC20 level\" has been sent from the Server.  This is not a number.");
}

struct TimeoutCase {
    int32_t answer;
    int32_t storedTimeout;
};

TEST_F(DdeChannel, ATimeOutOffersFiveSecondsMoreStoredAtOnce) {
    const TimeoutCase cases[] = {{MsgBoxResult::No, 50}, {MsgBoxResult::Yes, 100}};
    for (const TimeoutCase& c : cases) {
        document.General().SetDDETimeout(50);
        Attach("SlowLink|Line1", "PV");
        tp.dialogs.Clear();
        tp.dialogs.QueueAnswer(c.answer);
        int32_t lButtons = MsgBoxStyle::Critical;
        std::string sText = "Scanning of D disabled also.";
        EXPECT_FALSE(channel.GoOnline(document, lButtons, sText, false));
        ASSERT_EQ(tp.dialogs.Messages().size(), 1u);
        const auto& shown = tp.dialogs.Messages()[0];
        EXPECT_EQ(shown.text,
                  "Time out while waiting for DDE response.\r\n\r\nScanning of D disabled also."
                  "\r\n\r\nDo you want to increase the timeout time by 5 seconds?");
        EXPECT_EQ(shown.style, MsgBoxStyle::Critical | MsgBoxStyle::YesNo);
        EXPECT_EQ(shown.title, "Error trying to read PV");
        EXPECT_EQ(document.General().DDETimeout(), c.storedTimeout);
        EXPECT_EQ(document.IniFileObject().ReadLong("DDE", "DDE_Timeout", 0, 0, 0),
                  c.answer == MsgBoxResult::Yes ? 100 : 0);
    }
}

TEST_F(DdeChannel, WritesPokeTheApplicationAndFailuresSaySo) {
    Attach("PLC5|LIC20", "SP");
    EXPECT_TRUE(channel.SendValue("61.5"));
    EXPECT_EQ(channel.SendResult(), 0);
    EXPECT_EQ(tp.plant.DdeServers().ItemText("PLC5", "LIC20", "SP"), "61.5");

    Attach("SlowLink|Line1", "PV");
    EXPECT_FALSE(channel.SendValue("1"));
    EXPECT_EQ(channel.SendResult(), 2);
    EXPECT_FALSE(channel.ErrorStr().empty());

    channel.SetDdeLabel(nullptr);
    EXPECT_FALSE(channel.SendValue("1"));
    EXPECT_EQ(channel.SendResult(), 2);
    ASSERT_EQ(tp.dialogs.Messages().size(), 1u);
    EXPECT_EQ(tp.dialogs.Messages()[0].text, "Channel.SendValue error Dde");
}

TEST_F(DdeChannel, WithoutALinkNothingGoesOnline) {
    channel.SetItemName("PV");
    EXPECT_FALSE(GoOnline(true));
    EXPECT_FALSE(channel.SingleShotRead(document, true));
    EXPECT_EQ(channel.Online(false), OnlineState::Offline);
}

// Events run while the link waits: a channel taken offline meanwhile stays
// offline, and one destroyed meanwhile is not touched.
TEST_F(DdeChannel, EventsDuringTheRequestMayEndTheChannel) {
    Attach("SlowLink|Line1", "PV");
    tp.events.StartTimer(100, false, [this] { channel.ClearCommunicationsObject(); });
    EXPECT_FALSE(GoOnline(true));
    EXPECT_EQ(channel.Online(false), OnlineState::Offline);
    EXPECT_EQ(channel.DdeLabel(), nullptr);

    auto doomed = std::make_unique<Channel>(tp.platform);
    doomed->SetDdeAppTopic("SlowLink|Line1");
    doomed->SetItemName("PV");
    doomed->SetDdeLabel(tp.platform.dde.CreateDdeLink());
    tp.events.StartTimer(100, false, [&doomed] { doomed.reset(); });
    int32_t lButtons = 0;
    std::string sText;
    EXPECT_FALSE(doomed->GoOnline(document, lButtons, sText, true));
}

}  // namespace
}  // namespace cv
