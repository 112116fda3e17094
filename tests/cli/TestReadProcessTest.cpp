// The command-line test read as a user meets it: the built program run as a
// process, without a display, its output and exit code read back.

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <gtest/gtest.h>

#include <chrono>
#include <cstdlib>
#include <fstream>
#include <regex>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include "support/TempFolder.h"
#include "ua/ScriptedServer.h"
#include "ua/services/MonitoredItemServices.h"

extern char** environ;

namespace {

struct Outcome {
    int exitCode = -1;
    std::string out;
    std::string err;
};

std::string ReadAll(const std::string& path) {
    std::ifstream file(path);
    std::stringstream text;
    text << file.rdbuf();
    return text.str();
}

// Runs the program with the arguments, no display and settings of its own,
// in the time zone given (POSIX TZ form).
Outcome RunProgram(std::vector<std::string> arguments, const std::string& zone = "UTC0") {
    const cv::test::TempFolder folder;
    std::vector<std::string> environment;
    for (char** variable = environ; *variable != nullptr; ++variable) {
        const std::string entry(*variable);
        if (entry.rfind("DISPLAY=", 0) != 0 && entry.rfind("WAYLAND_DISPLAY=", 0) != 0 &&
            entry.rfind("QT_QPA_PLATFORM=", 0) != 0 && entry.rfind("CVOPCTESTCLIENT_", 0) != 0 &&
            entry.rfind("TZ=", 0) != 0) {
            environment.push_back(entry);
        }
    }
    environment.push_back("CVOPCTESTCLIENT_CONFIG_DIR=" + folder.Path());
    environment.push_back("TZ=" + zone);
    std::vector<char*> envp;
    for (auto& variable : environment) {
        envp.push_back(variable.data());
    }
    envp.push_back(nullptr);
    std::string program = CV_PROGRAM_PATH;
    arguments.insert(arguments.begin(), program);
    std::vector<char*> argv;
    for (auto& argument : arguments) {
        argv.push_back(argument.data());
    }
    argv.push_back(nullptr);
    const std::string outPath = folder.File("out");
    const std::string errPath = folder.File("err");
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, outPath.c_str(),
                                     O_WRONLY | O_CREAT | O_TRUNC, 0600);
    posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, errPath.c_str(),
                                     O_WRONLY | O_CREAT | O_TRUNC, 0600);
    pid_t pid = 0;
    Outcome outcome;
    if (posix_spawn(&pid, program.c_str(), &actions, nullptr, argv.data(), envp.data()) == 0) {
        int status = 0;
        if (waitpid(pid, &status, 0) == pid && WIFEXITED(status)) {
            outcome.exitCode = WEXITSTATUS(status);
        }
    }
    posix_spawn_file_actions_destroy(&actions);
    outcome.out = ReadAll(outPath);
    outcome.err = ReadAll(errPath);
    return outcome;
}

std::vector<std::string> Lines(const std::string& text) {
    std::vector<std::string> lines;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);) {
        lines.push_back(line);
    }
    return lines;
}

// Time stamps in ISO 8601 with milliseconds and the zone; no source time
// stamp from a Data Access server.
TEST(TestReadProcess, PrintsOneLinePerValueAndExitsZero) {
    for (const auto& [tz, zone] : {std::pair("UTC0", "Z"), std::pair("XYZ-5:30", "\\+05:30")}) {
        const Outcome outcome =
            RunProgram({"--test-read", "Sim.Plant.1", "--item", "Types.ReadOnly.R8", "--count", "3",
                        "--interval", "0.1", "--scale", "0:10:0:100"},
                       tz);
        EXPECT_EQ(outcome.exitCode, 0) << outcome.err;
        EXPECT_EQ(outcome.err, "Backend: simulated plant\n");
        const std::vector<std::string> lines = Lines(outcome.out);
        ASSERT_EQ(lines.size(), 3u) << outcome.out;
        const std::regex line(R"(\d{4}-\d\d-\d\dT\d\d:\d\d:\d\d\.\d{3})" + std::string(zone) +
                              R"(\t2\.71828182845905\t27\.18\tgood\t)");
        for (const std::string& text : lines) {
            EXPECT_TRUE(std::regex_match(text, line)) << text;
        }
    }
}

// Every value has its line, a bad one too (without a scaled value), and a
// number that is not one is not made one. Nobody is asked anything.
TEST(TestReadProcess, BadValuesAndNaNPrintTheirLinesAndNothingIsAsked) {
    struct Case {
        std::string item;
        int exitCode;
        std::string line;
    };
    const Case cases[] = {
        {"Special.NaN", 0, "\tNaN\tNaN\tgood\t"},
        {"Quality.CommFailure", 1, "\t14\t\tbad, communication failure\t"},
        {"Quality.LastKnown", 0, "\t13\t13.00\tbad, last known value\t"},
    };
    for (const Case& c : cases) {
        const Outcome outcome =
            RunProgram({"--test-read", "Sim.Plant.1", "--item", c.item, "--timeout", "0.5"});
        EXPECT_EQ(outcome.exitCode, c.exitCode) << outcome.err;
        const std::vector<std::string> lines = Lines(outcome.out);
        ASSERT_EQ(lines.size(), 1u) << outcome.out;
        EXPECT_EQ(lines[0].substr(lines[0].find('\t')), c.line);
        EXPECT_EQ(outcome.err.find('?'), std::string::npos) << outcome.err;
    }
}

