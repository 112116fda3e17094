#pragma once

#include <optional>
#include <string>

namespace cv::platform {

// Where the password of a user name at a server is kept between connects.
// Never a settings file: the program keeps passwords in memory for its run
// (a system keyring would be another implementation).
class PasswordStore {
  public:
    virtual ~PasswordStore() = default;
    virtual std::optional<std::string> Find(const std::string& endpointUrl,
                                            const std::string& userName) = 0;
    virtual void Remember(const std::string& endpointUrl, const std::string& userName,
                          const std::string& password) = 0;
    virtual void Forget(const std::string& endpointUrl, const std::string& userName) = 0;
};

struct PasswordRequest {
    std::string endpointUrl;
    std::string userName;
    // The server refused the password given before.
    bool refusedBefore = false;
};

// Asks the user for a password: a window, or the terminal. Nothing when the
// user cancels.
class PasswordPrompt {
  public:
    virtual ~PasswordPrompt() = default;
    virtual std::optional<std::string> AskPassword(const PasswordRequest& request) = 0;
};

}  // namespace cv::platform
