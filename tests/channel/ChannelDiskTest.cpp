#include <initializer_list>
#include <memory>
#include <sstream>
#include <string>
#include <tuple>

#include <gtest/gtest.h>

#include "channel/Channel.h"
#include "document/TunFile.h"
#include "stores/IniFile.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

constexpr int32_t kUntouched = ComTypeCode::OpcHda;
constexpr int32_t kDde = ComTypeCode::Dde;
constexpr int32_t kOpc = ComTypeCode::Opc;

struct Row {
    int32_t lTuner, lNumber, lType, lComType;
    const char *sAddress, *sItem, *sDescription;
};

// Everything the tuning file keeps of a channel.
auto Kept(const Channel& c) {
    return std::tuple(c.EngMin(), c.EngMax(), c.InstMin(), c.InstMax(), c.DisplayMin(),
                      c.DisplayMax(), c.EngUnits(), c.Description(), c.DecimalPlaces(),
                      c.LineWidth(), c.LineColor(), c.DisplayOnGraph(), c.ComType(), c.ItemName(),
                      c.TopicName(), c.DdeApplication(), c.OpcComputer(), c.OpcServerID());
}

void Fill(Channel& c, int32_t lSeed) {
    c.SetRange(RangeType::Engineering, -lSeed, 10.25 * lSeed);
    c.SetRange(RangeType::Instrument, 4, 20 + lSeed);
    c.SetRange(RangeType::Display, 1.5, 3 * lSeed);
    c.SetEngUnits("u" + std::to_string(lSeed));
    c.SetDescription("Channel " + std::to_string(lSeed));
    c.SetDecimalPlaces(lSeed % 6);
    c.SetLineWidth(1 + lSeed % 4);
    c.SetLineColor(1000 + lSeed);
    c.SetDisplayOnGraph(lSeed % 2 == 0);
    c.SetOpcNodeAndServer("\\\\Node\\Srv.1");
    c.SetOpcAccessPath("Path");
    c.SetItemName("Unit.Item" + std::to_string(lSeed));
}

// A document whose tuning file lies in a fresh folder, with the shared
// settings file beside it; every check reads the files afresh.
struct ChannelDisk : testing::Test {
    ChannelDisk() {
        Ini().SetFileName(tunPath);
        shared.SetFileName("Corvalen.ini");
    }
    IniFile& Ini() { return doc.IniFileObject(); }
    std::unique_ptr<Channel> Make(int32_t lNumber, int32_t lType = 0) {
        auto channel = std::make_unique<Channel>(tp.platform);
        channel->SetNumber(lNumber);
        channel->SetSpecificChannelType(lType);
        channel->SetComType(kUntouched);  // shows whether a read sets a type
        return channel;
    }
    std::unique_ptr<Channel> Read(int32_t lTuner, int32_t lNumber, int32_t lType = 0) {
        doc.SetTunerType(lTuner);
        auto channel = Make(lNumber, lType);
        channel->ReadFromDisk(shared, doc);
        return channel;
    }
    void Write(int32_t lTuner, Channel& channel) {
        doc.SetTunerType(lTuner);
        channel.WriteToDisk(shared, Ini(), doc.TunerTypeObj());
    }
    std::string Stored(const std::string& sFile, const char* sSection, const char* sItem) {
        IniFile reader(tp.profiles);
        reader.SetFileName(sFile);
        return reader.ReadString(sSection, sItem, "-");
    }
    std::string Tun(const char* sSection, const char* sItem) {
        return Stored(tunPath, sSection, sItem);
    }
    void ExpectRows(std::initializer_list<Row> rows) {
        for (const Row& row : rows) {
            SCOPED_TRACE(testing::Message() << "kind " << row.lTuner << " number " << row.lNumber);
            auto c = Read(row.lTuner, row.lNumber, row.lType);
            EXPECT_EQ(c->ComType(), row.lComType);
            EXPECT_EQ(c->ComType() == kOpc ? c->OpcNodeAndServer() + "/" + c->OpcAccessPath()
                                           : c->DdeAppTopic(),
                      row.sAddress);
            EXPECT_EQ(c->ItemName(), row.sItem);
            EXPECT_EQ(c->Description(), row.sDescription);
        }
    }

