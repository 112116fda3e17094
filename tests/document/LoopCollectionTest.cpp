#include "document/LoopCollection.h"

#include <fstream>
#include <tuple>

#include <gtest/gtest.h>

#include "document/TunFile.h"
#include "support/TestFiles.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

struct LoopsFile {
    test::TestPlatform tp;
    TunFile tunFile{tp.platform};
    LoopCollection loops{tp.platform};
    std::string path = tp.folder.File("loops.tun");

    explicit LoopsFile(int32_t lKind = 9, const std::string& sText = "") {
        tunFile.SetTunerType(lKind);
        tunFile.IniFileObject().SetFileName(path);
        std::ofstream(path, std::ios::binary) << sText;
    }
    std::string Text() const { return test::Slurp(path); }
    void AddLoops(int32_t lCount) {
        for (int32_t k = 0; k < lCount; ++k) {
            bool bFailed = true;
            ASSERT_NE(loops.Add(0, bFailed), nullptr);
            ASSERT_FALSE(bFailed);
        }
    }
};

TEST(LoopCollection, CopyIsDeepAndRemoveRenumbersAndLowersTheCurrentLoop) {
    LoopsFile f;
    EXPECT_EQ(f.loops.CurrentLoop(), 0);
    f.AddLoops(3);
    EXPECT_EQ(f.loops.CurrentLoop(), 1);
    f.loops.Item(3)->SetPVChannel(7);
    f.loops.Item(3)->SetControl(3);
    f.loops.SetCurrentLoop(3);
    f.loops.SetCurrentLoop(5);
    EXPECT_EQ(f.loops.CurrentLoop(), 3);

    std::unique_ptr<LoopCollection> copy = f.loops.Copy();
    EXPECT_EQ(std::tuple(copy->Count(), copy->CurrentLoop(), copy->Item(3)->Number(),
                         copy->PVChannelNumber(3), copy->Item(3)->Control()),
              std::tuple(3, 3, 3, 7, 1));
    copy->Item(1)->SetDescription("Changed");
    EXPECT_EQ(f.loops.Item(1)->Description(), "New Loop");

    LoopClass* second = f.loops.Item(2);
    f.loops.Remove(second);
    EXPECT_EQ(second, nullptr);
    EXPECT_EQ(std::tuple(f.loops.Count(), f.loops.CurrentLoop(), f.loops.PVChannelNumber(2)),
              std::tuple(2, 2, 7));
    EXPECT_EQ(f.loops.SPChannelNumber(3), 0);

    LoopClass stranger(f.tp.platform);
    stranger.SetNumber(9);
    LoopClass* pStranger = &stranger;
    f.loops.Remove(pStranger);
    EXPECT_EQ(pStranger, &stranger);
    EXPECT_EQ(f.loops.Count(), 2);

    for (LoopClass* first = f.loops.Item(1); first != nullptr; first = f.loops.Item(1)) {
        f.loops.Remove(first);
    }
    EXPECT_EQ(f.loops.CurrentLoop(), 0);

    // With no current loop, the loop added becomes current.
    f.AddLoops(2);
    f.loops.SetCurrentLoop(0);
    f.AddLoops(1);
    EXPECT_EQ(f.loops.CurrentLoop(), 3);
}

TEST(LoopCollection, LoopCountComesFromTheFileAndTheKind) {
    LoopsFile faceplate(9, "[ArchiveTuner]\n");
    faceplate.loops.ReadFromDisk(faceplate.tunFile);
    ASSERT_EQ(faceplate.loops.Count(), 1);
    EXPECT_EQ(faceplate.loops.Item(1)->Description(), "Faceplate");

    LoopsFile archive(5, "[ArchiveTuner]\nNumberOfLoops=-4\n");
    archive.loops.ReadFromDisk(archive.tunFile);
    EXPECT_EQ(archive.loops.Count(), 0);
    EXPECT_EQ(archive.loops.CurrentLoop(), 0);

    LoopsFile three(9, "[ArchiveTuner]\nNumberOfLoops=3\n[PIDController Loop 3]\nSPChannel=6\n");
    three.loops.ReadFromDisk(three.tunFile);
    ASSERT_EQ(three.loops.Count(), 3);
    EXPECT_EQ(three.loops.SPChannelNumber(1), 3);
    EXPECT_EQ(three.loops.SPChannelNumber(2), 0);
    EXPECT_EQ(three.loops.SPChannelNumber(3), 6);

    LoopsFile wild(5, "[ArchiveTuner]\nNumberOfLoops=2000000000\n");
    wild.loops.ReadFromDisk(wild.tunFile);
    EXPECT_EQ(wild.loops.Count(), LoopCollection::kMaxLoops);
    EXPECT_EQ(wild.loops.Item(LoopCollection::kMaxLoops)->Number(), LoopCollection::kMaxLoops);
}

TEST(LoopCollection, WritingFewerLoopsErasesTheirSectionsUpToTheOldCount) {
    std::string text = "[ArchiveTuner]\nNumberOfLoops=4\n";
    for (int k = 1; k <= 5; ++k) {
        text += "[PIDController Loop " + std::to_string(k) + "]\nDescription=Old\n";
    }
    LoopsFile f(9, text);
    f.AddLoops(2);
    f.loops.Item(2)->SetDescription("Kept");
    f.loops.WriteToDisk(f.tunFile);
    const std::string written = f.Text();
    EXPECT_NE(written.find("NumberOfLoops=2"), std::string::npos) << written;
    EXPECT_EQ(written.find("[PIDController Loop 3]"), std::string::npos) << written;
    EXPECT_EQ(written.find("[PIDController Loop 4]"), std::string::npos) << written;
    EXPECT_NE(written.find("[PIDController Loop 5]"), std::string::npos) << written;
    LoopCollection back(f.tp.platform);
    back.ReadFromDisk(f.tunFile);
    ASSERT_EQ(back.Count(), 2);
    EXPECT_EQ(back.Item(2)->Description(), "Kept");

    LoopsFile wild(5, "[ArchiveTuner]\nNumberOfLoops=2000000000\n[PIDController Loop 3]\nx=1\n");
    wild.AddLoops(2);
    wild.loops.WriteToDisk(wild.tunFile);
    EXPECT_NE(wild.Text().find("NumberOfLoops=2\n"), std::string::npos) << wild.Text();
    EXPECT_EQ(wild.Text().find("[PIDController Loop 3]"), std::string::npos);

    LoopsFile same(9, "[ArchiveTuner]\nNumberOfLoops=02\n");
    same.AddLoops(2);
    same.loops.WriteToDisk(same.tunFile);
    EXPECT_NE(same.Text().find("NumberOfLoops=02"), std::string::npos) << "same count: untouched";
}

}  // namespace
}  // namespace cv
