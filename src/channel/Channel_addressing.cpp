#include <algorithm>

#include "channel/Channel.h"
#include "util/PathText.h"

namespace cv {

std::string Channel::DdeAppTopic() const {
    return msDdeApplication + "|" + msTopicName;
}

void Channel::SetDdeAppTopic(const std::string& sAppTopic) {
    std::string sApplication;
    std::string sTopic;
    SplitAppTopic(sAppTopic, sApplication, sTopic);
    msDdeApplication = sApplication;
    msTopicName = sTopic;
}

std::string Channel::OpcNodeAndServer() const {
    if (msOpcComputer.empty()) {
        return msOpcServerID;
    }
    return "\\\\" + msOpcComputer + "\\" + msOpcServerID;
}

// Leading backslashes go; the first one left parts node from server ID.
void Channel::SetOpcNodeAndServer(const std::string& sNodeAndServer) {
    const size_t start = std::min(sNodeAndServer.find_first_not_of('\\'), sNodeAndServer.size());
    const std::string sText = sNodeAndServer.substr(start);
    const size_t p = sText.find('\\');
    if (p == std::string::npos) {
        msOpcComputer.clear();
        msOpcServerID = sText;
    } else {
        msOpcComputer = sText.substr(0, p);
        msOpcServerID = sText.substr(p + 1);
    }
}

}  // namespace cv
