#include "stores/IniFile.h"

#include <gtest/gtest.h>

#include "support/TestFiles.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

using namespace std::string_literals;

class IniFileTest : public ::testing::Test {
  protected:
    IniFileTest() {
        ini_.SetFileName(Path());
        other_.SetFileName(Path());
    }

    std::string Path() const { return tp_.folder.File("Unit7.tun"); }
    std::string Slurp() const { return test::Slurp(Path()); }
    void Put(const std::string& sText) { test::Spill(Path(), sText); }

    test::TestPlatform tp_;
    IniFile ini_{tp_.profiles};
    // The file as another running copy of the program sees it.
    posix::FileProfiles otherProgram_{tp_.folder.Path()};
    IniFile other_{otherProgram_};
};

TEST_F(IniFileTest, ReadLongTakesTheLeadingNumberAndClampsOnlyWithARange) {
    Put("[L]\nletters=12abc\nempty=\nbig=50\nlow=-3\n");
    EXPECT_EQ(ini_.ReadLong("L", "letters", 7, 0, 0), 12);
    EXPECT_EQ(ini_.ReadLong("L", "empty", 7, 0, 0), 0);
    EXPECT_EQ(ini_.ReadLong("L", "missing", -7, 0, 0), -7);
    EXPECT_EQ(ini_.ReadLong("L", "missing", 99, 1, 10), 10);
    EXPECT_EQ(ini_.ReadLong("L", "big", 0, 1, 10), 10);
    EXPECT_EQ(ini_.ReadLong("L", "low", 0, 1, 10), 1);
    EXPECT_EQ(ini_.ReadLong("L", "low", 0, 0, 0), -3);

    ini_.WriteLong("L", "written", -42);
    EXPECT_EQ(ini_.ReadString("L", "written", ""), "-42");
}

TEST_F(IniFileTest, BooleansAreOneOrZeroAndReadAsLongs) {
    Put("[B]\none=1\nminus=-1\nzero=0\ntwo=2\nword=True\n");
    EXPECT_TRUE(ini_.ReadBoolean("B", "one", false));
    EXPECT_TRUE(ini_.ReadBoolean("B", "minus", false));
    EXPECT_FALSE(ini_.ReadBoolean("B", "zero", true));
    EXPECT_TRUE(ini_.ReadBoolean("B", "two", true));
    EXPECT_FALSE(ini_.ReadBoolean("B", "two", false));
    EXPECT_FALSE(ini_.ReadBoolean("B", "word", true)) << "no number reads as 0";
    EXPECT_TRUE(ini_.ReadBoolean("B", "missing", true));

    ini_.WriteBoolean("B", "one", true);
    ini_.WriteBoolean("B", "zero", false);
    ini_.WriteBoolean("B", "minus", true);
    EXPECT_EQ(Slurp(), "[B]\none=1\nminus=1\nzero=0\ntwo=2\nword=True\n");
}

TEST_F(IniFileTest, DoublesUseInvariantText) {
    ini_.WriteDouble("D", "half", 0.5);
    EXPECT_EQ(Slurp(), "[D]\r\nhalf=.5\r\n");
    ini_.WriteString("D", "suffix", "12.5 degC");
    EXPECT_EQ(ini_.ReadDouble("D", "suffix", 9), 12.5);
    EXPECT_EQ(ini_.ReadDouble("D", "missing", -0.25), -0.25);
}

TEST_F(IniFileTest, StringsKeepQuotedBlanksAndAreCutTo254Bytes) {
    ini_.WriteString("S", "padded", "  two blanks  ", true);
    ini_.WriteString("S", "long", std::string(300, 'z'));
    EXPECT_EQ(ini_.ReadString("S", "padded", ""), "  two blanks  ");
    EXPECT_EQ(ini_.ReadString("S", "long", ""), std::string(254, 'z'));
    // Writing back what was read keeps the longer value; a change replaces it.
    for (const bool bEncrypted : {false, true}) {
        ini_.SetEncryptedFile(bEncrypted);
        const std::string sLong = std::string(200, 'y') + std::string(100, 'w');
        ini_.WriteString("S", "long", sLong);
        const std::string sRead = ini_.ReadString("S", "long", "");
        EXPECT_EQ(sRead.size(), bEncrypted ? 127u : 254u);
        ini_.WriteString("S", "long", sRead);
        ini_.WriteText("S", "long", sRead);
        EXPECT_NE(Slurp().find(bEncrypted ? ini_.Encrypt(sLong) : sLong), std::string::npos);
        ini_.WriteString("S", "long", std::string(sRead.size(), 'v'));
        EXPECT_EQ(ini_.ReadString("S", "long", ""), std::string(sRead.size(), 'v'));
    }
}

