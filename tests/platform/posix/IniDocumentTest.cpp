#include "platform/posix/IniDocument.h"

#include <string>

#include <gtest/gtest.h>

namespace cv::posix {
namespace {

using namespace std::string_literals;

TEST(IniDocument, RewritesEveryByteItDidNotChange) {
    for (const std::string& text :
         {""s, "[A]\r\nx=1\r\n"s, "[A]\nx=1\n; note\n\n[B]\ny = 2"s,
          "\xEF\xBB\xBF[A]\r\nx=1\nmixed\r\n\r\n"s, "junk\x01\xFF\0line\r\r\n[unclosed\n=\n[]\n"s,
          "preamble=1\n  [ Loop 1 ] trailing\n\tRate = 5 \n"s}) {
        EXPECT_EQ(IniDocument::Parse(text).Serialise(), text);
    }
}

TEST(IniDocument, ReadsWhatWindowsFilesHold) {
    const auto document = IniDocument::Parse(
        "top=0\r\n[ Loop 1 ] ; title\r\n  Rate  =  5  \r\nquoted='  padded  '\r\ndouble=\"x\"\r\n"
        "half='x\r\ninline=1 ; not a comment\r\n;hidden=1\r\nno equals sign\r\n[Broken\r\n"
        "after=broken\r\nempty=\r\n[a]b]\r\nc=3\r\n[A]\nx=1\nx=2\n[a]\nx=3\ny=4\n");
    EXPECT_EQ(document.Value("loop 1", "RATE"), "5");
    EXPECT_EQ(document.Value(" Loop 1 ", " Rate "), "5");
    EXPECT_EQ(document.Value("Loop 1", "quoted"), "  padded  ");
    EXPECT_EQ(document.Value("Loop 1", "double"), "x");
    EXPECT_EQ(document.Value("Loop 1", "half"), "'x");
    EXPECT_EQ(document.Value("Loop 1", "inline"), "1 ; not a comment");
    EXPECT_EQ(document.Value("Loop 1", ";hidden"), std::nullopt);
    EXPECT_EQ(document.Value("Loop 1", "no equals sign"), std::nullopt);
    EXPECT_EQ(document.Value("Loop 1", "[Broken"), std::nullopt);
    EXPECT_EQ(document.Value("Loop 1", "after"), "broken");
    EXPECT_EQ(document.Value("Loop 1", "empty"), "");
    EXPECT_EQ(document.Value("a]b", "c"), "3");
    EXPECT_EQ(document.Value("", "top"), std::nullopt);
    EXPECT_EQ(document.Value("Broken", "after"), std::nullopt);
    EXPECT_EQ(document.Value("A", "x"), "1") << "the first of duplicate keys and sections";
    EXPECT_EQ(document.Value("A", "y"), "4");
}

// One edit as the profile functions make it: no key erases the section, no value the key.
struct Edit {
    const char* before;
    const char* section;
    const char* key;
    const char* value;
    const char* after;
};

TEST(IniDocument, EditsPlaceAndRemoveLinesAsWindowsDoes) {
    const char* twice = "[A]\nx=1\nx=2\n\n[B]\nz=9\n\n[a]\nx=3\ny=4\n";
    const Edit edits[] = {
        {twice, "A", "x", "5", "[A]\nx=5\nx=2\n\n[B]\nz=9\n\n[a]\nx=3\ny=4\n"},
        {twice, "A", "y", "5", "[A]\nx=1\nx=2\n\n[B]\nz=9\n\n[a]\nx=3\ny=5\n"},
        {twice, "A", "w", "5", "[A]\nx=1\nx=2\nw=5\n\n[B]\nz=9\n\n[a]\nx=3\ny=4\n"},
        {twice, "A", "X", nullptr, "[A]\n\n[B]\nz=9\n\n[a]\ny=4\n"},
        {twice, "a", nullptr, nullptr, "[B]\nz=9\n\n"},
        {"[S]\r\n  Rate = 5 \r\nb=1\r\n", "s", "RATE", "10", "[S]\r\n  Rate = 10\r\nb=1\r\n"},
        {"[S]\nx=\n", "S", "x", "1", "[S]\nx=1\n"},
        {"", " New ", " key ", " v ", "[New]\r\nkey= v \r\n"},
        {"[A]\nx=1\n; about B\n\n\n[B]\n", "A", "y", "2", "[A]\nx=1\n; about B\ny=2\n\n\n[B]\n"},
        {"[A]\n\n[B]\n", "A", "y", "2", "[A]\ny=2\n\n[B]\n"},
        {"[A]\nx=1", "A", "y", "2", "[A]\nx=1\ny=2\n"},
        {"[A]\nx=1", "B", "y", "2", "[A]\nx=1\n\n[B]\ny=2\n"},
        {"[A]\r\nx=1\r\n\r\n", "B", "y", "2", "[A]\r\nx=1\r\n\r\n[B]\r\ny=2\r\n"},
        {"; only a comment", "B", "y", "2", "; only a comment\r\n\r\n[B]\r\ny=2\r\n"},
        {"[A]\r\nx=1\r\n\r\n[B]\r\ny=2\r\n", "A", "x", nullptr, "[A]\r\n\r\n[B]\r\ny=2\r\n"},
        {"[A]\r\nx=1\r\n\r\n[B]\r\ny=2\r\n; tail\r\n[C]\r\nz=3", "B", nullptr, nullptr,
         "[A]\r\nx=1\r\n\r\n[C]\r\nz=3"},
    };
    for (const Edit& edit : edits) {
        IniDocument document = IniDocument::Parse(edit.before);
        const bool changed = edit.key == nullptr ? document.EraseSection(edit.section)
                             : edit.value == nullptr
                                 ? document.EraseKey(edit.section, edit.key)
                                 : document.SetValue(edit.section, edit.key, edit.value);
        EXPECT_TRUE(changed) << edit.before;
        EXPECT_EQ(document.Serialise(), edit.after) << edit.before;
    }
}

TEST(IniDocument, ReportsOnlyRealChangesAndKeepsTheRestIntact) {
    auto document = IniDocument::Parse("[A]\nx=1\n[B]\ny=2\n[C]\nz=3\n");
    EXPECT_FALSE(document.SetValue("A", "x", "1"));
    EXPECT_FALSE(document.EraseKey("A", "y"));
    EXPECT_FALSE(document.EraseKey("T", "x"));
    EXPECT_FALSE(document.EraseSection("T"));
    document.EraseSection("A");
    document.SetValue("C", "w", "4");
    EXPECT_EQ(document.Value("B", "y"), "2");
    EXPECT_EQ(document.Value("C", "z"), "3");
    EXPECT_EQ(document.Value("C", "w"), "4");
    EXPECT_EQ(document.Serialise(), "[B]\ny=2\n[C]\nz=3\nw=4\n");
}

TEST(IniDocument, RefusesNamesThatWouldReadBackAsSomethingElse) {
    EXPECT_TRUE(IniDocument::IsSectionName("a]b [c"));
    EXPECT_FALSE(IniDocument::IsSectionName("a\nb"));
    EXPECT_TRUE(IniDocument::IsKeyName("Rate 1"));
    EXPECT_TRUE(IniDocument::IsKeyName(""));
    for (const char* key : {"a=b", "a\rb", " ;x", "[x]", "a\n"}) {
        EXPECT_FALSE(IniDocument::IsKeyName(key)) << key;
    }
    EXPECT_TRUE(IniDocument::IsValueText("a=b ; 'c'"));
    EXPECT_FALSE(IniDocument::IsValueText("a\r\n[B]\r\nx=1"));
}

TEST(IniDocument, CopesWithHugeAndOddInput) {
    std::string text = "[A]\nbig=" + std::string(10'000'000, 'v') + "\nx=1\n[B]\0\n"s;
    for (int i = 0; i < 256; ++i) {
        text += static_cast<char>(i);
    }
    auto document = IniDocument::Parse(text);
    EXPECT_EQ(document.Value("A", "big")->size(), 10'000'000u);
    EXPECT_EQ(document.Value("A", "x"), "1");
    document.SetValue("A", "x", std::string(300, 'w'));
    EXPECT_EQ(document.Value("A", "x"), std::string(300, 'w'));
    EXPECT_EQ(document.Value("A", "big")->size(), 10'000'000u);
}

}  // namespace
}  // namespace cv::posix