    test::TestPlatform tp;
    std::string tunPath = tp.folder.File("Loop.tun");
    TunFile doc{tp.platform};
    IniFile shared{tp.profiles};
};

TEST_F(ChannelDisk, SpecificChannelsReadTheKeysOfTheirTunerKind) {
    const std::pair<std::string, const char*> keys[] = {
        {"_FilterAppTopic", "Flt|Top"}, {"_item_PB", "pb"},          {"_item_SP", "sp"},
        {"_item_Integral", "int"},      {"_item_Filter", "flt"},     {"_ServerID", "\\\\N1\\Srv.1"},
        {"_AccessPath", "AP"},          {"_FilterServerID", "FSrv"}, {"_FilterAccessPath", "FAP"}};
    for (const auto& [sKey, sValue] : keys) {
        Ini().WriteString("DDE", "DDE" + sKey, sValue);
        Ini().WriteString("OPC", "OPC" + sKey, sValue);
    }
    Ini().WriteString("DDE", "Send_SP", "send");
    Ini().WriteString("OPC", "Send_SP", "send");
    ExpectRows({{1, 1, 1, kDde, "Simulate|Loop", "pb", "Proportional"},
                {1, 11, 11, kDde, "Flt|Top", "flt", "Filter"},
                {4, 6, 6, kDde, "VIEW|TAGNAME", "sp", "Loop Setpoint"},
                {7, 5, 5, kDde, "PLCDDE|Topic", "Output", "Controller Output"},
                {7, 12, 12, kDde, "PLCDDE|Topic", "", "F value"},
                {9, 6, 6, kOpc, "\\\\N1\\Srv.1/AP", "sp", "Loop Setpoint"},
                {9, 12, 12, kOpc, "FSrv/FAP", "flt", "F value"},
                {3, 4, 4, kUntouched, "|", "", "Controller Mode"},
                {9, 13, 13, kUntouched, "|", "", ""}});
    // Unique write locations move the write channels' items, defaulting to
    // the read item, except for the filter's.
    Ini().WriteBoolean("DDE", "DDE_UniqueWriteLocs", true);
    ExpectRows({{9, 6, 6, kOpc, "\\\\N1\\Srv.1/AP", "send", "Loop Setpoint"},
                {1, 6, 6, kDde, "Simulate|Loop", "send", "Loop Setpoint"},
                {9, 7, 7, kOpc, "\\\\N1\\Srv.1/AP", "pb", "P value"},
                {9, 12, 12, kOpc, "FSrv/FAP", "", "F value"}});
}

TEST_F(ChannelDisk, ArchiveChannelsReadTheKeysOfTheirTunerKind) {
    Ini().WriteString("DDE", "DDE_item_CO", "co");
    Ini().WriteString("OPC", "OPC_item_SP", "sp");
    Ini().WriteString("Channel5", "Application", "App");
    Ini().WriteString("Channel5", "Item", "i5");
    Ini().WriteString("Channel4", "Item", "i4");
    Ini().WriteString("Channel1", "Description", "Flow");
    ExpectRows({{1, 1, 0, kDde, "Simulate|Loop", "PVData", "Flow"},
                {1, 2, 0, kDde, "Simulate|Loop", "co", "CO"},
                {1, 5, 0, kDde, "App|Loop", "i5", "Trend2"},
                {2, 4, 0, kDde, "Simulate|Loop", "i4", "Trend1"},
                {4, 3, 0, kDde, "VIEW|TAGNAME", "", "SP"},
                {3, 6, 0, kDde, "|", "PID_1_PV", "Trend3"},
                {7, 2, 0, kDde, "PLCDDE|Topic", "Output", "CO"},
                {9, 1, 0, kOpc, "/", "PVData", "Flow"},
                {9, 3, 0, kOpc, "/", "sp", "SP"},
                {12, 4, 0, kUntouched, "|", "", "Trend4"},
                {5, 2, 0, kUntouched, "|", "", "Trend2"}});
    EXPECT_TRUE(tp.dialogs.Messages().empty());
    // An unknown kind asks each of its questions once.
    Read(0, 3);
    ASSERT_EQ(tp.dialogs.Messages().size(), 2u);
    EXPECT_EQ(tp.dialogs.Messages()[0].text, "Error: TunerType.HasFaceplate");
}

