#include "platform/posix/RegistryFile.h"

#include <string>

#include <gtest/gtest.h>

namespace cv::posix {
namespace {

using namespace std::string_literals;

RegistryValue Text(const std::string& sText) {
    return {1, sText + '\0'};
}

std::vector<std::string> Path(const std::string& sPath) {
    std::vector<std::string> names;
    EXPECT_TRUE(RegistryKey::SplitPath(sPath, names));
    return names;
}

const std::string kHeader = std::string(RegistryFile::kFirstLine) + "\n";

TEST(RegistryFile, WritesAReadableTextThatReadsBackExactly) {
    RegistryKey root;
    RegistryKey& client = root.Make(Path("Software\\Corvalent\\TestClient"));
    client.SetValue("ServerID", Text("\\\\PLANT1\\Vendor.Server.1"));
    client.SetValue("DecPt", {4, "\x02\0\0\0"s});
    client.SetValue("", Text("unnamed"));
    client.SetValue("Odd \"name\"", {3, "\x01\xff"s});
    root.Make(Path("Software\\Empty"));

    const std::string text = RegistryFile::Write(root, "HKEY_CURRENT_USER");
    EXPECT_EQ(text, kHeader +
                        "; HKEY_CURRENT_USER\n"
                        "\n[Software\\Corvalent\\TestClient]\n"
                        "\"ServerID\"=\"\\\\\\\\PLANT1\\\\Vendor.Server.1\"\n"
                        "\"DecPt\"=dword:00000002\n"
                        "@=\"unnamed\"\n"
                        "\"Odd \\\"name\\\"\"=hex(3):01,ff\n"
                        "\n[Software\\Empty]\n");
    bool damaged = true;
    const RegistryKey back = RegistryFile::Parse(text, damaged);
    EXPECT_FALSE(damaged);
    EXPECT_EQ(RegistryFile::Write(back, "HKEY_CURRENT_USER"), text);
}

TEST(RegistryFile, KeepsEveryByteTypeAndNameThroughARoundTrip) {
    RegistryKey root;
    root.SetValue("at the root", Text("r"));
    const std::string oddName = "tab\there %20 ]x[ \x7f\xc3\xa9";
    RegistryKey& odd = root.Make({oddName, "ends with blank "});
    odd.SetValue("nul inside", Text("a\0b"s));
    odd.SetValue("no nul", {1, "abc"});
    odd.SetValue("empty text", Text(""));
    odd.SetValue("nothing", {7, ""});
    odd.SetValue("short dword", {4, "\x01\x02"s});
    odd.SetValue("negative type", {-1, "\n\r\""s});
    odd.SetValue("@", Text("line1\r\nline2\\"));
    odd.SetValue("long", Text(std::string(300, 'v')));

    bool damaged = true;
    const RegistryKey back = RegistryFile::Parse(RegistryFile::Write(root, "X"), damaged);
    EXPECT_FALSE(damaged);
    const RegistryKey* key = back.Find({oddName, "ends with blank "});
    ASSERT_NE(key, nullptr);
    EXPECT_EQ(back.SubKey(0)->Name(), oddName);
    EXPECT_EQ(key->Values(), odd.Values());
    EXPECT_EQ(back.Values(), root.Values());
}

TEST(RegistryFile, ReadsHandEditedFiles) {
    const std::string text = "\xEF\xBB\xBF" + kHeader +
                             "; comment\r\n"
                             "  [Software\\App]  \r\n"
                             "  \"A\" = \"1\"  \r\n"
                             "\"B\"=dword:ff\n"
                             "[SOFTWARE\\app]\n"
                             "\"a\"=\"2\"\n"
                             "\"b\"=hex(4):03,00,00,00\n";
    bool damaged = true;
    const RegistryKey root = RegistryFile::Parse(text, damaged);
    EXPECT_FALSE(damaged);
    ASSERT_EQ(root.SubKeyCount(), 1u);
    EXPECT_EQ(root.SubKey(0)->Name(), "Software");
    const RegistryKey* app = root.Find(Path("software\\APP"));
    ASSERT_NE(app, nullptr);
    EXPECT_EQ(app->Name(), "App");
    ASSERT_EQ(app->Values().size(), 2u);
    EXPECT_EQ(app->Values()[0].first, "A");
    EXPECT_EQ(app->Values()[0].second, Text("2"));
    EXPECT_EQ(app->Values()[1].second, (RegistryValue{4, "\x03\0\0\0"s}));
}

TEST(RegistryFile, BadLinesCostOnlyThemselvesButAFileOfAnotherKindIsDamagedAsAWhole) {
    const std::string junk = "\x01\x02\xff\xfe binary\0junk\0"s;
    const std::string text =
        kHeader + "[Good\\One]\n\"kept\"=\"1\"\n" + "[Broken\\Key\n\"lost\"=\"2\"\n" + junk + "\n" +
        "\"orphan\"=\"3\"\n" + "[Good\\Two]\n" + "\"raw nul\"=\"a\0b\"\n"s +
        "\"bad escape\"=\"\\q\"\n" + "\"bad dword\"=dword:123456789\n" +
        "\"bad hex\"=hex(3):1,2\n" + "\"trailing\"=\"x\" y\n" + "\"long\"=\"" +
        std::string(10 << 20, 'L') + "\"\n" + "\"big\"=\"" + std::string(300, 'x') + "\"\n" +
        "[a\\\\b]\n" + "[]\n" + "\"dropped too\"=dword:00000001\n";
    bool damaged = false;
    const RegistryKey root = RegistryFile::Parse(text, damaged);
    EXPECT_TRUE(damaged);
    EXPECT_EQ(*root.Find(Path("Good\\One"))->Value("kept"), Text("1"));
    EXPECT_EQ(root.Find(Path("Broken")), nullptr);
    const RegistryKey* two = root.Find(Path("Good\\Two"));
    ASSERT_NE(two, nullptr);
    ASSERT_EQ(two->Values().size(), 2u);
    EXPECT_EQ(two->Value("long")->data.size(), (10u << 20) + 1);
    EXPECT_EQ(*two->Value("big"), Text(std::string(300, 'x')));
    EXPECT_EQ(root.SubKeyCount(), 1u) << "nothing under a malformed key line";

    EXPECT_EQ(RegistryFile::Parse("", damaged).SubKeyCount(), 0u);
    EXPECT_FALSE(damaged);
    EXPECT_EQ(RegistryFile::Parse("[Software\\X]\n\"a\"=\"1\"\n", damaged).SubKeyCount(), 0u);
    EXPECT_TRUE(damaged);
    RegistryFile::Parse(std::string(RegistryFile::kFirstLine) + " 2\n", damaged);
    EXPECT_TRUE(damaged);
}

TEST(RegistryFile, KeepsToWindowsLimitsOnNamesAndDepth) {
    std::vector<std::string> names;
    EXPECT_TRUE(RegistryKey::SplitPath("\\a\\\\b\\", names));
    EXPECT_EQ(names, (std::vector<std::string>{"a", "b"}));
    EXPECT_TRUE(RegistryKey::SplitPath(std::string(255, 'n'), names));
    EXPECT_FALSE(RegistryKey::SplitPath(std::string(256, 'n'), names));
    std::string deep = "k";
    for (int i = 1; i < 512; ++i) {
        deep += "\\k";
    }
    EXPECT_TRUE(RegistryKey::SplitPath(deep + "\\", names));
    EXPECT_FALSE(RegistryKey::SplitPath(deep + "\\k", names));

    bool damaged = false;
    RegistryFile::Parse(kHeader + "[" + deep + "]\n", damaged);
    EXPECT_FALSE(damaged);
    const RegistryKey root = RegistryFile::Parse(kHeader + "[" + deep + "\\k]\n", damaged);
    EXPECT_TRUE(damaged);
    EXPECT_EQ(root.SubKeyCount(), 0u);
}

}  // namespace
}  // namespace cv::posix
