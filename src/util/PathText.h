#pragma once

#include <cstdint>
#include <string>

namespace cv {

// Path routines; both "\" and "/" separate folders. FolderOfPath keeps the
// path up to its last separator, else up to its first ":", else nothing.
std::string FolderOfPath(const std::string& path);
void SplitPath(const std::string& path, std::string& folder, std::string& name);
// 1-based position of the last occurrence of character's first character;
// 0 when absent, when character is empty or beyond position 32767.
int16_t LastPosOf(const std::string& text, const std::string& character);

// "App|Topic" into its two parts.
void SplitAppTopic(const std::string& text, std::string& application, std::string& topic);

// "12.07.99" -> "12.0799": version texts with a second point.
std::string RemoveSecondDot(const std::string& text, bool insertZero);

}  // namespace cv