TEST_F(ChannelDisk, FaceplateSpTakesThePvsRangesAndUnitsAndWritesNone) {
    Ini().WriteDouble("Channel1", "EngMin", 10);
    Ini().WriteDouble("Channel1", "DisplayMax", 18);
    Ini().WriteDouble("Channel3", "EngMin", 5);
    Ini().WriteDouble("Channel3", "EngMax", 5);
    Ini().WriteString("Channel3", "EngineeringUnits", "own");
    Ini().WriteString("PIDTuningSelections", "Engineering_Units", "kPa");
    auto sp = Read(9, 3);
    EXPECT_EQ(std::tuple(sp->EngMin(), sp->DisplayMax(), sp->EngUnits()),
              std::tuple(10, 18, "kPa"));
    EXPECT_EQ(Read(9, 2)->EngUnits(), "%");
    sp = Read(5, 3);  // no faceplate: its own section; equal limits give 0 to 100
    EXPECT_EQ(std::tuple(sp->EngMin(), sp->EngMax(), sp->EngUnits()), std::tuple(0, 100, "own"));
    Ini().EraseSection("Channel3");
    Write(9, *sp);
    for (const char* sKey : {"EngMin", "InstMax", "DisplayMin", "EngineeringUnits"}) {
        EXPECT_EQ(Tun("Channel3", sKey), "-") << sKey;
    }
    EXPECT_EQ(Tun("Channel3", "Description"), "Trend3");
    sp->SetNumber(2);
    sp->WriteSpansToDisk("Spans", Ini(), doc.TunerTypeObj());
    EXPECT_EQ(std::tuple(Tun("Spans", "InstMax"), Tun("Spans", "DisplayMax")),
              std::tuple("100", "-"));
}

TEST_F(ChannelDisk, ColoursOfPvCoAndSpLiveInTheSharedFile) {
    shared.WriteLong("FacePlate", "ColorPV", 255);
    shared.WriteLong("FacePlate", "LineWidthPV", 3);
    shared.WriteLong("FacePlate", "LineWidthCO", 9);  // invalid: stays 2
    Ini().WriteLong("Channel1", "LineColor", 999);
    Ini().WriteLong("Channel4", "LineColor", 31);
    struct Colour {
        int32_t lTuner, lNumber, lColour, lWidth;
    };
    for (const Colour row : {Colour{9, 1, 255, 3}, Colour{9, 2, 65280, 2}, Colour{9, 3, 65535, 2},
                             Colour{9, 4, 31, 2}, Colour{5, 1, 999, 3}, Colour{5, 3, 65535, 2}}) {
        auto c = Read(row.lTuner, row.lNumber);
        EXPECT_EQ(std::tuple(c->LineColor(), c->LineWidth()), std::tuple(row.lColour, row.lWidth))
            << row.lTuner << "/" << row.lNumber;
    }
    std::string sRole = "XX";
    int32_t lColour = 7;
    Make(0)->ReadCorvalentIni(shared, sRole, lColour);  // keeps the caller's role and colour
    EXPECT_EQ(std::tuple(sRole, lColour), std::tuple("XX", 7));
    Make(2)->ReadCorvalentIni(shared, sRole, lColour);
    EXPECT_EQ(std::tuple(sRole, lColour), std::tuple("CO", 65280));

    auto pv = Make(1);
    pv->SetLineColor(4242);
    Write(9, *pv);
    pv->SetNumber(6);
    Write(9, *pv);
    EXPECT_EQ(std::tuple(Stored("Corvalen.ini", "FacePlate", "ColorPV"),
                         Tun("Channel1", "LineColor"), Tun("Channel6", "LineColor")),
              std::tuple("4242", "999", "4242"));
}

