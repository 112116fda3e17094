#include <algorithm>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "channel/Channel.h"
#include "document/TunFile.h"
#include "opc/CvOpcAutoClient.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

constexpr const char* kPlant = "Sim.Plant.1";
constexpr const char* kLoop = "Area1.Unit1.FIC101.";
constexpr uint16_t kCommsFailure = 0x18;

// The default OPC document with PV, CO and SP on the plant's loop FIC101.
struct DocumentOnline : testing::Test {
    DocumentOnline() {
        document.SetDefaults(9);
        document.IniFileObject().SetFileName(tp.folder.Path() + "/LoopTag.tun");
        Address(1, "PV");
        Address(2, "OUT");
        Address(3, "SP");
    }
    Channel& Archive(int32_t lNumber) { return *document.Archives().Item(lNumber); }
    void Address(int32_t lNumber, const std::string& item, const std::string& computer = "") {
        Channel& channel = Archive(lNumber);
        channel.SetOpcServerID(kPlant);
        channel.SetOpcComputer(computer);
        channel.SetItemName(kLoop + item);
    }
    // Going online and the first notifications.
    bool GoOnlineAndWait() {
        const bool bOk = document.GoOnline(true);
        tp.events.Advance(3000);
        return bOk;
    }
    size_t MessagesTitled(const std::string& title) const {
        const auto& shown = tp.dialogs.Messages();
        return static_cast<size_t>(std::count_if(shown.begin(), shown.end(),
                                                 [&](const auto& m) { return m.title == title; }));
    }
    test::TestPlatform tp;
    TunFile document{tp.platform};
};

struct ClientCase {
    const char* spComputer;
    size_t clients;
};

TEST_F(DocumentOnline, ChannelsShareTheClientOfTheirServerAndComputer) {
    const ClientCase cases[] = {{"", 1}, {"OPCHOST1", 2}};
    for (const ClientCase& c : cases) {
        SCOPED_TRACE(c.spComputer);
        Address(3, "SP", c.spComputer);
        ASSERT_TRUE(document.GoOnline(true));
        EXPECT_EQ(document.OpcClients().size(), c.clients);
        EXPECT_EQ(document.Online(false), OnlineState::GoingOnline);
        tp.events.Advance(3000);
        EXPECT_EQ(document.Online(false), OnlineState::Online);
        // Each value reaches its own channel.
        EXPECT_EQ(Archive(2).RawValue(), Variant::R8(35));
        EXPECT_EQ(Archive(3).RawValue(), Variant::R8(50));
        document.GoOffline();
        EXPECT_TRUE(document.OpcClients().empty());
        EXPECT_FALSE(Archive(1).IsOnline());
    }
}

TEST_F(DocumentOnline, TheUpdateRateIsTheSampleInterval) {
    document.General().SetSIinSec(2.5);
    ASSERT_TRUE(document.GoOnline(true));
    const auto& entries = tp.trace.Entries();
    EXPECT_TRUE(std::any_of(entries.begin(), entries.end(), [](const auto& entry) {
        return entry.label == "OPCGroup.UpdateRate = 2500";
    }));
}

struct FailureCase {
    int32_t number;
    bool documentOnline;
};

// PV and CO are needed; SP and extra channels may fail.
TEST_F(DocumentOnline, PvAndCoFailuresAreFatalSpFailuresTolerated) {
    const FailureCase cases[] = {{1, false}, {2, false}, {3, true}};
    for (const FailureCase& c : cases) {
        SCOPED_TRACE(c.number);
        Address(c.number, "NOSUCH");
        EXPECT_EQ(document.GoOnline(true), c.documentOnline);
        EXPECT_EQ(document.OpcClients().empty(), !c.documentOnline);
        EXPECT_FALSE(Archive(c.number).IsOnline());
        tp.events.Advance(3000);
        EXPECT_EQ(document.Online(false),
                  c.documentOnline ? OnlineState::Online : OnlineState::Offline);
        document.GoOffline();
        Address(1, "PV");
        Address(2, "OUT");
        Address(3, "SP");
    }
}