// With --verbose, what the server answered while the test waited.
TEST(TestReadProcess, VerboseTellsTheServersAnswersWhileItWaits) {
    const std::string answer =
        "The server answered: Either the Access Path or the Item Name are unknown to the OPC "
        "Server; trying again until the wait ends\n";
    for (const bool verbose : {true, false}) {
        std::vector<std::string> arguments = {"--test-read",  "Sim.Plant.1", "--item",
                                              "No.Such.Item", "--timeout",   "0.5"};
        if (verbose) {
            arguments.push_back("--verbose");
        }
        const Outcome outcome = RunProgram(arguments);
        EXPECT_EQ(outcome.exitCode, 1);
        EXPECT_EQ(outcome.err.find(answer) != std::string::npos, verbose) << outcome.err;
    }
}

TEST(TestReadProcess, FailuresPrintTheDiagnosisAndExitOne) {
    struct Case {
        std::vector<std::string> arguments;
        std::string diagnosis;
    };
    const Case cases[] = {
        {{"--test-read", "Sim.Plant.1", "--item", "No.Such.Item", "--timeout", "0.3"},
         "Either the Access Path or the Item Name are unknown to the OPC Server."},
        {{"--test-read", "\\\\.\\Sim.Nothing.1", "--item", "X", "--timeout", "0.3"},
         "Server ID \"Sim.Nothing.1\" is not registered as an OPC Server"},
        {{"--test-read", "Sim.Plant.1", "--item", "Quality.CommFailure", "--timeout", "0.3"},
         "Communications failure"},
        {{"--test-read", "Sim.Plant.1", "--item", "Special.PathItem", "--access-path", "COM9",
          "--timeout", "0.3"},
         "The Item's access path is not known to the OPC Server."},
    };
    for (const Case& c : cases) {
        const Outcome outcome = RunProgram(c.arguments);
        EXPECT_EQ(outcome.exitCode, 1) << c.diagnosis;
        EXPECT_EQ(outcome.out.empty(), c.diagnosis != "Communications failure") << outcome.out;
        EXPECT_NE(outcome.err.find(c.diagnosis), std::string::npos) << outcome.err;
    }
}

// Standard error holds no control character but line breaks and tabs.
bool HasControls(const std::string& text) {
    for (size_t i = 0; i < text.size(); ++i) {
        const auto byte = static_cast<unsigned char>(text[i]);
        const bool c1 = byte == 0xC2 && i + 1 < text.size() &&
                        (static_cast<unsigned char>(text[i + 1]) & 0xE0) == 0x80;
        if ((byte < 0x20 && byte != '\n' && byte != '\t') || byte == 0x7F || c1) {
            return true;
        }
    }
    return false;
}

// Texts that would retitle the terminal, clear it and start a C1 escape (and
// from the OPC UA server, draw a value line of its own): the reason an OPC UA
// server gives for refusing to watch the item, and a plant's text value the
// program quotes as no number.
TEST(TestReadProcess, ServerTextsReachTheTerminalWithoutControls) {
    const std::string reason =
        "late\x1b]0;owned\x07\x1b[2J\n12:00:00.000\t42.5\t42.5\tgood\xc2\x9b"
        "31m";
    using cv::ua::test::ScriptedServer;
    ScriptedServer server([&reason](ScriptedServer& s, const ScriptedServer::Request& r) {
        if (r.typeId != cv::ua::CreateMonitoredItemsRequest::kEncodingId) {
            return false;
        }
        s.SendChunk(
            cv::ua::MessageKind::Message, 'A', r.requestId,
            cv::ua::Encode(cv::ua::ErrorMessage{cv::ua::status::BadTcpInternalError, reason}));
        return true;
    });
    const cv::test::TempFolder folder;
    const std::string plant = folder.File("plant.json");
    std::ofstream(plant) << R"({"computers": [{"name": "HERE", "local": true, "servers": ["S.1"]}],
        "servers": [{"id": "S.1", "namespace": {"items": [{"name": "Text", "type": "BSTR",
        "value": "late\u001b]0;owned\u0007\u001b[2J\u009b31m\u202e"}]}}]})";
    const struct {
        std::vector<std::string> arguments;
        std::string shown;
    } cases[] = {
        {{"--test-read", server.Url(), "--item", "ns=1;s=X", "--security-mode", "None"},
         "late]0;owned[2J 12:00:00.000 42.5 42.5 good31m"},
        {{"--test-read", "S.1", "--item", "Text", "--plant", plant}, "late]0;owned[2J31m"},
    };
    for (const auto& c : cases) {
        std::vector<std::string> arguments = c.arguments;
        arguments.insert(arguments.end(), {"--timeout", "0.3"});
        const Outcome outcome = RunProgram(arguments);
        EXPECT_EQ(outcome.exitCode, 1);
        EXPECT_FALSE(HasControls(outcome.out)) << outcome.out;
        EXPECT_NE(outcome.err.find(c.shown), std::string::npos) << outcome.err;
        EXPECT_FALSE(HasControls(outcome.err)) << outcome.err;
    }
}