TEST_F(ChannelDisk, WritesKeepTheFormatsOfEachKind) {
    std::istringstream opcKeys(
        "OPC_item_PB OPC_item_Integral OPC_item_Derivative OPC_item_ControllerMode Send_CO Send_SP "
        "Send_PB Send_Integral Send_Derivative Send_mode OPC_item_Filter Send_Filter");
    for (int32_t lType = 1; lType <= 12; ++lType) {
        auto c = Make(lType, lType);
        c->SetItemName("it" + std::to_string(lType));
        c->SetOpcNodeAndServer(lType == 11 ? "\\\\N\\Filter.1" : "Other.1");
        Write(9, *c);
        std::string sKey;
        opcKeys >> sKey;
        EXPECT_EQ(Tun("OPC", sKey.c_str()), c->ItemName());
        Write(7, *c);  // the PLC tuner writes no loop-specific keys
    }
    EXPECT_EQ(std::tuple(Tun("OPC", "OPC_FilterServerID"), Tun("OPC", "OPC_ServerID")),
              std::tuple("\\\\N\\Filter.1", "-"));
    auto filter = Make(11, 11);
    filter->SetDdeAppTopic("Flt|Top");
    Write(1, *filter);
    EXPECT_EQ(Tun("DDE", "DDE_FilterAppTopic"), "Flt|Top");

    auto co = Make(2);
    co->SetComType(ComTypeCode::OpcHda);
    Write(9, *co);
    EXPECT_EQ(Tun("OPC", "OPC_ServerID"), "OPC HDA item - No OPC Server");
    co->SetNumber(5);
    Write(9, *co);
    EXPECT_EQ(Tun("Channel5", "ServerID"), "OPC HDA item - No OPC Server");
    // Fenwarden writes "LinxItem" but reads "Item".
    co->SetItemName("linx");
    Write(2, *co);
    EXPECT_EQ(std::tuple(Tun("Channel5", "LinxItem"), Read(2, 5)->ItemName()),
              std::tuple("linx", ""));
}

// The sample round trips carry every channel of real files; this one carries
// values no sample holds, and texts a read would trim or unquote.
TEST_F(ChannelDisk, WriteThenReadLosesNothingTheFormatKeeps) {
    for (const auto& [lTuner, lComType] : {std::pair(9, kOpc), std::pair(1, kDde)}) {
        auto c = Make(5);
        Fill(*c, 5);
        c->SetComType(lComType);
        c->SetDescription("  padded  ");
        c->SetEngUnits("'quoted'");
        if (lTuner == 1) {
            c->SetOpcNodeAndServer("");
            c->SetDdeAppTopic("Excel|Sheet1");
        }
        Write(lTuner, *c);
        EXPECT_EQ(Kept(*Read(lTuner, 5)), Kept(*c)) << lTuner;
    }
    // Charted channels 4 and above keep application and topic apart, so a
    // bar or blanks in either survive reading and writing back.
    Ini().WriteString("Channel6", "Application", "Ex|cel");
    Ini().WriteString("Channel6", "Topic", " Sheet 1 ", true);
    auto dde = Read(1, 6);
    EXPECT_EQ(std::tuple(dde->DdeApplication(), dde->TopicName()),
              std::tuple("Ex|cel", " Sheet 1 "));
    Write(1, *dde);
    EXPECT_EQ(std::tuple(Tun("Channel6", "Application"), Tun("Channel6", "Topic")),
              std::tuple("Ex|cel", " Sheet 1 "));
}

TEST_F(ChannelDisk, CopyFromTakesExactlyTheListedFields) {
    auto pv = Make(1);
    Fill(*pv, 7);
    Write(9, *pv);
    Ini().WriteLong("Channel1", "DecimalPlaces", 8);
    auto source = Read(9, 1);
    EXPECT_EQ(source->DecimalPlaces(), 8);  // stored unchecked
    source->SetDdeAppTopic("App|Topic");
    source->SetSpecificChannelType(5);
    source->SetExpectANumber(false);
    source->OpcSetRawValue(Variant::R8(12), 0xC0, 45000, false);
    auto target = Make(3);
    target->CopyFrom(*source);
    EXPECT_EQ(Kept(*target), Kept(*source));
    EXPECT_EQ(
        std::tuple(target->ScaleOffset(), target->SpecificChannelType(), target->ExpectANumber()),
        std::tuple(source->ScaleOffset(), 5, false));
    // Not the number or the value.
    EXPECT_EQ(std::tuple(target->Number(), target->IsOnline(), target->OpcRawValueVarType()),
              std::tuple(3, false, 0));
}

}  // namespace
}  // namespace cv
