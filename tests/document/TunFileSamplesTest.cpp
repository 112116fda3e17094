#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>

#include "document/TunFile.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

// Copies a sample file from the test data into the folder; the samples
// themselves are never written.
std::string CopySample(const test::TempFolder& folder, const std::string& name) {
    const char* data = std::getenv("CV_TEST_DATA");
    EXPECT_NE(data, nullptr) << "CV_TEST_DATA is not set";
    const std::string target = folder.File(name);
    std::filesystem::copy_file(std::string(data == nullptr ? "" : data) + "/" + name, target);
    return target;
}

std::string ReadText(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), {});
}

bool HasSection(const std::string& path, const std::string& section) {
    return ReadText(path).find("[" + section + "]") != std::string::npos;
}

void ExpectSameChannel(const Channel& a, const Channel& b) {
    SCOPED_TRACE("channel " + std::to_string(a.Number()) + " type " +
                 std::to_string(a.SpecificChannelType()));
    EXPECT_EQ(a.Number(), b.Number());
    EXPECT_EQ(a.SpecificChannelType(), b.SpecificChannelType());
    EXPECT_EQ(a.EngMin(), b.EngMin());
    EXPECT_EQ(a.EngMax(), b.EngMax());
    EXPECT_EQ(a.InstMin(), b.InstMin());
    EXPECT_EQ(a.InstMax(), b.InstMax());
    EXPECT_EQ(a.DisplayMin(), b.DisplayMin());
    EXPECT_EQ(a.DisplayMax(), b.DisplayMax());
    EXPECT_EQ(a.EngUnits(), b.EngUnits());
    EXPECT_EQ(a.Description(), b.Description());
    EXPECT_EQ(a.DecimalPlaces(), b.DecimalPlaces());
    EXPECT_EQ(a.LineColor(), b.LineColor());
    EXPECT_EQ(a.LineWidth(), b.LineWidth());
    EXPECT_EQ(a.DisplayOnGraph(), b.DisplayOnGraph());
    EXPECT_EQ(a.ComType(), b.ComType());
    EXPECT_EQ(a.ItemName(), b.ItemName());
    EXPECT_EQ(a.TopicName(), b.TopicName());
    EXPECT_EQ(a.DdeApplication(), b.DdeApplication());
    EXPECT_EQ(a.OpcComputer(), b.OpcComputer());
    EXPECT_EQ(a.OpcServerID(), b.OpcServerID());
}

void ExpectSameLoop(const LoopClass& a, const LoopClass& b) {
    SCOPED_TRACE("loop " + std::to_string(a.Number()));
    EXPECT_EQ(a.Description(), b.Description());
    EXPECT_EQ(a.PVChannel(), b.PVChannel());
    EXPECT_EQ(a.COChannel(), b.COChannel());
    EXPECT_EQ(a.SPChannel(), b.SPChannel());
    EXPECT_EQ(a.ControllerString(), b.ControllerString());
    EXPECT_EQ(a.ResponseDirection(), b.ResponseDirection());
    EXPECT_EQ(a.PBorGain(), b.PBorGain());
    EXPECT_EQ(a.IntegralUnits(), b.IntegralUnits());
    EXPECT_EQ(a.dUnits(), b.dUnits());
    EXPECT_EQ(a.PMultiplier(), b.PMultiplier());
    EXPECT_EQ(a.IMultiplier(), b.IMultiplier());
    EXPECT_EQ(a.DMultiplier(), b.DMultiplier());
    EXPECT_EQ(a.ControllerSI(), b.ControllerSI());
    EXPECT_EQ(a.InverseProcess(), b.InverseProcess());
    EXPECT_EQ(a.FilterUnits(), b.FilterUnits());
}

void ExpectSameGeneral(const TunFileGeneral& a, const TunFileGeneral& b) {
    EXPECT_EQ(a.SIinMSec(), b.SIinMSec());
    EXPECT_EQ(a.UseHotLinks(), b.UseHotLinks());
    EXPECT_EQ(a.UniqueWriteLocs(), b.UniqueWriteLocs());
    EXPECT_EQ(a.ScanMode(), b.ScanMode());
    EXPECT_EQ(a.ScalePVandCO(), b.ScalePVandCO());
    EXPECT_EQ(a.ScaleSP(), b.ScaleSP());
    EXPECT_EQ(a.DDETimeout(), b.DDETimeout());
    EXPECT_EQ(a.UserSetDisplayRanges(), b.UserSetDisplayRanges());
    ASSERT_EQ(a.ModeCount(), b.ModeCount());
    for (int32_t i = 1; i <= a.ModeCount(); ++i) {
        EXPECT_EQ(a.ModeKey(i), b.ModeKey(i));
        EXPECT_EQ(a.ModeValue(i), b.ModeValue(i));
        EXPECT_EQ(a.ModeAuto(i), b.ModeAuto(i));
    }
}

