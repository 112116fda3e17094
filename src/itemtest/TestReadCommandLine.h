#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace cv {

// The command-line test read:
//
//   cvopctestclient --test-read '\\Node\Server' --item ID [--access-path P]
//                   [--count N] [--interval S] [--scale INSTMIN:INSTMAX:ENGMIN:ENGMAX]
//                   [--timeout S] [--plant FILE] [--verbose]
//
// Numbers are written with a point, whatever the regional settings.
struct TestReadScale {
    double instMin = 0;
    double instMax = 100;
    double engMin = 0;
    double engMax = 100;
};

struct TestReadOptions {
    std::string nodeAndServer;
    std::string itemId;
    std::string accessPath;
    int32_t count = 1;
    double intervalSec = 1.0;
    std::optional<TestReadScale> scale;
    // Overrides the remembered wait for this run only.
    std::optional<double> timeoutSec;
    std::string plantFile;
    // Also print each answer of the server while the test waits for it.
    bool verbose = false;
    // OPC UA security for this run; empty: as chosen for the server in the
    // window (by default the most secure it offers). The mode is "None",
    // "Sign" or "SignAndEncrypt", the policy "Basic256Sha256" or
    // "Aes128_Sha256_RsaOaep". A user name's password comes from the
    // environment or standard input, never from the command line.
    std::string securityMode;
    std::string securityPolicy;
    std::string userName;
    // The one unknown server certificate to trust: 40 upper-case hex digits.
    std::string trustThumbprint;
};

// Exit codes of the command-line test read.
namespace TestReadExit {
inline constexpr int kValuesRead = 0;
inline constexpr int kTestFailed = 1;
inline constexpr int kUsage = 2;
inline constexpr int kPlantUnusable = 3;
}  // namespace TestReadExit

struct TestReadCommand {
    enum class Action { Run, Help, Version, Usage };
    Action action = Action::Usage;
    TestReadOptions options;
    // For Usage: what is wrong with the command line.
    std::string error;
};

// True when the arguments (without the program name) ask for a test read,
// --help or --version of it: then the program runs no window.
bool WantsTestRead(const std::vector<std::string>& arguments);
TestReadCommand ParseTestReadCommand(const std::vector<std::string>& arguments);
std::string TestReadUsage();

}  // namespace cv
