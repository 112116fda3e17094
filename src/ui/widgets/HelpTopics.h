#pragma once

#include <cstdint>

namespace cv {

struct Platform;

// Makes the run's help file name (platform.run.HelpFile) a full path in the
// program's folder, joined with "/". When the folder is unknown or no name
// is set it shows "Error setting help path: " and the reason, and leaves the
// name as it was.
void SetHelpPath(Platform& platform);
// Opens the run's help file at the topic of that context number.
void ShowHelpTopic(Platform& platform, int32_t context);

}  // namespace cv