void ExpectSameDocument(const TunFile& a, const TunFile& b) {
    ExpectSameGeneral(a.General(), b.General());
    ASSERT_EQ(a.Archives().Count(), b.Archives().Count());
    for (int32_t k = 1; k <= a.Archives().Count(); ++k) {
        ExpectSameChannel(*a.Archives().Item(k), *b.Archives().Item(k));
    }
    ASSERT_EQ(a.Specifics().Collection().size(), b.Specifics().Collection().size());
    EXPECT_EQ(a.Specifics().FilterReadWrite(), b.Specifics().FilterReadWrite());
    for (size_t k = 0; k < a.Specifics().Collection().size(); ++k) {
        ExpectSameChannel(*a.Specifics().Collection()[k], *b.Specifics().Collection()[k]);
    }
    ASSERT_EQ(a.Loops().Count(), b.Loops().Count());
    for (int32_t k = 1; k <= a.Loops().Count(); ++k) {
        ExpectSameLoop(*a.Loops().Item(k), *b.Loops().Item(k));
    }
}

// A test platform whose settings folder holds the machine's shared file.
struct Machine {
    Machine() { CopySample(tp.folder, "Corvalen.ini"); }
    test::TestPlatform tp;
    test::TempFolder files;
};

TEST(TunFileSamples, OpcFileGivesChartedChannelsLoopsAndSettings) {
    Machine m;
    TunFile doc(m.tp.platform);
    ASSERT_TRUE(doc.ReadFromDisk(9, CopySample(m.files, "Reactor_TIC101.tun")));
    EXPECT_TRUE(m.tp.dialogs.Messages().empty());

    ASSERT_EQ(doc.Archives().Count(), 5);
    const Channel& pv = *doc.Archives().PVChannel();
    EXPECT_EQ(pv.Description(), "Reactor temperature");
    EXPECT_EQ(pv.InstMin(), 4);
    EXPECT_EQ(pv.EngMax(), 250);
    EXPECT_EQ(pv.DisplayMin(), 50);
    EXPECT_EQ(pv.EngUnits(), "degC");
    EXPECT_EQ(pv.OpcNodeAndServer(), "\\\\PLANT-OPC1\\Corvalent.SimPlant.1");
    EXPECT_EQ(pv.ItemName(), "Area1.TIC101.PV");
    EXPECT_EQ(pv.LineColor(), 255);
    EXPECT_EQ(pv.LineWidth(), 3);
    const Channel& sp = *doc.Archives().SPChannel();
    EXPECT_EQ(sp.Description(), "Temperature setpoint");
    EXPECT_EQ(sp.DisplayMax(), 200);  // from the PV's section
    EXPECT_EQ(sp.EngUnits(), "degC");
    EXPECT_EQ(sp.LineColor(), 16776960);
    const Channel& vent = *doc.Archives().Item(5);
    EXPECT_EQ(vent.Description(), "Jacket vent valve");
    EXPECT_EQ(vent.OpcComputer(), "");
    EXPECT_EQ(vent.OpcAccessPath(), "Line2");
    EXPECT_EQ(vent.LineWidth(), 3);
    EXPECT_FALSE(vent.DisplayOnGraph());
    EXPECT_EQ(doc.Archives().Item(4)->DecimalPlaces(), 2);

    ASSERT_EQ(doc.Specifics().Collection().size(), 12u);
    EXPECT_TRUE(doc.Specifics().FilterReadWrite());
    EXPECT_EQ(doc.Specifics().Item(SpecificType::D)->ItemName(), "Area1.TIC101.RATE");
    EXPECT_EQ(doc.Specifics().Item(SpecificType::Filter)->OpcComputer(), "PLANT-OPC1");
    EXPECT_EQ(doc.Specifics().Item(SpecificType::SendSP)->EngMax(), 250);

    EXPECT_EQ(doc.General().SIinMSec(), 500);
    EXPECT_EQ(doc.General().ModeCount(), 4);
    EXPECT_EQ(doc.General().ModeValue(4), "Initialisation");
    EXPECT_EQ(doc.General().DDETimeout(), 150);

    ASSERT_EQ(doc.Loops().Count(), 2);
    EXPECT_EQ(doc.CurrentPVChannelObj(), &pv);
    const LoopClass& jacket = *doc.Loops().Item(2);
    EXPECT_EQ(jacket.Description(), "Jacket pressure");
    EXPECT_EQ(jacket.SPChannel(), 0);
    EXPECT_EQ(jacket.dUnits(), "sec");
    EXPECT_EQ(jacket.CurrentP(), 150);
    doc.Loops().SetCurrentLoop(2);
    EXPECT_EQ(doc.CurrentPVChannelObj()->Description(), "Jacket pressure");
    EXPECT_EQ(doc.CurrentSPChannelObj(), nullptr);
}

