#include "document/SpecificChannels.h"

#include <fstream>
#include <string>

#include <gtest/gtest.h>

#include "document/TunFile.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

// Number:Type of every channel in list order.
std::string Listed(const SpecificChannels& specifics) {
    std::string text;
    for (const auto& channel : specifics.Collection()) {
        text += std::to_string(channel->Number()) + ":" +
                std::to_string(channel->SpecificChannelType()) + " ";
    }
    return text;
}

const std::string kTypes1To10 = "1:1 2:2 3:3 4:4 5:5 6:6 7:7 8:8 9:9 10:10 ";
const std::string kTypes1To12 = kTypes1To10 + "11:11 12:12 ";

// A document of the given kind on a file with the given filter switch.
struct FileDocument {
    FileDocument(int32_t tuner, const std::string& filter) : document(tp.platform) {
        std::ofstream(tp.folder.File("loop.tun")) << "[DDE]\nRead_Write_Filter=" << filter << "\n";
        document.SetTunerType(tuner);
        document.IniFileObject().SetFileName(tp.folder.File("loop.tun"));
        document.Specifics().ReadFromDisk(document);
    }
    test::TestPlatform tp;
    TunFile document;
    SpecificChannels& specifics = document.Specifics();
};

TEST(SpecificChannels, ReadingFollowsTheTunerKind) {
    FileDocument opc(9, "-1");
    EXPECT_EQ(Listed(opc.specifics), kTypes1To12);
    EXPECT_TRUE(opc.specifics.FilterReadWrite());
    EXPECT_EQ(opc.specifics.FinalChannel(), 12);

    FileDocument opcOff(9, "0");
    EXPECT_TRUE(opcOff.specifics.FilterChannelsExist());
    EXPECT_FALSE(opcOff.specifics.FilterReadWrite());

    FileDocument wonderware(4, "1");  // no read/write filter
    EXPECT_EQ(Listed(wonderware.specifics), kTypes1To10);
    EXPECT_FALSE(wonderware.specifics.FilterReadWrite());

    FileDocument archive(5, "1");  // no faceplate
    EXPECT_EQ(Listed(archive.specifics), "");
    archive.specifics.SetDefaults(archive.document);
    archive.specifics.WriteToDisk(archive.document);
    EXPECT_EQ(archive.document.IniFileObject().ReadString("OPC", "Send_CO", "none"), "none");
    EXPECT_TRUE(archive.tp.dialogs.Messages().empty());
}

TEST(SpecificChannels, WritingStoresTheFilterSwitchAndDefaultsAreTypesOneToTenWithoutFilter) {
    FileDocument file(9, "1");
    file.specifics.SetFilterReadWrite(false);
    file.specifics.WriteToDisk(file.document);
    EXPECT_FALSE(file.document.IniFileObject().ReadBoolean("DDE", "Read_Write_Filter", true));

    file.specifics.SetDefaults(file.document);
    EXPECT_EQ(Listed(file.specifics), kTypes1To10);
    EXPECT_EQ(file.specifics.Item(SpecificType::Mode)->ComType(), ComTypeCode::Opc);
    EXPECT_FALSE(file.specifics.FilterChannelsExist());
    file.specifics.SetFilterReadWrite(true);
    EXPECT_FALSE(file.specifics.FilterReadWrite());
    EXPECT_EQ(file.specifics.FinalChannel(), 10);
}

}  // namespace
}  // namespace cv
