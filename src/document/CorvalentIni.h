#pragma once

#include "platform/Platform.h"
#include "stores/IniFile.h"

namespace cv {

// The settings file the tuning tools of one machine share (display defaults,
// the write switch, the filter switch), opened by its bare name. One
// spelling everywhere, so that a first write creates the file under the name
// every reader looks for.
inline IniFile CorvalentIni(Platform& platform) {
    IniFile cShared(platform.profiles);
    cShared.SetFileName("Corvalen.ini");
    return cShared;
}

}  // namespace cv
