#include "document/ArchiveChannels.h"

#include <gtest/gtest.h>

#include <fstream>
#include <string>
#include <vector>

#include "document/TunFile.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

std::vector<int32_t> Numbers(const ArchiveChannels& archives) {
    std::vector<int32_t> numbers;
    for (const auto& channel : archives.Collection()) {
        numbers.push_back(channel->Number());
    }
    return numbers;
}

std::vector<std::string> Descriptions(const ArchiveChannels& archives) {
    std::vector<std::string> texts;
    for (const auto& channel : archives.Collection()) {
        texts.push_back(channel->Description());
    }
    return texts;
}

// A collection of n channels described "C1".."Cn".
void Fill(ArchiveChannels& archives, int32_t n) {
    for (int32_t k = 1; k <= n; ++k) {
        bool error = true;
        archives.Add(k, error)->SetDescription("C" + std::to_string(k));
        ASSERT_FALSE(error);
    }
}

std::string ReadText(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), {});
}

// A document of the given kind whose tuning file holds the given count.
struct CountedFile {
    CountedFile(int32_t tuner, const std::string& count) : document(tp.platform) {
        std::ofstream(tp.folder.File("count.tun")) << "[Trend]\nNumberOfChannels=" << count << "\n";
        document.SetTunerType(tuner);
        document.IniFileObject().SetFileName(tp.folder.File("count.tun"));
    }
    int32_t Read() {
        EXPECT_TRUE(document.Archives().ReadFromDisk(document));
        return document.Archives().Count();
    }
    test::TestPlatform tp;
    TunFile document;
};

TEST(ArchiveChannels, AddNumbersAndRemoveRenumbers) {
    test::TestPlatform tp;
    ArchiveChannels archives(tp.platform);
    Fill(archives, 4);
    EXPECT_EQ(archives.SPChannel()->Description(), "C3");
    EXPECT_EQ(archives.Item(5), nullptr);
    EXPECT_EQ(archives.Item(0), nullptr);

    Channel* second = archives.Item(2);
    archives.Remove(second);
    EXPECT_EQ(second, nullptr);
    EXPECT_EQ(Numbers(archives), (std::vector<int32_t>{1, 2, 3}));
    EXPECT_EQ(Descriptions(archives), (std::vector<std::string>{"C1", "C3", "C4"}));
    EXPECT_EQ(archives.COChannel()->Description(), "C3");

    ArchiveChannels other(tp.platform);
    Fill(other, 7);
    Channel* stranger = other.Item(7);
    archives.Remove(stranger);
    EXPECT_NE(stranger, nullptr);
    EXPECT_EQ(archives.Count(), 3);
    Channel* none = nullptr;
    archives.Remove(none);
    EXPECT_EQ(archives.Count(), 3);
}

TEST(ArchiveChannels, AddRefusesBeyondTheLimit) {
    test::TestPlatform tp;
    ArchiveChannels archives(tp.platform);
    Fill(archives, ArchiveChannels::kMaxChannels);
    bool error = false;
    EXPECT_EQ(archives.Add(ArchiveChannels::kMaxChannels + 1, error), nullptr);
    EXPECT_TRUE(error);
    EXPECT_EQ(archives.Count(), ArchiveChannels::kMaxChannels);
}

TEST(ArchiveChannels, FindChannelSearchesFromTheStartNumber) {
    test::TestPlatform tp;
    ArchiveChannels archives(tp.platform);
    Fill(archives, 4);
    archives.Item(4)->SetDescription("C2");
    EXPECT_EQ(archives.FindChannel("C2", 1), 2);
    EXPECT_EQ(archives.FindChannel("C2", 3), 4);
    EXPECT_EQ(archives.FindChannel("C2", -5), 2);
    EXPECT_EQ(archives.FindChannel("c2", 1), 0);
    EXPECT_EQ(archives.FindChannel("C1", 5), 0);
}

TEST(ArchiveChannels, CopyIsDeepAndCopyFromConsumesTheSource) {
    test::TestPlatform tp;
    ArchiveChannels archives(tp.platform);
    Fill(archives, 3);
    archives.Item(1)->SetRange(RangeType::Engineering, 4, 20);
    archives.Item(1)->SetItemName("TIC101.PV");

    std::unique_ptr<ArchiveChannels> copy = archives.Copy();
    ASSERT_EQ(copy->Count(), 3);
    EXPECT_NE(copy->Item(1), archives.Item(1));
    EXPECT_EQ(copy->Item(1)->ItemName(), "TIC101.PV");
    EXPECT_EQ(copy->Item(1)->EngMax(), 20);

    copy->Item(1)->SetDescription("edited");
    copy->Item(3)->SetItemName("TIC101.SP");
    Channel* removed = copy->Item(2);
    copy->Remove(removed);  // the former SP is now number 2
    archives.CopyFrom(copy);
    EXPECT_EQ(copy, nullptr);
    EXPECT_EQ(Descriptions(archives), (std::vector<std::string>{"edited", "C3", "C3"}));
    EXPECT_EQ(archives.Item(2)->ItemName(), "TIC101.SP");
    EXPECT_EQ(Numbers(archives), (std::vector<int32_t>{1, 2, 3}));
}

