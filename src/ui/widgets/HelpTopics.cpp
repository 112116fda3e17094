#include "ui/widgets/HelpTopics.h"

#include <string>

#include "platform/Platform.h"

namespace cv {

void SetHelpPath(Platform& platform) {
    std::string folder = platform.program.Folder();
    const std::string& name = platform.run.HelpFile;
    std::string error;
    if (folder.empty()) {
        error = "The program's folder is unknown.";
    } else if (name.empty()) {
        error = "No help file name is set.";
    }
    if (!error.empty()) {
        platform.dialogs.MsgBox("Error setting help path: " + error, MsgBoxStyle::OKOnly, "");
        return;
    }
    if (folder.back() != '/' && folder.back() != '\\') {
        folder += '/';
    }
    platform.run.HelpFile = folder + name;
}

void ShowHelpTopic(Platform& platform, int32_t context) {
    platform.help.ShowTopic(platform.run.HelpFile, context);
}

}  // namespace cv
