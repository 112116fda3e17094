#include <cstdlib>
#include <filesystem>
#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "document/TunFile.h"
#include "support/TestFiles.h"
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

// The documents' parts read their own rules; this shows a real file reaches them all.
TEST(TunFileSamples, OpcFileGivesChartedChannelsLoopsAndSettings) {
    Machine m;
    TunFile doc(m.tp.platform);
    ASSERT_TRUE(doc.ReadFromDisk(9, CopySample(m.files, "Reactor_TIC101.tun")));
    EXPECT_TRUE(m.tp.dialogs.Messages().empty());

    ASSERT_EQ(doc.Archives().Count(), 5);
    const Channel& pv = *doc.Archives().PVChannel();
    EXPECT_EQ(Join(pv.Description(), pv.EngUnits(), pv.OpcNodeAndServer(), pv.LineColor()),
              "Reactor temperature|degC|\\\\PLANT-OPC1\\Corvalent.SimPlant.1|255|");
    ASSERT_EQ(doc.Specifics().Collection().size(), 12u);
    EXPECT_EQ(Join(doc.General().SIinMSec(), doc.General().ModeValue(4)), "500|Initialisation|");
    ASSERT_EQ(doc.Loops().Count(), 2);
    doc.Loops().SetCurrentLoop(2);
    EXPECT_EQ(doc.CurrentPVChannelObj()->Description(), "Jacket pressure");
}

// Reading converts the old word Booleans and leaves the version as it was.
TEST(TunFileSamples, OldFileIsUpgradedOnRead) {
    Machine m;
    const std::string path = CopySample(m.files, "Kiln_TIC7_1999.tun");
    TunFile doc(m.tp.platform);
    ASSERT_TRUE(doc.ReadFromDisk(1, path));
    EXPECT_EQ(Join(doc.General().AutoModeDetect(), doc.General().ManualModeDetect(),
                   doc.General().UseHotLinks()),
              "1|0|1|");
    const std::string text = test::Slurp(path);
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
    ASSERT_TRUE(doc.WriteToDisk(path));

    const std::string text = test::Slurp(path);
    EXPECT_NE(text.find("[Channel3]"), std::string::npos);
    for (const char* stale : {"[Channel4]", "[Channel5]"}) {
        EXPECT_EQ(text.find(stale), std::string::npos) << stale;
    }

    TunFile reread(m.tp.platform);
    ASSERT_TRUE(reread.ReadFromDisk(9, path));
    EXPECT_EQ(Kept(doc), Kept(reread));
}

}  // namespace
}  // namespace cv
