#pragma once

#include <string>
#include <vector>

namespace cv {

// The program run from a terminal for a test read, --help or --version:
// no window and no display. The arguments are without the program name;
// the answer is the exit code (TestReadExit).
int RunTestReadProgram(const std::vector<std::string>& arguments);

// The window's own usage lines, which --help shows before the test read's.
extern const char* const kWindowUsage;

}  // namespace cv
