#pragma once

#include <string>

namespace cv::posix {

// The environment variable that moves all of the program's settings to
// another folder (for tests, or for a user who keeps them elsewhere).
inline constexpr const char* kConfigDirVariable = "CVOPCTESTCLIENT_CONFIG_DIR";

// The program's folder under an XDG base directory: $<variable>/cvopctestclient,
// or $HOME/<fallback>/cvopctestclient when the variable is unset or relative.
std::string XdgFolder(const char* variable, const char* fallback);

// Where the settings files live: $CVOPCTESTCLIENT_CONFIG_DIR when set,
// otherwise the XDG configuration folder.
std::string ConfigFolder();

}  // namespace cv::posix
