#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

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

// Values joined as text, so that what the format keeps of two documents
// compares field by field in one expectation.
template <typename... T>
std::string Join(const T&... values) {
    std::ostringstream o;
    ((o << values << '|'), ...);
    return o.str();
}

std::string Kept(const Channel& c) {
    return Join(c.Number(), c.SpecificChannelType(), c.EngMin(), c.EngMax(), c.InstMin(),
                c.InstMax(), c.DisplayMin(), c.DisplayMax(), c.EngUnits(), c.Description(),
                c.DecimalPlaces(), c.LineColor(), c.LineWidth(), c.DisplayOnGraph(), c.ComType(),
                c.ItemName(), c.TopicName(), c.DdeApplication(), c.OpcNodeAndServer());
}

std::string Kept(const LoopClass& l) {
    return Join(l.Description(), l.PVChannel(), l.COChannel(), l.SPChannel(), l.ControllerString(),
                l.ResponseDirection(), l.PBorGain(), l.IntegralUnits(), l.dUnits(), l.PMultiplier(),
                l.IMultiplier(), l.DMultiplier(), l.ControllerSI(), l.InverseProcess(),
                l.FilterUnits());
}

std::string Kept(const TunFileGeneral& g) {
    std::string text =
        Join(g.SIinMSec(), g.UseHotLinks(), g.UniqueWriteLocs(), g.ScanMode(), g.ScalePVandCO(),
             g.ScaleSP(), g.UserSetDisplayRanges(), g.DDETimeout());
    for (int32_t i = 1; i <= g.ModeCount(); ++i) {
        text += Join(g.ModeKey(i), g.ModeValue(i), g.ModeAuto(i));
    }
    return text;
}

std::vector<std::string> Kept(const TunFile& d) {
    std::vector<std::string> kept{Kept(d.General()),
                                  std::to_string(d.Specifics().FilterReadWrite())};
    for (const auto& channel : d.Archives().Collection()) {
        kept.push_back(Kept(*channel));
    }
    for (const auto& channel : d.Specifics().Collection()) {
        kept.push_back(Kept(*channel));
    }
    for (int32_t k = 1; k <= d.Loops().Count(); ++k) {
        kept.push_back(Kept(*d.Loops().Item(k)));
    }
    return kept;
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
    EXPECT_EQ(Join(pv.Description(), pv.EngUnits(), pv.OpcNodeAndServer(), pv.LineColor()),
              "Reactor temperature|degC|\\\\PLANT-OPC1\\Corvalent.SimPlant.1|255|");
    const Channel& sp = *doc.Archives().SPChannel();  // display range from the PV's section
    EXPECT_EQ(Join(sp.DisplayMax(), sp.EngUnits(), sp.LineColor()), "200|degC|16776960|");
    const Channel& vent = *doc.Archives().Item(5);
    EXPECT_EQ(Join(vent.OpcAccessPath(), vent.DisplayOnGraph()), "Line2|0|");

    ASSERT_EQ(doc.Specifics().Collection().size(), 12u);
    EXPECT_TRUE(doc.Specifics().FilterReadWrite());
    EXPECT_EQ(doc.Specifics().Item(SpecificType::Filter)->OpcComputer(), "PLANT-OPC1");
    EXPECT_EQ(doc.Specifics().Item(SpecificType::SendSP)->EngMax(), 250);

    EXPECT_EQ(Join(doc.General().SIinMSec(), doc.General().ModeValue(4)), "500|Initialisation|");

    ASSERT_EQ(doc.Loops().Count(), 2);
    EXPECT_EQ(doc.CurrentPVChannelObj(), &pv);
    EXPECT_EQ(Join(doc.Loops().Item(2)->SPChannel(), doc.Loops().Item(2)->dUnits()), "0|sec|");
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
    EXPECT_EQ(pv.EngUnits(), "%");  // the old place for the PV's units
    EXPECT_EQ(doc.Archives().Item(4)->ItemName(), "N7:30");

    EXPECT_FALSE(doc.Specifics().FilterReadWrite());
    EXPECT_EQ(doc.Specifics().Item(SpecificType::SendCO)->ItemName(), "N7:41");
    EXPECT_FALSE(doc.General().UseHotLinks());
    EXPECT_EQ(doc.FaceplateLoop()->FilterUnits(), "Minutes");
}

TEST(TunFileSamples, OldFileIsUpgradedOnRead) {
    Machine m;
    const std::string path = CopySample(m.files, "Kiln_TIC7_1999.tun");
    TunFile doc(m.tp.platform);
    ASSERT_TRUE(doc.ReadFromDisk(1, path));
    EXPECT_EQ(Join(doc.General().AutoModeDetect(), doc.General().ManualModeDetect(),
                   doc.General().UseHotLinks()),
              "1|0|1|");
    EXPECT_EQ(doc.Archives().PVChannel()->Description(), "Kiln temperature");
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
        EXPECT_EQ(Kept(original), Kept(reread));
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

    const std::string text = ReadText(path);
    EXPECT_NE(text.find("[Channel3]"), std::string::npos);
    for (const char* stale : {"[Channel4]", "[Channel5]", "[PIDController Loop 2]", "ModeKey2"}) {
        EXPECT_EQ(text.find(stale), std::string::npos) << stale;
    }

    TunFile reread(m.tp.platform);
    ASSERT_TRUE(reread.ReadFromDisk(9, path));
    EXPECT_EQ(Kept(doc), Kept(reread));
}

}  // namespace
}  // namespace cv
