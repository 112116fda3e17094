#include "platform/ua/UaGroups.h"

#include "platform/ua/UaGroup.h"
#include "platform/ua/UaGroupState.h"

namespace cv::uaopc {

// Each call holds the connection itself: this object goes with its server
// object, which an event handler may release while the call waits.

ErrorInfo UaGroups::Add(const std::string& sName, std::shared_ptr<platform::OPCGroup>& cGroup) {
    const auto connection = connection_;
    std::shared_ptr<UaGroupState> state;
    if (const ErrorInfo error = connection->AddGroup(sName, state)) {
        return error;
    }
    cGroup = std::make_shared<UaGroup>(std::move(state));
    return {};
}

ErrorInfo UaGroups::Remove(const std::string& sName) {
    const auto connection = connection_;
    return connection->RemoveGroup(sName);
}

ErrorInfo UaGroups::RemoveAll() {
    const auto connection = connection_;
    return connection->RemoveAllGroups();
}

}  // namespace cv::uaopc
