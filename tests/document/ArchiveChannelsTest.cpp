#include "document/ArchiveChannels.h"

#include <fstream>
#include <string>

#include <gtest/gtest.h>

#include "document/TunFile.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

// Number:Description of every channel in list order.
std::string Listed(const ArchiveChannels& archives) {
    std::string text;
    for (const auto& channel : archives.Collection()) {
        text += std::to_string(channel->Number()) + ":" + channel->Description() + " ";
    }
    return text;
}

void Fill(ArchiveChannels& archives, int32_t n) {
    for (int32_t k = 1; k <= n; ++k) {
        bool error = true;
        archives.Add(k, error)->SetDescription("C" + std::to_string(k));
        ASSERT_FALSE(error);
    }
}

// The count a document of the given kind reads from a file holding sCount.
int32_t CountRead(int32_t lTuner, const std::string& sCount, bool bDefaultsFirst = false) {
    test::TestPlatform tp;
    TunFile document(tp.platform);
    std::ofstream(tp.folder.File("count.tun")) << "[Trend]\nNumberOfChannels=" << sCount << "\n";
    document.SetTunerType(lTuner);
    document.IniFileObject().SetFileName(tp.folder.File("count.tun"));
    if (bDefaultsFirst) {
        document.Archives().SetDefaults(document);
    }
    EXPECT_TRUE(document.Archives().ReadFromDisk(document));
    return document.Archives().Count();
}

struct Archives : testing::Test {
    test::TestPlatform tp;
    ArchiveChannels archives{tp.platform};
};

TEST_F(Archives, RemoveRenumbersFindSearchesOnAndAddStopsAtTheLimit) {
    Fill(archives, 4);
    Channel* second = archives.Item(2);
    archives.Remove(second);
    EXPECT_EQ(second, nullptr);
    EXPECT_EQ(Listed(archives), "1:C1 2:C3 3:C4 ");
    EXPECT_EQ(archives.SPChannel()->Description(), "C4");

    ArchiveChannels full(tp.platform);
    Fill(full, ArchiveChannels::kMaxChannels);
    bool error = false;
    EXPECT_EQ(full.Add(ArchiveChannels::kMaxChannels + 1, error), nullptr);
    EXPECT_TRUE(error);
    Channel* stranger = full.Item(7);
    archives.Remove(stranger);
    EXPECT_NE(stranger, nullptr);
    EXPECT_EQ(archives.Count(), 3);

    archives.Item(3)->SetDescription("C1");
    EXPECT_EQ(archives.FindChannel("C1", -5), 1);
    EXPECT_EQ(archives.FindChannel("C1", 2), 3);
    EXPECT_EQ(archives.FindChannel("c3", 1), 0);
}

TEST_F(Archives, CopyIsDeepCopyFromConsumesTheSourceAndDisplayLimitsFollowTheMaster) {
    Fill(archives, 3);
    archives.Item(1)->SetItemName("TIC101.PV");
    std::unique_ptr<ArchiveChannels> copy = archives.Copy();
    EXPECT_NE(copy->Item(1), archives.Item(1));
    EXPECT_EQ(copy->Item(1)->ItemName(), "TIC101.PV");
    copy->Item(1)->SetDescription("edited");
    Channel* removed = copy->Item(2);
    copy->Remove(removed);  // the former SP is now number 2
    archives.CopyFrom(copy);
    EXPECT_EQ(copy, nullptr);
    EXPECT_EQ(Listed(archives), "1:edited 2:C3 3:C3 ");

    archives.PVChannel()->SetRange(RangeType::Display, 50, 200);
    archives.PVChannel()->SetEngUnits("degC");
    archives.SetPVSPDisplayLimitsEqual(2);
    EXPECT_EQ(archives.SPChannel()->DisplayMax(), 100);
    archives.SetPVSPDisplayLimitsEqual(1);
    EXPECT_EQ(archives.SPChannel()->DisplayMin(), 50);
    EXPECT_EQ(archives.SPChannel()->EngUnits(), "degC");
    archives.SPChannel()->SetRange(RangeType::Display, -1, 1);
    archives.SetPVSPDisplayLimitsEqual(3);
    EXPECT_EQ(archives.PVChannel()->DisplayMin(), -1);
}

TEST(ArchiveChannels, StoredCountIsBoundedByTheTunerKind) {
    EXPECT_EQ(CountRead(4, "5"), 3);  // faceplate, no extra trends
    EXPECT_EQ(CountRead(9, "5"), 5);
    EXPECT_EQ(CountRead(9, "1"), 3);
    EXPECT_EQ(CountRead(5, "1"), 2);  // extra trends, no faceplate
    EXPECT_EQ(CountRead(5, "-7"), 2);
    // A typed count in the billions reads the most the collection holds.
    EXPECT_EQ(CountRead(9, "2000000000"), ArchiveChannels::kMaxChannels);
    EXPECT_EQ(CountRead(9, "4", true), 4) << "reading replaces what was held";
}

TEST_F(Archives, DefaultsArePvCoSpOverOpcWithSharedColours) {
    std::ofstream(tp.folder.File("Corvalen.ini")) << "[FacePlate]\nColorPV=255\n";
    TunFile document(tp.platform);
    Fill(archives, 5);
    archives.SetDefaults(document);
    ASSERT_EQ(archives.Count(), 3);
    for (const auto& channel : archives.Collection()) {
        EXPECT_EQ(channel->ComType(), ComTypeCode::Opc);
    }
    EXPECT_EQ(archives.PVChannel()->LineColor(), 255);
}

}  // namespace
}  // namespace cv
