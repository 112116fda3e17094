#pragma once

#include <istream>
#include <optional>
#include <string>

#include "platform/PasswordStore.h"

namespace cv::posix {

// The command line's password: the environment variable's value when it is
// set, else one line of standard input. Asked again after the server
// refused it, there is nothing better to give: nothing.
class ConsolePasswordPrompt : public platform::PasswordPrompt {
  public:
    static constexpr const char* kVariable = "CVOPCTESTCLIENT_PASSWORD";

    // variable: the environment variable's value, null when unset.
    ConsolePasswordPrompt(const char* variable, std::istream& in);

    std::optional<std::string> AskPassword(const platform::PasswordRequest& request) override;

  private:
    std::optional<std::string> variable_;
    std::istream& in_;
};

}  // namespace cv::posix