// A server that never answers Hello: each attempt to connect waits what the
// user gave (the item test makes three), not the 10 s a connection has by
// default. The bound is generous, far below three default waits.
TEST(TestReadProcess, TheUsersWaitBoundsEachConnection) {
    using cv::ua::test::ScriptedServer;
    ScriptedServer server([](ScriptedServer&, const ScriptedServer::Request& r) {
        return r.kind == cv::ua::MessageKind::Hello;
    });
    const auto start = std::chrono::steady_clock::now();
    const Outcome outcome =
        RunProgram({"--test-read", server.Url(), "--item", "ns=1;s=X", "--timeout", "0.5"});
    EXPECT_EQ(outcome.exitCode, 1) << outcome.err;
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(15));
}

TEST(TestReadProcess, UsageHelpVersionAndPlantFile) {
    struct Case {
        std::vector<std::string> arguments;
        int exitCode;
        std::string out;
        std::string err;
    };
    const Case cases[] = {
        {{"--help"}, 0, "--test-read SERVER", ""},
        {{"--help"}, 0, "--verbose ", ""},
        {{"--version"}, 0, "cvopctestclient ", ""},
        {{"--test-read", "S"}, 2, "", "--test-read and --item are both needed"},
        {{"--test-read", "S", "--item", "X", "--interval", "99"}, 2, "", "--interval must be"},
        {{"--test-read", "S", "--item", "X", "--plant", "/nonexistent/plant.json"},
         3,
         "",
         "/nonexistent/plant.json"},
    };
    for (const Case& c : cases) {
        const Outcome outcome = RunProgram(c.arguments);
        EXPECT_EQ(outcome.exitCode, c.exitCode) << outcome.err;
        EXPECT_NE(outcome.out.find(c.out), std::string::npos) << outcome.out;
        EXPECT_NE(outcome.err.find(c.err), std::string::npos) << outcome.err;
    }
}

// The endpoint URL of the node-opcua peer CTest started for test_cli_peer.
std::string PeerUrl() {
    const char* file = std::getenv("CV_UA_PEER_URL_FILE");
    std::ifstream in(file ? file : "");
    std::string url;
    std::getline(in, url);
    return url;
}

TEST(TestReadPeer, ReadsScaledValuesOfAnOpcUaServer) {
    const std::string url = PeerUrl();
    ASSERT_FALSE(url.empty()) << "CV_UA_PEER_URL_FILE names no endpoint URL";
    struct Case {
        std::string nodeId;
        std::string scale;
        std::string rawAndScaled;
    };
    const Case cases[] = {
        {"ns=1;s=Static.Double", "0:10:0:100", "2.71828182845905\t27.18"},
        {"ns=1;s=Plant.Area2.Unit1.Pump1.Starts", "0:100:0:1000", "17\t170.00"},
    };
    for (const Case& c : cases) {
        const Outcome outcome =
            RunProgram({"--test-read", url, "--item", c.nodeId, "--count", "2", "--interval", "0.1",
                        "--scale", c.scale, "--timeout", "10"});
        EXPECT_EQ(outcome.exitCode, 0) << outcome.err;
        EXPECT_EQ(outcome.err, "Backend: OPC UA\n");
        const std::vector<std::string> lines = Lines(outcome.out);
        ASSERT_EQ(lines.size(), 2u) << outcome.out;
        const std::regex line(R"(\d{4}-\d\d-\d\dT\d\d:\d\d:\d\d\.\d{3}Z\t)" + c.rawAndScaled +
                              R"(\tgood\t\d{4}-\d\d-\d\dT\d\d:\d\d:\d\d\.\d{3}Z)");
        for (const std::string& text : lines) {
            EXPECT_TRUE(std::regex_match(text, line)) << text;
        }
    }
}

TEST(TestReadPeer, AnUnknownNodeIdIsDiagnosedAndExitsOne) {
    const Outcome outcome =
        RunProgram({"--test-read", PeerUrl(), "--item", "ns=1;s=No.Such.Node", "--timeout", "1"});
    EXPECT_EQ(outcome.exitCode, 1);
    EXPECT_EQ(outcome.out, "");
    EXPECT_NE(outcome.err.find("Backend: OPC UA\n"), std::string::npos) << outcome.err;
    EXPECT_NE(outcome.err.find("Either the Access Path or the Item Name are unknown to the OPC "
                               "Server."),
              std::string::npos)
        << outcome.err;
}

}  // namespace
