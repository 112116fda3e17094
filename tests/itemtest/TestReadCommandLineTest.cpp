#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "itemtest/TestReadCommandLine.h"

namespace cv {
namespace {

using Action = TestReadCommand::Action;
using Args = std::vector<std::string>;

Args With(Args extra) {
    Args args = {"--test-read", "\\\\PLANT2\\Sim.Plant.1", "--item", "Area1.FIC101.PV"};
    args.insert(args.end(), extra.begin(), extra.end());
    return args;
}

TEST(TestReadCommandLine, ReadsEveryOptionInBothForms) {
    const TestReadCommand command = ParseTestReadCommand(
        With({"--access-path", "Line1", "--count=5", "--interval", "0.5", "--scale", "4:20:0:250.5",
              "--timeout=2.5", "--plant", "p.json", "--verbose"}));
    ASSERT_EQ(command.action, Action::Run) << command.error;
    const TestReadOptions& o = command.options;
    EXPECT_EQ(o.nodeAndServer, "\\\\PLANT2\\Sim.Plant.1");
    EXPECT_EQ(o.itemId, "Area1.FIC101.PV");
    EXPECT_EQ(o.accessPath, "Line1");
    EXPECT_EQ(o.count, 5);
    EXPECT_DOUBLE_EQ(o.intervalSec, 0.5);
    ASSERT_TRUE(o.scale.has_value());
    EXPECT_DOUBLE_EQ(o.scale->instMin, 4);
    EXPECT_DOUBLE_EQ(o.scale->instMax, 20);
    EXPECT_DOUBLE_EQ(o.scale->engMin, 0);
    EXPECT_DOUBLE_EQ(o.scale->engMax, 250.5);
    EXPECT_DOUBLE_EQ(o.timeoutSec.value_or(0), 2.5);
    EXPECT_EQ(o.plantFile, "p.json");
    EXPECT_TRUE(o.verbose);
}

TEST(TestReadCommandLine, DefaultsToOneUnscaledValueAtOneSecond) {
    const TestReadCommand command = ParseTestReadCommand(With({}));
    ASSERT_EQ(command.action, Action::Run);
    EXPECT_EQ(command.options.count, 1);
    EXPECT_DOUBLE_EQ(command.options.intervalSec, 1.0);
    EXPECT_FALSE(command.options.scale.has_value());
    EXPECT_FALSE(command.options.timeoutSec.has_value());
    EXPECT_FALSE(command.options.verbose);
}

TEST(TestReadCommandLine, RefusesWhatCannotBeRead) {
    struct Case {
        Args args;
        std::string error;
    };
    const Case cases[] = {
        {{"--item", "X"}, "--test-read and --item are both needed"},
        {{"--test-read", "S"}, "--test-read and --item are both needed"},
        {With({"--count"}), "--count needs a value"},
        {With({"--verbose=yes"}), "--verbose takes no value"},
        {With({"--count", "0"}), "--count must be a whole number from 1 to 1000000000, not \"0\""},
        {With({"--count", "2.5"}),
         "--count must be a whole number from 1 to 1000000000, not \"2.5\""},
        {With({"--interval", "0.09"}), "--interval must be from 0.1 to 61 seconds, not \"0.09\""},
        {With({"--interval", "61.5"}), "--interval must be from 0.1 to 61 seconds, not \"61.5\""},
        {With({"--interval", "1,5"}), "--interval must be from 0.1 to 61 seconds, not \"1,5\""},
        {With({"--scale", "4:20:0"}),
         "--scale must be INSTMIN:INSTMAX:ENGMIN:ENGMAX, not \"4:20:0\""},
        {With({"--scale", "1:2:3:4:5"}),
         "--scale must be INSTMIN:INSTMAX:ENGMIN:ENGMAX, not \"1:2:3:4:5\""},
        {With({"--scale", "1:2:3:nan"}),
         "--scale must be INSTMIN:INSTMAX:ENGMIN:ENGMAX, not \"1:2:3:nan\""},
        {With({"--scale", "20:4:0:100"}),
         "--scale: each minimum must be at least .05 below its maximum"},
        {With({"--scale", "4:20:0:0.03"}),
         "--scale: each minimum must be at least .05 below its maximum"},
        {With({"--timeout", "0"}), "--timeout must be from 0.1 to 86400 seconds, not \"0\""},
        {With({"--item="}), "--item needs an item ID"},
        {With({"--quiet"}), "unknown option \"--quiet\""},
    };
    for (const Case& c : cases) {
        const TestReadCommand command = ParseTestReadCommand(c.args);
        EXPECT_EQ(command.action, Action::Usage) << c.error;
        EXPECT_EQ(command.error, c.error);
    }
}

TEST(TestReadCommandLine, TakesSecurityChoicesAndRefusesOthers) {
    struct Case {
        Args extra;
        std::string error;  // empty: accepted
        std::string mode, policy, user, thumbprint;
    };
    const std::string upper = "0123456789ABCDEF0123456789ABCDEF01234567";
    const Case cases[] = {
        {{}, "", "", "", "", ""},
        {{"--security-mode", "SignAndEncrypt", "--security-policy=Aes128_Sha256_RsaOaep"},
         "",
         "SignAndEncrypt",
         "Aes128_Sha256_RsaOaep",
         "",
         ""},
        {{"--security-mode=Sign", "--user", "bob"}, "", "Sign", "", "bob", ""},
        {{"--trust", "01:23:45:67:89:ab:cd:ef:01:23:45:67:89:ab:cd:ef:01:23:45:67"},
         "",
         "",
         "",
         "",
         upper},
        {{"--security-mode", "Encrypt"},
         "--security-mode must be one of None, Sign, SignAndEncrypt, not \"Encrypt\"",
         "",
         "",
         "",
         ""},
        {{"--security-policy", "Basic128Rsa15"},
         "--security-policy must be one of Basic256Sha256, Aes128_Sha256_RsaOaep, not "
         "\"Basic128Rsa15\"",
         "",
         "",
         "",
         ""},
        {{"--security-mode", "None", "--security-policy", "Basic256Sha256"},
         "--security-policy needs --security-mode Sign or SignAndEncrypt",
         "",
         "",
         "",
         ""},
        {{"--user", ""}, "--user needs a user name", "", "", "", ""},
        {{"--user"}, "--user needs a value", "", "", "", ""},
        {{"--trust", upper + "00"},
         "--trust must be a certificate thumbprint of 40 hexadecimal digits, not \"" + upper +
             "00\"",
         "",
         "",
         "",
         ""},
        {{"--trust", "XYZ"},
         "--trust must be a certificate thumbprint of 40 hexadecimal digits, not \"XYZ\"",
         "",
         "",
         "",
         ""},
    };
    for (const Case& c : cases) {
        const TestReadCommand command = ParseTestReadCommand(With(c.extra));
        SCOPED_TRACE(c.error);
        if (!c.error.empty()) {
            EXPECT_EQ(command.action, Action::Usage);
            EXPECT_EQ(command.error, c.error);
            continue;
        }
        ASSERT_EQ(command.action, Action::Run) << command.error;
        EXPECT_EQ(command.options.securityMode, c.mode);
        EXPECT_EQ(command.options.securityPolicy, c.policy);
        EXPECT_EQ(command.options.userName, c.user);
        EXPECT_EQ(command.options.trustThumbprint, c.thumbprint);
    }
}

TEST(TestReadCommandLine, HelpAndVersionWinAndTellTheWindowFromTheTerminal) {
    EXPECT_EQ(ParseTestReadCommand(With({"--help", "--bogus"})).action, Action::Help);
    EXPECT_EQ(ParseTestReadCommand({"-h"}).action, Action::Help);
    EXPECT_EQ(ParseTestReadCommand({"--version"}).action, Action::Version);
    EXPECT_TRUE(WantsTestRead(With({})));
    EXPECT_TRUE(WantsTestRead({"--test-read=S"}));
    EXPECT_TRUE(WantsTestRead({"--version"}));
    EXPECT_FALSE(WantsTestRead({"--plant", "p.json"}));
    EXPECT_NE(TestReadUsage().find("Exit status: 0"), std::string::npos);
}

}  // namespace
}  // namespace cv