TEST(TunFileSamples, DdeFileGivesDdeAddresses) {
    Machine m;
    TunFile doc(m.tp.platform);
    ASSERT_TRUE(doc.ReadFromDisk(1, CopySample(m.files, "Boiler_LIC20.tun")));
    ASSERT_EQ(doc.Archives().Count(), 4);
    for (const auto& channel : doc.Archives().Collection()) {
        EXPECT_EQ(channel->ComType(), ComTypeCode::Dde);
    }
    const Channel& pv = *doc.Archives().PVChannel();
    EXPECT_EQ(pv.DdeAppTopic(), "RSLINX|BOILER3");
    EXPECT_EQ(pv.ItemName(), "N7:10");
    EXPECT_EQ(pv.EngUnits(), "%");  // the old place for the PV's units
    EXPECT_EQ(doc.Archives().Item(4)->DdeAppTopic(), "RSLINX|BOILER3");
    EXPECT_EQ(doc.Archives().Item(4)->ItemName(), "N7:30");

    EXPECT_FALSE(doc.Specifics().FilterReadWrite());
    EXPECT_EQ(doc.Specifics().Item(SpecificType::SendCO)->ItemName(), "N7:41");
    EXPECT_EQ(doc.Specifics().Item(SpecificType::Mode)->ItemName(), "B3:0/4");
    EXPECT_FALSE(doc.General().UseHotLinks());
    EXPECT_EQ(doc.General().SIinMSec(), 2000);
    ASSERT_EQ(doc.Loops().Count(), 1);
    EXPECT_EQ(doc.FaceplateLoop()->FilterUnits(), "Minutes");
}

TEST(TunFileSamples, OldFileIsUpgradedOnRead) {
    Machine m;
    const std::string path = CopySample(m.files, "Kiln_TIC7_1999.tun");
    TunFile doc(m.tp.platform);
    ASSERT_TRUE(doc.ReadFromDisk(1, path));
    EXPECT_EQ(doc.General().AutoModeDetect(), "1");
    EXPECT_EQ(doc.General().ManualModeDetect(), "0");
    EXPECT_TRUE(doc.General().UseHotLinks());
    EXPECT_EQ(doc.Archives().Count(), 3);
    EXPECT_EQ(doc.Archives().PVChannel()->Description(), "Kiln temperature");
    EXPECT_TRUE(doc.Archives().PVChannel()->DisplayOnGraph());
    EXPECT_EQ(doc.Archives().SPChannel()->ItemName(), "SPData");
    const std::string text = ReadText(path);
    EXPECT_NE(text.find("common=12.07.99"), std::string::npos);
    EXPECT_NE(text.find("DDE_Item_AutoModeDetect=1"), std::string::npos);
}

TEST(TunFileSamples, WrittenDocumentsReadBackTheSame) {
    const std::pair<int32_t, const char*> samples[] = {
        {9, "Reactor_TIC101.tun"}, {1, "Boiler_LIC20.tun"}, {1, "Kiln_TIC7_1999.tun"}};
    for (const auto& [tuner, name] : samples) {
        SCOPED_TRACE(name);
        Machine m;
        TunFile original(m.tp.platform);
        ASSERT_TRUE(original.ReadFromDisk(tuner, CopySample(m.files, name)));
        const std::string copy = m.files.File("copy.tun");
        ASSERT_TRUE(original.WriteToDisk(copy));
        EXPECT_EQ(original.TunFilePath(), copy);

        TunFile reread(m.tp.platform);
        ASSERT_TRUE(reread.ReadFromDisk(tuner, copy));
        ExpectSameDocument(original, reread);
        EXPECT_TRUE(m.tp.dialogs.Messages().empty());
    }
}

TEST(TunFileSamples, RewritingAShorterDocumentLeavesNoStaleSections) {
    Machine m;
    const std::string path = CopySample(m.files, "Reactor_TIC101.tun");
    TunFile doc(m.tp.platform);
    ASSERT_TRUE(doc.ReadFromDisk(9, path));
    for (Channel* extra = doc.Archives().Item(4); extra; extra = doc.Archives().Item(4)) {
        doc.Archives().Remove(extra);
    }
    LoopClass* second = doc.Loops().Item(2);
    doc.Loops().Remove(second);
    doc.General().SetModeCount(3);
    ASSERT_TRUE(doc.WriteToDisk(path));

    EXPECT_TRUE(HasSection(path, "Channel3"));
    EXPECT_FALSE(HasSection(path, "Channel4"));
    EXPECT_FALSE(HasSection(path, "Channel5"));
    EXPECT_TRUE(HasSection(path, "PIDController Loop 1"));
    EXPECT_FALSE(HasSection(path, "PIDController Loop 2"));
    const std::string text = ReadText(path);
    EXPECT_EQ(text.find("ModeKey2"), std::string::npos);

    TunFile reread(m.tp.platform);
    ASSERT_TRUE(reread.ReadFromDisk(9, path));
    ExpectSameDocument(doc, reread);
}

}  // namespace
}  // namespace cv
