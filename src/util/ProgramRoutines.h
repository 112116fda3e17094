#pragma once

#include <cstdint>
#include <string>

namespace cv {

struct Platform;

// The local computer's name as the platform reports it, in full; empty when
// it cannot be found.
std::string ComputerName(const Platform& platform);
std::string ProgramTitle();
int32_t ProgramTunerKind();

// Reads the run-wide uncertain-value warning switch, or sets it for good.
bool UncertainWarningOff(Platform& platform, bool setFlag);

}  // namespace cv
