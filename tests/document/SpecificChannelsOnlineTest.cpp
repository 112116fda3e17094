#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "document/SpecificChannels.h"
#include "document/TunFile.h"
#include "opc/CvOpcAutoClient.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

constexpr const char* kPlant = "Sim.Plant.1";

// The default document's loop-specific channels, addressed on the plant's
// loop FIC101 unless a case names an item the server does not have.
struct SpecificOnline : testing::Test {
    SpecificOnline() {
        document.SetDefaults(9);
        document.IniFileObject().SetFileName(tp.folder.Path() + "/LoopTag.tun");
    }
    Channel& Specific(int32_t lType) { return *document.Specifics().Item(lType); }
    void Address(int32_t lType, const std::string& item) {
        Channel& channel = Specific(lType);
        channel.SetOpcServerID(kPlant);
        channel.SetItemName(item.empty() ? "" : "Area1.Unit1.FIC101." + item);
        channel.SetDescription("T" + std::to_string(lType));
    }
    test::TestPlatform tp;
    TunFile document{tp.platform};
};

struct ChainCase {
    const char* p;
    const char* pWrite;
    std::vector<int32_t> served;  // types the client serves, in order
    const char* firstReportTail;
};

TEST_F(SpecificOnline, APChannelThatCannotBeReachedStopsIAndD) {
    const ChainCase cases[] = {
        {"SP", "SP", {1, 2, 3, 7, 8, 9}, ""},
        {"", "SP", {}, ""},
        {"NOSUCH", "SP", {}, "Scanning of I and D disabled also.  "},
        {"SP", "NOSUCH", {1, 2, 3}, "Scanning of I and D disabled also.  Writing of T7 disabled."},
    };
    for (const ChainCase& c : cases) {
        SCOPED_TRACE(std::string(c.p) + "/" + c.pWrite);
        Address(SpecificType::P, c.p);
        Address(SpecificType::I, "OUT");
        Address(SpecificType::D, "PV");
        Address(SpecificType::SendP, c.pWrite);
        Address(SpecificType::SendI, "OUT");
        Address(SpecificType::SendD, "PV");
        tp.dialogs.Clear();
        EXPECT_TRUE(document.Specifics().CreateCommsObjects(document, false));
        std::vector<int32_t> served;
        for (const auto& cClient : document.OpcClients()) {
            for (const auto& entry : cClient->Channels().InOrder()) {
                if (Channel* channel = entry.Get()) {
                    served.push_back(channel->SpecificChannelType());
                }
            }
        }
        EXPECT_EQ(served, c.served);
        const std::string tail = c.firstReportTail;
        if (tail.empty()) {
            EXPECT_TRUE(tp.dialogs.Messages().empty());
        } else {
            ASSERT_EQ(tp.dialogs.Messages().size(), 1u);
            const std::string& text = tp.dialogs.Messages()[0].text;
            EXPECT_EQ(text.substr(text.size() - tail.size()), tail);
            EXPECT_EQ(tp.dialogs.Messages()[0].style, MsgBoxStyle::Information);
        }
        document.GoOffline();
    }
}

TEST_F(SpecificOnline, TheModeChannelHoldsTheStateAtWaitingUntilItsValue) {
    Address(SpecificType::P, "SP");
    Address(SpecificType::Mode, "MODE");
    ASSERT_TRUE(document.Specifics().CreateCommsObjects(document, true));
    ASSERT_TRUE(document.Specifics().GoOnline(document, true));
    EXPECT_EQ(document.Specifics().Online(false), OnlineState::GoingOnline);
    document.OpcAutoGoOnline(1000);
    tp.events.Advance(3000);
    EXPECT_EQ(document.Specifics().Online(false), OnlineState::Online);
    EXPECT_EQ(Specific(SpecificType::Mode).RawValue(), Variant::Str("1"));
}

TEST_F(SpecificOnline, AWriteChannelDropOutIsReportedWithWhatItDisables) {
    Address(SpecificType::P, "SP");
    Address(SpecificType::SendP, "SP");
    ASSERT_TRUE(document.Specifics().CreateCommsObjects(document, true));
    ASSERT_TRUE(document.Specifics().GoOnline(document, true));
    document.OpcAutoGoOnline(1000);
    tp.events.Advance(3000);
    Specific(SpecificType::SendP).GoOffline();
    std::string sValue = "1";
    EXPECT_FALSE(Specific(SpecificType::SendP).SendValue(sValue));
    EXPECT_EQ(document.Specifics().Online(false), OnlineState::Online);
    ASSERT_EQ(tp.dialogs.Messages().size(), 1u);
    EXPECT_EQ(tp.dialogs.Messages()[0].text,
              "Writing disabled due to a previously reported error from the OPC Server.\r\n\r\n"
              "Writing of T7 disabled.");
    EXPECT_EQ(tp.dialogs.Messages()[0].title, "Error reading T7");
}

}  // namespace
}  // namespace cv
