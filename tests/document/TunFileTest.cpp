#include "document/TunFile.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

#include "support/TestPlatform.h"

namespace cv {
namespace {

// A document whose program folder is a writable temporary one.
struct Fixture {
    Fixture() : document(tp.platform) {
        tp.program.folder = programFolder.Path();
        tp.program.dataFolder = dataFolder.Path();
    }
    test::TestPlatform tp;
    test::TempFolder programFolder;
    test::TempFolder dataFolder;
    TunFile document;
};

TEST(TunFile, ForwardsTheTunerKindAndKeepsItsSettings) {
    test::TestPlatform tp;
    TunFile tunFile(tp.platform);
    tunFile.SetTunerType(9);
    EXPECT_TRUE(tunFile.TunerTypeObj().HasFaceplate());
    tunFile.TunerTypeObj().SetTuner(5);
    EXPECT_EQ(tunFile.TunerType(), 5);

    tunFile.General().SetSIinSec(2.5);
    EXPECT_EQ(tunFile.General().SIinMSec(), 2500);
    EXPECT_TRUE(tp.dialogs.Messages().empty());
}

TEST(TunFile, DefaultsBuildTheOpcTunerDocument) {
    Fixture f;
    EXPECT_FALSE(f.document.IsValid());
    EXPECT_EQ(f.document.CurrentPVChannelObj(), nullptr);
    f.document.SetDefaults(9);
    EXPECT_TRUE(f.document.IsValid());
    EXPECT_EQ(f.document.Specifics().Collection().size(), 10u);
    EXPECT_EQ(f.document.CurrentLoop()->Description(), "Faceplate");
    EXPECT_EQ(f.document.CurrentSPChannelObj(), f.document.Archives().SPChannel());
    EXPECT_EQ(f.document.TunFilePath(), f.programFolder.File("LoopTag.tun"));
    EXPECT_EQ(f.document.LoopTag(), "LoopTag");

    EXPECT_FALSE(f.document.ReadFromDisk(9, f.programFolder.File("other.tun")));
    ASSERT_EQ(f.tp.dialogs.Messages().size(), 1u);
    EXPECT_EQ(f.tp.dialogs.Last().text, "Error: TunFile.ReadFromDisk(1)");
    EXPECT_EQ(f.tp.dialogs.Last().style, MsgBoxStyle::OKOnly);
    EXPECT_EQ(f.tp.dialogs.Last().title, "");
    EXPECT_TRUE(std::filesystem::is_empty(f.programFolder.Path()));
}

TEST(TunFile, FaceplateSendChannelsTakeTheChartedRanges) {
    Fixture f;
    std::ofstream(f.dataFolder.File("ranges.tun")) << "[Trend]\nNumberOfChannels=3\n"
                                                   << "[Channel1]\nEngMin=4\nEngMax=20\n"
                                                   << "[Channel2]\nEngMin=-10\nEngMax=110\n";
    TunFile read(f.tp.platform);
    ASSERT_TRUE(read.ReadFromDisk(9, f.dataFolder.File("ranges.tun")));
    const Channel* sendCO = read.Specifics().Item(SpecificType::SendCO);
    const Channel* sendSP = read.Specifics().Item(SpecificType::SendSP);
    EXPECT_EQ(sendCO->EngMin(), -10);
    EXPECT_EQ(sendSP->EngMax(), 20);
}

TEST(TunFile, UnwritableProgramFolderPutsTheDefaultFileInTheDataFolder) {
    Fixture f;
    f.tp.program.folder = f.programFolder.File("missing");
    f.document.SetDefaults(9);
    EXPECT_EQ(f.document.TunFilePath(), f.dataFolder.File("LoopTag.tun"));

    TunFile second(f.tp.platform);
    f.tp.program.folder = f.programFolder.Path() + "/";
    second.SetDefaults(9);
    EXPECT_EQ(second.TunFilePath(), f.programFolder.File("LoopTag.tun"));
}

TEST(TunFile, LoopTagCutsAtTheLastPoint) {
    Fixture f;
    f.document.SetDefaults(9);
    f.document.SetLoopTag("Unit7.A.tun");
    EXPECT_EQ(f.document.TunFilePath(), f.programFolder.File("Unit7.A.tun"));
    EXPECT_EQ(f.document.LoopTag(), "Unit7.A");
    f.document.SetLoopTag("FIC12");
    EXPECT_EQ(f.document.TunFilePath(), f.programFolder.File("FIC12.tun"));
    f.document.IniFileObject().SetFileName("C:\\Plant\\Area 1\\TIC 3.old.tun");
    EXPECT_EQ(f.document.LoopTag(), "TIC 3.old");
}

TEST(TunFile, RefusedReadsAndFailedSavesKeepTheDocumentsFile) {
    Fixture f;
    EXPECT_FALSE(f.document.ReadFromDisk(9, ""));
    EXPECT_EQ(f.tp.dialogs.Last().text, "Error: TunFile.ReadFromDisk(2)");
    EXPECT_EQ(f.document.TunFilePath(), "");

    f.document.SetDefaults(9);
    EXPECT_FALSE(f.document.WriteToDisk(""));
    EXPECT_EQ(f.tp.dialogs.Last().text, "Error: TunFile.WriteToDisk");
    const std::string blocked = f.dataFolder.File("no-such-folder/plant.tun");
    EXPECT_FALSE(f.document.WriteToDisk(blocked));
    EXPECT_EQ(f.tp.dialogs.Messages().size(), 3u);
    EXPECT_EQ(f.tp.dialogs.Last().text, "Error: TunFile.WriteToDisk");
    EXPECT_EQ(f.document.TunFilePath(), f.programFolder.File("LoopTag.tun"));
    EXPECT_FALSE(std::filesystem::exists(blocked));
}

TEST(TunFile, ConvertFileFormatRewritesOldWordBooleans) {
    struct Case {
        const char* versionLine;
        const char* storedAuto;
        const char* expectedAuto;
        const char* expectedManual;
    };
    const Case cases[] = {{"common=12.07.99", "TRUE", "1", "0"},
                          {"common=12.0799", "true", "1", "0"},
                          {"common=12.07.9", "True", "1", "0"},
                          {"", "Yes", "Yes", "0"},
                          {"common=12.08", "TRUE", "TRUE", "fAlSe"}};
    for (const Case& c : cases) {
        test::TestPlatform tp;
        const std::string path = tp.folder.File("old.tun");
        std::ofstream(path) << "[version]\n"
                            << c.versionLine << "\n[DDE]\nDDE_Item_AutoModeDetect=" << c.storedAuto
                            << "\nDDE_Item_ManualModeDetect=fAlSe\n";
        TunFile document(tp.platform);
        document.IniFileObject().SetFileName(path);
        document.ConvertFileFormat();
        const IniFile& ini = document.IniFileObject();
        EXPECT_EQ(ini.ReadString("DDE", "DDE_Item_AutoModeDetect", ""), c.expectedAuto);
        EXPECT_EQ(ini.ReadString("DDE", "DDE_Item_ManualModeDetect", ""), c.expectedManual);
        EXPECT_EQ("common=" + ini.ReadString("version", "common", ""),
                  *c.versionLine ? c.versionLine : "common=")
            << "the version is never written";
    }
}

TEST(TunFile, CurrentChannelsFollowTheCurrentLoop) {
    Fixture f;
    f.document.SetDefaults(9);
    bool failed = false;
    LoopClass* loop = f.document.Loops().Add(2, failed);
    loop->SetPVChannel(4);
    loop->SetSPChannel(0);
    f.document.Loops().SetCurrentLoop(2);
    EXPECT_EQ(f.document.CurrentPVChannel(), 0);
    EXPECT_EQ(f.document.CurrentPVChannelObj(), nullptr);
    EXPECT_EQ(f.document.CurrentCOChannelObj(), f.document.Archives().COChannel());
    EXPECT_EQ(f.document.CurrentSPChannelObj(), nullptr);

    bool error = false;
    f.document.Archives().Add(4, error);
    EXPECT_EQ(f.document.CurrentPVChannel(), 4);
    EXPECT_EQ(f.document.CurrentPVChannelObj(), f.document.Archives().Item(4));
}

TEST(TunFile, ModeValueNeedsTheModeChannelOnline) {
    Fixture f;
    f.document.SetDefaults(9);
    f.document.ModeMap().AddModeMapItem("AUTO", "Automatic");
    EXPECT_EQ(f.document.ModeValue(), "Unknown");

    Channel* mode = f.document.Specifics().Item(SpecificType::Mode);
    mode->SetExpectANumber(false);
    mode->OpcSetRawValue(Variant::Str("AUTO\r\n"), 0xC0, 0, false);
    EXPECT_EQ(f.document.ModeValue(), "Automatic");
    mode->OpcSetRawValue(Variant::Str("CAS"), 0xC0, 0, false);
    EXPECT_EQ(f.document.ModeValue(), "unknown");
    mode->GoOffline();
    EXPECT_EQ(f.document.ModeValue(), "Unknown");
}

TEST(TunFile, ReplacedCollectionsAreKeptAndNullIsIgnored) {
    Fixture f;
    f.document.SetDefaults(9);
    auto archives = std::make_unique<ArchiveChannels>(f.tp.platform);
    ArchiveChannels* raw = archives.get();
    f.document.SetArchives(std::move(archives));
    f.document.SetArchives(nullptr);
    EXPECT_EQ(&f.document.Archives(), raw);
    EXPECT_FALSE(f.document.IsValid());
    f.document.SetLoops(std::make_unique<LoopCollection>(f.tp.platform));
    f.document.SetLoops(nullptr);
    EXPECT_EQ(f.document.FaceplateLoop(), nullptr);
}

}  // namespace
}  // namespace cv
