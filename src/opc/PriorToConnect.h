#pragma once

#include <string>

#include "platform/ServerCallWait.h"

namespace cv {

// Before connecting to a server: a call into it that is still pending after
// 5000 ms shows a busy notice naming the server (and its computer, when one
// is named). The setting is application-wide.
void PriorToConnect(platform::ServerCallWait& cWait, const std::string& sServerID,
                    const std::string& sComputer);

}  // namespace cv