TEST_F(DocumentOnline, AnSpWithoutItemStaysOfflineAPvWithoutItemIsTried) {
    Archive(3).SetItemName("");
    ASSERT_TRUE(GoOnlineAndWait());
    EXPECT_FALSE(Archive(3).IsOnline());
    EXPECT_TRUE(Archive(1).IsOnline());
    document.GoOffline();
    Archive(1).SetItemName("");
    EXPECT_FALSE(document.GoOnline(true));
}

TEST_F(DocumentOnline, AChannelStillWaitingWhenTimeIsUpFailsAsTimedOut) {
    ASSERT_TRUE(document.GoOnline(true));
    EXPECT_EQ(document.Online(true), OnlineState::Offline);
    ASSERT_EQ(MessagesTitled("Error reading " + Archive(1).Description()), 1u);
    EXPECT_EQ(tp.dialogs.Messages()[0].text, "Timed out waiting for a response");
    EXPECT_EQ(tp.dialogs.Messages()[0].style, MsgBoxStyle::Critical);
}

// Before every channel was seen online an SP failure is shown modally; after
// it, once in a modeless window of its own, closed when going offline.
TEST_F(DocumentOnline, SpDropOutsOpenOneModelessWindowUntilOffline) {
    ASSERT_TRUE(GoOnlineAndWait());
    ASSERT_EQ(document.Online(false), OnlineState::Online);
    ASSERT_FALSE(tp.plant.SetItemQuality("", kPlant, std::string(kLoop) + "SP", kCommsFailure));
    tp.events.Advance(3000);
    for (int poll = 0; poll < 3; ++poll) {
        EXPECT_EQ(document.Online(false), OnlineState::Online);
    }
    ASSERT_EQ(tp.modeless.windows.size(), 1u);
    EXPECT_EQ(tp.modeless.windows[0].title, "Error reading " + Archive(3).Description());
    EXPECT_EQ(tp.modeless.windows[0].text, "OPC Server error: \"Communications failure\"");
    EXPECT_EQ(tp.modeless.windows[0].button, "OK");
    EXPECT_TRUE(tp.dialogs.Messages().empty());
    document.GoOffline();
    EXPECT_EQ(tp.modeless.OpenCount(), 0u);
}

TEST_F(DocumentOnline, APvDropOutIsShownModallyAndEndsThePoll) {
    ASSERT_TRUE(GoOnlineAndWait());
    ASSERT_FALSE(tp.plant.SetItemQuality("", kPlant, std::string(kLoop) + "PV", kCommsFailure));
    tp.events.Advance(3000);
    EXPECT_EQ(document.Online(false), OnlineState::Offline);
    ASSERT_EQ(tp.dialogs.Messages().size(), 1u);
    EXPECT_EQ(tp.dialogs.Messages()[0].style, MsgBoxStyle::Critical);
    EXPECT_TRUE(tp.modeless.windows.empty());
}

TEST_F(DocumentOnline, AServerShuttingDownTakesTheChannelsOffline) {
    ASSERT_TRUE(GoOnlineAndWait());
    ASSERT_FALSE(tp.plant.ShutDownServer("", kPlant, "maintenance"));
    tp.events.Advance(3000);
    for (int32_t n = 1; n <= 3; ++n) {
        EXPECT_FALSE(Archive(n).IsOnline());
    }
    EXPECT_EQ(document.Online(false), OnlineState::Offline);
    std::string sValue = "55";
    EXPECT_FALSE(Archive(3).SendValue(sValue));
    EXPECT_EQ(Archive(3).SendResult(), 2);
    EXPECT_EQ(Archive(3).ErrorStr(),
              "Writing disabled due to a previously reported error from the OPC Server.");
    document.GoOffline();
    EXPECT_TRUE(document.OpcClients().empty());
}

TEST_F(DocumentOnline, WritesGoThroughTheSharedClient) {
    ASSERT_TRUE(GoOnlineAndWait());
    EXPECT_TRUE(Archive(3).SendValue("55"));
    EXPECT_EQ(Archive(3).SendResult(), 0);
    tp.events.Advance(3000);
    EXPECT_EQ(Archive(3).RawValue(), Variant::R8(55));
    EXPECT_EQ(Archive(2).RawValue(), Variant::R8(35));
}

