#include "document/SpecificChannels.h"

#include <gtest/gtest.h>

#include <fstream>
#include <string>
#include <vector>

#include "document/TunFile.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

std::vector<int32_t> Types(const SpecificChannels& specifics) {
    std::vector<int32_t> types;
    for (const auto& channel : specifics.Collection()) {
        EXPECT_EQ(channel->Number(), static_cast<int32_t>(types.size()) + 1);
        types.push_back(channel->SpecificChannelType());
    }
    return types;
}

const std::vector<int32_t> kTypes1To10{1, 2, 3, 4, 5, 6, 7, 8, 9, 10};
const std::vector<int32_t> kTypes1To12{1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12};

// A document of the given kind on a file with the given "DDE" lines.
struct FileDocument {
    FileDocument(int32_t tuner, const std::string& ddeLines) : document(tp.platform) {
        path = tp.folder.File("loop.tun");
        std::ofstream(path) << "[DDE]\n" << ddeLines << "[OPC]\nOPC_item_PB=TIC1.GAIN\n";
        document.SetTunerType(tuner);
        document.IniFileObject().SetFileName(path);
    }
    test::TestPlatform tp;
    TunFile document;
    std::string path;
};

TEST(SpecificChannels, DefaultsAreTypesOneToTenOverOpc) {
    test::TestPlatform tp;
    TunFile document(tp.platform);
    SpecificChannels specifics(tp.platform);
    specifics.SetDefaults(document);
    specifics.SetDefaults(document);
    EXPECT_EQ(Types(specifics), kTypes1To10);
    for (const auto& channel : specifics.Collection()) {
        EXPECT_EQ(channel->ComType(), ComTypeCode::Opc);
    }
    EXPECT_EQ(specifics.Item(SpecificType::Mode)->Number(), 4);
    EXPECT_EQ(specifics.Item(SpecificType::Filter), nullptr);
    EXPECT_FALSE(specifics.FilterChannelsExist());
}

TEST(SpecificChannels, FilterScanningNeedsTheFilterChannels) {
    test::TestPlatform tp;
    TunFile document(tp.platform);
    SpecificChannels& specifics = document.Specifics();
    specifics.SetDefaults(document);
    specifics.SetFilterReadWrite(true);
    EXPECT_FALSE(specifics.FilterReadWrite());
    EXPECT_EQ(specifics.FinalChannel(), 10);

    FileDocument file(9, "Read_Write_Filter=0\n");
    SpecificChannels& read = file.document.Specifics();
    read.ReadFromDisk(file.document);
    EXPECT_EQ(Types(read), kTypes1To12);
    EXPECT_TRUE(read.FilterChannelsExist());
    EXPECT_FALSE(read.FilterReadWrite());
    read.SetFilterReadWrite(true);
    EXPECT_TRUE(read.FilterReadWrite());
    EXPECT_EQ(read.FinalChannel(), 12);
}

TEST(SpecificChannels, ReadingFollowsTheTunerKind) {
    FileDocument opc(9, "Read_Write_Filter=-1\n");
    opc.document.Specifics().ReadFromDisk(opc.document);
    EXPECT_TRUE(opc.document.Specifics().FilterReadWrite());
    EXPECT_EQ(opc.document.Specifics().Item(SpecificType::P)->ItemName(), "TIC1.GAIN");
    EXPECT_EQ(opc.document.Specifics().Item(SpecificType::SendP)->ItemName(), "TIC1.GAIN");

    FileDocument wonderware(4, "Read_Write_Filter=1\n");
    wonderware.document.Specifics().ReadFromDisk(wonderware.document);
    EXPECT_EQ(Types(wonderware.document.Specifics()), kTypes1To10);
    EXPECT_FALSE(wonderware.document.Specifics().FilterReadWrite());

    FileDocument archive(5, "Read_Write_Filter=1\n");
    archive.document.Specifics().SetDefaults(archive.document);
    archive.document.Specifics().ReadFromDisk(archive.document);
    EXPECT_TRUE(archive.document.Specifics().Collection().empty());
    EXPECT_TRUE(archive.tp.dialogs.Messages().empty());
}

TEST(SpecificChannels, WritingStoresItemsAndTheFilterSwitch) {
    FileDocument file(9, "Read_Write_Filter=1\n");
    SpecificChannels& specifics = file.document.Specifics();
    specifics.ReadFromDisk(file.document);
    specifics.Item(SpecificType::SendSP)->SetItemName("TIC1.SP.WRITE");
    specifics.SetFilterReadWrite(false);
    specifics.WriteToDisk(file.document);

    const IniFile& ini = file.document.IniFileObject();
    EXPECT_FALSE(ini.ReadBoolean("DDE", "Read_Write_Filter", true));
    EXPECT_EQ(ini.ReadString("OPC", "Send_SP", ""), "TIC1.SP.WRITE");
    EXPECT_EQ(ini.ReadString("OPC", "Send_PB", ""), "TIC1.GAIN");

    FileDocument noFaceplate(6, "");
    noFaceplate.document.Specifics().SetDefaults(noFaceplate.document);
    noFaceplate.document.Specifics().WriteToDisk(noFaceplate.document);
    EXPECT_EQ(noFaceplate.document.IniFileObject().ReadString("OPC", "Send_CO", "none"), "none");
}

}  // namespace
}  // namespace cv
