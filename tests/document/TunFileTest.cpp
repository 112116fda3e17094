#include "document/TunFile.h"

#include <filesystem>
#include <fstream>
#include <tuple>

#include <gtest/gtest.h>

#include "support/TestPlatform.h"

namespace cv {
namespace {

// A document whose program folder is a writable temporary one.
struct TunFileDocument : testing::Test {
    TunFileDocument() : document(tp.platform) {
        tp.program.folder = programFolder.Path();
        tp.program.dataFolder = dataFolder.Path();
    }
    test::TestPlatform tp;
    test::TempFolder programFolder;
    test::TempFolder dataFolder;
    TunFile document;
};

TEST_F(TunFileDocument, DefaultsBuildTheOpcTunerDocument) {
    EXPECT_FALSE(document.IsValid());
    EXPECT_EQ(document.CurrentPVChannelObj(), nullptr);
    document.SetDefaults(9);
    EXPECT_TRUE(document.IsValid());
    EXPECT_EQ(document.Specifics().Collection().size(), 10u);
    EXPECT_EQ(document.CurrentLoop()->Description(), "Faceplate");
    EXPECT_EQ(document.CurrentSPChannelObj(), document.Archives().SPChannel());
    EXPECT_EQ(document.TunFilePath(), programFolder.File("LoopTag.tun"));
    EXPECT_EQ(document.LoopTag(), "LoopTag");

    EXPECT_FALSE(document.ReadFromDisk(9, programFolder.File("other.tun")));
    ASSERT_EQ(tp.dialogs.Messages().size(), 1u);
    EXPECT_EQ(std::tuple(tp.dialogs.Last().text, tp.dialogs.Last().style, tp.dialogs.Last().title),
              std::tuple("Error: TunFile.ReadFromDisk(1)", MsgBoxStyle::OKOnly, ""));
    EXPECT_TRUE(std::filesystem::is_empty(programFolder.Path()));
}

TEST_F(TunFileDocument, FaceplateSendChannelsTakeTheChartedRanges) {
    std::ofstream(dataFolder.File("ranges.tun")) << "[Trend]\nNumberOfChannels=3\n"
                                                 << "[Channel1]\nEngMin=4\nEngMax=20\n"
                                                 << "[Channel2]\nEngMin=-10\nEngMax=110\n";
    TunFile read(tp.platform);
    ASSERT_TRUE(read.ReadFromDisk(9, dataFolder.File("ranges.tun")));
    EXPECT_EQ(read.Specifics().Item(SpecificType::SendCO)->EngMin(), -10);
    EXPECT_EQ(read.Specifics().Item(SpecificType::SendSP)->EngMax(), 20);
}

TEST_F(TunFileDocument, DefaultFileGoesToAWritableFolderAndLoopTagCutsAtTheLastPoint) {
    tp.program.folder = programFolder.File("missing");
    document.SetDefaults(9);
    EXPECT_EQ(document.TunFilePath(), dataFolder.File("LoopTag.tun"));

    TunFile second(tp.platform);
    tp.program.folder = programFolder.Path() + "/";
    second.SetDefaults(9);
    EXPECT_EQ(second.TunFilePath(), programFolder.File("LoopTag.tun"));

    document.SetLoopTag("Unit7.A.tun");
    EXPECT_EQ(document.TunFilePath(), dataFolder.File("Unit7.A.tun"));
    EXPECT_EQ(document.LoopTag(), "Unit7.A");
    document.SetLoopTag("FIC12");
    EXPECT_EQ(document.TunFilePath(), dataFolder.File("FIC12.tun"));
    document.IniFileObject().SetFileName("C:\\Plant\\Area 1\\TIC 3.old.tun");
    EXPECT_EQ(document.LoopTag(), "TIC 3.old");
}

TEST_F(TunFileDocument, RefusedReadsAndFailedSavesKeepTheDocumentsFile) {
    EXPECT_FALSE(document.ReadFromDisk(9, ""));
    EXPECT_EQ(tp.dialogs.Last().text, "Error: TunFile.ReadFromDisk(2)");
    EXPECT_EQ(document.TunFilePath(), "");
    // A file that is not there, or is no file, leaves the document untouched.
    for (const std::string& path : {dataFolder.File("mistyped.tun"), dataFolder.Path()}) {
        EXPECT_FALSE(document.ReadFromDisk(7, path));
        EXPECT_EQ(tp.dialogs.Last().text,
                  "Error: TunFile.ReadFromDisk(3)\r\n\r\nThe tuning file \"" + path +
                      "\" is missing or cannot be read.");
        EXPECT_EQ(std::tuple(document.TunFilePath(), document.TunerType(), document.IsValid()),
                  std::tuple("", 0, false));
    }
    // One that merely lacks keys reads their defaults.
    std::ofstream(dataFolder.File("empty.tun")) << "";
    TunFile empty(tp.platform);
    EXPECT_TRUE(empty.ReadFromDisk(9, dataFolder.File("empty.tun")));
    EXPECT_EQ(empty.Archives().Count(), 3);
    tp.dialogs.Clear();

    document.SetDefaults(9);
    EXPECT_FALSE(document.WriteToDisk(""));
    EXPECT_EQ(tp.dialogs.Last().text, "Error: TunFile.WriteToDisk");
    const std::string blocked = dataFolder.File("no-such-folder/plant.tun");
    EXPECT_FALSE(document.WriteToDisk(blocked));
    EXPECT_EQ(tp.dialogs.Messages().size(), 2u);
    EXPECT_EQ(tp.dialogs.Last().text, "Error: TunFile.WriteToDisk");
    EXPECT_EQ(document.TunFilePath(), programFolder.File("LoopTag.tun"));
    EXPECT_FALSE(std::filesystem::exists(blocked));
}

// A save stores every part or says it did not: the shared file holds the
// colours of PV, CO and SP, and a text the file refuses fails its part.
TEST_F(TunFileDocument, ASaveThatLostAPartReportsIt) {
    struct Row {
        const char* what;
        bool sharedBlocked;
        const char* description;
        bool tunStored;
    };
    for (const Row& row :
         {Row{"shared file", true, "Loop", true}, Row{"refused text", false, "two\r\nlines", false},
          Row{"whole", false, "Loop", true}}) {
        SCOPED_TRACE(row.what);
        test::TempFolder folder;
        const std::string shared = tp.folder.File("Corvalen.ini");
        std::filesystem::remove_all(shared);
        if (row.sharedBlocked) {
            std::filesystem::create_directory(shared);
        }
        TunFile doc(tp.platform);
        doc.SetDefaults(9);
        doc.CurrentLoop()->SetDescription(row.description);
        tp.dialogs.Clear();
        const bool saved = doc.WriteToDisk(folder.File("plant.tun"));
        const bool whole = !row.sharedBlocked && row.tunStored;
        EXPECT_EQ(saved, whole);
        EXPECT_EQ(tp.dialogs.Messages().size(), whole ? 0u : 1u);
        EXPECT_EQ(std::filesystem::exists(folder.File("plant.tun")), row.tunStored);
        EXPECT_EQ(doc.TunFilePath(),
                  row.tunStored ? folder.File("plant.tun") : programFolder.File("LoopTag.tun"));
    }
}

TEST(TunFile, ConvertFileFormatRewritesOldWordBooleans) {
    const struct {
        const char *versionLine, *storedAuto, *expectedAuto, *expectedManual;
    } cases[] = {{"common=12.07.99", "TRUE", "1", "0"},
                 {"common=12.07.9", "True", "1", "0"},
                 {"", "Yes", "Yes", "0"},
                 {"common=12.08", "TRUE", "TRUE", "fAlSe"}};
    for (const auto& c : cases) {
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

TEST_F(TunFileDocument, CurrentChannelsFollowTheCurrentLoopAndModeNeedsItsChannelOnline) {
    document.SetDefaults(9);
    bool failed = false;
    LoopClass* loop = document.Loops().Add(2, failed);
    loop->SetPVChannel(4);
    loop->SetSPChannel(0);
    document.Loops().SetCurrentLoop(2);
    EXPECT_EQ(document.CurrentPVChannel(), 0);
    EXPECT_EQ(std::tuple(document.CurrentPVChannelObj(), document.CurrentCOChannelObj(),
                         document.CurrentSPChannelObj()),
              std::tuple(nullptr, document.Archives().COChannel(), nullptr));

    bool error = false;
    document.Archives().Add(4, error);
    EXPECT_EQ(document.CurrentPVChannel(), 4);
    EXPECT_EQ(document.CurrentPVChannelObj(), document.Archives().Item(4));

    document.ModeMap().AddModeMapItem("AUTO", "Automatic");
    EXPECT_EQ(document.ModeValue(), "Unknown");

    Channel* mode = document.Specifics().Item(SpecificType::Mode);
    mode->SetExpectANumber(false);
    mode->MarkGoingOnline();
    mode->OpcSetRawValue(Variant::Str("AUTO\r\n"), 0xC0, 0, false);
    EXPECT_EQ(document.ModeValue(), "Automatic");
    mode->OpcSetRawValue(Variant::Str("CAS"), 0xC0, 0, false);
    EXPECT_EQ(document.ModeValue(), "unknown");
    mode->GoOffline();
    EXPECT_EQ(document.ModeValue(), "Unknown");
}

TEST_F(TunFileDocument, ReplacedCollectionsAndSettingsAreKeptAndNullIsIgnored) {
    document.SetDefaults(9);
    auto archives = std::make_unique<ArchiveChannels>(tp.platform);
    ArchiveChannels* raw = archives.get();
    document.SetArchives(std::move(archives));
    document.SetArchives(nullptr);
    EXPECT_EQ(&document.Archives(), raw);
    EXPECT_FALSE(document.IsValid());
    document.SetLoops(std::make_unique<LoopCollection>(tp.platform));
    document.SetLoops(nullptr);
    EXPECT_EQ(document.FaceplateLoop(), nullptr);
    auto general = std::make_unique<TunFileGeneral>(tp.platform);
    general->SetSIinSec(5);
    TunFileGeneral* settings = general.get();
    document.SetGeneral(std::move(general));
    document.SetGeneral(nullptr);
    EXPECT_EQ(std::tuple(&document.General(), document.General().SIinMSec()),
              std::tuple(settings, 5000));
}

}  // namespace
}  // namespace cv
