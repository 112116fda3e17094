// Start-up time of the program: from starting its process to the main
// window's first paint (the program's --quit-when-shown option), on Qt's
// offscreen platform. Run with the median of the repetitions as the figure.

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <string>
#include <vector>

#include <benchmark/benchmark.h>

#include "support/TempFolder.h"

extern char** environ;

namespace {

// The caller's environment with the offscreen platform and a settings folder
// of its own, so that timing runs leave the user's settings alone.
std::vector<std::string> ProgramEnvironment(const std::string& configFolder) {
    std::vector<std::string> variables;
    for (char** variable = environ; *variable != nullptr; ++variable) {
        const std::string entry(*variable);
        if (entry.rfind("QT_QPA_PLATFORM=", 0) != 0 &&
            entry.rfind("CVOPCTESTCLIENT_CONFIG_DIR=", 0) != 0) {
            variables.push_back(entry);
        }
    }
    variables.push_back("QT_QPA_PLATFORM=offscreen");
    variables.push_back("CVOPCTESTCLIENT_CONFIG_DIR=" + configFolder);
    return variables;
}

// Runs the program once; false when it cannot start or fails.
bool RunOnce(const char* program, std::vector<std::string>& environment) {
    std::vector<char*> envp;
    for (auto& variable : environment) {
        envp.push_back(variable.data());
    }
    envp.push_back(nullptr);
    std::string name = program;
    std::string option = "--quit-when-shown";
    char* argv[] = {name.data(), option.data(), nullptr};
    // The toolkit's notes on the offscreen platform would clutter the report.
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, "/dev/null", O_WRONLY, 0);
    pid_t pid = 0;
    const int started = posix_spawn(&pid, program, &actions, nullptr, argv, envp.data());
    posix_spawn_file_actions_destroy(&actions);
    if (started != 0) {
        return false;
    }
    int status = 0;
    if (waitpid(pid, &status, 0) != pid) {
        return false;
    }
    return WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

void BM_StartUntilWindowShown(benchmark::State& state) {
#ifdef CV_PROGRAM_PATH
    const cv::test::TempFolder folder;
    auto environment = ProgramEnvironment(folder.Path());
    for (auto _ : state) {
        if (!RunOnce(CV_PROGRAM_PATH, environment)) {
            state.SkipWithError("the program did not start and end cleanly");
            break;
        }
    }
#else
    state.SkipWithError("built without the program (CV_BUILD_UI is off)");
#endif
}

}  // namespace

BENCHMARK(BM_StartUntilWindowShown)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1)
    ->Repetitions(15)
    ->ReportAggregatesOnly(true);
