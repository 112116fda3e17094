#include <gtest/gtest.h>

#include <fstream>

#include "platform/posix/FileRegistry.h"
#include "security/RunPasswords.h"
#include "security/ServerSettings.h"
#include "security/ThumbprintTrust.h"
#include "support/TempFolder.h"

namespace cv::security {
namespace {

using ua::MessageSecurityMode;
using ua::UserTokenType;

const std::string kBasic = "http://opcfoundation.org/UA/SecurityPolicy#Basic256Sha256";

class ServerSettingsTest : public ::testing::Test {
  protected:
    std::string RegistryText() const {
        std::ifstream file(folder_.File(posix::FileRegistry::kCurrentUserFile));
        return std::string((std::istreambuf_iterator<char>(file)), {});
    }

    test::TempFolder folder_;
    posix::FileRegistry registry_{folder_.Path()};
};

TEST_F(ServerSettingsTest, AnUnknownServerGetsTheMostSecureAnonymously) {
    EXPECT_EQ(ServerSettings(registry_).Read("opc.tcp://plant:4840"), ServerSecurity{});
}

TEST_F(ServerSettingsTest, KeepsEachServersChoicesOnDisk) {
    const std::vector<std::pair<std::string, ServerSecurity>> servers = {
        {"opc.tcp://plant:4840",
         {MessageSecurityMode::SignAndEncrypt, kBasic, UserTokenType::UserName, "operator"}},
        {"opc.tcp://plant:4841/UA", {MessageSecurityMode::None, "", UserTokenType::Anonymous, ""}},
        {"opc.tcp://odd\\host%:1", {MessageSecurityMode::Sign, "", UserTokenType::Anonymous, ""}},
    };
    ServerSettings settings(registry_);
    for (const auto& [url, security] : servers) {
        settings.Write(url, security);
    }
    posix::FileRegistry reopened(folder_.Path());
    for (const auto& [url, security] : servers) {
        EXPECT_EQ(ServerSettings(reopened).Read(url), security) << url;
    }
    const std::string text = RegistryText();
    EXPECT_NE(text.find("[Software\\Corvalent\\TestClient\\UaServers\\opc.tcp://plant:4840]"),
              std::string::npos)
        << text;
    EXPECT_NE(text.find("UaServers\\opc.tcp://odd%255Chost%2525:1]"), std::string::npos) << text;
    EXPECT_NE(text.find("\"SecurityMode\"=\"SignAndEncrypt\""), std::string::npos);
    EXPECT_NE(text.find("\"UserName\"=\"operator\""), std::string::npos);
}

TEST_F(ServerSettingsTest, ReadsUnknownWordsAsTheDefaults) {
    std::ofstream(folder_.File(posix::FileRegistry::kCurrentUserFile))
        << "CvOpcTestClient registry file 1\n"
           "[Software\\Corvalent\\TestClient\\UaServers\\opc.tcp://plant:4840]\n"
           "\"SecurityMode\"=\"Encrypt please\"\n"
           "\"Identity\"=dword:00000001\n"
           "\"UserName\"=\"operator\"\n";
    const ServerSecurity read = ServerSettings(registry_).Read("opc.tcp://plant:4840");
    EXPECT_EQ(read.mode, MessageSecurityMode::Invalid);
    EXPECT_EQ(read.identity, UserTokenType::Anonymous);
    EXPECT_EQ(read.userName, "operator");
}

TEST_F(ServerSettingsTest, RunChoicesGoAheadOfTheRegistryWithoutBeingWritten) {
    const std::string url = "opc.tcp://plant:4840";
    const ServerSecurity stored{MessageSecurityMode::Sign, kBasic, UserTokenType::UserName, "ann"};
    struct Row {
        RunChoices run;
        ServerSecurity read;
    };
    const std::vector<Row> rows = {
        {{}, stored},
        {{MessageSecurityMode::SignAndEncrypt, "", ""},
         {MessageSecurityMode::SignAndEncrypt, "", UserTokenType::UserName, "ann"}},
        {{MessageSecurityMode::None, "", "bob"},
         {MessageSecurityMode::None, "", UserTokenType::UserName, "bob"}},
        {{std::nullopt, "", "bob"},
         {MessageSecurityMode::Sign, kBasic, UserTokenType::UserName, "bob"}},
    };
    ServerSettings(registry_).Write(url, stored);
    const std::string before = RegistryText();
    for (const Row& row : rows) {
        ServerSettings settings(registry_);
        settings.SetRunChoices(row.run);
        EXPECT_EQ(settings.Read(url), row.read);
    }
    EXPECT_EQ(RegistryText(), before);
}

TEST(RunPasswords, KeepsAPasswordPerServerAndUserUntilForgotten) {
    RunPasswords passwords;
    passwords.Remember("opc.tcp://a", "bob", "one");
    passwords.Remember("opc.tcp://b", "bob", "two");
    EXPECT_EQ(passwords.Find("opc.tcp://a", "bob"), "one");
    EXPECT_EQ(passwords.Find("opc.tcp://b", "bob"), "two");
    EXPECT_EQ(passwords.Find("opc.tcp://a", "ann"), std::nullopt);
    passwords.Forget("opc.tcp://a", "bob");
    EXPECT_EQ(passwords.Find("opc.tcp://a", "bob"), std::nullopt);
}

TEST(ThumbprintTrust, TrustsForTheSessionOnlyTheCertificateNamed) {
    platform::TrustQuestion question;
    question.facts.thumbprint = "0A1B2C3D4E5F60718293A4B5C6D7E8F901234567";
    const struct {
        std::string named;
        platform::TrustAnswer answer;
    } cases[] = {
        {"0a1b2c3d4e5f60718293a4b5c6d7e8f901234567", platform::TrustAnswer::TrustForSession},
        {"0A:1B:2C:3D:4E:5F:60:71:82:93:A4:B5:C6:D7:E8:F9:01:23:45:67",
         platform::TrustAnswer::TrustForSession},
        {"0A1B2C3D4E5F60718293A4B5C6D7E8F901234568", platform::TrustAnswer::Refuse},
        {"", platform::TrustAnswer::Refuse},
    };
    for (const auto& c : cases) {
        EXPECT_EQ(ThumbprintTrust(c.named).Ask(question), c.answer) << c.named;
    }
}

}  // namespace
}  // namespace cv::security