TEST(ArchiveChannels, DisplayLimitsFollowTheMaster) {
    test::TestPlatform tp;
    ArchiveChannels archives(tp.platform);
    Fill(archives, 3);
    archives.PVChannel()->SetRange(RangeType::Display, 50, 200);
    archives.PVChannel()->SetEngUnits("degC");
    archives.SetPVSPDisplayLimitsEqual(2);
    EXPECT_EQ(archives.SPChannel()->DisplayMax(), 100);
    archives.SetPVSPDisplayLimitsEqual(1);
    EXPECT_EQ(archives.SPChannel()->DisplayMin(), 50);
    EXPECT_EQ(archives.SPChannel()->DisplayMax(), 200);
    EXPECT_EQ(archives.SPChannel()->EngUnits(), "degC");

    archives.SPChannel()->SetRange(RangeType::Display, -1, 1);
    archives.SetPVSPDisplayLimitsEqual(3);
    EXPECT_EQ(archives.PVChannel()->DisplayMin(), -1);
    EXPECT_EQ(archives.PVChannel()->DisplayMax(), 1);
}

TEST(ArchiveChannels, StoredCountIsBoundedByTheTunerKind) {
    EXPECT_EQ(CountedFile(4, "5").Read(), 3);  // faceplate, no extra trends
    EXPECT_EQ(CountedFile(9, "5").Read(), 5);
    EXPECT_EQ(CountedFile(9, "1").Read(), 3);
    EXPECT_EQ(CountedFile(5, "1").Read(), 2);  // extra trends, no faceplate
    EXPECT_EQ(CountedFile(5, "-7").Read(), 2);
    // A typed count in the billions reads the most the collection holds.
    EXPECT_EQ(CountedFile(9, "2000000000").Read(), ArchiveChannels::kMaxChannels);
    EXPECT_EQ(CountedFile(9, "1E300").Read(), ArchiveChannels::kMaxChannels);
}

TEST(ArchiveChannels, ReadingReplacesWhatWasHeld) {
    CountedFile file(9, "4");
    file.document.Archives().SetDefaults(file.document);
    EXPECT_EQ(file.Read(), 4);
    EXPECT_EQ(Numbers(file.document.Archives()), (std::vector<int32_t>{1, 2, 3, 4}));
}

TEST(ArchiveChannels, WritingFewerChannelsErasesTheStaleSections) {
    CountedFile file(9, "5");
    ASSERT_EQ(file.Read(), 5);
    ArchiveChannels& archives = file.document.Archives();
    archives.WriteToDisk(file.document.IniFileObject(), file.document.TunerTypeObj());
    const std::string path = file.tp.folder.File("count.tun");
    EXPECT_NE(ReadText(path).find("[Channel5]"), std::string::npos);

    for (Channel* extra = archives.Item(4); extra != nullptr; extra = archives.Item(4)) {
        archives.Remove(extra);
    }
    archives.WriteToDisk(file.document.IniFileObject(), file.document.TunerTypeObj());
    const std::string text = ReadText(path);
    EXPECT_NE(text.find("NumberOfChannels=3"), std::string::npos);
    EXPECT_NE(text.find("[Channel1]"), std::string::npos);
    EXPECT_EQ(text.find("[Channel4]"), std::string::npos);
    EXPECT_EQ(text.find("[Channel5]"), std::string::npos);
}

TEST(ArchiveChannels, DefaultsArePvCoSpOverOpcWithSharedColours) {
    test::TestPlatform tp;
    std::ofstream(tp.folder.File("Corvalen.ini")) << "[FacePlate]\nColorPV=255\nLineWidthSP=4\n";
    TunFile document(tp.platform);
    ArchiveChannels archives(tp.platform);
    Fill(archives, 5);
    archives.SetDefaults(document);
    ASSERT_EQ(Numbers(archives), (std::vector<int32_t>{1, 2, 3}));
    for (const auto& channel : archives.Collection()) {
        EXPECT_EQ(channel->ComType(), ComTypeCode::Opc);
        EXPECT_EQ(channel->SpecificChannelType(), 0);
    }
    EXPECT_EQ(archives.PVChannel()->LineColor(), 255);
    EXPECT_EQ(archives.COChannel()->LineColor(), 65280);
    EXPECT_EQ(archives.SPChannel()->LineColor(), 65535);
    EXPECT_EQ(archives.SPChannel()->LineWidth(), 4);
}

}  // namespace
}  // namespace cv
