#pragma once

#include <string>

namespace cv::posix {

// Where a profile file name leads, as the Windows profile functions resolve
// it but with the settings folder in place of the Windows folder:
// - an empty name leads nowhere (empty result);
// - a bare name (no "/" or "\") lies in configFolder; since Windows names
//   match without regard to case, an existing file there whose name differs
//   only in ASCII case is used ("Corvalen.Ini" finds "Corvalen.ini"; among
//   several, the exact name, else the first in byte order);
// - any other name is a path, "\" read as "/", relative to the current folder.
std::string ProfilePath(const std::string& fileName, const std::string& configFolder);

// Whether path names a file directly inside configFolder.
bool IsInConfigFolder(const std::string& path, const std::string& configFolder);

}  // namespace cv::posix
