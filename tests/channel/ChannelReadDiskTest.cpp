#include <gtest/gtest.h>

#include "ChannelDiskFixture.h"

namespace cv {
namespace {

constexpr int32_t kUntouched = ComTypeCode::OpcHda;

// The address as one text: "app|topic" for DDE, "server/path" for OPC.
std::string Address(const Channel& channel) {
    if (channel.ComType() == ComTypeCode::Opc) {
        return channel.OpcNodeAndServer() + "/" + channel.OpcAccessPath();
    }
    return channel.DdeAppTopic();
}

struct Expected {
    int32_t lTuner;
    int32_t lNumber;
    int32_t lType;
    int32_t lComType;
    const char* sAddress;
    const char* sItem;
    const char* sDescription;
};

class ReadDisk : public test::ChannelDisk {
  protected:
    void ExpectRead(const Expected& row);
};

// The channel's communication type starts as a mark that shows whether the
// read set one.
void ReadDisk::ExpectRead(const Expected& row) {
    SCOPED_TRACE(testing::Message()
                 << "kind " << row.lTuner << " number " << row.lNumber << " type " << row.lType);
    doc.SetTunerType(row.lTuner);
    auto channel = Make(row.lNumber, row.lType);
    channel->SetComType(kUntouched);
    channel->ReadFromDisk(shared, doc);
    EXPECT_EQ(channel->ComType(), row.lComType);
    EXPECT_EQ(Address(*channel), row.sAddress);
    EXPECT_EQ(channel->ItemName(), row.sItem);
    EXPECT_EQ(channel->Description(), row.sDescription);
}

TEST_F(ReadDisk, SpecificChannelKeysFollowTheTunerKind) {
    Ini().WriteString("DDE", "DDE_FilterAppTopic", "Flt|Top");
    Ini().WriteString("DDE", "DDE_item_PB", "pb.dde");
    Ini().WriteString("DDE", "DDE_item_Integral", "int.dde");
    Ini().WriteString("DDE", "DDE_item_Derivative", "der.dde");
    Ini().WriteString("DDE", "DDE_item_Filter", "flt.dde");
    Ini().WriteString("DDE", "Send_PB", "never read without unique writes");
    Ini().WriteString("OPC", "OPC_ServerID", "\\\\N1\\Srv.1");
    Ini().WriteString("OPC", "OPC_AccessPath", "AP");
    Ini().WriteString("OPC", "OPC_FilterServerID", "FSrv");
    Ini().WriteString("OPC", "OPC_FilterAccessPath", "FAP");
    Ini().WriteString("OPC", "OPC_item_ControllerMode", "mode.opc");
    Ini().WriteString("OPC", "OPC_item_Filter", "flt.opc");
    Ini().WriteString("OPC", "OPC_item_CO", "co.opc");
    const Expected rows[] = {
        {1, 1, 1, ComTypeCode::Dde, "Simulate|Loop", "pb.dde", "Proportional"},
        {1, 7, 7, ComTypeCode::Dde, "Simulate|Loop", "pb.dde", "P value"},
        {1, 11, 11, ComTypeCode::Dde, "Flt|Top", "flt.dde", "Filter"},
        {2, 2, 2, ComTypeCode::Dde, "VIEW|TAGNAME", "int.dde", "Integral"},
        {4, 3, 3, ComTypeCode::Dde, "VIEW|TAGNAME", "der.dde", "Derivative"},
        {4, 12, 12, ComTypeCode::Dde, "Flt|Top", "flt.dde", "F value"},
        {7, 5, 5, ComTypeCode::Dde, "PLCDDE|Topic", "Output", "Controller Output"},
        {7, 10, 10, ComTypeCode::Dde, "PLCDDE|Topic", "mode", "Controller Mode"},
        {7, 12, 12, ComTypeCode::Dde, "PLCDDE|Topic", "", "F value"},
        {9, 4, 4, ComTypeCode::Opc, "\\\\N1\\Srv.1/AP", "mode.opc", "Controller Mode"},
        {9, 5, 5, ComTypeCode::Opc, "\\\\N1\\Srv.1/AP", "co.opc", "Controller Output"},
        {9, 6, 6, ComTypeCode::Opc, "\\\\N1\\Srv.1/AP", "", "Loop Setpoint"},
        {9, 11, 11, ComTypeCode::Opc, "FSrv/FAP", "flt.opc", "Filter"},
        {9, 12, 12, ComTypeCode::Opc, "FSrv/FAP", "flt.opc", "F value"},
        {3, 1, 1, kUntouched, "|", "", "Proportional"},
        {5, 9, 9, kUntouched, "|", "", "D value"},
        {9, 13, 13, kUntouched, "|", "", ""},
    };
    for (const Expected& row : rows) {
        ExpectRead(row);
    }
}

TEST_F(ReadDisk, UniqueWriteLocationsMoveOnlyTheWriteChannelsItem) {
    Ini().WriteString("OPC", "OPC_item_SP", "sp.read");
    Ini().WriteString("OPC", "Send_SP", "sp.send");
    Ini().WriteString("OPC", "OPC_item_Filter", "flt.read");
    EXPECT_EQ(Read(9, 6, 6)->ItemName(), "sp.read");
    Ini().WriteBoolean("DDE", "DDE_UniqueWriteLocs", true);
    EXPECT_EQ(Read(9, 6, 6)->ItemName(), "sp.send");
    EXPECT_EQ(Read(9, 2, 2)->ItemName(), "");
    Ini().EraseItem("OPC", "Send_SP");
    EXPECT_EQ(Read(9, 6, 6)->ItemName(), "sp.read");
    // The filter's write channel has no fallback to its read item.
    EXPECT_EQ(Read(9, 12, 12)->ItemName(), "");
    Ini().WriteString("DDE", "DDE_item_SP", "sp.dde");
    Ini().WriteString("DDE", "Send_SP", "send.dde");
    EXPECT_EQ(Read(1, 6, 6)->ItemName(), "send.dde");
}

TEST_F(ReadDisk, ArchiveKeysFollowTheTunerKind) {
    Ini().WriteString("DDE", "DDE_item_CO", "co.dde");
    Ini().WriteString("Channel5", "Application", "App");
    Ini().WriteString("Channel5", "Item", "i5");
    Ini().WriteString("Channel4", "Item", "i4");
    Ini().WriteString("Channel4", "LinxItem", "linx4");
    const Expected rows[] = {
        {1, 1, 0, ComTypeCode::Dde, "Simulate|Loop", "PVData", "PV"},
        {1, 2, 0, ComTypeCode::Dde, "Simulate|Loop", "co.dde", "CO"},
        {1, 3, 0, ComTypeCode::Dde, "Simulate|Loop", "", "SP"},
        {1, 5, 0, ComTypeCode::Dde, "App|Loop", "i5", "Trend2"},
        {2, 1, 0, ComTypeCode::Dde, "VIEW|TAGNAME", "PVData", "PV"},
        {2, 4, 0, ComTypeCode::Dde, "Simulate|Loop", "i4", "Trend1"},
        {4, 3, 0, ComTypeCode::Dde, "VIEW|TAGNAME", "", "SP"},
        {3, 1, 0, ComTypeCode::Dde, "|", "", "PV"},
        {3, 4, 0, ComTypeCode::Dde, "|", "i4", "Trend1"},
        {3, 6, 0, ComTypeCode::Dde, "|", "PID_1_PV", "Trend3"},
        {7, 2, 0, ComTypeCode::Dde, "PLCDDE|Topic", "Output", "CO"},
        {7, 3, 0, ComTypeCode::Dde, "PLCDDE|Topic", "SP", "SP"},
        {7, 4, 0, ComTypeCode::Dde, "PLCDDE|Topic", "", "Trend1"},
        {9, 4, 0, ComTypeCode::Opc, "/", "i4", "Trend1"},
        {12, 4, 0, kUntouched, "|", "", "Trend4"},
        {6, 1, 0, kUntouched, "|", "", "Trend1"},
    };
    for (const Expected& row : rows) {
        ExpectRead(row);
    }
    EXPECT_TRUE(tp.dialogs.Messages().empty());
}

TEST_F(ReadDisk, OpcChannelsWithoutKeysReadTheDefaults) {
    auto pv = Read(9, 1);
    EXPECT_EQ(pv->ComType(), ComTypeCode::Opc);
    EXPECT_EQ(pv->OpcServerID(), "");
    EXPECT_EQ(pv->OpcComputer(), "");
    EXPECT_EQ(pv->OpcAccessPath(), "");
    EXPECT_EQ(pv->ItemName(), "PVData");
    EXPECT_EQ(pv->DecimalPlaces(), 1);
    EXPECT_EQ(pv->EngUnits(), "");
    EXPECT_EQ(pv->DisplayMax(), 100);
    EXPECT_TRUE(pv->DisplayOnGraph());
    auto co = Read(9, 2);
    EXPECT_EQ(co->ItemName(), "COData");
    EXPECT_EQ(co->EngUnits(), "%");
    EXPECT_EQ(Read(9, 3)->ItemName(), "");
    EXPECT_EQ(Read(5, 2)->EngUnits(), "");

    Ini().WriteString("OPC", "OPC_ServerID", "\\\\Plant\\Sim.1");
    Ini().WriteString("OPC", "OPC_item_PV", "Unit1.PV");
    pv = Read(9, 1);
    EXPECT_EQ(pv->OpcComputer(), "Plant");
    EXPECT_EQ(pv->OpcServerID(), "Sim.1");
    EXPECT_EQ(pv->ItemName(), "Unit1.PV");
}

TEST_F(ReadDisk, FaceplateSpTakesRangesAndUnitsFromThePv) {
    Ini().WriteDouble("Channel1", "EngMin", 10);
    Ini().WriteDouble("Channel1", "EngMax", 20);
    Ini().WriteDouble("Channel1", "InstMin", 4);
    Ini().WriteDouble("Channel1", "DisplayMin", 12);
    Ini().WriteDouble("Channel1", "DisplayMax", 18);
    Ini().WriteDouble("Channel3", "EngMin", 500);
    Ini().WriteDouble("Channel3", "EngMax", 500);
    Ini().WriteString("Channel3", "EngineeringUnits", "own");
    Ini().WriteString("PIDTuningSelections", "Engineering_Units", "kPa");
    auto sp = Read(9, 3);
    EXPECT_EQ(sp->EngMin(), 10);
    EXPECT_EQ(sp->EngMax(), 20);
    EXPECT_EQ(sp->InstMin(), 4);
    EXPECT_EQ(sp->InstMax(), 100);
    EXPECT_EQ(sp->DisplayMin(), 12);
    EXPECT_EQ(sp->EngUnits(), "kPa");
    EXPECT_EQ(Read(9, 1)->EngUnits(), "kPa");
    Ini().WriteString("Channel1", "EngineeringUnits", "degC");
    EXPECT_EQ(Read(9, 3)->EngUnits(), "degC");

    // Without a faceplate the SP keeps its own section; equal limits give 0 to 100.
    sp = Read(5, 3);
    EXPECT_EQ(sp->EngMin(), 0);
    EXPECT_EQ(sp->EngMax(), 100);
    EXPECT_EQ(sp->EngUnits(), "own");
    EXPECT_EQ(Read(5, 2)->EngUnits(), "");
}

TEST_F(ReadDisk, ColoursComeFromTheSharedFileByRole) {
    shared.WriteLong("FacePlate", "ColorPV", 255);
    shared.WriteLong("FacePlate", "LineWidthPV", 3);
    shared.WriteLong("FacePlate", "LineWidthCO", 9);
    shared.WriteLong("FacePlate", "ColorSP", 12345);
    Ini().WriteLong("Channel1", "LineColor", 999);
    Ini().WriteLong("Channel4", "LineColor", 31);
    Ini().WriteLong("Channel4", "LineWidth", 4);

    auto channel = Make(1);
    std::string sRole = "given";
    int32_t lColour = 7;
    channel->ReadCorvalentIni(shared, sRole, lColour);
    EXPECT_EQ(sRole, "PV");
    EXPECT_EQ(lColour, 16777215);
    EXPECT_EQ(channel->LineColor(), 255);
    EXPECT_EQ(channel->LineWidth(), 3);
    channel = Make(0);
    shared.WriteLong("FacePlate", "LineWidthXX", 4);
    sRole = "XX";
    lColour = 7;
    channel->ReadCorvalentIni(shared, sRole, lColour);
    EXPECT_EQ(sRole, "XX");
    EXPECT_EQ(channel->LineColor(), 7);
    EXPECT_EQ(channel->LineWidth(), 4);
    channel = Make(5);
    channel->SetLineWidth(4);
    channel->ReadCorvalentIni(shared, sRole, lColour);
    EXPECT_EQ(channel->LineColor(), 65280);
    EXPECT_EQ(channel->LineWidth(), 2);
    EXPECT_EQ(lColour, 7);

    struct Row {
        int32_t lTuner, lNumber, lColour, lWidth;
    };
    const Row rows[] = {{9, 1, 255, 3},   {9, 2, 65280, 2}, {9, 3, 12345, 2},
                        {9, 4, 31, 4},    {9, 5, 65280, 2}, {5, 1, 999, 3},
                        {5, 2, 65280, 2}, {5, 3, 12345, 2}, {12, 4, 31, 4}};
    for (const Row& row : rows) {
        SCOPED_TRACE(testing::Message() << "kind " << row.lTuner << " number " << row.lNumber);
        channel = Read(row.lTuner, row.lNumber);
        EXPECT_EQ(channel->LineColor(), row.lColour);
        EXPECT_EQ(channel->LineWidth(), row.lWidth);
    }
}

TEST_F(ReadDisk, DescriptionsAndDisplayFields) {
    EXPECT_EQ(Read(9, 5)->Description(), "Trend2");
    EXPECT_EQ(Read(5, 1)->Description(), "Trend1");
    EXPECT_EQ(Read(5, 5)->Description(), "Trend5");
    Ini().WriteString("Channel1", "Description", "Flow");
    Ini().WriteString("Channel4", "Description", "");
    EXPECT_EQ(Read(9, 1)->Description(), "Flow");
    EXPECT_EQ(Read(9, 4)->Description(), "Trend1");

    Ini().WriteLong("Channel2", "DecimalPlaces", 9);
    Ini().WriteString("Channel2", "LineStyle", "Dash");
    Ini().WriteString("Channel2", "DisplayOnGraph", "0");
    Ini().WriteString("Channel3", "DisplayOnGraph", "-1");
    Ini().WriteLong("Channel3", "DecimalPlaces", -3);
    auto co = Read(9, 2);
    EXPECT_EQ(co->DecimalPlaces(), 9);
    EXPECT_EQ(co->FormatDecPt(0.5), "0.500000000");
    EXPECT_EQ(co->LineStyle(), "Solid");
    EXPECT_FALSE(co->DisplayOnGraph());
    auto sp = Read(9, 3);
    EXPECT_EQ(sp->DecimalPlaces(), -3);
    EXPECT_TRUE(sp->DisplayOnGraph());
}

TEST_F(ReadDisk, UnknownKindReportsEachQuestionOnceAndReadsNoAddress) {
    auto pv = Read(0, 1);
    ASSERT_EQ(tp.dialogs.Messages().size(), 1u);
    EXPECT_EQ(tp.dialogs.Last().text, "Error: TunerType.UsesCvIni");
    EXPECT_EQ(pv->ItemName(), "");
    EXPECT_EQ(pv->Description(), "Trend1");
    tp.dialogs.Clear();
    Read(0, 3);
    ASSERT_EQ(tp.dialogs.Messages().size(), 2u);
    EXPECT_EQ(tp.dialogs.Messages()[0].text, "Error: TunerType.HasFaceplate");
}

}  // namespace
}  // namespace cv