TEST_F(IniFileTest, ScramblesWithTheKeyedNibbleAlphabet) {
    EXPECT_EQ(ini_.Encrypt("3"), "qt") << "'3' xor 'r' is 0x41";
    EXPECT_EQ(ini_.Decrypt("qt"), "3");
    EXPECT_EQ(ini_.Decrypt("QT"), "3");
    EXPECT_EQ(ini_.Decrypt("qtx"), "3") << "a last unpaired letter is ignored";
    const std::string all = "\0\x01 Az~\x7F\x80\xFF"s + std::string(20, 'k');
    EXPECT_EQ(ini_.Decrypt(ini_.Encrypt(all)), all);
    EXPECT_EQ(ini_.Encrypt(all).size(), 2 * all.size());

    ini_.SetKey("");
    EXPECT_EQ(ini_.Encrypt("A"), "qt");
    EXPECT_EQ(ini_.Decrypt(ini_.Encrypt(all)), all);
    EXPECT_EQ(ini_.Decrypt("a?"), std::string(1, '\0')) << "other characters count as 0";
}

TEST_F(IniFileTest, EncryptedFilesHoldOnlyLettersAndReadBackPlain) {
    ini_.SetEncryptedFile(true);
    ini_.WriteString("Loop 1", "Gain", "1.5");
    ini_.WriteLong("Loop 1", "Mode", -2);
    ini_.WriteBoolean("Loop 1", "Auto", true);
    EXPECT_EQ(ini_.ReadString("Loop 1", "Gain", ""), "1.5");
    EXPECT_EQ(ini_.ReadLong("Loop 1", "Mode", 0, 0, 0), -2);
    EXPECT_TRUE(ini_.ReadBoolean("Loop 1", "Auto", false));
    EXPECT_EQ(ini_.ReadString("Loop 1", "missing", "plain default"), "plain default");
    EXPECT_EQ(Slurp().find_first_not_of("cdefghipqrstuvwx[]=\r\n"), std::string::npos) << Slurp();

    ini_.EraseItem("Loop 1", "Gain");
    EXPECT_EQ(ini_.ReadString("Loop 1", "Gain", "gone"), "gone");
    ini_.EraseSection("Loop 1");
    EXPECT_EQ(ini_.ReadLong("Loop 1", "Mode", 5, 0, 0), 5);

    ini_.SetEncryptedFile(false);
    ini_.WriteString("S", "long", std::string(300, 'z'));
    ini_.SetEncryptedFile(true);
    EXPECT_EQ(ini_.ReadString("S", "missing", std::string(300, 'y')), std::string(127, 'y'));
}

TEST_F(IniFileTest, BatchSavesTheWholeDocumentOnce) {
    {
        IniFile::Batch batch(ini_);
        ini_.WriteLong("Channel1", "Number", 1);
        ini_.WriteLong("Channel2", "Number", 2);
        EXPECT_EQ(ini_.ReadLong("Channel2", "Number", 0, 0, 0), 2);
        EXPECT_EQ(other_.ReadLong("Channel2", "Number", 0, 0, 0), 0);
        EXPECT_TRUE(batch.End());
        EXPECT_FALSE(batch.End());
    }
    EXPECT_EQ(other_.ReadLong("Channel2", "Number", 0, 0, 0), 2);
    {
        IniFile::Batch batch(ini_);
        ini_.WriteLong("Channel1", "Number", 10);
    }
    EXPECT_EQ(other_.ReadLong("Channel1", "Number", 0, 0, 0), 10);
}

}  // namespace
}  // namespace cv
