#include <gtest/gtest.h>

#include <sstream>

#include "platform/posix/ConsolePasswordPrompt.h"

namespace cv::posix {
namespace {

TEST(ConsolePasswordPrompt, TakesTheVariableElseOneLineAndNeverRepeatsARefusedOne) {
    struct Row {
        const char* variable;
        std::string input;
        bool refusedBefore;
        std::optional<std::string> password;
    };
    const std::vector<Row> rows = {
        {"from env", "from stdin\n", false, "from env"},
        {"", "from stdin\n", false, ""},
        {nullptr, "from stdin\nsecond\n", false, "from stdin"},
        {nullptr, "windows line\r\n", false, "windows line"},
        {nullptr, "", false, std::nullopt},
        {"from env", "", true, std::nullopt},
        {nullptr, "from stdin\n", true, std::nullopt},
    };
    for (const Row& row : rows) {
        std::istringstream in(row.input);
        ConsolePasswordPrompt prompt(row.variable, in);
        EXPECT_EQ(prompt.AskPassword({"opc.tcp://plant:4840", "bob", row.refusedBefore}),
                  row.password)
            << (row.variable ? row.variable : "<unset>") << " / " << row.input;
    }
}

}  // namespace
}  // namespace cv::posix
