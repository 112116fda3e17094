#include "util/ProgramRoutines.h"

#include "platform/Platform.h"

namespace cv {

std::string ComputerName(const Platform& platform) {
    return platform.computer.Query().value_or(std::string());
}

std::string ProgramTitle() {
    return "Corvalent OPC Test Client";
}

int32_t ProgramTunerKind() {
    return 9;
}

bool UncertainWarningOff(Platform& platform, bool setFlag) {
    if (setFlag) {
        platform.run.UncertainWarningOff = true;
    }
    return platform.run.UncertainWarningOff;
}

}  // namespace cv
