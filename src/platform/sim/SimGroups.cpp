#include "platform/sim/SimGroups.h"

#include "platform/sim/GroupState.h"
#include "platform/sim/SimGroup.h"

namespace cv::sim {

// Each call holds the connection itself: this object goes with its server
// object, which an event handler may release while the call waits.

ErrorInfo SimGroups::Add(const std::string& sName, std::shared_ptr<platform::OPCGroup>& cGroup) {
    const auto connection = connection_;
    std::shared_ptr<GroupState> state;
    if (const ErrorInfo error = connection->AddGroup(sName, state)) {
        return error;
    }
    cGroup = std::make_shared<SimGroup>(std::move(state));
    return {};
}

ErrorInfo SimGroups::Remove(const std::string& sName) {
    const auto connection = connection_;
    return connection->RemoveGroup(sName);
}

ErrorInfo SimGroups::RemoveAll() {
    const auto connection = connection_;
    return connection->RemoveAllGroups();
}

}  // namespace cv::sim