struct ReadCase {
    bool hotLinks;
    bool dropServer;
    const char* message;
};

TEST_F(DocumentOnline, OneShotReadsStopAtTheFirstFailure) {
    const ReadCase cases[] = {
        {false, false, ""},
        {true, false, " error: TunFile.SingleShotRead 1"},
        {false, true, "Corvalent OPC Test Client Error: OpcAutoSingleShotRead"},
    };
    for (const ReadCase& c : cases) {
        SCOPED_TRACE(c.message);
        document.General().SetUseHotLinks(c.hotLinks);
        ASSERT_TRUE(GoOnlineAndWait());
        tp.dialogs.Clear();
        if (c.dropServer) {
            ASSERT_FALSE(tp.plant.DropServer("", kPlant));
        }
        const bool bOk = document.SingleShotRead();
        EXPECT_EQ(bOk, std::string(c.message).empty());
        EXPECT_EQ(Archive(1).IsOnline(), bOk);
        const bool bShown =
            std::any_of(tp.dialogs.Messages().begin(), tp.dialogs.Messages().end(),
                        [&](const auto& m) { return m.text.find(c.message) != std::string::npos; });
        EXPECT_TRUE(bShown || bOk);
        document.GoOffline();
    }
}

// A channel of specific type 13 reads through the client's extra group,
// which goes again with the channel.
TEST_F(DocumentOnline, TheExtraGroupComesAndGoesWithItsChannel) {
    ASSERT_TRUE(document.GoOnline(true));
    Channel extra(tp.platform);
    extra.SetComType(ComTypeCode::Opc);
    extra.SetSpecificChannelType(13);
    extra.SetOpcServerID(kPlant);
    extra.SetItemName(std::string(kLoop) + "MODE");
    int32_t lButtons = 0;
    std::string sText;
    ASSERT_TRUE(extra.CreateCommsObjects(document, lButtons, sText, true));
    EXPECT_EQ(document.OpcClients().size(), 1u);
    const auto& entries = tp.trace.Entries();
    EXPECT_TRUE(std::any_of(entries.begin(), entries.end(),
                            [](const auto& e) { return e.label == "OPCGroups.Add Corvalent2"; }));
    extra.GoOffline();
    EXPECT_TRUE(std::any_of(entries.begin(), entries.end(), [](const auto& e) {
        return e.label == "Server.OPCGroups.Remove Corvalent2";
    }));
}

struct UncertainCase {
    int32_t answer;
    size_t questions;
};

// Yes keeps the warning but asks each channel once; No silences it for the
// run. Going offline and online again asks nothing new.
TEST_F(DocumentOnline, TheUncertainWarningComesOncePerChannelAndRun) {
    const UncertainCase cases[] = {{MsgBoxResult::Yes, 2}, {MsgBoxResult::No, 1}};
    for (const UncertainCase& c : cases) {
        test::TestPlatform fresh;
        TunFile doc(fresh.platform);
        doc.SetDefaults(9);
        for (int32_t n = 1; n <= 3; ++n) {
            Channel& channel = *doc.Archives().Item(n);
            channel.SetOpcServerID(kPlant);
            channel.SetItemName(std::string(kLoop) + (n == 2 ? "OUT" : "SP"));
        }
        ASSERT_FALSE(fresh.plant.SetItemQuality("", kPlant, std::string(kLoop) + "SP", 0x40));
        fresh.dialogs.QueueAnswer(c.answer);
        fresh.dialogs.QueueAnswer(c.answer);
        for (int run = 0; run < 2; ++run) {
            ASSERT_TRUE(doc.GoOnline(true));
            fresh.events.Advance(3000);
            for (int read = 0; read < 2; ++read) {
                EXPECT_EQ(doc.Archives().Item(1)->RawValue(), Variant::R8(50));
                EXPECT_EQ(doc.Archives().Item(3)->RawValue(), Variant::R8(50));
            }
            doc.GoOffline();
        }
        EXPECT_EQ(fresh.dialogs.Messages().size(), c.questions);
        EXPECT_EQ(fresh.dialogs.Messages()[0].title,
                  doc.Archives().Item(1)->Description() + ": Uncertain OPC Value");
    }
}

}  // namespace
}  // namespace cv
