#pragma once

#include <map>
#include <string>
#include <utility>

#include "platform/PasswordStore.h"

namespace cv::security {

// Passwords kept in memory for the program's run, never on disk: the user
// is asked once per run for each user name at each server, and again after
// the server refused the password.
class RunPasswords : public platform::PasswordStore {
  public:
    std::optional<std::string> Find(const std::string& endpointUrl,
                                    const std::string& userName) override;
    void Remember(const std::string& endpointUrl, const std::string& userName,
                  const std::string& password) override;
    void Forget(const std::string& endpointUrl, const std::string& userName) override;

  private:
    std::map<std::pair<std::string, std::string>, std::string> passwords_;
};

}  // namespace cv::security
